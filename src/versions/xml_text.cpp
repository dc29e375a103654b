// Text records of the XML document tree: comparisons, look-ups and byte copies.
#include <cstdlib>
#include <cstring>

#include "versions/xml_tree.h"

const char kvXmlEmptyText[1] = {'\0'};

namespace {

unsigned char foldAscii(unsigned int unit) {
    return static_cast<unsigned char>(unit >= 'A' && unit <= 'Z' ? unit + ('a' - 'A') : unit);
}

}  // namespace

bool kvXmlTextEquals(const _kvXmlText* text, const char* name) {
    if (!text || !name) return false;
    size_t length = std::strlen(name);
    if (static_cast<size_t>(text->length) != length) return false;
    for (size_t i = 0; i < length; ++i) {
        auto unit = static_cast<unsigned int>(text->text[i]);
        if (foldAscii(unit) != foldAscii(static_cast<unsigned char>(name[i]))) return false;
    }
    return true;
}

_kvXmlAttribute* kvXmlFindAttribute(const _kvXmlNode* node, const char* name) {
    for (_kvXmlAttribute* attribute = kvXmlFirstAttribute(node); attribute; attribute = attribute->next)
        if (kvXmlTextEquals(attribute->name, name)) return attribute;
    return nullptr;
}

_kvXmlNode* kvXmlFindChild(const _kvXmlNode* node, const char* name) {
    for (_kvXmlNode* child = kvXmlFirstChild(node); child; child = child->nextSibling)
        if (kvXmlTextEquals(child->name, name)) return child;
    return nullptr;
}

std::string kvXmlBytes(const _kvXmlText* text) {
    std::string bytes;
    if (!text) return bytes;
    bytes.resize(static_cast<size_t>(text->length));
    for (int32_t i = 0; i < text->length; ++i) bytes[static_cast<size_t>(i)] = static_cast<char>(text->text[i]);
    return bytes;
}

// Each unit holds one byte of the UTF-8 text, so the copy gives those bytes back unchanged
// (encoding the units themselves as characters would encode the text twice).
const char* kvXmlUtf8Copy(const _kvXmlText* text) {
    if (!text || text->length <= 0) return kvXmlEmptyText;
    auto* copy = static_cast<char*>(std::malloc(static_cast<size_t>(text->length) + 1));
    if (!copy) return kvXmlEmptyText;
    for (int32_t i = 0; i < text->length; ++i) copy[i] = static_cast<char>(text->text[i]);
    copy[text->length] = '\0';
    return copy;
}

void kvXmlFreeUtf8Copy(const char* copy) {
    if (copy != kvXmlEmptyText) std::free(const_cast<char*>(copy));
}
