// RunList resources and their LayoutElement / FileSpec / MetadataMap elements.
// Attributes and sub-elements of a run-list partition are inherited from enclosing partitions.
#pragma once

#include "platform/jdf/integer_range_list.h"
#include "platform/jdf/jdf_resource.h"

namespace JDF {

class JDFFileSpec : public JDFResource {
public:
    JDFFileSpec() = default;
    JDFFileSpec(const KElement& e) : JDFResource(e) {}
    WString GetURL() const { return GetAttribute(L"URL"); }
    void SetURL(const WString& url) { SetAttribute(L"URL", url); }
    WString GetMimeType() const { return GetAttribute(L"MimeType"); }
    void SetMimeType(const WString& type) { SetAttribute(L"MimeType", type); }
};

class JDFAutoLayoutElement : public JDFResource {
public:
    JDFAutoLayoutElement() = default;
    JDFAutoLayoutElement(const KElement& e) : JDFResource(e) {}
    // IsBlank="true"; false when absent.
    bool GetIsBlank() const { return GetAttribute(L"IsBlank") == L"true"; }
    void SetIsBlank(bool value) { SetAttribute(L"IsBlank", value ? L"true" : L"false"); }
    bool GetIsTrapped() const { return GetAttribute(L"IsTrapped") == L"true"; }
    void SetIsTrapped(bool value) { SetAttribute(L"IsTrapped", value ? L"true" : L"false"); }
    // The FileSpec child (a FileSpecRef is followed); null when none.
    JDFFileSpec GetFileSpec() const;
    JDFFileSpec GetCreateFileSpec();
};

class JDFLayoutElement : public JDFAutoLayoutElement {
public:
    JDFLayoutElement() = default;
    JDFLayoutElement(const KElement& e) : JDFAutoLayoutElement(e) {}
    bool IsBlank() const { return GetIsBlank(); }
};

class JDFMetadataMap : public JDFElement {
public:
    JDFMetadataMap() = default;
    JDFMetadataMap(const KElement& e) : JDFElement(e) {}
    void SetDataType(int dataType);   // 8 PartIDKeys
    void SetContext(int context);     // 2 Document
    void SetName(const WString& name) { SetAttribute(L"Name", name); }
    void SetValueFormat(const WString& format) { SetAttribute(L"ValueFormat", format); }
    void SetValueTemplate(const WString& tmpl) { SetAttribute(L"ValueTemplate", tmpl); }
    // Appends <Expr Name=… Value=…/>.
    KElement AppendExpr(const WString& name, const WString& value);
};

class JDFAutoRunList : public JDFResource {
public:
    JDFAutoRunList() = default;
    JDFAutoRunList(const KElement& e) : JDFResource(e) {}
    int GetNPage() const { return GetIntAttribute(L"NPage"); }
    void SetNPage(int n) { SetAttribute(L"NPage", n); }
    int GetFirstPage() const { return GetIntAttribute(L"FirstPage"); }
    int GetSkipPage() const { return GetIntAttribute(L"SkipPage"); }
    bool GetEndOfDocument() const { return GetAttribute(L"EndOfDocument") == L"true"; }
    // Pages (inherited); an empty list when absent or not a range list.
    JDFIntegerRangeList GetPages() const;
    void SetPages(const JDFIntegerRangeList& pages) { SetAttribute(L"Pages", pages.GetString()); }
    WString GetRunTag() const { return GetAttribute(L"RunTag"); }
    void SetRunTag(const WString& tag) { SetAttribute(L"RunTag", tag); }
    // The LayoutElement of this partition or the nearest enclosing one (refs followed).
    JDFLayoutElement GetLayoutElement() const;
    // This element's own LayoutElement, created when missing.
    JDFLayoutElement GetCreateLayoutElement();
    JDFMetadataMap AppendMetadataMap() { return AppendElement(L"MetadataMap"); }
    // Integer attribute of this partition or an enclosing one.
    int GetIntAttribute(const WString& key, int def = 0) const;
};

class JDFRunList : public JDFAutoRunList {
public:
    JDFRunList() = default;
    JDFRunList(const KElement& e) : JDFAutoRunList(e) {}
    // URL of the LayoutElement's FileSpec (inherited); empty when none.
    WString GetFileURL() const;
    // Sets the URL on this element's own LayoutElement/FileSpec (created when missing).
    void SetFileURL(const WString& url);
    // Appends a Run partition for pages first … last of a file (Pages "first ~ last", negative
    // values count from the end) with LayoutElement/FileSpec URL. Returns the partition.
    JDFRunList AddRun(const WString& fileName, int first = 0, int last = -1);
    // AddRun with MimeType "application/pdf" on the FileSpec.
    JDFRunList AddPDF(const WString& fileName, int first = 0, int last = -1);
};

}  // namespace JDF
