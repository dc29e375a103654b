// Prunes, right after the description was read, the switches and OCG entries of the kind that the
// job's mode does not use: layers in separation mode, separations in layer mode. The OCGs that
// form the first die cut's die line are kept.
#include <cstdlib>
#include <new>
#include <vector>

#include "versions/name_lists.h"
#include "vorlan/LD_JDF.h"

namespace {

using vorlan::versions::containsName;
using vorlan::versions::removeFirstName;

// Removes every OCG of one kind except those named in keep: the name, its display name at the
// same position, and its first entry in each default list.
void pruneKind(XMLLayerData& layers, std::vector<wchar_t*>& ocgNames, std::vector<wchar_t*>& displayNames,
               const std::vector<wchar_t*>& keep) {
    std::vector<wchar_t*> keptNames, keptDisplayNames;
    keptNames.reserve(ocgNames.size());  // nothing below allocates: the lists change all or not at all
    keptDisplayNames.reserve(displayNames.size());
    for (size_t i = 0; i < ocgNames.size(); ++i) {
        wchar_t* name = ocgNames[i];
        wchar_t* displayName = i < displayNames.size() ? displayNames[i] : nullptr;
        if (containsName(keep, name)) {
            keptNames.push_back(name);
            if (displayName) keptDisplayNames.push_back(displayName);
            continue;
        }
        removeFirstName(layers.defaultOnOCGNames, name);
        removeFirstName(layers.defaultOffOCGNames, name);
        std::free(name);
        std::free(displayName);
    }
    for (size_t i = ocgNames.size(); i < displayNames.size(); ++i) keptDisplayNames.push_back(displayNames[i]);
    ocgNames.swap(keptNames);
    displayNames.swap(keptDisplayNames);
}

}  // namespace

LDError LD_JDF::applyClientModeChangesToXMLBufferData() {
    const LD_DieCut* die = m_XMLDieCuts.empty() ? nullptr : m_XMLDieCuts.front();
    const std::vector<wchar_t*> none;
    const bool layerMode = defaultLayerMode;

    for (XMLVersionData* version : versions)
        for (XMLSurfaceData* surface : version->surfaces)
            for (XMLContentObjectData* object : surface->contentObjects) {
                LD_FreeTextList(layerMode ? object->sepNameOn : object->layerNameOn);
                LD_FreeTextList(layerMode ? object->sepNameOff : object->layerNameOff);
            }

    try {
        for (auto& [pdf, layers] : layerDataMap) {
            if (!layers) continue;
            if (layerMode)
                pruneKind(*layers, layers->sepOCGNames, layers->sepDisplayNames,
                          die ? die->dieSepInternalNames : none);
            else
                pruneKind(*layers, layers->layerOCGNames, layers->layerDisplayNames,
                          die ? die->dieLayerInternalNames : none);
        }
    } catch (const std::bad_alloc&) {
        lastError = LD_FAILED;
        return LD_FAILED;
    }
    return LD_OK;
}
