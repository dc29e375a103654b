// Version expansion: every version of the description becomes run / interpreting-parameter
// pairs, reached from the layout's content objects (or from PDF pages) through ordinals.
//
// Four paths: without versions a bare PDF gets one pair per selected page (A) and a ticket one
// parameter record per content run (B); with versions a layout's content objects are pointed at
// the pair their version's switches need (C), and without a layout every version page becomes
// its own run carrying the version's name, index and copy count (D).
#include <cstdlib>
#include <unordered_map>

#include "jdf/pair_index.h"
#include "jdf/pair_records.h"
#include "jdf/ticket_handles.h"
#include "vorlan/LD_JDF.h"

namespace {

using vorlan::jdf::PairIndex;

bool selected(const std::vector<bool>& selection, int64_t position) {
    return position >= 0 && static_cast<size_t>(position) < selection.size() && selection[static_cast<size_t>(position)];
}

void setVersionTags(wchar_t*& name, int32_t& index, int64_t& copies, const XMLVersionData& version) {
    std::free(name);
    name = LD_CopyText(version.name);
    index = version.position;
    copies = version.copies;
}

// The state Path C keeps across the content objects of all versions.
class LayoutExpansion {
public:
    explicit LayoutExpansion(LD_JDF& w) : w_(w), pairs_(w) {
        for (size_t i = 0; i < w.surfaces.size(); ++i)
            if (w.surfaces[i]) surfaceAt_.emplace(w.surfaces[i]->index, i);  // first surface with that index
        for (LD_MarkObject* mark : w.markObjects)
            if (mark) marksByOrd_[mark->Ord].push_back(mark);
    }

    // Tags the layout surface the version entry names; LD_FAILED when there is none.
    LDError tagSurface(const XMLSurfaceData& entry, const XMLVersionData& version) {
        auto it = surfaceAt_.find(entry.index);
        if (it == surfaceAt_.end()) return LD_FAILED;
        LD_Surface* surface = w_.surfaces[it->second];
        setVersionTags(surface->VersionName, surface->VersionIndex, surface->VersionCopyCount, version);
        return LD_OK;
    }

    LDError expandContentObject(const XMLContentObjectData& entry);

private:
    // The row with ordinal o: rows stand at the position of their ordinal unless something moved
    // them, which the look-up by ordinal then finds.
    LD_OrdinalTableElement* row(int32_t o) {
        auto& table = w_.m_OrdinalTable;
        if (o >= 0 && static_cast<size_t>(o) < table.size() && table[static_cast<size_t>(o)] &&
            table[static_cast<size_t>(o)]->ordinal == o)
            return table[static_cast<size_t>(o)];
        return w_.getOrdinalElementByOrdNum(o);
    }
    void moveMarkObjects(int32_t from, int32_t to) {
        auto it = marksByOrd_.find(from);
        if (it == marksByOrd_.end()) return;
        std::vector<LD_MarkObject*> moved = std::move(it->second);
        marksByOrd_.erase(it);
        for (LD_MarkObject* mark : moved) mark->Ord = to;
        auto& target = marksByOrd_[to];
        target.insert(target.end(), moved.begin(), moved.end());
    }

    LD_JDF& w_;
    PairIndex pairs_;
    std::unordered_map<int32_t, size_t> surfaceAt_;
    std::unordered_map<int32_t, std::vector<LD_MarkObject*>> marksByOrd_;
};

LDError LayoutExpansion::expandContentObject(const XMLContentObjectData& entry) {
    int32_t o = w_.getOrdNumberFromContentObjectIndex(entry.index);
    if (o == -1) return LD_REFERENCE_OUT_OF_RANGE;
    LD_OrdinalTableElement* current = row(o);
    // An ordinal the table does not hold (a placed object beyond the job's pages) cannot be
    // given a version: report it as an ordinal that is out of range.
    if (!current || !current->content || !current->content->run) return LD_REFERENCE_OUT_OF_RANGE;
    auto& table = w_.m_OrdinalTable;
    // The content page of the row at position o (the same row unless rows were moved).
    LD_OrdinalTableElement* atPosition =
        static_cast<size_t>(o) < table.size() ? table[static_cast<size_t>(o)] : nullptr;
    int32_t page = atPosition && atPosition->content ? atPosition->content->page : current->content->page;
    LD_Run* run = current->content->run;
    LD_OCG_InterpretingParams* params = current->content->interpretingParams;
    LD_Run* markRun = current->mark ? current->mark->run : nullptr;

    LD_OCG_InterpretingParams* wanted = vorlan::jdf::newVersionParams(entry);
    if (w_.areInterpretingParamsEqual(params, wanted)) {  // the version changes nothing here
        delete wanted;
        return LD_OK;
    }
    int32_t n;
    if (LD_OrdinalTableElement* shared = pairs_.find(run, wanted, page)) {
        n = shared->ordinal;
        delete wanted;
    } else {
        LD_Run* variant = vorlan::jdf::copyRun(run);
        n = w_.updateAndAppendToOrdinalTable(variant, wanted);
        LD_OrdinalTableElement* made = row(n);
        made->content->page = page;
        w_.contentRuns.push_back(variant);
        w_.m_InterpretingParams.push_back(wanted);
        pairs_.add(made);
        if (markRun) {
            LD_Run* markVariant = vorlan::jdf::copyRun(markRun);
            markVariant->runNumber = variant->runNumber;
            if (!made->mark) {
                LD_OrdinalTableElement* source = row(o);  // still the row with ordinal o
                made->mark = source && source->mark ? new LD_MarkTableElement(*source->mark) : new LD_MarkTableElement;
                made->mark->run = markVariant;
            }
            w_.markRuns.push_back(markVariant);
            moveMarkObjects(o, n);
        }
    }
    w_.updateOrdInLayout(entry.index, n);
    w_.setOrdNumberFromContentObjectIndex(entry.index, n);
    return LD_OK;
}

}  // namespace

