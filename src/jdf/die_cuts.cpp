// Die cuts: the die switched off in every existing pair, then (when the die is to be printed)
// die-with-content and die-only pages added, as two die sheets of a layout or as die runs of a
// bare PDF; and the die-info file in the job folder.
#include <cstdio>
#include <cstdlib>
#include <string>

#include "jdf/pair_records.h"
#include "jdf/ticket_handles.h"
#include "vorlan/LD_JDF.h"

namespace {

const wchar_t* const kSpecialOCG = L"KVVersionSpecialOCGName";

// Removes the first entry of list equal to name (ignoring case).
void removeFirst(LD_JDF& w, std::vector<wchar_t*>& list, const wchar_t* name) {
    int32_t at = w.stringVecContains(list, name);
    if (at < 0) return;
    std::free(list[static_cast<size_t>(at)]);
    list.erase(list.begin() + at);
}

// The die's names switched off in one existing pair.
void switchDieOff(LD_JDF& w, LD_OCG_InterpretingParams* params, const LD_DieCut& die) {
    for (const auto* names : {&die.dieLayerInternalNames, &die.dieSepInternalNames}) {
        for (const wchar_t* name : *names) {
            removeFirst(w, params->m_OCGOn, name);
            if (w.stringVecContains(params->m_OCGOff, name) < 0) params->m_OCGOff.push_back(LD_CopyText(name));
        }
    }
}

bool bit(const std::vector<bool>& selection, size_t i) { return i < selection.size() && selection[i]; }

}  // namespace

LDError LD_JDF::addDieCut(bool hasTicket) {
    // 1.-2. Existing pairs: the die off (one die cut only), the catch-all group on.
    for (LD_OCG_InterpretingParams* params : m_InterpretingParams) {
        if (!params) continue;
        if (m_XMLDieCuts.size() == 1 && m_XMLDieCuts[0]) switchDieOff(*this, params, *m_XMLDieCuts[0]);
        params->m_OCGOn.push_back(LD_CopyText(kSpecialOCG));
    }
    // 3. Nothing more unless the die is to be printed; only one die cut can be.
    if (!dieEnabled || m_XMLDieCuts.empty()) return LD_OK;
    if (m_XMLDieCuts.size() != 1 || !m_XMLDieCuts[0]) return LD_FAILED;
    LD_DieCut* die = m_XMLDieCuts[0];

    // 4. A layout: a die-with-content sheet, then a die-only sheet, after the last sheet.
    if (hasTicket && ticket->hasLayout()) {
        if (versions.empty() && surfaces.empty()) return LD_OK;
        for (ContentType type : {CONTENT_DIE_WITH_CONTENT, CONTENT_DIE_ONLY}) {
            LD_Sheet* sheet = appendDieSheetInLayout(0, type);
            if (!sheet) return lastError;
            for (LD_Surface* surface : {sheet->front, sheet->back}) {
                if (!surface) continue;
                // A placed object whose ordinal the table lacks cannot get its die page.
                if (createDieRunIPPairsAndUpdateDieSurface(surface, die, type) != LD_OK) return LD_FAILED;
            }
        }
        return LD_OK;
    }

    // 5. A bare PDF (or a ticket without layout): die runs appended directly.
    auto* dieParams = new LD_OCG_InterpretingParams;
    LDError resolved = resolveDieLayerNames(inputPDF, die->dieLayerInternalNames, die->dieSepInternalNames,
                                            dieParams->m_OCGOn, dieParams->m_OCGOff);
    if (resolved != LD_OK || dieParams->m_OCGOn.empty()) {  // no layer of the PDF is the die
        delete dieParams;
        return LD_FAILED;
    }
    dieParams->m_OCGOff.push_back(LD_CopyText(kSpecialOCG));

    if (!hasTicket) {  // which of the first two pages the die goes with
        if (pageSelection.size() == 1 && !pageSelection[0]) {
            delete dieParams;
            return LD_OK;
        }
        if (pageSelection.size() >= 2) {
            if (!pageSelection[0] && !pageSelection[1]) {
                delete dieParams;
                return LD_OK;
            }
            if (pageSelection[0] && pageSelection[1]) dieCutDefined = true;
        }
    }
    const size_t lastPosition = dieCutDefined ? 1 : 0;

    // A die-with-content pair for one run: the content's switches plus the die.
    auto addDieWithContent = [&](LD_Run* run, int32_t contentIndex) -> LDError {
        auto* params = new LD_OCG_InterpretingParams;
        if (createDieAndContentIP(contentIndex, dieParams, params) != LD_OK || params->m_OCGOn.empty()) {
            delete params;
            delete run;
            return LD_FAILED;
        }
        if (updateAndAppendToOrdinalTable(run, params) == -1) {
            delete params;
            delete run;
            return LD_FAILED;
        }
        contentRuns.push_back(run);
        m_InterpretingParams.push_back(params);
        return LD_OK;
    };

    LDError result = LD_OK;
    if (versions.empty()) {
        for (size_t i = 0; i < contentRuns.size() && i <= lastPosition && result == LD_OK; ++i) {
            if (!contentRuns[i] || contentRuns[i]->contentType != CONTENT_CONTENT) continue;
            LD_Run* run = vorlan::jdf::copyRun(contentRuns[i]);
            run->contentType = CONTENT_DIE_WITH_CONTENT;
            result = addDieWithContent(run, static_cast<int32_t>(i));
        }
    } else if (versions[0]) {
        const auto& entries = versions[0]->surfaces;
        size_t start = bit(pageSelection, 0) ? 0 : 1;
        for (size_t k = 0; start + k < entries.size() && k <= lastPosition && result == LD_OK; ++k) {
            if (!entries[start + k]) continue;
            LD_Run* run = vorlan::jdf::newPageRun(inputPDF, entries[start + k]->pageIndex, CONTENT_DIE_WITH_CONTENT);
            result = addDieWithContent(run, static_cast<int32_t>(k));
        }
    }
    if (result != LD_OK) {
        delete dieParams;
        return result;
    }

    // Die-only pages 0 and 1, sharing one parameter record.
    bool used = false;
    for (size_t p = 0; p < 2 && p < pageSelection.size(); ++p) {
        if (!pageSelection[p]) continue;
        LD_Run* run = vorlan::jdf::newPageRun(inputPDF, static_cast<int32_t>(p), CONTENT_DIE_ONLY);
        if (updateAndAppendToOrdinalTable(run, dieParams) == -1) {
            delete run;
            if (used) m_InterpretingParams.push_back(dieParams);  // an earlier row refers to it
            else delete dieParams;
            return LD_FAILED;
        }
        contentRuns.push_back(run);
        used = true;
    }
    if (used) m_InterpretingParams.push_back(dieParams);
    else delete dieParams;
    return LD_OK;
}

// One line "key=value" per call, appended to "<job folder>/job<N>.dieinfo"; lines end in CR LF on
// every platform so the file reads the same everywhere.
void LD_JDF::AddDieInfoFile(const char* key, int32_t value) {
    if (!key) return;
    std::string path = std::string(jobFolder ? jobFolder : ".") + "/job" + std::to_string(jobNumber) + ".dieinfo";
    FILE* out = std::fopen(path.c_str(), "ab");
    if (!out) return;
    std::fprintf(out, "%s=%d\r\n", key, value);
    std::fclose(out);
}
