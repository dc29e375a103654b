// Resources, their links and pools.
//
// A resource is an element in a ResourcePool; a partitioned resource holds nested elements of
// the same name, each adding one partition key (PartIDKeys on the root names the keys). For
// reading, GetAttribute / HasAttribute / GetStatus of a partition fall back to the enclosing
// partitions up to the root. New resources get ID "r…", Status "Unavailable" and the Class of
// their kind; partitions get only their key attribute.
#pragma once

#include "platform/jdf/integer_range_list.h"
#include "platform/jdf/jdf_element.h"

namespace JDF {

class JDFResourceLink;
class JDFResourceScope;

class JDFResource : public JDFElement {
public:
    JDFResource() = default;
    JDFResource(const KElement& e) : JDFElement(e) {}

    // Attribute of this partition or, when absent, of the nearest enclosing partition.
    WString GetAttribute(const WString& key, const WString& nameSpaceURI = L"", const WString& def = L"") const;
    bool HasAttribute(const WString& key, const WString& nameSpaceURI = L"", bool bInherit = true) const;

    // Resource status (inherited): 3 Unavailable, 7 Available; 0 when missing or unknown.
    int GetStatus(bool bCheckPartitions = false) const;
    // Writes Status on this element only (bCleanLeaves is accepted; partitions keep theirs).
    void SetStatus(int status, bool bCleanLeaves = false);
    int GetPartUsage() const;
    void SetPartUsage(int partUsage);  // on the resource root
    WString GetClass() const { return GetAttribute(L"Class"); }
    // The value of the Run partition key (inherited).
    WString GetRun() const { return GetAttribute(L"Run"); }
    int GetSide() const;
    void SetSide(int side);  // 1 Front, 2 Back
    void SetRunTags(const vWString& tags) { SetAttribute(L"RunTags", tags.GetString()); }

    // The top-level element of this (possibly partitioned) resource.
    JDFResource GetResourceRoot() const;
    bool IsResourceRoot() const;
    vWString GetPartIDKeys() const;
    // Overwrites PartIDKeys on the root with the blank-joined list.
    void setPartIDKeys(const vWString& keys);
    // Adds a key to PartIDKeys on the root unless present.
    void AddPartIDKey(int partIDKey);
    // Part keys of this partition and its enclosing ones (key → value).
    JDFAttributeMap GetPartMap() const;
    // The direct child partition with key = value, created when missing (the key joins
    // PartIDKeys of the root). partIDKeys, when given, replaces PartIDKeys first.
    JDFResource GetCreatePartition(int partIDKey, const WString& value, const vWString& partIDKeys = vWString());
    // Appends a new child partition with key = value without looking for an existing one (the
    // key joins PartIDKeys of the root): for writers that make each value once, in constant time.
    JDFResource AddPartition(int partIDKey, const WString& value);
    // The partition (at any depth) whose part map holds all entries of partMap; null when none.
    JDFResource GetPartition(const JDFAttributeMap& partMap) const;

    // Links in the document that refer to this resource (linkName "*" or "" = any link element;
    // otherwise e.g. "RunListLink").
    vElement GetLinks(const WString& linkName = L"*") const;
};

// A Part element (partition selector) of a resource link.
class JDFPart : public JDFElement {
public:
    JDFPart() = default;
    JDFPart(const KElement& e) : JDFElement(e) {}
    void SetSheetIndex(const JDFIntegerRangeList& r) { SetAttribute(L"SheetIndex", r.GetString()); }
    void SetSetIndex(const JDFIntegerRangeList& r) { SetAttribute(L"SetIndex", r.GetString()); }
    void SetSide(int side);
    void SetPartMap(const JDFAttributeMap& m);
};

class JDFResourceLink : public JDFElement {
public:
    JDFResourceLink() = default;
    JDFResourceLink(const KElement& e) : JDFElement(e) {}
    WString GetrRef() const { return GetAttribute(L"rRef"); }
    // 1 Input, 2 Output, 0 otherwise.
    int GetUsage() const;
    // The ProcessUsage text as written ("Marks", "Document"); empty when absent.
    WString GetProcessUsage() const { return GetAttribute(L"ProcessUsage"); }
    // The linked resource (root, or the partition named by a single Part child); null if absent.
    JDFResource GetTarget() const;
    // The same, with rRef resolved in the pools of the given scope only.
    JDFResource GetTarget(const JDFResourceScope& scope) const;
    // The resource name the link refers to ("RunListLink" → "RunList").
    WString GetLinkedResourceName() const;
    JDFPart AppendPart() { return AppendElement(L"Part"); }
};

class JDFResourcePool : public JDFElement {
public:
    JDFResourcePool() = default;
    JDFResourcePool(const KElement& e) : JDFElement(e) {}
    // Resources of the pool matching name ("*" any), attribute filter and namespace.
    vElement GetPoolChildren(const WString& name = L"*", const JDFAttributeMap& mAttrib = JDFAttributeMap(),
                             const WString& nameSpaceURI = L"") const;
    // The index-th resource of that name; null when absent.
    JDFResource GetResource(const WString& name, int index = 0, const WString& nameSpaceURI = L"") const;
    // Appends a new resource: ID "r…", Status "Unavailable", and Class (the given one, or the
    // known class of that resource name when empty). A Component also gets the ComponentType
    // "Sheet" that the schema requires.
    JDFResource AppendResource(const WString& name, const WString& resourceClass = L"",
                               const WString& nameSpaceURI = L"");
    // Appends a deep copy of a resource (from any document). The copy keeps its ID unless the ID
    // is already taken in this document, in which case it gets a new one.
    JDFResource CopyResource(const JDFResource& src);
    JDFResource AppendResource(const JDFResource& src) { return CopyResource(src); }
};

class JDFResourceLinkPool : public JDFElement {
public:
    JDFResourceLinkPool() = default;
    JDFResourceLinkPool(const KElement& e) : JDFElement(e) {}
    vElement GetPoolChildren(const WString& name = L"*", const JDFAttributeMap& mAttrib = JDFAttributeMap(),
                             const WString& nameSpaceURI = L"") const;
    // Links r as input or output: <NameLink rRef Usage> (plus a Part for a partition). Returns
    // null when an identical link already exists.
    JDFResourceLink AppendResource(const JDFResource& r, bool bInput);
    // The link of this pool that refers to r (any direction); null when none.
    JDFResourceLink GetLink(const JDFResource& r) const;
};

// The Class a resource of that name has ("Parameter", "Consumable", "Quantity"), or empty.
WString ResourceClassOf(const WString& resourceName);

}  // namespace JDF
