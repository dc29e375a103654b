// Converts the job's PDFs for layer-mode versions: separations that versions switch become
// optional-content groups in new files named by the host.
#include <cassert>
#include <cstdlib>
#include <string>
#include <vector>

#include "entry/host_paths.h"
#include "pdf/separation_layers.h"
#include "platform/os/text.h"
#include "vorlan/LD_JDF.h"

namespace {

void appendOnce(std::vector<wchar_t*>& names, wchar_t* name) {
    if (!name) return;
    for (wchar_t* known : names)
        if (vorlan::os::equalsIgnoreCase(known, name)) return;
    names.push_back(name);
}

// Narrow copies of wide names; an unconvertible name becomes empty (and matches nothing).
std::vector<std::string> narrowNames(const std::vector<wchar_t*>& names) {
    std::vector<std::string> out;
    out.reserve(names.size());
    for (const wchar_t* name : names) out.push_back(vorlan::os::narrow(name));
    return out;
}

std::vector<const char*> pointers(const std::vector<std::string>& names) {
    std::vector<const char*> out;
    for (const std::string& name : names) out.push_back(name.c_str());
    return out;
}

}  // namespace

void LD_JDF::getListOfSeparationsToBeConverted(std::vector<wchar_t*>& names) {
    if (!versions.empty() && versions.front()) {
        for (XMLSurfaceData* surface : versions.front()->surfaces) {
            assert(surface);
            if (!surface) continue;
            for (XMLContentObjectData* object : surface->contentObjects) {
                assert(object);
                if (!object) continue;
                for (wchar_t* name : object->sepNameOff) appendOnce(names, name);
            }
        }
    }
    if (m_XMLDieCuts.size() == 1 && m_XMLDieCuts.front())
        for (wchar_t* name : m_XMLDieCuts.front()->dieSepInternalNames) appendOnce(names, name);
}

LDError LD_JDF::convertAllPDFs() {
    for (auto& [pdf, layers] : layerDataMap) {
        if (!pdf) continue;
        const std::string buffer = askHostForFilePath(*this);
        wchar_t* converted = getWCharFromChar(buffer.c_str());
        if (!converted) converted = static_cast<wchar_t*>(std::calloc(1, sizeof(wchar_t)));
        std::free(pdf->convertedPath);
        pdf->convertedPath = converted;

        std::vector<wchar_t*> separationNames;
        getListOfSeparationsToBeConverted(separationNames);
        const std::vector<std::string> separations = narrowNames(separationNames);
        const std::vector<std::string> plainLayers =
            layers ? narrowNames(layers->layerOCGNames) : std::vector<std::string>();

        int result = 2;  // not converted
        if (!separations.empty() || (!plainLayers.empty() && !m_XMLDieCuts.empty())) {
            const std::string input = vorlan::os::narrow(pdf->nativePath);
            std::vector<const char*> s = pointers(separations), l = pointers(plainLayers);
            result = vorlan::pdf::convertPDF(zipFileSystem, input.c_str(), buffer.c_str(), s.data(), l.data(),
                                             static_cast<int>(s.size()), static_cast<int>(l.size()));
        }
        if (result == 1) {
            lastError = LD_PDF_CONVERSION_FAILED;
            return LD_PDF_CONVERSION_FAILED;
        }
        pdf->converted = result == 0;
    }
    lastError = LD_OK;
    return LD_OK;
}
