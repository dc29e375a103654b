// KElement: the value handle every element type of the JDF layer builds on.
//
// A KElement is a pugi::xml_node plus a shared reference to its document, so a handle keeps the
// document alive (the JDFParser or JDFDoc that made it may be gone). A default handle is null
// (isNull()); calls on a null handle read as empty / null and write nothing. Copies are cheap and
// refer to the same element. All text is WString (wide); the tree itself holds UTF-8.
//
// Name and namespace arguments of the look-ups:
//  - name "" or "*" matches any element; a name with a prefix ("KAV:Foo") is compared with the
//    element's qualified name, a name without one with its local name; case matters.
//  - namespace "" or "*" matches any namespace; otherwise the element's namespace URI (resolved
//    through the xmlns declarations of it and its ancestors) must equal it.
//  - an attribute filter (JDFAttributeMap) matches when all (bAnd / !bAnyAttr) or any of its
//    entries equal the element's attributes; an empty filter matches every element.
#pragma once

#include <functional>
#include <vector>

#include "platform/jdf/attribute_map.h"
#include "platform/jdf/document_state.h"
#include "platform/jdf/wstring.h"

namespace JDF {

class vElement;

class KElement {
public:
    KElement() = default;
    KElement(pugi::xml_node node, detail::DocumentPtr doc) : node_(node), doc_(std::move(doc)) {
        if (!node_ || node_.type() != pugi::node_element) node_ = pugi::xml_node();
    }

    bool isNull() const { return !node_; }
    pugi::xml_node node() const { return node_; }
    const detail::DocumentPtr& document() const { return doc_; }
    bool operator==(const KElement& o) const { return node_ == o.node_; }
    bool operator!=(const KElement& o) const { return node_ != o.node_; }

    // --- names -------------------------------------------------------------------------------
    // Qualified name as written ("JDF", "KAV:OrvelDeliveryOptions"); empty for a null handle.
    WString GetNodeName() const;
    WString GetLocalName() const;
    WString GetPrefix() const;
    // Namespace URI of the element (its prefix or the default namespace in scope).
    WString GetNamespaceURI() const;
    // URI bound to prefix ("" = default namespace) in scope at this element; empty when none.
    WString GetNamespaceURIFromPrefix(const WString& prefix) const;

    // --- attributes --------------------------------------------------------------------------
    // Value of an attribute; def when absent. A prefixed key is looked up as written; with a
    // namespace URI an unprefixed key also finds an attribute whose prefix is bound to that URI.
    WString GetAttribute(const WString& key, const WString& nameSpaceURI = L"", const WString& def = L"") const;
    bool HasAttribute(const WString& key, const WString& nameSpaceURI = L"") const;
    // Integer value read like the C library's strtol (leading blanks, sign, digits); def when
    // absent or not a number.
    int GetIntAttribute(const WString& key, const WString& nameSpaceURI = L"", int def = 0) const;
    // Number read like strtod; def when absent or not a number.
    double GetRealAttribute(const WString& key, const WString& nameSpaceURI = L"", double def = 0.0) const;
    // Sets (or replaces) an attribute. A prefixed key with a namespace URI gets its xmlns
    // declaration (on the document root) when the prefix is not bound yet.
    void SetAttribute(const WString& key, const WString& value, const WString& nameSpaceURI = L"");
    void SetAttribute(const WString& key, const wchar_t* value, const WString& nameSpaceURI = L"") {
        SetAttribute(key, WString(value), nameSpaceURI);
    }
    void SetAttribute(const WString& key, int value, const WString& nameSpaceURI = L"");
    void SetAttribute(const WString& key, unsigned int value, const WString& nameSpaceURI = L"");
    void SetAttribute(const WString& key, double value, const WString& nameSpaceURI = L"");
    void RemoveAttribute(const WString& key, const WString& nameSpaceURI = L"");
    // All attributes (qualified name → value).
    JDFAttributeMap GetAttributeMap() const;
    // Attribute names in document order.
    vWString GetAttributeNames() const;
    int NumAttributes() const;