LDError LD_JDF::createRunListAndInterpretingParamPairs(bool hasTicket) {
    const bool layout = ticket->hasLayout();

    if (versions.empty() && !hasTicket) {  // Path A: one pair per selected page of the bare PDF
        XMLLayerData* defaults = layerDataMap.empty() ? nullptr : layerDataMap.begin()->second;
        for (size_t i = 0; i < surfaceVersions.size(); ++i) {
            if (!selected(pageSelection, static_cast<int64_t>(i)) || !surfaceVersions[i]) continue;
            LD_Run* run = vorlan::jdf::newPageRun(inputPDF, surfaceVersions[i]->index, CONTENT_CONTENT);
            auto* params = new LD_OCG_InterpretingParams;
            if (defaults) {
                copyOCGVec(params->m_OCGOn, defaults->defaultOnOCGNames);
                copyOCGVec(params->m_OCGOff, defaults->defaultOffOCGNames);
            }
            updateAndAppendToOrdinalTable(run, params);
            contentRuns.push_back(run);
            m_InterpretingParams.push_back(params);
        }
        return LD_OK;
    }

    if (versions.empty()) {  // Path B: one parameter record per content run of the ticket
        // Parameters made before this step, or a run list with a hole, mean the model is not the
        // one the reader built: refuse rather than guess.
        if (!m_InterpretingParams.empty()) return LD_FAILED;
        for (LD_Run* run : contentRuns) {
            if (!run) return LD_FAILED;
            XMLLayerData* layers = nullptr;
            if (run->pdf && !layerDataMap.empty()) {
                // A PDF the description does not cover keeps its own switches (none here).
                auto it = layerDataMap.find(run->pdf);
                if (it != layerDataMap.end()) layers = it->second;
            }
            auto* params = new LD_OCG_InterpretingParams;
            if (layers) {
                copyOCGVec(params->m_OCGOn, layers->defaultOnOCGNames);
                copyOCGVec(params->m_OCGOff, layers->defaultOffOCGNames);
            }
            LD_SetText(params->runName, run->runName);
            params->runNumber = run->runNumber;
            params->status = LD_RESOURCE_AVAILABLE;
            LD_SetText(params->OCGDefault, L"FromPDF");
            LD_SetText(params->OCGIntent, L"View");
            LD_SetText(params->OCGProcess, L"View");
            params->runNumbers.push_back(run->runNumber);
            m_InterpretingParams.push_back(params);
        }
        constructOrdinalTable();
        return LD_OK;
    }

    // Paths C and D: the versions, in document order.
    const bool withLayout = hasTicket && layout;
    std::unique_ptr<LayoutExpansion> expansion;
    if (withLayout) expansion = std::make_unique<LayoutExpansion>(*this);
    for (XMLVersionData* version : versions) {
        if (!version || !version->enabled || version->surfaces.empty()) continue;
        // A version to print needs a layout surface for each of its entries.
        if (withLayout && surfaces.empty()) return LD_FAILED;
        for (XMLSurfaceData* entry : version->surfaces) {
            if (!entry) continue;
            if (withLayout) {
                if (expansion->tagSurface(*entry, *version) != LD_OK) return LD_FAILED;
                for (XMLContentObjectData* object : entry->contentObjects) {
                    if (!object) continue;
                    if (LDError result = expansion->expandContentObject(*object); result != LD_OK) return result;
                }
                continue;
            }
            // Path D: one run per content object entry of a selected page.
            if (!selected(pageSelection, entry->pageIndex)) continue;
            for (XMLContentObjectData* object : entry->contentObjects) {
                if (!object) continue;
                LD_Run* run = vorlan::jdf::newPageRun(hasTicket ? nullptr : inputPDF, entry->pageIndex, CONTENT_CONTENT);
                LD_OCG_InterpretingParams* params = vorlan::jdf::newVersionParams(*object);
                updateAndAppendToOrdinalTable(run, params);
                setVersionTags(run->VersionName, run->VersionIndex, run->VersionCopyCount, *version);
                contentRuns.push_back(run);
                m_InterpretingParams.push_back(params);
            }
        }
    }
    return LD_OK;
}

LDError LD_JDF::markCurrLayoutOrRunlistAsDefaultVersion(bool mark) {
    if (!mark) return LD_OK;
    auto tag = [](wchar_t*& name, int32_t& index, int64_t& copies) {
        std::free(name);
        name = LD_CopyText(L"Default");
        index = 0;
        copies = 0;
    };
    if (ticket->hasLayout()) {
        for (LD_Surface* surface : surfaces)
            if (surface) tag(surface->VersionName, surface->VersionIndex, surface->VersionCopyCount);
    } else {
        for (LD_Run* run : contentRuns)
            if (run) tag(run->VersionName, run->VersionIndex, run->VersionCopyCount);
    }
    return LD_OK;
}

void LD_JDF::insertVersionedSheetAndSurfaceInLayout(int32_t surfaceIndex, wchar_t*, int32_t, int64_t) {
    if (!getSurfaceByIndex(surfaceIndex)) lastError = LD_FAILED;
}
