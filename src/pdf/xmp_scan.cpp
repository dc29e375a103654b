// The two scan modes and their descriptions.
#include "pdf/xmp_scan.h"

#include <memory>
#include <string>
#include <vector>

#include "pdf/pdf_document.h"
#include "pdf/page_geometry.h"
#include "pdf/pdf_session.h"
#include "pdf/xmp_inks.h"
#include "versions/description_writer.h"
#include "versions/die_library.h"

namespace {

constexpr int kEskoResult = 1;
constexpr int kDieLibraryResult = 2;

// The description for a single PDF: its inks are layers of PDF 0, and every page has one
// content object (index 0) that switches `off` off.
InkDescription singlePdfDescription(const char* versionName, const std::vector<std::string>& layerInks,
                                    const std::vector<std::string>& off, size_t pageCount) {
    InkDescription d;
    d.versionName = versionName;
    for (const std::string& ink : layerInks) d.layers.push_back({0, ink});
    d.surfaces.assign(pageCount, {InkDescription::ContentObject{0, &off}});
    return d;
}

void scanEsko(const char* pdfPath, const char* outputPath) {
    std::unique_ptr<QPDF> pdf = vorlan::pdf::openDocument(pdfPath, false);
    if (!pdf) return;
    std::vector<std::string> technical, die;
    vorlan::pdf::documentEskoInks(*pdf, technical, die);
    if (technical.empty()) return;
    InkDescription d = singlePdfDescription("EskoTechnicalVersion", technical, technical,
                                            vorlan::pdf::documentPages(*pdf).size());
    d.writeDieCut = !die.empty();
    d.dieInks = std::move(die);
    writeInkDescription(outputPath, d);
}

void scanDieLibrary(const char* pdfPath, const char* outputPath) {
    std::unique_ptr<QPDF> pdf = vorlan::pdf::openDocument(pdfPath, false);
    if (!pdf) return;
    std::vector<std::string> pageInks;
    vorlan::pdf::documentPageInks(*pdf, pageInks);
    if (pageInks.empty()) return;
    DieLibrary library;
    if (!loadDieLibrary(library, dieLibraryPath())) return;
    std::vector<std::string> die = dieSeparations(library, pageInks);
    if (die.empty()) return;
    InkDescription d = singlePdfDescription("KAVDieLibrary", die, die, vorlan::pdf::documentPages(*pdf).size());
    d.writeDieCut = true;
    d.dieInks = die;
    writeInkDescription(outputPath, d);
}

}  // namespace

int scanPdfInksToDescription(const char* pdfPath, char* outputPath, bool dieLibrary) {
    vorlan::pdf::PdfSession session;
    try {
        if (dieLibrary) scanDieLibrary(pdfPath, outputPath);
        else scanEsko(pdfPath, outputPath);
    } catch (...) {
        // a failure ends the scan; the result stays that of the mode
    }
    return dieLibrary ? kDieLibraryResult : kEskoResult;
}
