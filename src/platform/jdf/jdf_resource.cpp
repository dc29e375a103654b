// Resources: inherited attributes, status, partitions, links and pools.
#include "platform/jdf/jdf_resource.h"

#include <cstring>
#include <string>
#include <vector>

#include "platform/jdf/enum_tables.h"
#include "platform/jdf/resource_scope.h"
#include "platform/os/text.h"

namespace JDF {

WString ResourceClassOf(const WString& name) {
    static const wchar_t* const parameters[] = {
        L"Layout", L"RunList", L"FileSpec", L"ColorantControl", L"ColorantAlias", L"ColorPool",
        L"BinderySignature", L"Assembly", L"StrippingParams", L"ImageSetterParams", L"Preview",
        L"TransferCurvePool", L"DeviceNSpace", L"NodeInfo", L"CustomerInfo", L"ContactInfo", L"Contact",
        L"Address", L"Person", L"Company", L"LayoutElement", L"PageList", L"Sheet", L"Surface",
        L"Signature", L"CutBlock", L"ByteMap", L"ObjectResolution", L"Shape", L"DieLayout"};
    static const wchar_t* const consumables[] = {L"Media", L"Ink", L"Paper", L"Plate", L"Glue", L"Thread"};
    static const wchar_t* const quantities[] = {L"Component"};
    static const wchar_t* const handlings[] = {L"ExposedMedia", L"Pallet", L"Bundle", L"Strap"};
    static const wchar_t* const implementations[] = {L"Device", L"Employee", L"Tool", L"MiscConsumable"};
    for (const wchar_t* n : parameters) if (name == n) return L"Parameter";
    for (const wchar_t* n : consumables) if (name == n) return L"Consumable";
    for (const wchar_t* n : quantities) if (name == n) return L"Quantity";
    for (const wchar_t* n : handlings) if (name == n) return L"Handling";
    for (const wchar_t* n : implementations) if (name == n) return L"Implementation";
    if (name.size() > 6 && name.compare(name.size() - 6, 6, L"Params") == 0) return L"Parameter";
    if (name.size() > 6 && name.compare(name.size() - 6, 6, L"Intent") == 0) return L"Intent";
    return {};
}

// --- JDFResource ----------------------------------------------------------------------------

WString JDFResource::GetAttribute(const WString& key, const WString& ns, const WString& def) const {
    WString name = GetNodeName();
    for (KElement e = *this; !e.isNull(); e = e.GetParentNode()) {
        if (e.HasAttribute(key, ns)) return e.KElement::GetAttribute(key, ns);
        if (e.GetParentNode().GetNodeName() != name) break;
    }
    return def;
}

bool JDFResource::HasAttribute(const WString& key, const WString& ns, bool bInherit) const {
    if (!bInherit) return KElement::HasAttribute(key, ns);
    WString sentinel(L"\x1");
    return GetAttribute(key, ns, sentinel) != sentinel;
}

int JDFResource::GetStatus(bool) const {
    return Tables::Number(Tables::ResourceStatus, GetAttribute(L"Status"));
}

void JDFResource::SetStatus(int status, bool) { SetEnumAttribute(L"Status", status, Tables::ResourceStatus); }

int JDFResource::GetPartUsage() const {
    return Tables::Number(Tables::PartUsage, GetResourceRoot().KElement::GetAttribute(L"PartUsage"));
}

void JDFResource::SetPartUsage(int partUsage) {
    GetResourceRoot().SetEnumAttribute(L"PartUsage", partUsage, Tables::PartUsage);
}

int JDFResource::GetSide() const { return Tables::Number(Tables::Side, GetAttribute(L"Side")); }

void JDFResource::SetSide(int side) { SetEnumAttribute(L"Side", side, Tables::Side); }

namespace {

// The outermost element of the same name above n, n included: the root of n's partitions.
pugi::xml_node partitionRoot(pugi::xml_node n) {
    while (n && n.parent().type() == pugi::node_element && std::strcmp(n.parent().name(), n.name()) == 0)
        n = n.parent();
    return n;
}

// Whether a whitespace-separated list holds key.
bool listsToken(const char* list, const WString& key) {
    const std::string wanted = key.getUTF8();
    bool found = false;
    vorlan::os::forEachListItem<char>(list, " \t\r\n", [&](std::string_view item) {
        found = item == wanted;
        return !found;
    });
    return found;
}

}  // namespace

JDFResource JDFResource::GetResourceRoot() const {
    if (isNull()) return {};
    return wrap(partitionRoot(node_));
}

bool JDFResource::IsResourceRoot() const { return !isNull() && GetResourceRoot() == *this; }

vWString JDFResource::GetPartIDKeys() const {
    return vWString(GetResourceRoot().KElement::GetAttribute(L"PartIDKeys"));
}

void JDFResource::setPartIDKeys(const vWString& keys) {
    JDFResource root = GetResourceRoot();
    if (keys.empty()) root.RemoveAttribute(L"PartIDKeys");
    else root.KElement::SetAttribute(L"PartIDKeys", keys.GetString());
}

void JDFResource::AddPartIDKey(int partIDKey) {
    // Every partition added asks for its key, which the root lists from the first one on.
    if (!isNull() && listsToken(partitionRoot(node_).attribute("PartIDKeys").value(), Tables::Token(Tables::PartIDKey, partIDKey)))
        return;
    vWString keys = GetPartIDKeys();
    keys.AppendUnique(Tables::Token(Tables::PartIDKey, partIDKey));
    setPartIDKeys(keys);
}

JDFAttributeMap JDFResource::GetPartMap() const {
    JDFAttributeMap map;
    vWString keys = GetPartIDKeys();
    WString name = GetNodeName();
    for (KElement e = *this; !e.isNull(); e = e.GetParentNode()) {
        if (e.GetNodeName() != name) break;
        for (const WString& k : keys)
            if (e.KElement::HasAttribute(k) && !map.count(k)) map[k] = e.KElement::GetAttribute(k);
    }
    return map;
}

JDFResource JDFResource::GetCreatePartition(int partIDKey, const WString& value, const vWString& partIDKeys) {
    if (isNull()) return {};
    if (!partIDKeys.empty()) setPartIDKeys(partIDKeys);
    WString key = Tables::Token(Tables::PartIDKey, partIDKey);
    for (const KElement& child : GetChildrenByTagName(GetNodeName())) {
        if (child.KElement::GetAttribute(key, L"", L"\x1") == value) return child;
    }
    AddPartIDKey(partIDKey);
    JDFResource part = AppendElement(GetNodeName());
    part.KElement::SetAttribute(key, value);
    return part;
}

JDFResource JDFResource::AddPartition(int partIDKey, const WString& value) {
    if (isNull()) return {};
    WString key = Tables::Token(Tables::PartIDKey, partIDKey);
    AddPartIDKey(partIDKey);
    JDFResource part = AppendElement(GetNodeName());
    part.KElement::SetAttribute(key, value);
    return part;
}

JDFResource JDFResource::GetPartition(const JDFAttributeMap& partMap) const {
    if (isNull()) return {};
    if (partMap.empty()) return *this;
    // Depth-first over the partitions below, carrying the inherited value of each wanted key.
    std::vector<std::string> keys, wanted;
    for (const auto& [k, v] : partMap) {
        keys.push_back(k.getUTF8());
        wanted.push_back(v.getUTF8());
    }
    struct Item {
        pugi::xml_node node;
        std::vector<std::string> values;
    };
    auto valuesOf = [&](pugi::xml_node n, std::vector<std::string> values) {
        for (size_t i = 0; i < keys.size(); ++i)
            if (pugi::xml_attribute a = n.attribute(keys[i].c_str())) values[i] = a.value();
        return values;
    };
    const char* name = node_.name();
    std::vector<Item> stack;
    std::vector<std::string> own = valuesOf(node_, std::vector<std::string>(keys.size(), std::string(1, '\x1')));
    for (pugi::xml_node c = node_.last_child(); c; c = c.previous_sibling())
        if (c.type() == pugi::node_element && std::strcmp(c.name(), name) == 0) stack.push_back({c, own});
    while (!stack.empty()) {
        Item item = std::move(stack.back());
        stack.pop_back();
        item.values = valuesOf(item.node, std::move(item.values));
        if (item.values == wanted) return KElement(item.node, doc_);
        for (pugi::xml_node c = item.node.last_child(); c; c = c.previous_sibling())
            if (c.type() == pugi::node_element && std::strcmp(c.name(), name) == 0) stack.push_back({c, item.values});
    }
    return {};
}

vElement JDFResource::GetLinks(const WString& linkName) const {
    vElement out;
    JDFResource root = GetResourceRoot();
    WString id = root.GetID();
    if (id.empty()) return out;
    bool any = linkName.empty() || linkName == L"*";
    WString wanted = any ? WString(GetNodeName() + L"Link") : linkName;
    for (const KElement& pool : GetDocRoot().GetChildrenByTagName(L"ResourceLinkPool", L"", JDFAttributeMap(), false)) {
        for (const KElement& link : pool.GetChildrenByTagName()) {
            if (link.KElement::GetAttribute(L"rRef") != id) continue;
            if (!any && link.GetNodeName() != wanted) continue;
            out.push_back(link);
        }
    }
    // Ref elements inside other resources also refer to it.
    if (any) {
        WString refName = GetNodeName() + L"Ref";
        for (const KElement& ref : GetDocRoot().GetChildrenByTagName(refName, L"", JDFAttributeMap(L"rRef", id), false))
            out.push_back(ref);
    }
    return out;
}

// --- JDFPart / JDFResourceLink ----------------------------------------------------------------

void JDFPart::SetSide(int side) { SetEnumAttribute(L"Side", side, Tables::Side); }

void JDFPart::SetPartMap(const JDFAttributeMap& m) {
    for (const auto& [k, v] : m) SetAttribute(k, v);
}

int JDFResourceLink::GetUsage() const { return Tables::Number(Tables::LinkUsage, GetAttribute(L"Usage")); }

WString JDFResourceLink::GetLinkedResourceName() const {
    WString n = GetLocalName();
    if (n.size() > 4 && n.compare(n.size() - 4, 4, L"Link") == 0) n.resize(n.size() - 4);
    return n;
}

namespace {

// The partition of root that the link's single Part child names; root itself otherwise.
JDFResource selectedPart(const JDFResourceLink& link, const JDFResource& root) {
    if (root.isNull()) return root;
    vElement parts = link.GetChildrenByTagName(L"Part");
    if (parts.size() != 1) return root;
    return root.GetPartition(parts[0].GetAttributeMap());
}

}  // namespace

JDFResource JDFResourceLink::GetTarget() const {
    if (isNull() || !doc_) return {};
    return selectedPart(*this, KElement(doc_->FindByID(node_.attribute("rRef").value()), doc_));
}

JDFResource JDFResourceLink::GetTarget(const JDFResourceScope& scope) const {
    if (isNull()) return {};
    return selectedPart(*this, scope.Find(node_.attribute("rRef").value()));
}

// --- pools ------------------------------------------------------------------------------------

vElement JDFResourcePool::GetPoolChildren(const WString& name, const JDFAttributeMap& mAttrib,
                                          const WString& ns) const {
    return GetChildrenByTagName(name, ns, mAttrib, true);
}

JDFResource JDFResourcePool::GetResource(const WString& name, int index, const WString& ns) const {
    return GetElement(name, ns, index);
}

JDFResource JDFResourcePool::AppendResource(const WString& name, const WString& resourceClass, const WString& ns) {
    if (isNull() || !doc_) return {};
    JDFResource r = AppendElement(name, ns);
    r.KElement::SetAttribute(L"ID", WString(doc_->NewID("r")));
    r.KElement::SetAttribute(L"Status", L"Unavailable");
    WString cls = resourceClass.empty() ? ResourceClassOf(name) : resourceClass;
    if (!cls.empty()) r.KElement::SetAttribute(L"Class", cls);
    // The schema requires ComponentType; what a print process makes is sheets.
    if (name == L"Component") r.KElement::SetAttribute(L"ComponentType", L"Sheet");
    return r;
}

JDFResource JDFResourcePool::CopyResource(const JDFResource& src) {
    if (isNull() || src.isNull() || !doc_) return {};
    WString id = src.GetID();
    bool clash = !id.empty() && doc_->FindByID(id.getUTF8().c_str());
    JDFResource r = CopyElement(src);
    if (clash) r.KElement::SetAttribute(L"ID", WString(doc_->NewID("r")));
    return r;
}

vElement JDFResourceLinkPool::GetPoolChildren(const WString& name, const JDFAttributeMap& mAttrib,
                                              const WString& ns) const {
    if (name.empty() || name == L"*") return GetChildrenByTagName(L"*", ns, mAttrib, true);
    // Resource names select their links.
    WString linkName = name.size() > 4 && name.compare(name.size() - 4, 4, L"Link") == 0 ? name : WString(name + L"Link");
    return GetChildrenByTagName(linkName, ns, mAttrib, true);
}

JDFResourceLink JDFResourceLinkPool::AppendResource(const JDFResource& r, bool bInput) {
    if (isNull() || r.isNull()) return {};
    JDFResource root = r.GetResourceRoot();
    WString id = root.GetID();
    if (id.empty()) return {};
    WString usage = bInput ? L"Input" : L"Output";
    JDFAttributeMap part = r.IsResourceRoot() ? JDFAttributeMap() : r.GetPartMap();
    for (const KElement& e : GetChildrenByTagName(root.GetNodeName() + L"Link")) {
        JDFResourceLink link(e);
        if (link.GetrRef() != id || link.GetAttribute(L"Usage") != usage) continue;
        vElement parts = link.GetChildrenByTagName(L"Part");
        if ((part.empty() && parts.empty()) || (parts.size() == 1 && parts[0].GetAttributeMap() == part))
            return {};
    }
    JDFResourceLink link = AppendElement(root.GetNodeName() + L"Link");
    link.SetAttribute(L"rRef", id);
    link.SetAttribute(L"Usage", usage);
    if (!part.empty()) link.AppendPart().SetPartMap(part);
    return link;
}

JDFResourceLink JDFResourceLinkPool::GetLink(const JDFResource& r) const {
    WString id = r.GetResourceRoot().GetID();
    if (id.empty()) return {};
    for (const KElement& e : GetChildrenByTagName(r.GetResourceRoot().GetNodeName() + L"Link"))
        if (e.GetAttribute(L"rRef") == id) return e;
    return {};
}

}  // namespace JDF
