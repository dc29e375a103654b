// Compares two element trees: names, attributes (in order), text and comments.
#pragma once

#include <string>

#include <pugixml.hpp>

namespace jdflayer_test {

// Empty when equal, else the path of the first difference.
inline std::string diffTrees(pugi::xml_node a, pugi::xml_node b, const std::string& path = "") {
    std::string here = path + "/" + a.name();
    if (a.type() != b.type()) return here + ": node type";
    if (std::string(a.name()) != b.name()) return here + ": name " + b.name();
    if (std::string(a.value()) != b.value()) return here + ": value";
    pugi::xml_attribute x = a.first_attribute(), y = b.first_attribute();
    for (; x && y; x = x.next_attribute(), y = y.next_attribute())
        if (std::string(x.name()) != y.name() || std::string(x.value()) != y.value())
            return here + "/@" + x.name();
    if (x || y) return here + ": attribute count";
    // The writer adds an XML declaration where the input had none.
    auto skip = [](pugi::xml_node n) {
        while (n && n.type() == pugi::node_declaration) n = n.next_sibling();
        return n;
    };
    pugi::xml_node c = skip(a.first_child()), d = skip(b.first_child());
    for (; c && d; c = skip(c.next_sibling()), d = skip(d.next_sibling())) {
        std::string diff = diffTrees(c, d, here);
        if (!diff.empty()) return diff;
    }
    if (c || d) return here + ": child count";
    return {};
}

}  // namespace jdflayer_test
