// Fuzzes whole PDF files through the entry points a job uses: page count, first-page size, page
// inks and the XMP ink list, conversion of the found spot inks to layers, and separation
// rewriting in keep-listed and drop-listed mode. Input and output are scratch files; at most
// four distinct inks are used so that one execution stays short.
#include <algorithm>
#include <cstdint>
#include <string>
#include <vector>

#include "pdf/page_geometry.h"
#include "pdf/separation_layers.h"
#include "pdf/separation_rewrite.h"
#include "pdf/xmp_inks.h"
#include "platform/os/text.h"
#include "scratch_file.h"

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    vorlan::os::ensureUtf8Locale();
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    static const vorlan::fuzz::ScratchFile input("vorlan-pdf-fuzz-in"), output("vorlan-pdf-fuzz-out");
    if (!input.write(data, size)) return 0;
    const char* in = input.path();
    const char* out = output.path();

    if (getPDFPageCount(nullptr, in) <= 0) return 0;
    double height = 0, width = 0;
    getFirstPageSize(nullptr, in, &height, &width);
    std::vector<std::string> technical, die;
    collectEskoTechnicalInks(in, technical, die);

    std::vector<std::string> inks;
    scanPDFPageInks(in, inks);
    std::vector<std::string> names{"Spot"};
    for (const std::string& ink : inks)
        if (names.size() < 4 && std::find(names.begin(), names.end(), ink) == names.end()) names.push_back(ink);
    std::vector<const char*> separations;
    for (const std::string& name : names) separations.push_back(name.c_str());
    const char* layers[] = {"Layer"};

    vorlan::pdf::convertPDF(nullptr, in, out, separations.data(), layers, static_cast<int>(separations.size()), 1);
    vorlan::pdf::rewriteSeparations(nullptr, in, out, names, true);
    vorlan::pdf::rewriteSeparations(nullptr, in, out, names, false);
    return 0;
}
