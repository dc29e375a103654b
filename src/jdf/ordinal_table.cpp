// The ordinal table: logical pages numbered by ordinal, each a content page with its
// interpreting parameters and optionally a mark page.
//
// Rows are looked up by the ordinal they carry, never by position; the position index of
// model_indexes.h makes those look-ups constant-time while keeping "the first row with that
// ordinal" as the answer.
#include <algorithm>
#include <cwchar>

#include "jdf/ticket_handles.h"
#include "platform/os/text.h"
#include "vorlan/LD_JDF.h"

namespace {

// Pages of a run given only by its range: FirstPage, FirstPage + SkipPage, … below NPage.
// At most this many pages are made from one range, so that a ticket claiming billions of pages
// cannot exhaust memory (the JDF layer caps explicit page lists the same way).
constexpr size_t kMaxRangePages = 10'000'000;

void fillPagesFromRange(LD_Run* run) {
    if (!run->pages.empty() || run->NPage <= 0) return;
    int64_t step = run->SkipPage < 1 ? 1 : run->SkipPage;
    for (int64_t page = run->FirstPage; page < run->NPage && run->pages.size() < kMaxRangePages; page += step)
        run->pages.push_back(static_cast<int32_t>(page));
}

LD_ContentTableElement* newContent(LD_Run* run, int32_t page, LD_OCG_InterpretingParams* params) {
    auto* content = new LD_ContentTableElement;
    content->pdf = run ? run->pdf : nullptr;
    content->page = page;
    content->run = run;
    content->interpretingParams = params;
    return content;
}

LD_OrdinalTableElement* newRow(int32_t ordinal, int32_t logicalDocument) {
    auto* row = new LD_OrdinalTableElement;
    row->ordinal = ordinal;
    row->logicalDocument = logicalDocument;
    return row;
}

// The parameters a pair gets when it enters the table.
void prepareParams(LD_OCG_InterpretingParams* params) {
    if (!params) return;
    params->status = 7;
    LD_SetText(params->OCGDefault, L"FromPDF");
    LD_SetText(params->OCGIntent, L"View");
    LD_SetText(params->OCGProcess, L"View");
    params->OCGOnEmpty = params->m_OCGOn.empty();
}

void fillContent(LD_ContentTableElement* content, LD_Run* run, LD_OCG_InterpretingParams* params) {
    content->pdf = run ? run->pdf : nullptr;
    content->run = run;
    content->interpretingParams = params;
    content->page = run && !run->pages.empty() ? run->pages.front() : -1;
}

// Every name of `names` occurs in `in`, ignoring case.
bool allNamesIn(const std::vector<wchar_t*>& names, const std::vector<wchar_t*>& in) {
    for (const wchar_t* name : names) {
        bool found = std::any_of(in.begin(), in.end(),
                                 [&](const wchar_t* other) { return vorlan::os::equalsIgnoreCase(name, other); });
        if (!found) return false;
    }
    return true;
}

}  // namespace

void LD_JDF::constructOrdinalTable() {
    numberOfLogicalPages = 0;
    numberOfLogicalDocs = 0;
    int32_t documents = 0;
    releaseOrdinalTable();
    ticket->indexes.rows.invalidate();

    for (size_t r = 0; r < contentRuns.size(); ++r) {
        LD_Run* run = contentRuns[r];
        if (!run) continue;
        fillPagesFromRange(run);
        LD_OCG_InterpretingParams* params = getInterpretingParamsByRunNumber(static_cast<int32_t>(r));
        for (int32_t page : run->pages) {
            LD_OrdinalTableElement* row = newRow(static_cast<int32_t>(m_OrdinalTable.size()), documents);
            row->content = newContent(run, page, params);
            m_OrdinalTable.push_back(row);
        }
        if (run->EndOfDocument) ++documents;
    }

    // The k-th mark page overall goes with ordinal k.
    int32_t m = 0;
    for (LD_Run* run : markRuns) {
        if (!run) continue;
        fillPagesFromRange(run);
        size_t sizeAtStart = m_OrdinalTable.size();
        for (int32_t page : run->pages) {
            LD_OrdinalTableElement* row;
            if (static_cast<size_t>(m) >= sizeAtStart) {
                row = newRow(m, documents);
                m_OrdinalTable.push_back(row);
            } else {
                row = getOrdinalElementByOrdNum(m);
            }
            if (row) {
                delete row->mark;
                row->mark = new LD_MarkTableElement{run->pdf, page, run};
            }
            ++m;
        }
        if (run->EndOfDocument) ++documents;
    }
    numberOfLogicalPages = static_cast<int32_t>(m_OrdinalTable.size());
    numberOfLogicalDocs = documents + 1;
}

int32_t LD_JDF::getNewContentTableElementPosition() {
    for (size_t i = m_OrdinalTable.size(); i > 0; --i)
        if (m_OrdinalTable[i - 1] && m_OrdinalTable[i - 1]->content) return static_cast<int32_t>(i);
    return 0;
}

