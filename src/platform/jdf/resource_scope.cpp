// The index of the resource pools a node sees, nearest first.
#include "platform/jdf/resource_scope.h"

#include <cstring>

namespace JDF {
namespace {

bool hasLocalName(pugi::xml_node n, const char* wanted) {
    const char* name = n.name();
    const char* colon = std::strchr(name, ':');
    return std::strcmp(colon ? colon + 1 : name, wanted) == 0;
}

}  // namespace

JDFResourceScope::JDFResourceScope(const JDFNode& node) : doc_(node.document()) {
    for (pugi::xml_node n = node.node(); n; n = n.parent()) {
        if (n.type() != pugi::node_element || !hasLocalName(n, "JDF")) continue;
        for (pugi::xml_node pool = n.first_child(); pool; pool = pool.next_sibling()) {
            if (pool.type() != pugi::node_element || !hasLocalName(pool, "ResourcePool")) continue;
            for (pugi::xml_node r = pool.first_child(); r; r = r.next_sibling()) {
                pugi::xml_attribute id = r.attribute("ID");
                // emplace keeps the first entry: the nearer pool's.
                if (r.type() == pugi::node_element && id && *id.value()) byId_.emplace(id.value(), r);
            }
        }
    }
}

JDFResource JDFResourceScope::Find(const char* id) const {
    if (!id) return {};
    auto it = byId_.find(id);
    return it == byId_.end() ? JDFResource() : JDFResource(KElement(it->second, doc_));
}

}  // namespace JDF
