// Page ranges: the host's page-range text ("All", "Odd", "Even" or a list such as "1-3,6")
// turned into the selection of layout surfaces or PDF pages that the later stages honour.
#include <climits>
#include <cstdint>

#include "jdf/page_selection.h"
#include "platform/jdf/jdf.h"
#include "vorlan/LD_JDF.h"

namespace {


// Sets the bits [first, first + count) of the selection that the page-range mode selects, the
// positions counted from 0 within that stretch. A list is parsed once by the caller.
void selectStretch(std::vector<bool>& selection, size_t first, size_t count, int mode,
                   const std::vector<int32_t>& listed) {
    switch (mode) {
        case PAGE_RANGE_ALL:
            for (size_t i = 0; i < count; ++i) selection[first + i] = true;
            break;
        case PAGE_RANGE_ODD:  // 1st, 3rd, … position
            for (size_t i = 0; i < count; i += 2) selection[first + i] = true;
            break;
        case PAGE_RANGE_EVEN:
            for (size_t i = 1; i < count; i += 2) selection[first + i] = true;
            break;
        default:
            for (int32_t value : listed)
                if (value >= 0 && static_cast<size_t>(value) < count) selection[first + static_cast<size_t>(value)] = true;
            break;
    }
}

}  // namespace

void LD_JDF::ConvertPageRangesToPages(std::vector<int32_t>& pages, int32_t limit) {
    // v: the number being read (an out-of-range number is remembered as overflowed and then left
    // out); a: start of an open range; separator: the last ',' or '-'.
    int64_t v = 0;
    bool overflowed = false;
    int64_t a = 1;
    char separator = ',';
    auto appendValue = [&](int64_t value, bool skip) {
        if (!skip) pages.push_back(static_cast<int32_t>(value - 1));
    };
    auto appendRange = [&](int64_t from, int64_t to) {  // from … to - 1, stopping at the limit
        int64_t end = to < static_cast<int64_t>(limit) ? to : static_cast<int64_t>(limit);
        for (int64_t p = from; p < end; ++p) pages.push_back(static_cast<int32_t>(p));
    };
    bool startOverflowed = false;
    for (const char* c = pageRange ? pageRange : ""; *c; ++c) {
        if (*c >= '0' && *c <= '9') {
            v = v * 10 + (*c - '0');
            if (v > INT32_MAX) {
                overflowed = true;
                v = INT32_MAX;  // keeps the arithmetic bounded; the number itself is left out
            }
        } else if (*c == ',') {
            if (separator == ',') appendValue(v, overflowed);
            else if (!overflowed && !startOverflowed) appendRange(a, v);
            separator = ',';
            a = v;
            startOverflowed = overflowed;
            v = 0;
            overflowed = false;
        } else if (*c == '-') {
            appendValue(v, overflowed);
            separator = '-';
            a = v;
            startOverflowed = overflowed;
            v = 0;
            overflowed = false;
        }
    }
    if (separator == '-') {
        if (!overflowed && !startOverflowed) appendRange(a, v);
    } else {
        appendValue(v, overflowed);
    }
}

void LD_JDF::applyPageRangeForLayout() {
    if (pageRangeMode == PAGE_RANGE_ALL) return;  // every surface keeps the selection the reader gave it
    std::vector<bool> selected(surfaces.size(), false);
    std::vector<int32_t> listed;
    if (pageRangeMode == PAGE_RANGE_LIST) ConvertPageRangesToPages(listed, static_cast<int32_t>(surfaces.size()));
    selectStretch(selected, 0, selected.size(), pageRangeMode, listed);
    for (size_t i = 0; i < surfaces.size(); ++i)
        if (surfaces[i]) surfaces[i]->isSelected = selected[i];
}

void LD_JDF::applyPageRangeForPDF() {
    // One stretch per version, positions counted from 0 within each; the list is parsed once
    // against the longest stretch.
    size_t longest = 0;
    for (XMLVersionData* version : versions)
        if (version && version->surfaces.size() > longest) longest = version->surfaces.size();
    std::vector<int32_t> listed;
    if (pageRangeMode == PAGE_RANGE_LIST)
        ConvertPageRangesToPages(listed, longest > INT32_MAX ? INT32_MAX : static_cast<int32_t>(longest));
    for (XMLVersionData* version : versions) {
        if (!version) continue;  // a missing record selects nothing
        size_t first = pageSelection.size();
        size_t count = version->surfaces.size();
        pageSelection.resize(first + count, false);
        selectStretch(pageSelection, first, count, pageRangeMode, listed);
    }
}

void LD_JDF::applyPageRangeForPDFWithoutVersions() {
    std::vector<bool> selected = selectPositions(*this, surfaceVersions.size());
    pageSelection.insert(pageSelection.end(), selected.begin(), selected.end());
}

std::vector<bool> selectPositions(LD_JDF& w, size_t count) {
    std::vector<bool> selected(count, false);
    std::vector<int32_t> listed;
    if (w.pageRangeMode == PAGE_RANGE_LIST)
        w.ConvertPageRangesToPages(listed, count > INT32_MAX ? INT32_MAX : static_cast<int32_t>(count));
    selectStretch(selected, 0, count, w.pageRangeMode, listed);
    return selected;
}

LDError LD_JDF::convertPagesVecToJDFRangeList(std::vector<int32_t>& pages, JDF::JDFIntegerRangeList& ranges) {
    size_t i = 0;
    while (i < pages.size()) {
        size_t end = i;  // last index of the stretch of consecutive ascending values
        while (end + 1 < pages.size() && pages[end] != INT32_MAX && pages[end + 1] == pages[end] + 1) ++end;
        if (end == i) ranges.Append(pages[i]);
        else ranges.Append(pages[i], pages[end]);
        i = end + 1;
    }
    return LD_OK;
}
