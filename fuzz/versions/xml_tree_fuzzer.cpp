// Fuzzes the XML document tree: the buffer fed in 512-byte pieces must succeed or fail exactly
// as one final piece does, and give the same tree.
#include <cstdint>
#include <cstdlib>
#include <string>
#include <vector>

#include "versions/xml_tree.h"

namespace {

// Element names and attributes in document order, walking firstChild / nextSibling without
// recursion (deeply nested input must not overflow the stack).
std::string describe(const _kvXmlNode* root) {
    std::string out;
    std::vector<const _kvXmlNode*> ancestors;
    const _kvXmlNode* node = root;
    while (node) {
        out += '<' + kvXmlBytes(node->name);
        for (const _kvXmlAttribute* a = node->firstAttribute; a; a = a->next)
            out += ' ' + kvXmlBytes(a->name) + '=' + kvXmlBytes(a->value);
        out += '>';
        if (node->firstChild) {
            ancestors.push_back(node);
            node = node->firstChild;
            continue;
        }
        out += '/';
        while (!node->nextSibling && !ancestors.empty()) {
            node = ancestors.back();
            ancestors.pop_back();
            out += '/';
        }
        node = node->nextSibling;
    }
    return out;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const char* bytes = reinterpret_cast<const char*>(data);
    KvXmlDocumentPtr pieces(kvXmlCreateDocument());
    KvXmlDocumentPtr whole(kvXmlCreateDocument());
    if (!pieces || !whole) return 0;
    bool piecesOk = kvXmlFeedBuffer(pieces.get(), bytes, size);
    bool wholeOk = size == 0 || kvXmlFeedPiece(whole.get(), bytes, size, true);
    if (piecesOk != wholeOk) std::abort();
    if (piecesOk && describe(kvXmlRoot(pieces.get())) != describe(kvXmlRoot(whole.get()))) std::abort();
    return 0;
}
