// Content rows grouped by PDF, page and switch counts (see pair_index.h).
#include "jdf/pair_index.h"

#include <cwctype>

namespace vorlan::jdf {

PairIndex::PairIndex(LD_JDF& worker) : worker_(worker) {
    for (LD_OrdinalTableElement* row : worker.m_OrdinalTable) add(row);
}

std::wstring PairIndex::key(const LD_PDF* pdf, int32_t page, size_t on, size_t off) {
    std::wstring k = std::to_wstring(page) + L'|' + std::to_wstring(on) + L'|' + std::to_wstring(off) + L'|';
    if (pdf && pdf->url)
        for (const wchar_t* c = pdf->url; *c; ++c) k += static_cast<wchar_t>(std::towlower(static_cast<wint_t>(*c)));
    else
        k += L'\x1';  // no PDF: never equal to a URL
    return k;
}

void PairIndex::add(LD_OrdinalTableElement* row) {
    if (!row || !row->content || !row->content->interpretingParams) return;  // such rows never match
    const LD_ContentTableElement* c = row->content;
    const LD_PDF* pdf = c->run ? c->run->pdf : nullptr;
    groups_[key(pdf, c->page, c->interpretingParams->m_OCGOn.size(), c->interpretingParams->m_OCGOff.size())]
        .push_back(row);
}

LD_OrdinalTableElement* PairIndex::find(LD_Run* run, LD_OCG_InterpretingParams* params, int32_t page) {
    if (page < 0 || !params) return worker_.searchOrdinalTableForRunIPPair(run, params, page);
    auto it = groups_.find(key(run ? run->pdf : nullptr, page, params->m_OCGOn.size(), params->m_OCGOff.size()));
    if (it == groups_.end()) return nullptr;
    for (LD_OrdinalTableElement* row : it->second) {
        LD_ContentTableElement* c = row->content;
        if (!c || c->page != page) continue;  // the row changed since it was indexed
        bool sameRun = (!c->run || !run) ? c->run == run : worker_.areRunsEqual(c->run, run);
        if (sameRun && worker_.areInterpretingParamsEqual(c->interpretingParams, params)) return row;
    }
    return nullptr;
}

}  // namespace vorlan::jdf
