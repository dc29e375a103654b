// JDFElement: enumeration, status and resource helpers.
#include "platform/jdf/jdf_element.h"

#include <cstring>

#include "platform/jdf/enum_tables.h"

namespace JDF {

const wchar_t* const kJDFNamespace = L"http://www.CIP4.org/JDFSchema_1_1";

int JDFElement::GetStatus() const { return GetEnumAttribute(L"Status", Tables::NodeStatus); }

void JDFElement::SetStatus(int status) { SetEnumAttribute(L"Status", status, Tables::NodeStatus); }

bool JDFElement::IsResource(bool bPartition) const {
    if (isNull()) return false;
    const char* name = node_.name();
    for (pugi::xml_node n = node_.parent(); n; n = n.parent()) {
        const char* colon = std::strchr(n.name(), ':');
        if (std::strcmp(colon ? colon + 1 : n.name(), "ResourcePool") == 0) return true;
        if (!bPartition || std::strcmp(n.name(), name) != 0) return false;
    }
    return false;
}

int JDFElement::GetEnumAttribute(const WString& key, const wchar_t* table, int def) const {
    if (!HasAttribute(key)) return def;
    return Tables::Number(table, GetAttribute(key));
}

void JDFElement::SetEnumAttribute(const WString& key, int value, const wchar_t* table, bool bAllowUnknown) {
    SetAttribute(key, Tables::Token(table, value, bAllowUnknown));
}

bool JDFElement::GetBoolAttribute(const WString& key, bool def) const {
    if (!HasAttribute(key)) return def;
    return GetAttribute(key) == L"true";
}

KElement JDFElement::GetTarget() const {
    if (isNull() || !doc_) return {};
    return KElement(doc_->FindByID(node_.attribute("rRef").value()), doc_);
}

}  // namespace JDF
