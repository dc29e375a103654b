// Fuzzes the texts a ticket and a host hand over as strings: the geometry and clip-path strings of
// placed objects (as UTF-8), and the page-range text, which selects surfaces and pages.
#include <cstdint>
#include <string>
#include <vector>

#include "jdf/page_selection.h"
#include "platform/jdf/jdf.h"
#include "platform/os/text.h"
#include "vorlan/LD_JDF.h"

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    vorlan::os::ensureUtf8Locale();
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const std::string bytes(reinterpret_cast<const char*>(data), size);

    const JDF::WString text(bytes);
    LD_CTM ctm;
    LD_JDF::parseStringAsCTM(text, &ctm);
    LD_Box box;
    LD_JDF::parseStringAsBox(text, &box);
    std::vector<LD_Point*> points;
    LD_JDF::parseStringAsPoints(text, points);
    for (LD_Point* point : points) delete point;
    std::vector<LD_ClipPathOperations*> operations;
    LD_JDF::parseStringAsClipPathOperations(text, operations);
    for (LD_ClipPathOperations* operation : operations) delete operation;
    delete LD_JDF::splitIntoFloatTokensBySpace(text);

    LD_JDF worker;
    std::string range = bytes.substr(0, bytes.find('\0'));
    worker.pageRange = range.data();
    worker.pageRangeMode = 3;
    std::vector<int32_t> pages;
    worker.ConvertPageRangesToPages(pages, 4096);
    selectPositions(worker, 4096);
    return 0;
}
