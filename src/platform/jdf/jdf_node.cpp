// JDFNode: types, activation, node search, resource matching and linking.
#include "platform/jdf/jdf_node.h"

#include <algorithm>
#include <set>

#include "platform/jdf/enum_tables.h"
#include "platform/jdf/exception.h"
#include "platform/jdf/link_table.h"
#include "platform/jdf/resource_scope.h"

namespace JDF {
namespace {

const wchar_t* const kXsiNamespace = L"http://www.w3.org/2001/XMLSchema-instance";

// The process types whose link tables apply to the node.
vWString processTypes(const JDFNode& n) {
    WString type = n.GetType();
    if (type == L"Combined" || type == L"ProcessGroup") return n.GetTypes();
    return type.empty() ? vWString() : vWString{type};
}

bool anyKnownType(const vWString& types) {
    return std::any_of(types.begin(), types.end(), [](const WString& t) { return detail::IsKnownProcessType(t); });
}

// Links of this node to resources called name, in the order GetMatchingResource uses.
std::vector<JDFResourceLink> matchingLinks(const JDFNode& node, const WString& name, int pu) {
    std::vector<JDFResourceLink> out;
    JDFResourceLinkPool pool = node.GetResourceLinkPool();
    if (pool.isNull()) return out;
    vElement links = pool.GetPoolChildren(name);
    auto take = [&](const wchar_t* usage, bool skipInternal) {
        for (const KElement& e : links) {
            JDFResourceLink l(e);
            if (l.GetAttribute(L"Usage") != usage) continue;
            if (skipInternal && l.GetAttribute(L"PipeProtocol") == L"Internal") continue;
            out.push_back(l);
        }
    };
    if (pu == 3 || pu <= 0) {
        take(L"Input", false);
        take(L"Output", false);
    } else if (pu == 1) {
        take(L"Input", true);
    } else if (pu == 2) {
        take(L"Output", true);
    } else {
        WString token = Tables::Token(Tables::ProcessUsage, pu);
        vWString types = processTypes(node);
        // Process types unknown to the slot tables do not restrict the query.
        if (anyKnownType(types) && detail::MatchingSlots(types, name, pu).empty()) return out;
        for (const KElement& e : links)
            if (e.GetAttribute(L"ProcessUsage") == token) out.push_back(e);
    }
    return out;
}

}  // namespace

void JDFNode::SetType(const WString& type) {
    SetAttribute(L"Type", type);
    if (type == L"Combined" || type == L"ProcessGroup") SetAttribute(L"xsi:type", type, kXsiNamespace);
    else RemoveAttribute(L"xsi:type");  // a stale one would contradict Type
}

int JDFNode::GetActivation(bool bInherit) const {
    int result = Tables::Number(Tables::NodeActivation, GetAttribute(L"Activation", L"", L"Active"));
    if (!bInherit) return result;
    for (KElement e = GetParentNode(); !e.isNull() && e.GetLocalName() == L"JDF"; e = e.GetParentNode())
        result = std::min(result, JDFNode(e).GetActivation(false));
    return result;
}

void JDFNode::SetActivation(int activation) {
    SetEnumAttribute(L"Activation", activation, Tables::NodeActivation);
}

vElement JDFNode::GetvJDFNode(const WString& type, int activation, bool bDirect) const {
    vElement out;
    if (isNull()) return out;
    auto fits = [&](const JDFNode& n) {
        if (!type.empty() && n.GetType() != type) return false;
        if (activation == 0) return true;
        int a = n.GetActivation(true);
        if (activation == 6) return a == 6 || a == 5;
        return a == activation;
    };
    for (const KElement& e : GetChildrenByTagName(L"JDF", L"", JDFAttributeMap(), bDirect))
        if (fits(JDFNode(e))) out.push_back(e);
    if (fits(*this)) out.push_back(*this);
    return out;
}

JDFResourcePool JDFNode::GetCreateResourcePool() {
    JDFResourcePool pool = GetResourcePool();
    if (!pool.isNull()) return pool;
    // Before the links and child nodes, after the audit pool and the rest.
    KElement before = GetElement(L"ResourceLinkPool");
    if (before.isNull()) before = GetElement(L"JDF");
    return InsertElementBefore(L"ResourcePool", before);
}

JDFResourceLinkPool JDFNode::GetCreateResourceLinkPool() {
    JDFResourceLinkPool pool = GetResourceLinkPool();
    if (!pool.isNull()) return pool;
    return InsertElementBefore(L"ResourceLinkPool", GetElement(L"JDF"));
}

JDFResource JDFNode::AppendMatchingResource(const WString& name, int pu, const JDFNode& resRoot) {
    if (isNull()) return {};
    if (pu < 1) throw JDFException("AppendMatchingResource: process usage " + std::to_string(pu) + " cannot be linked");
    vWString types = processTypes(*this);
    std::vector<detail::LinkSlot> slots = detail::MatchingSlots(types, name, pu);
    bool input = pu != 2;
    WString processUsage = pu > 3 ? Tables::Token(Tables::ProcessUsage, pu) : WString();
    if (!slots.empty()) {
        input = slots.front().direction == L'i';
        std::set<std::wstring> kinds;
        bool bounded = true;
        for (const detail::LinkSlot& s : slots) {
            kinds.insert(std::wstring(1, s.direction) + s.processUsage);
            if (s.cardinality == L'*' || s.cardinality == L'+') bounded = false;
        }
        if (kinds.size() == 1 && !slots.front().processUsage.empty()) processUsage = slots.front().processUsage;
        if (bounded) {
            int taken = 0;
            for (const JDFResourceLink& l : matchingLinks(*this, name, input ? 1 : 2))
                if (pu <= 3 || l.GetProcessUsage() == processUsage) ++taken;
            if (taken >= static_cast<int>(slots.size()))
                throw JDFException("AppendMatchingResource: " + name.getUTF8() + " link already exists");
        }
    }
    JDFNode owner = resRoot.isNull() ? *this : resRoot;
    JDFResource r = owner.GetCreateResourcePool().AppendResource(name);
    if (r.isNull()) throw JDFException("AppendMatchingResource: cannot create " + name.getUTF8());
    JDFResourceLink link = GetCreateResourceLinkPool().AppendElement(name + L"Link");
    link.SetAttribute(L"rRef", r.GetID());
    link.SetAttribute(L"Usage", input ? L"Input" : L"Output");
    if (!processUsage.empty()) link.SetAttribute(L"ProcessUsage", processUsage);
    return r;
}

JDFResource JDFNode::GetMatchingResource(const WString& name, int pu, const JDFAttributeMap& partMap, int pos) const {
    std::vector<JDFResourceLink> links = matchingLinks(*this, name, pu);
    if (links.empty()) return {};
    JDFResourceScope scope(*this);
    int seen = 0;
    for (const JDFResourceLink& l : links) {
        JDFResource r = l.GetTarget(scope);
        if (r.isNull()) continue;
        if (!partMap.empty()) r = r.GetPartition(partMap);
        if (r.isNull()) continue;
        if (seen++ == pos) return r;
    }
    return {};
}

JDFResourceLink JDFNode::GetMatchingLink(const WString& name, int pu, int pos) const {
    std::vector<JDFResourceLink> links = matchingLinks(*this, name, pu);
    if (pos < 0 || pos >= static_cast<int>(links.size())) return {};
    return links[static_cast<size_t>(pos)];
}

vElement JDFNode::GetLinkedResources() const {
    vElement out;
    JDFResourceLinkPool pool = GetResourceLinkPool();
    if (pool.isNull()) return out;
    JDFResourceScope scope(*this);
    std::set<pugi::xml_node> taken;
    for (pugi::xml_node link = pool.node().first_child(); link; link = link.next_sibling()) {
        if (link.type() != pugi::node_element) continue;
        JDFResource r = scope.Find(link.attribute("rRef").value());
        if (!r.isNull() && taken.insert(r.node()).second) out.push_back(r);
    }
    return out;
}

JDFResourceLink JDFNode::GetLink(const JDFResource& r) const {
    JDFResourceLinkPool pool = GetResourceLinkPool();
    return pool.isNull() ? JDFResourceLink() : pool.GetLink(r);
}

bool JDFNode::IsValid(int level) const {
    if (isNull() || GetLocalName() != L"JDF") return false;
    if (level < 1) return true;
    if (!HasAttribute(L"ID") || !HasAttribute(L"Type")) return false;
    if (level >= 3 && !HasAttribute(L"Status")) return false;
    if (level >= 5) {
        for (const KElement& pool : GetChildrenByTagName(L"ResourceLinkPool", L"", JDFAttributeMap(), false))
            for (const KElement& link : pool.GetChildrenByTagName())
                if (!doc_ || !doc_->FindByID(link.node().attribute("rRef").value())) return false;
    }
    return true;
}

}  // namespace JDF
