// The version description a job gets when the host sends none: the content PDFs' technical
// inks, found through the die library or the Esko XMP ink lists, are switched off on every
// content object, and their die inks make a die cut.
#include <set>
#include <string>
#include <vector>

#include "entry/description_file.h"
#include "pdf/page_geometry.h"
#include "pdf/xmp_inks.h"
#include "pdf/zipped_jdf_file_system.h"
#include "platform/os/text.h"
#include "versions/description_writer.h"
#include "versions/die_library.h"
#include "vorlan/LD_JDF.h"

namespace {

// The file of a content PDF: the data folder joined with the URL as the ticket writes it.
std::string contentPdfPath(const wchar_t* dataPath, const LD_PDF* pdf) {
    return vorlan::os::narrow(dataPath) + '/' + vorlan::os::narrow(pdf->url);
}

}  // namespace

bool LD_JDF::populateKAVDieLibInks() {
    DieLibrary library;
    if (!loadDieLibrary(library, dieLibraryPath()) || contentPDFs.empty()) return false;
    ensurePdfLibraryStarted(zipFileSystem);
    bool found = false;
    for (LD_PDF* pdf : contentPDFs) {
        std::vector<std::string> pageInks;
        scanPDFPageInks(contentPdfPath(dataPath, pdf).c_str(), pageInks);
        if (pageInks.empty()) continue;
        std::vector<std::string> die = dieSeparations(library, pageInks);
        found = found || !die.empty();
        technicalInkMap[pdf] = die;
        dieInkMap[pdf] = std::move(die);
    }
    return found;
}

bool LD_JDF::populateEskoTechInks() {
    for (LD_PDF* pdf : contentPDFs) {
        std::vector<std::string> technical, die;
        collectEskoTechnicalInks(contentPdfPath(dataPath, pdf).c_str(), technical, die);
        if (!technical.empty()) eskoInksFound = true;
        technicalInkMap[pdf] = std::move(technical);
        dieInkMap[pdf] = std::move(die);
    }
    return true;
}

bool LD_JDF::generateImpInfoFile(const char* path) {
    InkDescription d;
    // Layers: pdfIndex counts only the PDFs that have an entry.
    int pdfIndex = 0;
    for (LD_PDF* pdf : contentPDFs) {
        auto entry = technicalInkMap.find(pdf);
        if (entry == technicalInkMap.end()) continue;
        for (const std::string& ink : entry->second) d.layers.push_back({pdfIndex, ink});
        ++pdfIndex;
    }
    // One version for both sources; each content object switches off the inks of its PDF. An
    // object whose Ord has no content row, or whose PDF has no entry, switches nothing off.
    d.versionName = "EskoTechnicalVersion";
    d.surfaces.resize(surfaces.size());
    for (size_t s = 0; s < surfaces.size(); ++s) {
        for (const LD_ContentObject* object : surfaces[s]->contentObjects) {
            const std::vector<std::string>* off = nullptr;
            const int32_t ord = object->Ord;
            if (ord >= 0 && static_cast<size_t>(ord) < m_OrdinalTable.size() && m_OrdinalTable[ord]->content) {
                auto entry = technicalInkMap.find(m_OrdinalTable[ord]->content->pdf);
                if (entry != technicalInkMap.end()) off = &entry->second;
            }
            d.surfaces[s].push_back({object->contentObjectIndex, off});
        }
    }
    // The die cut: every die ink once, in byte order.
    std::set<std::string> die;
    for (const auto& [pdf, inks] : dieInkMap) die.insert(inks.begin(), inks.end());
    d.dieInks.assign(die.begin(), die.end());
    d.writeDieCut = !d.dieInks.empty();
    writeInkDescription(path, d);
    return true;
}

bool LD_JDF::parseImpInfoFile(const char* path, char** buffer, long* length) {
    return readDescriptionFile(path, buffer, length) && *buffer;
}
