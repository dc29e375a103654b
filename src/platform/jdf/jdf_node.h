// JDFNode: a JDF process node (<JDF>): type, activation, child nodes, resources and links.
//
// Process usage numbers (AppendMatchingResource, GetMatchingResource, GetMatchingLink):
// 1 AnyInput, 2 AnyOutput, 3 Any (query only), 9 Marks, 10 Document (others as in the token
// table). 1 and 2 only choose the link's Usage; 9 and 10 are written as ProcessUsage.
#pragma once

#include "platform/jdf/jdf_resource.h"

namespace JDF {

class JDFNode : public JDFElement {
public:
    JDFNode() = default;
    JDFNode(const KElement& e) : JDFElement(e) {}

    WString GetType() const { return GetAttribute(L"Type"); }
    // Types as a list (empty when absent).
    vWString GetTypes() const { return vWString(GetAttribute(L"Types")); }
    // Writes Type; for Combined and ProcessGroup also xsi:type (removed for other types).
    void SetType(const WString& type);
    void SetTypes(const vWString& types) { SetAttribute(L"Types", types.GetString()); }
    // Node activation (6 Active); a missing attribute reads Active. With bInherit the lowest
    // activation of this node and its ancestor nodes counts.
    int GetActivation(bool bInherit = false) const;
    void SetActivation(int activation);
    WString GetJobPartID() const { return GetAttribute(L"JobPartID"); }
    WString GetVersion() const { return GetAttribute(L"Version"); }
    vWString GetICSVersions() const { return vWString(GetAttribute(L"ICSVersions")); }

    // Nodes below this one in document order (direct children only with bDirect), then this
    // node itself, whose Type equals type (any type when empty) and whose effective activation
    // fits: for 6 (Active) it must be Active or TestRunAndGo, for 0 anything, else equal.
    vElement GetvJDFNode(const WString& type = L"", int activation = 0, bool bDirect = false) const;

    JDFResourcePool GetResourcePool() const { return GetElement(L"ResourcePool"); }
    JDFResourcePool GetCreateResourcePool();
    JDFResourceLinkPool GetResourceLinkPool() const { return GetElement(L"ResourceLinkPool"); }
    JDFResourceLinkPool GetCreateResourceLinkPool();
    KElement GetAuditPool() const { return GetElement(L"AuditPool"); }

    // Creates resource `name` in resRoot's ResourcePool (this node's when resRoot is null) and
    // links it here by processUsage. Class follows the resource name; ProcessUsage is written
    // for 9/10 (and for a usage the process types imply unambiguously). Throws JDFException when
    // every slot the node's process types have for it is already linked.
    JDFResource AppendMatchingResource(const WString& name, int processUsage, const JDFNode& resRoot = JDFNode());
    // The pos-th linked resource (partition when partMap is given) that matches name and
    // processUsage: 3 Any = inputs first then outputs; 1/2 one direction; 9/10 only when the
    // node's process types know that usage for the resource, and then only links with that
    // ProcessUsage. A link's rRef is resolved in the pools of this node and its ancestors,
    // nearest first (JDFResourceScope). Null when none.
    JDFResource GetMatchingResource(const WString& name, int processUsage = 3,
                                    const JDFAttributeMap& partMap = JDFAttributeMap(), int pos = 0) const;
    JDFResourceLink GetMatchingLink(const WString& name, int processUsage = 3, int pos = 0) const;
    // The resources this node's ResourceLinkPool links, in link order, each once: every link's
    // rRef resolved as GetMatchingResource resolves it, to the whole resource (a Part selection
    // is not applied). Links whose rRef names no resource in scope are left out.
    vElement GetLinkedResources() const;
    // This node's link to r; null when none.
    JDFResourceLink GetLink(const JDFResource& r) const;

    // Structural check: level 0 accepts any JDF element; from level 1 the node needs ID and
    // Type, from level 3 also Status (the attributes the schema requires), and from level 5
    // every resource link in the node and its descendants must name an existing ID.
    bool IsValid(int level = 5) const;
};

}  // namespace JDF
