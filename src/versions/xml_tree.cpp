// Building the XML document tree from expat's element events, and reading it.
#include "versions/xml_tree.h"

#include "versions/xml_document.h"

#include <expat.h>

#include <cstring>
#include <limits>
#include <new>

namespace {

using vorlan::xmltree::Level;

// A text record holding one unit per byte of the UTF-8 text. Null when it cannot be represented.
_kvXmlText* makeText(_kvXmlDocument* document, const XML_Char* bytes) {
    size_t length = std::strlen(bytes);
    if (length >= static_cast<size_t>(std::numeric_limits<int32_t>::max())) return nullptr;
    auto* text = document->arena.make<_kvXmlText>();
    text->length = static_cast<int32_t>(length);
    text->text = static_cast<wchar_t*>(document->arena.allocate((length + 1) * sizeof(wchar_t)));
    for (size_t i = 0; i < length; ++i) text->text[i] = static_cast<unsigned char>(bytes[i]);
    text->text[length] = L'\0';
    return text;
}

void fail(_kvXmlDocument* document, bool outOfMemory) {
    document->failed = true;
    document->outOfMemory = outOfMemory;
    XML_StopParser(document->parser, XML_FALSE);
}

void startElement(_kvXmlDocument* document, const XML_Char* name, const XML_Char** attributes) {
    const int32_t d = document->depth;
    auto* node = document->arena.make<_kvXmlNode>();
    node->document = document;
    node->name = makeText(document, name);
    if (!node->name) return fail(document, false);

    if (static_cast<size_t>(d) >= document->levels.size()) document->levels.emplace_back();
    // The first child of the element started just before begins a new sibling chain at its
    // depth; later children at that depth append to it. This keeps the chains of cousins apart.
    if (document->depth - document->lastStartedDepth == 1) document->levels[d] = Level{};
    document->lastStartedDepth = d;
    document->depth = d + 1;

    if (d > 0) {
        _kvXmlNode* parent = document->levels[d - 1].last;
        if (parent && !parent->firstChild) parent->firstChild = node;
    }
    Level& level = document->levels[d];
    if (!level.first) level.first = node;
    if (level.last) level.last->nextSibling = node;
    level.last = node;

    for (const XML_Char** pair = attributes; pair && pair[0]; pair += 2) {
        auto* attribute = document->arena.make<_kvXmlAttribute>();
        attribute->name = makeText(document, pair[0]);
        attribute->value = makeText(document, pair[1]);
        if (!attribute->name || !attribute->value) return fail(document, false);
        if (node->lastAttribute)
            node->lastAttribute->next = attribute;
        else
            node->firstAttribute = attribute;
        node->lastAttribute = attribute;
    }
}

void XMLCALL onStartElement(void* userData, const XML_Char* name, const XML_Char** attributes) {
    auto* document = static_cast<_kvXmlDocument*>(userData);
    if (document->failed) return;
    try {
        startElement(document, name, attributes);
    } catch (const std::bad_alloc&) {
        fail(document, true);  // exceptions must not unwind through expat's C frames
    }
}

void XMLCALL onEndElement(void* userData, const XML_Char*) {
    auto* document = static_cast<_kvXmlDocument*>(userData);
    if (document->depth > 0) --document->depth;
}

}  // namespace

_kvXmlDocument* kvXmlCreateDocument() {
    auto* document = new (std::nothrow) _kvXmlDocument;
    if (!document) return nullptr;
    document->parser = XML_ParserCreate(nullptr);
    if (!document->parser) {
        delete document;
        return nullptr;
    }
    XML_SetUserData(document->parser, document);
    XML_SetElementHandler(document->parser, onStartElement, onEndElement);
    return document;
}

void kvXmlRelease(_kvXmlDocument* document) {
    if (!document) return;
    XML_ParserFree(document->parser);
    delete document;
}

const char* kvXmlErrorText(const _kvXmlDocument* document) {
    if (!document || !document->failed) return "";
    if (document->outOfMemory) return "out of memory";
    XML_Error code = XML_GetErrorCode(document->parser);
    const XML_LChar* text = XML_ErrorString(code);
    return text ? text : "parse error";
}

_kvXmlNode* kvXmlRoot(const _kvXmlDocument* document) {
    if (!document || document->levels.empty()) return nullptr;
    return document->levels[0].first;
}

_kvXmlNode* kvXmlFirstChild(const _kvXmlNode* node) { return node ? node->firstChild : nullptr; }
_kvXmlNode* kvXmlNextSibling(const _kvXmlNode* node) { return node ? node->nextSibling : nullptr; }
_kvXmlText* kvXmlName(const _kvXmlNode* node) { return node ? node->name : nullptr; }
_kvXmlAttribute* kvXmlFirstAttribute(const _kvXmlNode* node) { return node ? node->firstAttribute : nullptr; }
_kvXmlText* kvXmlAttributeName(const _kvXmlAttribute* attribute) { return attribute ? attribute->name : nullptr; }
_kvXmlText* kvXmlAttributeValue(const _kvXmlAttribute* attribute) { return attribute ? attribute->value : nullptr; }
_kvXmlAttribute* kvXmlAttributeNext(const _kvXmlAttribute* attribute) { return attribute ? attribute->next : nullptr; }
