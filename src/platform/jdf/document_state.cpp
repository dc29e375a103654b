// IDs and ID look-up of one document.
#include "platform/jdf/document_state.h"

#include <cstdio>
#include <cstring>

namespace JDF::detail {

namespace {
bool carries(pugi::xml_node n, const pugi::char_t* id) { return std::strcmp(n.attribute("ID").value(), id) == 0; }
}  // namespace

void DocumentState::rebuild() {
    ids_.clear();
    doc.find_node([this](pugi::xml_node n) {
        if (n.type() == pugi::node_element)
            if (pugi::xml_attribute a = n.attribute("ID")) ids_.emplace(a.value(), n);
        return false;
    });
    idsDirty_ = false;
}

void DocumentState::IDSet(const pugi::char_t* id, pugi::xml_node n) {
    if (idsDirty_ || !id || !*id) return;
    auto [it, inserted] = ids_.emplace(id, n);
    if (!inserted && !carries(it->second, id)) it->second = n;
}

pugi::xml_node DocumentState::FindByID(const pugi::char_t* id) {
    if (!id || !*id) return {};
    if (idsDirty_) rebuild();
    auto it = ids_.find(id);
    if (it != ids_.end() && !carries(it->second, id)) {  // the element's ID was changed since
        rebuild();
        it = ids_.find(id);
    }
    return it == ids_.end() ? pugi::xml_node() : it->second;
}

std::string DocumentState::NewID(const char* prefix) {
    char buf[48];
    for (;;) {
        std::snprintf(buf, sizeof buf, "%s%06lu", prefix, nextId++);
        if (!FindByID(buf)) return buf;
    }
}

}  // namespace JDF::detail
