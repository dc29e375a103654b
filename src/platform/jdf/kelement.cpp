// KElement: names, namespaces, attributes and child access on a pugixml node.
#include "platform/jdf/kelement.h"

#include <cstdlib>
#include <cstring>
#include <set>
#include <string>

#include "platform/jdf/deferred_output.h"
#include "platform/jdf/exception.h"
#include "platform/jdf/node_walk.h"
#include "platform/os/text.h"

namespace JDF {
namespace {

std::string prefixOf(const char* qname) {
    const char* colon = std::strchr(qname, ':');
    return colon ? std::string(qname, colon) : std::string();
}

const char* localOf(const char* qname) {
    const char* colon = std::strchr(qname, ':');
    return colon ? colon + 1 : qname;
}

pugi::xml_node documentElement(pugi::xml_node n) {
    for (pugi::xml_node c = n.root().first_child(); c; c = c.next_sibling())
        if (c.type() == pugi::node_element) return c;
    return {};
}

bool isWildcard(const WString& s) { return s.empty() || s == L"*"; }

// URI bound to prefix in scope at n, and whether it is bound at all.
bool lookupNamespace(pugi::xml_node n, const std::string& prefix, std::string& uri) {
    std::string attr = prefix.empty() ? std::string("xmlns") : "xmlns:" + prefix;
    if (prefix == "xml") {
        uri = "http://www.w3.org/XML/1998/namespace";
        return true;
    }
    for (; n && n.type() == pugi::node_element; n = n.parent()) {
        if (pugi::xml_attribute a = n.attribute(attr.c_str())) {
            uri = a.value();
            return true;
        }
    }
    uri.clear();
    return false;
}

void collectPrefixes(pugi::xml_node top, std::set<std::string>& out) {
    auto collect = [&](pugi::xml_node n) {
        out.insert(prefixOf(n.name()));
        for (pugi::xml_attribute a = n.first_attribute(); a; a = a.next_attribute()) {
            std::string p = prefixOf(a.name());
            if (!p.empty() && p != "xmlns") out.insert(p);
        }
        return true;
    };
    if (top.type() == pugi::node_element) collect(top);
    forEachElementBelow(top, collect);
}

// Finds the attribute for key (and optional namespace) on n.
pugi::xml_attribute findAttribute(pugi::xml_node n, const WString& key, const WString& ns) {
    if (!n) return {};
    const vorlan::os::Utf8Text k(key);
    if (pugi::xml_attribute a = n.attribute(k.c_str())) {
        if (ns.empty() || std::strchr(k.c_str(), ':')) return a;
        // Unprefixed attribute asked for in a namespace: accept when that is the element's own.
        std::string uri;
        lookupNamespace(n, prefixOf(n.name()), uri);
        if (WString(uri) == ns) return a;
    }
    if (ns.empty() || std::strchr(k.c_str(), ':')) return {};
    for (pugi::xml_attribute a = n.first_attribute(); a; a = a.next_attribute()) {
        std::string p = prefixOf(a.name());
        if (p.empty() || p == "xmlns" || std::strcmp(k.c_str(), localOf(a.name())) != 0) continue;
        std::string uri;
        if (lookupNamespace(n, p, uri) && WString(uri) == ns) return a;
    }
    return {};
}

}  // namespace

WString KElement::GetNodeName() const { return node_ ? WString(node_.name()) : WString(); }
WString KElement::GetLocalName() const { return node_ ? WString(localOf(node_.name())) : WString(); }
WString KElement::GetPrefix() const { return node_ ? WString(prefixOf(node_.name())) : WString(); }

WString KElement::GetNamespaceURI() const {
    if (!node_) return {};
    std::string uri;
    lookupNamespace(node_, prefixOf(node_.name()), uri);
    return WString(uri);
}

WString KElement::GetNamespaceURIFromPrefix(const WString& prefix) const {
    std::string uri;
    lookupNamespace(node_, prefix.getUTF8(), uri);
    return WString(uri);
}

WString KElement::GetAttribute(const WString& key, const WString& ns, const WString& def) const {
    pugi::xml_attribute a = findAttribute(node_, key, ns);
    return a ? WString(a.value()) : def;
}

bool KElement::HasAttribute(const WString& key, const WString& ns) const {
    return static_cast<bool>(findAttribute(node_, key, ns));
}

int KElement::GetIntAttribute(const WString& key, const WString& ns, int def) const {
    pugi::xml_attribute a = findAttribute(node_, key, ns);
    if (!a) return def;
    char* end = nullptr;
    long v = std::strtol(a.value(), &end, 10);
    if (end == a.value()) return def;
    if (v > INT32_MAX) return INT32_MAX;
    if (v < INT32_MIN) return INT32_MIN;
    return static_cast<int>(v);
}

double KElement::GetRealAttribute(const WString& key, const WString& ns, double def) const {
    pugi::xml_attribute a = findAttribute(node_, key, ns);
    if (!a) return def;
    char* end = nullptr;
    double v = std::strtod(a.value(), &end);
    return end == a.value() ? def : v;
}

void KElement::SetAttribute(const WString& key, const WString& value, const WString& ns) {
    if (!node_) return;
    const vorlan::os::Utf8Text k(key);
    std::string p = prefixOf(k.c_str());
    if (!ns.empty() && !p.empty() && p != "xmlns") {
        std::string uri;
        std::string want = ns.getUTF8();
        if (!lookupNamespace(node_, p, uri)) {
            pugi::xml_node root = documentElement(node_);
            root.append_attribute(("xmlns:" + p).c_str()).set_value(want.c_str());
        } else if (uri != want) {
            std::string decl = "xmlns:" + p;
            pugi::xml_attribute d = node_.attribute(decl.c_str());
            if (!d) d = node_.append_attribute(decl.c_str());
            d.set_value(want.c_str());
        }
    }
    pugi::xml_attribute a = node_.attribute(k.c_str());
    if (!a) a = node_.append_attribute(k.c_str());
    a.set_value(vorlan::os::Utf8Text(value).c_str());
    if (doc_ && std::strcmp(k.c_str(), "ID") == 0) doc_->IDSet(a.value(), node_);
}

void KElement::SetAttribute(const WString& key, int value, const WString& ns) {
    SetAttribute(key, WString::valueOf(value), ns);
}
void KElement::SetAttribute(const WString& key, unsigned int value, const WString& ns) {
    SetAttribute(key, WString::valueOf(value), ns);
}
void KElement::SetAttribute(const WString& key, double value, const WString& ns) {
    SetAttribute(key, WString::valueOf(value), ns);
}

void KElement::RemoveAttribute(const WString& key, const WString& ns) {
    if (pugi::xml_attribute a = findAttribute(node_, key, ns)) {
        if (doc_ && std::strcmp(a.name(), "ID") == 0) doc_->IDsChanged();
        node_.remove_attribute(a);
    }
}

JDFAttributeMap KElement::GetAttributeMap() const {
    JDFAttributeMap m;
    for (pugi::xml_attribute a = node_.first_attribute(); a; a = a.next_attribute())
        m[WString(a.name())] = WString(a.value());
    return m;
}

vWString KElement::GetAttributeNames() const {
    vWString names;
    for (pugi::xml_attribute a = node_.first_attribute(); a; a = a.next_attribute()) names.push_back(WString(a.name()));
    return names;
}

int KElement::NumAttributes() const {
    int n = 0;
    for (pugi::xml_attribute a = node_.first_attribute(); a; a = a.next_attribute()) ++n;
    return n;
}

namespace {

// A name / namespace / attribute filter compiled once per look-up.
class Matcher {
public:
    Matcher(const WString& name, const WString& ns, const JDFAttributeMap& attrs, bool bAnd)
        : anyName_(isWildcard(name)), name_(name.getUTF8()), anyNs_(isWildcard(ns)), ns_(ns.getUTF8()), and_(bAnd) {
        prefixed_ = name_.find(':') != std::string::npos;
        for (const auto& [k, v] : attrs) attrs_.emplace_back(k.getUTF8(), v.getUTF8());
    }

