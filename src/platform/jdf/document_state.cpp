// IDs and ID look-up of one document.
#include "platform/jdf/document_state.h"

#include <cstdio>
#include <cstring>

namespace JDF::detail {

pugi::xml_node DocumentState::FindByID(const pugi::char_t* id) const {
    if (!id || !*id) return {};
    return doc.find_node([id](pugi::xml_node n) {
        if (n.type() != pugi::node_element) return false;
        pugi::xml_attribute a = n.attribute("ID");
        return a && std::strcmp(a.value(), id) == 0;
    });
}

std::string DocumentState::NewID(const char* prefix) {
    char buf[48];
    for (;;) {
        std::snprintf(buf, sizeof buf, "%s%06lu", prefix, nextId++);
        if (!FindByID(buf)) return buf;
    }
}

}  // namespace JDF::detail
