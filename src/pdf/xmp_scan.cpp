// The two scan modes and their descriptions.
#include "pdf/xmp_scan.h"

#include <memory>
#include <string>
#include <vector>

#include "pdf/description_writer.h"
#include "pdf/die_library.h"
#include "pdf/pdf_document.h"
#include "pdf/page_geometry.h"
#include "pdf/pdf_session.h"
#include "pdf/xmp_inks.h"

namespace {

constexpr int kEskoResult = 1;
constexpr int kDieLibraryResult = 2;

void scanEsko(const char* pdfPath, const char* outputPath) {
    std::unique_ptr<QPDF> pdf = vorlan::pdf::openDocument(pdfPath, false);
    if (!pdf) return;
    std::string xmp = vorlan::pdf::documentXmp(*pdf);
    std::vector<XMPInk> inks;
    if (xmp.empty() || !readXMPInks(xmp.c_str(), inks)) return;
    ScanDescription d;
    d.versionName = "EskoTechnicalVersion";
    for (const XMPInk& ink : inks) {
        if (isTechnicalVersionInk(ink)) d.layerInks.push_back(ink.name);
        if (isDieInk(ink)) d.dieInks.push_back(ink.name);
    }
    if (d.layerInks.empty()) return;
    d.offInks = d.layerInks;
    d.pageCount = static_cast<int>(vorlan::pdf::documentPages(*pdf).size());
    d.writeDieCut = !d.dieInks.empty();
    writeScanDescription(outputPath, d);
}

void scanDieLibrary(const char* pdfPath, const char* outputPath) {
    std::unique_ptr<QPDF> pdf = vorlan::pdf::openDocument(pdfPath, false);
    if (!pdf) return;
    std::vector<std::string> pageInks;
    vorlan::pdf::documentPageInks(*pdf, pageInks);
    if (pageInks.empty()) return;
    std::vector<DieLibraryEntry> library;
    if (!loadDieLibrary(dieLibraryPath(), library)) return;
    ScanDescription d;
    d.versionName = "KAVDieLibrary";
    for (const std::string& ink : pageInks)
        if (isDieSeparation(library, ink)) d.dieInks.push_back(ink);
    if (d.dieInks.empty()) return;
    d.layerInks = d.offInks = d.dieInks;
    d.pageCount = static_cast<int>(vorlan::pdf::documentPages(*pdf).size());
    d.writeDieCut = true;
    writeScanDescription(outputPath, d);
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
