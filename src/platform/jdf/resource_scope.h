// JDFResourceScope: the resources a process node can refer to by ID.
//
// A node's links name resources by rRef; the resources lie in the ResourcePool of the node or of
// one of its ancestor nodes (MIS and imposition tools keep them in the root's pool and link them
// from the nodes below). The nearest pool wins: a resource there hides one with the same ID
// farther up. Resources elsewhere in the document (a sibling node's pool) are not in scope.
#pragma once

#include <string>
#include <unordered_map>

#include "platform/jdf/jdf_node.h"

namespace JDF {

class JDFResourceScope {
public:
    // Indexes the pools of node and its ancestors once; a null node gives an empty scope.
    // A snapshot: valid while those pools are unchanged.
    explicit JDFResourceScope(const JDFNode& node);
    // The resource (a pool child) with that ID; null when no pool in scope holds one.
    JDFResource Find(const char* id) const;

private:
    std::unordered_map<std::string, pugi::xml_node> byId_;
    detail::DocumentPtr doc_;
};

}  // namespace JDF
