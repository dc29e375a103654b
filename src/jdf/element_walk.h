// Walks of the document's own tree for the reader's whole-document look-ups.
//
// The JDF layer answers one question per walk, in wide text; a ticket with thousands of placed
// objects makes each walk costly, so the reader asks several questions in one walk over the
// pugixml nodes, with the same matching rules as the layer (local names, case kept).
#pragma once

#include <cstring>

#include <pugixml.hpp>

#include "platform/jdf/node_walk.h"

namespace vorlan::jdf {

// The name after the prefix ("Layout" of "jdf:Layout").
inline const char* localName(pugi::xml_node n) {
    const char* qualified = n.name();
    const char* colon = std::strchr(qualified, ':');
    return colon ? colon + 1 : qualified;
}

using JDF::forEachElementBelow;

}  // namespace vorlan::jdf
