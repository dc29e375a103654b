// The resource slots of the process types the layer knows: which resources a process takes as
// input or output, how many, and with which ProcessUsage. Used to pick link direction,
// ProcessUsage and the "already linked" check of JDFNode::AppendMatchingResource.
#pragma once

#include <vector>

#include "platform/jdf/wstring.h"

namespace JDF::detail {

struct LinkSlot {
    wchar_t direction;    // 'i' input, 'o' output
    wchar_t cardinality;  // '_' one, '?' optional, '*' any number, '+' one or more
    WString processUsage; // "" or e.g. "Marks", "Document"
    int typeIndex;        // position of the process type in the node's type list
};

// True when the layer has a slot table for this process type.
bool IsKnownProcessType(const WString& type);
// Slots of resource `name` across the given process types, filtered by process usage number
// (3 all, 1 inputs, 2 outputs, above 3 those whose ProcessUsage is that token).
std::vector<LinkSlot> MatchingSlots(const vWString& types, const WString& name, int processUsage);

}  // namespace JDF::detail
