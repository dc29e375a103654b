// Prunes, right after the description was read, the switches and OCG entries of the kind that the
// job's mode does not use: layers in separation mode, separations in layer mode. The OCGs that
// form the first die cut's die line are kept.
#include <cstdlib>
#include <new>
#include <vector>

#include "versions/name_lists.h"
#include "vorlan/LD_JDF.h"

namespace {

using vorlan::versions::NameCounts;

// Removes every OCG of one kind except those named in keep: the name and its display name at the
// same position, and, when a die decides what stays, its first entry in each default list (without
// a die the default switches stay for the ticket's own switches).
void pruneKind(XMLLayerData& layers, std::vector<wchar_t*>& ocgNames, std::vector<wchar_t*>& displayNames,
               const NameCounts& keep, bool pruneDefaults) {
    std::vector<bool> drop(ocgNames.size());
    NameCounts removed;
    for (size_t i = 0; i < ocgNames.size(); ++i) {
        if (keep.contains(ocgNames[i])) continue;
        drop[i] = true;
        removed.add(ocgNames[i]);
    }
    if (pruneDefaults) {
        removed.removeFrom(layers.defaultOnOCGNames);
        removed.removeFrom(layers.defaultOffOCGNames);
    }
    // Nothing below allocates: the parallel lists shrink together.
    size_t keptNames = 0, keptDisplayNames = 0;
    for (size_t i = 0; i < ocgNames.size(); ++i) {
        wchar_t* displayName = i < displayNames.size() ? displayNames[i] : nullptr;
        if (drop[i]) {
            std::free(ocgNames[i]);
            std::free(displayName);
            continue;
        }
        ocgNames[keptNames++] = ocgNames[i];
        if (i < displayNames.size()) displayNames[keptDisplayNames++] = displayName;
    }
    for (size_t i = ocgNames.size(); i < displayNames.size(); ++i) displayNames[keptDisplayNames++] = displayNames[i];
    ocgNames.resize(keptNames);
    displayNames.resize(keptDisplayNames);
}

}  // namespace

LDError LD_JDF::applyClientModeChangesToXMLBufferData() {
    const LD_DieCut* die = m_XMLDieCuts.empty() ? nullptr : m_XMLDieCuts.front();
    const bool layerMode = defaultLayerMode;

    for (XMLVersionData* version : versions)
        for (XMLSurfaceData* surface : version->surfaces)
            for (XMLContentObjectData* object : surface->contentObjects) {
                LD_FreeTextList(layerMode ? object->sepNameOn : object->layerNameOn);
                LD_FreeTextList(layerMode ? object->sepNameOff : object->layerNameOff);
            }

    try {
        // Without a die cut nothing is kept.
        NameCounts keep;
        if (die) keep = NameCounts(layerMode ? die->dieSepInternalNames : die->dieLayerInternalNames);
        for (auto& [pdf, layers] : layerDataMap) {
            if (!layers) continue;
            if (layerMode)
                pruneKind(*layers, layers->sepOCGNames, layers->sepDisplayNames, keep, die != nullptr);
            else
                pruneKind(*layers, layers->layerOCGNames, layers->layerDisplayNames, keep, die != nullptr);
        }
    } catch (const std::bad_alloc&) {
        lastError = LD_FAILED;
        return LD_FAILED;
    }
    return LD_OK;
}