    bool operator()(pugi::xml_node n) const {
        if (!anyName_ && name_ != (prefixed_ ? n.name() : localOf(n.name()))) return false;
        if (!anyNs_) {
            std::string uri;
            lookupNamespace(n, prefixOf(n.name()), uri);
            if (uri != ns_) return false;
        }
        if (attrs_.empty()) return true;
        for (const auto& [k, v] : attrs_) {
            pugi::xml_attribute a = n.attribute(k.c_str());
            bool ok = a && v == a.value();
            if (ok && !and_) return true;
            if (!ok && and_) return false;
        }
        return and_;
    }

private:
    bool anyName_, prefixed_ = false;
    std::string name_;
    bool anyNs_;
    std::string ns_;
    std::vector<std::pair<std::string, std::string>> attrs_;
    bool and_;
};

}  // namespace

bool KElement::MatchesName(const WString& name, const WString& ns) const {
    return node_ && Matcher(name, ns, JDFAttributeMap(), true)(node_);
}

bool KElement::MatchesAttributes(const JDFAttributeMap& mAttrib, bool bAnd) const {
    return node_ && Matcher(L"*", L"*", mAttrib, bAnd)(node_);
}

KElement KElement::GetChildByTagName(const WString& name, const WString& ns, int index,
                                     const JDFAttributeMap& mAttrib, bool bDirect, bool bAnyAttr) const {
    if (!node_ || index < 0) return {};
    int seen = 0;
    Matcher match(name, ns, mAttrib, !bAnyAttr);
    pugi::xml_node found;
    forEachElementBelow(
        node_,
        [&](pugi::xml_node n) {
            if (match(n) && seen++ == index) found = n;
            return !found;
        },
        bDirect);
    return found ? wrap(found) : KElement();
}

vElement KElement::GetChildrenByTagName(const WString& name, const WString& ns, const JDFAttributeMap& mAttrib,
                                        bool bDirect, bool bAnd, int maxSize) const {
    vElement out;
    if (!node_) return out;
    Matcher match(name, ns, mAttrib, bAnd);
    forEachElementBelow(
        node_,
        [&](pugi::xml_node n) {
            if (match(n)) out.push_back(wrap(n));
            return maxSize <= 0 || static_cast<int>(out.size()) < maxSize;
        },
        bDirect);
    return out;
}

vElement KElement::GetChildElementVector(const WString& name, const WString& ns, const JDFAttributeMap& mAttrib,
                                         bool bAnd, int maxSize, bool bResolveTarget) const {
    vElement out;
    Matcher match(name, ns, mAttrib, bAnd);
    for (pugi::xml_node n = node_.first_child(); n; n = n.next_sibling()) {
        if (n.type() != pugi::node_element) continue;
        KElement e = wrap(n);
        if (bResolveTarget && doc_) {
            std::string nm = localOf(n.name());
            pugi::xml_attribute ref = n.attribute("rRef");
            if (ref && nm.size() > 3 && nm.compare(nm.size() - 3, 3, "Ref") == 0) {
                pugi::xml_node target = doc_->FindByID(ref.value());
                if (target) e = wrap(target);
            }
        }
        if (!match(e.node_)) continue;
        out.push_back(e);
        if (maxSize > 0 && static_cast<int>(out.size()) >= maxSize) break;
    }
    return out;
}

KElement KElement::GetElement(const WString& name, const WString& ns, int iSkip) const {
    return GetChildByTagName(name, ns, iSkip, JDFAttributeMap(), true, false);
}

KElement KElement::GetCreateElement(const WString& name, const WString& ns, int iSkip) {
    KElement e = GetElement(name, ns, iSkip);
    return e.isNull() ? AppendElement(name, ns) : e;
}

KElement KElement::AppendElement(const WString& name, const WString& ns) {
    return InsertElementBefore(name, KElement(), ns);
}

KElement KElement::InsertElementBefore(const WString& name, const KElement& before, const WString& ns) {
    if (!node_ || name.empty()) return {};
    std::string qn = name.getUTF8();
    pugi::xml_node n = before.isNull() || before.node_.parent() != node_
                           ? node_.append_child(qn.c_str())
                           : node_.insert_child_before(qn.c_str(), before.node_);
    if (!n) return {};
    if (!ns.empty()) {
        std::string p = prefixOf(qn.c_str());
        std::string want = ns.getUTF8(), uri;
        if (!lookupNamespace(n, p, uri) || uri != want)
            n.append_attribute(p.empty() ? "xmlns" : ("xmlns:" + p).c_str()).set_value(want.c_str());
    }
    return wrap(n);
}

KElement KElement::CopyElement(const KElement& src, const KElement& before) {
    if (!node_ || src.isNull()) return {};
    pugi::xml_node n = before.isNull() || before.node_.parent() != node_
                           ? node_.append_copy(src.node_)
                           : node_.insert_copy_before(src.node_, before.node_);
    if (!n) return {};
    if (doc_) doc_->IDsChanged();
    std::set<std::string> prefixes;
    collectPrefixes(n, prefixes);
    for (const std::string& p : prefixes) {
        std::string srcUri, haveUri;
        bool srcBound = lookupNamespace(src.node_, p, srcUri);
        bool haveBound = lookupNamespace(n, p, haveUri);
        if (srcBound && (!haveBound || haveUri != srcUri)) {
            std::string decl = p.empty() ? std::string("xmlns") : "xmlns:" + p;
            pugi::xml_attribute d = n.attribute(decl.c_str());
            if (!d) d = n.append_attribute(decl.c_str());
            d.set_value(srcUri.c_str());
        }
    }
    return wrap(n);
}

int KElement::NumChildElements(const WString& name, const WString& ns) const {
    return static_cast<int>(GetChildrenByTagName(name, ns).size());
}

bool KElement::HasChildElement(const WString& name, const WString& ns) const {
    return !GetElement(name, ns).isNull();
}

KElement KElement::GetFirstChildElement() const {
    for (pugi::xml_node n = node_.first_child(); n; n = n.next_sibling())
        if (n.type() == pugi::node_element) return wrap(n);
    return {};
}

KElement KElement::GetNextSiblingElement() const {
    if (!node_) return {};
    for (pugi::xml_node n = node_.next_sibling(); n; n = n.next_sibling())
        if (n.type() == pugi::node_element) return wrap(n);
    return {};
}

KElement KElement::GetParentNode() const { return node_ ? wrap(node_.parent()) : KElement(); }

KElement KElement::GetDocRoot() const { return node_ ? wrap(documentElement(node_)) : KElement(); }

void KElement::DeleteNode() {
    if (!node_) return;
    pugi::xml_node parent = node_.parent();
    if (doc_) doc_->IDsChanged();
    if (parent) parent.remove_child(node_);
    node_ = pugi::xml_node();
}

void KElement::DeferChildren(std::function<bool(KElement& scratchParent)> makeBatch) {
    if (!node_ || !doc_ || !makeBatch) throw JDFException("DeferChildren: null element or maker");
    const size_t index = doc_->deferred.size();
    if (!node_.append_child(pugi::node_comment).set_value(detail::deferredMarkerText(index).c_str()))
        throw JDFException("DeferChildren: out of memory");
    doc_->deferred.push_back({node_, [make = std::move(makeBatch)](pugi::xml_node parent, const detail::DocumentPtr& scratch) {
                                  KElement element(parent, scratch);
                                  return make(element);
                              }});
}

WString KElement::GetText() const { return node_ ? WString(node_.text().get()) : WString(); }

void KElement::SetText(const WString& text) {
    if (node_) node_.text().set(text.getUTF8().c_str());
}

}  // namespace JDF
