// Die pairs: the interpreting parameters that show the die alone or with the content, and the
// run / parameter pairs of die-sheet surfaces.
#include <cstdlib>

#include "jdf/pair_records.h"
#include "platform/os/text.h"
#include "vorlan/LD_JDF.h"

LDError LD_JDF::createDieRunIPPairsAndUpdateDieSurface(LD_Surface* surface, LD_DieCut* die, ContentType type) {
    if (!surface || !die) {
        lastError = LD_FAILED;
        return LD_FAILED;
    }
    for (LD_ContentObject* object : surface->contentObjects) {
        if (!object) continue;
        LD_OrdinalTableElement* row = getOrdinalElementByOrdNum(object->Ord);
        // A placed object whose ordinal has no content run has nothing to show the die with.
        if (!row || !row->content || !row->content->run) {
            lastError = LD_FAILED;
            return LD_FAILED;
        }
        LD_Run* source = row->content->run;
        int32_t page = row->content->page;
        if (object->Ord >= 0 && static_cast<size_t>(object->Ord) < m_OrdinalTable.size()) {
            LD_OrdinalTableElement* atPosition = m_OrdinalTable[static_cast<size_t>(object->Ord)];
            if (atPosition && atPosition->content) page = atPosition->content->page;
        }

        auto* run = new LD_Run;
        run->pdf = source->pdf;
        run->IsBlank = source->IsBlank;
        run->pages = source->pages;
        auto* dieParams = new LD_OCG_InterpretingParams;
        if (run->pdf)
            resolveDieLayerNames(run->pdf, die->dieLayerInternalNames, die->dieSepInternalNames, dieParams->m_OCGOn,
                                 dieParams->m_OCGOff);
        LD_OCG_InterpretingParams* params = dieParams;
        if (type == CONTENT_DIE_ONLY) {
            dieParams->m_OCGOff.push_back(LD_CopyText(L"KVVersionSpecialOCGName"));
        } else {
            params = new LD_OCG_InterpretingParams;
            LDError made = createDieAndContentIP(object->contentObjectIndex, dieParams, params);
            delete dieParams;
            if (made != LD_OK) {
                delete params;
                delete run;
                lastError = LD_FAILED;
                return LD_FAILED;
            }
        }

        int32_t n;
        if (LD_OrdinalTableElement* shared = searchOrdinalTableForRunIPPair(run, params, page)) {
            n = shared->ordinal;
            delete run;
            delete params;
        } else {
            n = updateAndAppendToOrdinalTable(run, params);
            if (LD_OrdinalTableElement* added = getOrdinalElementByOrdNum(n)) added->content->page = page;
            contentRuns.push_back(run);
            m_InterpretingParams.push_back(params);
        }
        if (n == -1) {
            lastError = LD_FAILED;
            return LD_FAILED;
        }
        object->Ord = n;
    }
    return LD_OK;
}

LDError LD_JDF::createDieAndContentIP(int32_t contentObjectIndex, LD_OCG_InterpretingParams* dieParams,
                                      LD_OCG_InterpretingParams* target) {
    if (!dieParams || !target) return LD_FAILED;
    int32_t ordinal = getOrdNumberFromContentObjectIndex(contentObjectIndex);
    LD_OrdinalTableElement* row = getOrdinalElementByOrdNum(ordinal);
    if (!row) {  // no logical page to take the content's switches from
        lastError = LD_FAILED;
        return LD_FAILED;
    }
    if (row->content && row->content->interpretingParams) {
        LD_OCG_InterpretingParams* content = row->content->interpretingParams;
        vorlan::jdf::appendNameCopies(target->m_OCGOn, content->m_OCGOn);
        for (const wchar_t* name : content->m_OCGOff)
            if (stringVecContains(dieParams->m_OCGOn, name) < 0) target->m_OCGOff.push_back(LD_CopyText(name));
    }
    vorlan::jdf::appendNameCopies(target->m_OCGOn, dieParams->m_OCGOn);
    lastError = LD_OK;
    return LD_OK;
}

LDError LD_JDF::resolveDieLayerNames(LD_PDF* pdf, std::vector<wchar_t*>& layerNames, std::vector<wchar_t*>& sepNames,
                                     std::vector<wchar_t*>& dieNames, std::vector<wchar_t*>& otherNames) {
    // The layer record of the PDF: the last whose PDF has the same path (ignoring case). A job
    // without ticket keeps its only record under no PDF when the description was read before its
    // PDF was found; that record is the PDF's.
    XMLLayerData* record = nullptr;
    auto pathOf = [](const LD_PDF* p) { return p->converted ? p->convertedPath : p->nativePath; };
    for (auto& [key, layers] : layerDataMap) {
        const LD_PDF* owner = key ? key : (jobHasTicket ? nullptr : pdf);
        if (!owner || !pdf || !layers) continue;
        if (vorlan::os::equalsIgnoreCase(pathOf(owner), pathOf(pdf))) record = layers;
    }
    if (!record) {
        lastError = LD_FAILED;
        return LD_FAILED;
    }
    size_t before = dieNames.size();
    for (const auto* names : {&record->layerOCGNames, &record->sepOCGNames}) {
        for (const wchar_t* name : *names) {
            bool isDieName = stringVecContains(layerNames, name) >= 0 || stringVecContains(sepNames, name) >= 0;
            (isDieName ? dieNames : otherNames).push_back(LD_CopyText(name));
        }
    }
    if (dieNames.size() == before) {
        lastError = LD_FAILED;
        return LD_FAILED;
    }
    return LD_OK;
}

bool LD_JDF::isDie(std::vector<wchar_t*>& names, const wchar_t* name) { return stringVecContains(names, name) >= 0; }

bool LD_JDF::isNested(std::vector<wchar_t*>& names, const wchar_t* name) { return stringVecContains(names, name) >= 0; }
