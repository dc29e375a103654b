// The shared state behind every handle of one document: the pugixml tree and the ID counter.
// Handles hold it by shared_ptr, so a document lives as long as any handle into it (the parser
// that read it may be gone).
#pragma once

#include <functional>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include <pugixml.hpp>

namespace JDF::detail {

struct DocumentState;

// Children of `parent` that are made only while the document is written, batch by batch (see
// KElement::DeferChildren). makeBatch appends the next batch to scratchParent, an element of its
// own scratch document, and returns false once it has appended the last.
struct DeferredChildren {
    pugi::xml_node parent;
    std::function<bool(pugi::xml_node scratchParent, const std::shared_ptr<DocumentState>& scratch)> makeBatch;
};

struct DocumentState {
    pugi::xml_document doc;
    unsigned long nextId = 1;
    // Placeholders in the tree, by the number their marker comment carries.
    std::vector<DeferredChildren> deferred;

    // A new ID: prefix followed by a six-digit counter, skipping IDs already in the document.
    std::string NewID(const char* prefix);
    // The first element (document order) whose ID attribute equals id, or a null node.
    pugi::xml_node FindByID(const pugi::char_t* id);
    // Every change that adds, removes or renames an ID, or removes elements, calls this; the
    // ID index is then rebuilt on the next look-up. (Edits made directly on the pugixml tree
    // must call it too.)
    void IDsChanged() { idsDirty_ = true; }
    // Records that element n now carries ID id (cheaper than IDsChanged).
    void IDSet(const pugi::char_t* id, pugi::xml_node n);

private:
    void rebuild();
    std::unordered_map<std::string, pugi::xml_node> ids_;
    bool idsDirty_ = true;
};

using DocumentPtr = std::shared_ptr<DocumentState>;

}  // namespace JDF::detail
