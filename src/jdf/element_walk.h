// Walks of the document's own tree for the reader's whole-document look-ups.
//
// The JDF layer answers one question per walk, in wide text; a ticket with thousands of placed
// objects makes each walk costly, so the reader asks several questions in one walk over the
// pugixml nodes, with the same matching rules as the layer (local names, case kept).
#pragma once

#include <cstring>

#include <pugixml.hpp>

namespace vorlan::jdf {

// The name after the prefix ("Layout" of "jdf:Layout").
inline const char* localName(pugi::xml_node n) {
    const char* qualified = n.name();
    const char* colon = std::strchr(qualified, ':');
    return colon ? colon + 1 : qualified;
}

// Calls visit(element) for every element below top (top itself excluded), in document order,
// until visit returns false.
template <typename Visit>
void forEachElementBelow(pugi::xml_node top, Visit visit) {
    if (!top) return;
    pugi::xml_node n = top.first_child();
    while (n) {
        if (n.type() == pugi::node_element) {
            if (!visit(n)) return;
            if (n.first_child()) {
                n = n.first_child();
                continue;
            }
        }
        while (n != top && !n.next_sibling()) n = n.parent();
        if (n == top) return;
        n = n.next_sibling();
    }
}

}  // namespace vorlan::jdf
