// Walks of a pugixml subtree in document order, without recursion: documents may nest deeper
// than the stack allows.
#pragma once

#include <pugixml.hpp>

namespace JDF {

// Calls visit(element) for every element below top (top itself excluded), in document order,
// until visit returns false. With childrenOnly, only top's own child elements are visited.
template <typename Visit>
void forEachElementBelow(pugi::xml_node top, Visit visit, bool childrenOnly = false) {
    if (!top) return;
    pugi::xml_node n = top.first_child();
    while (n) {
        if (n.type() == pugi::node_element) {
            if (!visit(n)) return;
            if (!childrenOnly && n.first_child()) {
                n = n.first_child();
                continue;
            }
        }
        while (n != top && !n.next_sibling()) n = n.parent();
        if (n == top) return;
        n = n.next_sibling();
    }
}

}  // namespace JDF