int32_t LD_JDF::updateAndAppendToOrdinalTable(LD_Run* run, LD_OCG_InterpretingParams* params) {
    int32_t n = getNewContentTableElementPosition();

    // Number the pair: one past the last content run of a ticket, 0 otherwise.
    int32_t runNumber = 0;
    if (jobHasTicket && !contentRuns.empty() && contentRuns.back()) runNumber = contentRuns.back()->runNumber + 1;
    wchar_t name[32];
    std::swprintf(name, 32, L"%d", runNumber);
    if (run) {
        LD_SetText(run->runName, name);
        run->runNumber = runNumber;
    }
    if (params) {
        LD_SetText(params->runName, name);
        params->runNumber = runNumber;
        ticket->indexes.params.invalidate();
    }
    prepareParams(params);

    LD_OrdinalTableElement* row = getOrdinalElementByOrdNum(n);
    if (row) {
        delete row->content;
        row->content = new LD_ContentTableElement;
    } else {
        row = newRow(n, 0);
        row->content = new LD_ContentTableElement;
        m_OrdinalTable.push_back(row);
    }
    if (n >= 1 && static_cast<size_t>(n) <= m_OrdinalTable.size()) {
        LD_OrdinalTableElement* previous = m_OrdinalTable[static_cast<size_t>(n - 1)];
        if (previous && previous->content && previous->content->run && previous->content->run->EndOfDocument)
            ++numberOfLogicalDocs;
    }
    row->logicalDocument = numberOfLogicalDocs - 1;
    fillContent(row->content, run, params);
    return n;
}

int32_t LD_JDF::updateAndInsertToOrdinalTable(LD_Run* run, LD_OCG_InterpretingParams* params, int32_t position) {
    if (position < 0 || static_cast<size_t>(position) >= m_OrdinalTable.size()) return -1;
    const int32_t last = static_cast<int32_t>(m_OrdinalTable.size()) - 1;

    // Every ordinal from the position to the last must have its row; a table with gaps is
    // reported before anything moves, never assumed away.
    for (int32_t k = position; k <= last; ++k) {
        if (!getOrdinalElementByOrdNum(k)) {
            lastError = LD_FAILED;
            return -1;
        }
    }
    // Move every row from the position on up by one ordinal, from the last one down.
    for (int32_t k = last; k >= position; --k) {
        LD_OrdinalTableElement* current = getOrdinalElementByOrdNum(k);
        if (k == last) {
            m_OrdinalTable.push_back(newRow(last + 1, 0));
            ticket->indexes.rows.invalidate();
        }
        LD_OrdinalTableElement* moved = newRow(k + 1, current->logicalDocument);
        if (current->content) moved->content = new LD_ContentTableElement(*current->content);
        moved->mark = current->mark ? new LD_MarkTableElement(*current->mark) : new LD_MarkTableElement;
        LD_OrdinalTableElement* replaced = getOrdinalElementByOrdNum(k + 1);
        setOrdinalElementByOrdNum(k + 1, moved);
        if (lastError == LD_OK) delete replaced;
        else delete moved;
    }

    LD_OrdinalTableElement* fresh = newRow(position, 0);
    fresh->content = new LD_ContentTableElement;
    LD_OrdinalTableElement* old = getOrdinalElementByOrdNum(position);
    fresh->logicalDocument = old ? old->logicalDocument : 0;
    setOrdinalElementByOrdNum(position, fresh);
    if (lastError == LD_OK) delete old;

    prepareParams(params);
    fillContent(fresh->content, run, params);
    return position;
}

LD_OrdinalTableElement* LD_JDF::searchOrdinalTableForRunIPPair(LD_Run* run, LD_OCG_InterpretingParams* params,
                                                               int32_t page) {
    for (LD_OrdinalTableElement* row : m_OrdinalTable) {
        if (!row || !row->content) continue;
        LD_ContentTableElement* content = row->content;
        if (page >= 0 && content->page != page) continue;
        if (!content->run || !run) {
            if (content->run != run) continue;
        } else if (!areRunsEqual(content->run, run)) {
            continue;
        }
        if (areInterpretingParamsEqual(content->interpretingParams, params)) return row;
    }
    return nullptr;
}

bool LD_JDF::areRunsEqual(LD_Run* a, LD_Run* b) {
    if (!a || !b) return a == b;
    if (a->pdf) {
        if (!b->pdf || !vorlan::os::equalsIgnoreCase(a->pdf->url, b->pdf->url)) return false;
    } else if (b->pdf) {
        return false;
    }
    fillPagesFromRange(a);
    fillPagesFromRange(b);
    if (a->pages.size() != b->pages.size()) return false;
    a->pages.sort();
    b->pages.sort();
    return a->pages == b->pages;
}

bool LD_JDF::areInterpretingParamsEqual(LD_OCG_InterpretingParams* a, LD_OCG_InterpretingParams* b) {
    if (!a || !b) return false;
    if (a->m_OCGOn.size() != b->m_OCGOn.size() || a->m_OCGOff.size() != b->m_OCGOff.size()) return false;
    return allNamesIn(a->m_OCGOn, b->m_OCGOn) && allNamesIn(a->m_OCGOff, b->m_OCGOff);
}

