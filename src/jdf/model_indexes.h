// The look-up indexes the ordinal table and the layout use (see position_index.h).
#pragma once

#include "jdf/position_index.h"
#include "vorlan/LD_Records.h"

namespace vorlan::jdf {

struct RowOrdinal {
    int64_t operator()(const LD_OrdinalTableElement* row) const { return row ? row->ordinal : kNoKey; }
};
struct ParamsRunNumber {
    int64_t operator()(const LD_OCG_InterpretingParams* p) const { return p ? p->runNumber : kNoKey; }
};
struct MapContentObject {
    int64_t operator()(const LD_ContentObjectOrdinal& e) const { return e.contentObjectIndex; }
};
struct LayoutContentObject {
    int64_t operator()(const LD_ContentObject* o) const { return o ? o->contentObjectIndex : kNoKey; }
};

struct ModelIndexes {
    PositionIndex<LD_OrdinalTableElement*, RowOrdinal> rows;                 // m_OrdinalTable by ordinal
    PositionIndex<LD_OCG_InterpretingParams*, ParamsRunNumber> params;      // m_InterpretingParams by run number
    PositionIndex<LD_ContentObjectOrdinal, MapContentObject> ordinalMap;    // ordinal map by object index
    PositionIndex<LD_ContentObject*, LayoutContentObject> contentObjects;  // layout objects by object index
};

}  // namespace vorlan::jdf
