// The shared state behind every handle of one document: the pugixml tree and the ID counter.
// Handles hold it by shared_ptr, so a document lives as long as any handle into it (the parser
// that read it may be gone).
#pragma once

#include <memory>
#include <string>

#include <pugixml.hpp>

namespace JDF::detail {

struct DocumentState {
    pugi::xml_document doc;
    unsigned long nextId = 1;

    // A new ID: prefix followed by a six-digit counter, skipping IDs already in the document.
    std::string NewID(const char* prefix);
    // The element whose ID attribute equals id, or a null node.
    pugi::xml_node FindByID(const pugi::char_t* id) const;
};

using DocumentPtr = std::shared_ptr<DocumentState>;

}  // namespace JDF::detail
