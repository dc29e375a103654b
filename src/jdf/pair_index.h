// Finding an ordinal row by content run, switches and page without walking the whole table.
//
// searchOrdinalTableForRunIPPair answers "the first row, in table order, whose content has an
// equal run and equal parameters (and the given page)". Version expansion asks that once per
// content object of every version, so a linear search makes large jobs quadratic. This index
// groups the content rows by what any equal pair must share (the PDF's URL ignoring case, the
// content page and the numbers of names switched on and off) and then checks the few rows of
// that group with the worker's own equality tests, in table order, so the answer is the same.
#pragma once

#include <string>
#include <unordered_map>
#include <vector>

#include "vorlan/LD_JDF.h"

namespace vorlan::jdf {

class PairIndex {
public:
    // Indexes the content rows the table holds now.
    explicit PairIndex(LD_JDF& worker);
    // The row searchOrdinalTableForRunIPPair(run, params, page) would return.
    LD_OrdinalTableElement* find(LD_Run* run, LD_OCG_InterpretingParams* params, int32_t page);
    // A row whose content was just filled; rows are added in table order.
    void add(LD_OrdinalTableElement* row);

private:
    static std::wstring key(const LD_PDF* pdf, int32_t page, size_t on, size_t off);

    LD_JDF& worker_;
    std::unordered_map<std::wstring, std::vector<LD_OrdinalTableElement*>> groups_;
};

}  // namespace vorlan::jdf
