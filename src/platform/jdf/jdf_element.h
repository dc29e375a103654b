// JDFElement: an element of a JDF document, with the JDF-wide attribute helpers
// (enumerations, ID, status of nodes, descriptive name).
#pragma once

#include "platform/jdf/kelement.h"

namespace JDF {

// Namespace of JDF elements as this layer writes them.
extern const wchar_t* const kJDFNamespace;

class JDFElement : public KElement {
public:
    JDFElement() = default;
    JDFElement(const KElement& e) : KElement(e) {}

    // Node status (Waiting, Ready, …) by the node-status table: 3 = Ready. A missing or unknown
    // token reads 0. Resources read their own table through JDFResource::GetStatus.
    int GetStatus() const;
    void SetStatus(int status);

    // True for a resource: an element directly in a ResourcePool, or (bPartition) a partition
    // of one (a child element with the same name as its resource parent).
    bool IsResource(bool bPartition = true) const;

    WString GetDescriptiveName() const { return GetAttribute(L"DescriptiveName"); }
    void SetDescriptiveName(const WString& name) { SetAttribute(L"DescriptiveName", name); }
    WString GetID() const { return GetAttribute(L"ID"); }

    // Enumeration attributes: see enum_tables.h for tables and rules.
    int GetEnumAttribute(const WString& key, const wchar_t* table, int def = 0) const;
    void SetEnumAttribute(const WString& key, int value, const wchar_t* table, bool bAllowUnknown = false);
    // "true"/"false" attributes; def when absent, false for any other text.
    bool GetBoolAttribute(const WString& key, bool def = false) const;
    void SetBoolAttribute(const WString& key, bool value) { SetAttribute(key, value ? L"true" : L"false"); }

    // The element referred to by a ref element's rRef (MediaRef → Media); null when absent.
    KElement GetTarget() const;
};

}  // namespace JDF