    // --- children ----------------------------------------------------------------------------
    // The index-th (from 0) matching element below this one, in document order: direct children
    // only when bDirect, else all descendants. Null when there are fewer matches.
    KElement GetChildByTagName(const WString& name, const WString& nameSpaceURI = L"", int index = 0,
                               const JDFAttributeMap& mAttrib = JDFAttributeMap(), bool bDirect = true,
                               bool bAnyAttr = false) const;
    // All matching elements below this one (direct children only when bDirect), document order;
    // at most maxSize when maxSize > 0. Ref elements (MediaRef, ...) are returned as they are.
    vElement GetChildrenByTagName(const WString& name = L"", const WString& nameSpaceURI = L"",
                                  const JDFAttributeMap& mAttrib = JDFAttributeMap(), bool bDirect = true,
                                  bool bAnd = true, int maxSize = 0) const;
    // Direct child elements that match, document order. With bResolveTarget a ref element
    // (name ending in "Ref" with an rRef) is replaced by the resource it refers to when that
    // exists in the document; the name filter then applies to the resolved element.
    vElement GetChildElementVector(const WString& name = L"", const WString& nameSpaceURI = L"",
                                   const JDFAttributeMap& mAttrib = JDFAttributeMap(), bool bAnd = true,
                                   int maxSize = 0, bool bResolveTarget = true) const;
    // The iSkip-th direct child with that name (and namespace); null when absent.
    KElement GetElement(const WString& name, const WString& nameSpaceURI = L"", int iSkip = 0) const;
    // GetElement, or when fewer than iSkip+1 such children exist, one new child appended.
    KElement GetCreateElement(const WString& name, const WString& nameSpaceURI = L"", int iSkip = 0);
    // Appends a new child element. nameSpaceURI other than the one in scope for the name's
    // prefix is declared on the new element.
    KElement AppendElement(const WString& name, const WString& nameSpaceURI = L"");
    // Inserts a new child element before the given child (appends when before is null).
    KElement InsertElementBefore(const WString& name, const KElement& before, const WString& nameSpaceURI = L"");
    // Appends a deep copy of src (from any document); namespace prefixes that src used and that
    // are not bound here are declared on the copy.
    KElement CopyElement(const KElement& src, const KElement& before = KElement());
    int NumChildElements(const WString& name = L"", const WString& nameSpaceURI = L"") const;
    bool HasChildElement(const WString& name, const WString& nameSpaceURI = L"") const;
    KElement GetFirstChildElement() const;
    KElement GetNextSiblingElement() const;
    KElement GetParentNode() const;
    // The document's root element.
    KElement GetDocRoot() const;
    // Removes this element (and its subtree) from the tree; the handle becomes null.
    void DeleteNode();
    // Children made only when the document is written, so that the tree never holds them all:
    // `makeBatch` gets an empty element with this element's name and attributes (in a scratch
    // document with the namespace declarations in scope here), appends the next batch of children
    // to it and returns false once it has appended the last. Each batch is written where this
    // element's children go, after those it has now, and dropped. Until the document is written
    // the tree holds a marker comment instead; makeBatch (and what it refers to) must stay valid
    // until then. Whatever makeBatch throws makes the write fail.
    void DeferChildren(std::function<bool(KElement& scratchParent)> makeBatch);
    // Text content of the element (first text child).
    WString GetText() const;
    void SetText(const WString& text);

    // --- matching helpers (also used by derived handles) --------------------------------------
    bool MatchesName(const WString& name, const WString& nameSpaceURI) const;
    bool MatchesAttributes(const JDFAttributeMap& mAttrib, bool bAnd) const;

protected:
    KElement wrap(pugi::xml_node n) const { return KElement(n, doc_); }

    pugi::xml_node node_;
    detail::DocumentPtr doc_;
};

class vElement : public std::vector<KElement> {
public:
    using std::vector<KElement>::vector;
};

}  // namespace JDF