LD_OrdinalTableElement* LD_JDF::getOrdinalElementByOrdNum(int32_t ordinal) {
    size_t pos = ticket->indexes.rows.find(m_OrdinalTable, ordinal);
    return pos == vorlan::jdf::PositionIndex<LD_OrdinalTableElement*, vorlan::jdf::RowOrdinal>::npos
               ? nullptr
               : m_OrdinalTable[pos];
}

void LD_JDF::setOrdinalElementByOrdNum(int32_t ordinal, LD_OrdinalTableElement* row) {
    size_t pos = ticket->indexes.rows.find(m_OrdinalTable, ordinal);
    if (pos == vorlan::jdf::PositionIndex<LD_OrdinalTableElement*, vorlan::jdf::RowOrdinal>::npos) {
        lastError = LD_FAILED;
        return;
    }
    m_OrdinalTable[pos] = row;
    ticket->indexes.rows.invalidate();
    lastError = LD_OK;
}

LD_Run* LD_JDF::getRunByOrdNumber(int32_t ordinal) {
    LD_OrdinalTableElement* row = getOrdinalElementByOrdNum(ordinal);
    return row && row->content ? row->content->run : nullptr;
}

LD_Run* LD_JDF::getMarkRunByOrdNumber(int32_t ordinal) {
    LD_OrdinalTableElement* row = getOrdinalElementByOrdNum(ordinal);
    return row && row->mark ? row->mark->run : nullptr;
}

LD_OCG_InterpretingParams* LD_JDF::getInterpretingParamsByOrdNumber(int32_t ordinal) {
    LD_OrdinalTableElement* row = getOrdinalElementByOrdNum(ordinal);
    return row && row->content ? row->content->interpretingParams : nullptr;
}

LD_OCG_InterpretingParams* LD_JDF::getInterpretingParamsByRunNumber(int32_t runNumber) {
    size_t pos = ticket->indexes.params.find(m_InterpretingParams, runNumber);
    return pos == vorlan::jdf::PositionIndex<LD_OCG_InterpretingParams*, vorlan::jdf::ParamsRunNumber>::npos
               ? nullptr
               : m_InterpretingParams[pos];
}

int32_t LD_JDF::getOrdNumberFromContentObjectIndex(int32_t contentObjectIndex) {
    if (!jobHasTicket || ticket->layoutElement.isNull()) return contentObjectIndex;
    size_t pos = ticket->indexes.ordinalMap.find(contentObjectOrdinalMap, contentObjectIndex);
    return pos == vorlan::jdf::PositionIndex<LD_ContentObjectOrdinal, vorlan::jdf::MapContentObject>::npos
               ? -1
               : contentObjectOrdinalMap[pos].ord;
}

void LD_JDF::setOrdNumberFromContentObjectIndex(int32_t contentObjectIndex, int32_t ordinal) {
    if (!jobHasTicket) return;
    auto& index = ticket->indexes.ordinalMap;
    size_t pos = index.find(contentObjectOrdinalMap, contentObjectIndex);
    if (pos == vorlan::jdf::PositionIndex<LD_ContentObjectOrdinal, vorlan::jdf::MapContentObject>::npos) return;
    if (!index.repeated(contentObjectIndex)) {
        contentObjectOrdinalMap[pos].ord = ordinal;
        return;
    }
    for (size_t i = pos; i < contentObjectOrdinalMap.size(); ++i)
        if (contentObjectOrdinalMap[i].contentObjectIndex == contentObjectIndex) contentObjectOrdinalMap[i].ord = ordinal;
}

void LD_JDF::updateOrdInLayout(int32_t contentObjectIndex, int32_t ordinal) {
    size_t pos = ticket->indexes.contentObjects.find(contentObjects, contentObjectIndex);
    if (pos == vorlan::jdf::PositionIndex<LD_ContentObject*, vorlan::jdf::LayoutContentObject>::npos) {
        lastError = LD_FAILED;
        return;
    }
    contentObjects[pos]->Ord = ordinal;
    lastError = LD_OK;
}

LDError LD_JDF::copyRunlist(std::vector<LD_Run*>& source, std::vector<LD_Run*>& destination) {
    for (LD_Run* run : source) {
        if (!run) {
            lastError = LD_INVALID_INPUT;
            return LD_INVALID_INPUT;
        }
        destination.push_back(run);
    }
    return LD_OK;
}

int32_t LD_JDF::stringVecContains(std::vector<wchar_t*>& list, const wchar_t* text) {
    for (size_t i = 0; i < list.size(); ++i)
        if (vorlan::os::equalsIgnoreCase(list[i], text)) return static_cast<int32_t>(i);
    return -1;
}

void LD_JDF::copyOCGVec(std::vector<wchar_t*>& destination, std::vector<wchar_t*>& source) {
    for (const wchar_t* name : source) destination.push_back(LD_CopyText(name));
}
