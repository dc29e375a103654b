// A minimal read-only XML document tree built from expat's start- and end-element events.
//
// The tree keeps element names, attributes in document order and the parent / first-child /
// next-sibling structure; character data, comments and processing instructions are dropped.
// Every byte of the UTF-8 text that expat reports becomes one unit of a text record (no
// decoding), so ASCII names compare as usual and a non-ASCII character takes two to four units.
//
// A document is created, fed once, examined and released by one caller; nodes, attributes and
// text records belong to the document and die with it. Expat's own protections (entity
// amplification limits, no external entities) stay in force.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cwchar>
#include <memory>
#include <string>

struct _kvXmlDocument;

// Text of a name or value: length units, each holding one byte (0..255), zero-terminated.
struct _kvXmlText {
    int32_t length;
    wchar_t* text;
};

struct _kvXmlAttribute {
    _kvXmlText* name;
    _kvXmlText* value;
    _kvXmlAttribute* next;  // null for the last
};

// One element.
struct _kvXmlNode {
    _kvXmlDocument* document;
    _kvXmlText* name;  // as written, with any prefix
    _kvXmlNode* firstChild;
    _kvXmlNode* nextSibling;
    _kvXmlAttribute* firstAttribute;
    _kvXmlAttribute* lastAttribute;
};

// Size of the pieces a buffer or file is fed in.
constexpr size_t kvXmlPieceSize = 512;

// Creates an empty document with its parser; null when out of memory.
_kvXmlDocument* kvXmlCreateDocument();
// Frees the parser, the tree and the document. Null is ignored.
void kvXmlRelease(_kvXmlDocument* document);

// Parses one piece; isFinal tells expat that the document ends with it. False on a parse error
// (also for every call after one).
bool kvXmlFeedPiece(_kvXmlDocument* document, const char* bytes, size_t length, bool isFinal);
// Parses a whole buffer in pieces of 512 bytes; the shorter last piece is marked final. When the
// length is an exact multiple of 512 an empty final piece closes the document, so a truncated
// document is reported as an error. Length 0 parses nothing and gives true (no root).
bool kvXmlFeedBuffer(_kvXmlDocument* document, const char* bytes, size_t length);
// The same, reading the file at path 512 bytes at a time. False when the file cannot be opened
// or read, or on a parse error. An empty file parses nothing (no root).
bool kvXmlFeedFile(_kvXmlDocument* document, const char* path);

// Description of the first error (expat's message, or "out of memory"); "" without one.
const char* kvXmlErrorText(const _kvXmlDocument* document);

// The root element, or null when no element was started.
_kvXmlNode* kvXmlRoot(const _kvXmlDocument* document);

// Field reads; each accepts null and then gives null.
_kvXmlNode* kvXmlFirstChild(const _kvXmlNode* node);
_kvXmlNode* kvXmlNextSibling(const _kvXmlNode* node);
_kvXmlText* kvXmlName(const _kvXmlNode* node);
_kvXmlAttribute* kvXmlFirstAttribute(const _kvXmlNode* node);
_kvXmlText* kvXmlAttributeName(const _kvXmlAttribute* attribute);
_kvXmlText* kvXmlAttributeValue(const _kvXmlAttribute* attribute);
_kvXmlAttribute* kvXmlAttributeNext(const _kvXmlAttribute* attribute);

// ---- Text records -------------------------------------------------------------------------------

// True when the text equals name, ASCII letters compared ignoring case, other bytes exactly.
bool kvXmlTextEquals(const _kvXmlText* text, const char* name);
// The first attribute whose name equals name as kvXmlTextEquals compares; null when none.
_kvXmlAttribute* kvXmlFindAttribute(const _kvXmlNode* node, const char* name);
// The first child element named name (kvXmlTextEquals); null when none.
_kvXmlNode* kvXmlFindChild(const _kvXmlNode* node, const char* name);

// The original UTF-8 bytes of a text record; empty for null.
std::string kvXmlBytes(const _kvXmlText* text);
// The original UTF-8 bytes as a new zero-terminated malloc block, or the shared empty string
// kvXmlEmptyText when the text is empty or the copy cannot be allocated. Release with
// kvXmlFreeUtf8Copy, which leaves the shared empty string alone. The copy is read-only, so the
// shared empty string is a constant that jobs on other threads can never see changed.
const char* kvXmlUtf8Copy(const _kvXmlText* text);
void kvXmlFreeUtf8Copy(const char* copy);
extern const char kvXmlEmptyText[1];

// ---- Ownership for C++ callers ------------------------------------------------------------------

struct KvXmlDocumentDeleter {
    void operator()(_kvXmlDocument* document) const { kvXmlRelease(document); }
};
using KvXmlDocumentPtr = std::unique_ptr<_kvXmlDocument, KvXmlDocumentDeleter>;
