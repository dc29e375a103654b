// RunList: inherited pages and layout elements, file URLs, new runs.
#include "platform/jdf/run_list.h"

#include <cstdint>
#include <cwchar>

#include "platform/jdf/enum_tables.h"
#include "platform/jdf/exception.h"

namespace JDF {
namespace {

// First child named name (or name+"Ref", followed) of e.
KElement resolvedChild(const KElement& e, const WString& name) {
    vElement v = e.GetChildElementVector(name, L"", JDFAttributeMap(), true, 1, true);
    return v.empty() ? KElement() : v.front();
}

}  // namespace

JDFFileSpec JDFAutoLayoutElement::GetFileSpec() const { return resolvedChild(*this, L"FileSpec"); }

JDFFileSpec JDFAutoLayoutElement::GetCreateFileSpec() {
    JDFFileSpec f = GetFileSpec();
    return f.isNull() ? JDFFileSpec(AppendElement(L"FileSpec")) : f;
}

void JDFMetadataMap::SetDataType(int dataType) { SetEnumAttribute(L"DataType", dataType, Tables::MetadataDataType); }
void JDFMetadataMap::SetContext(int context) { SetEnumAttribute(L"Context", context, Tables::MetadataContext); }

KElement JDFMetadataMap::AppendExpr(const WString& name, const WString& value) {
    KElement e = AppendElement(L"Expr");
    e.SetAttribute(L"Name", name);
    e.SetAttribute(L"Value", value);
    return e;
}

int JDFAutoRunList::GetIntAttribute(const WString& key, int def) const {
    WString v = GetAttribute(key);
    if (v.empty()) return def;
    wchar_t* end = nullptr;
    long n = std::wcstol(v.c_str(), &end, 10);
    if (end == v.c_str()) return def;
    if (n > INT32_MAX) return INT32_MAX;
    if (n < INT32_MIN) return INT32_MIN;
    return static_cast<int>(n);
}

JDFIntegerRangeList JDFAutoRunList::GetPages() const {
    try {
        return JDFIntegerRangeList(GetAttribute(L"Pages"));
    } catch (const JDFException&) {
        return {};
    }
}

JDFLayoutElement JDFAutoRunList::GetLayoutElement() const {
    WString name = GetNodeName();
    for (KElement e = *this; !e.isNull() && e.GetNodeName() == name; e = e.GetParentNode()) {
        KElement le = resolvedChild(e, L"LayoutElement");
        if (!le.isNull()) return le;
    }
    return {};
}

JDFLayoutElement JDFAutoRunList::GetCreateLayoutElement() {
    KElement le = resolvedChild(*this, L"LayoutElement");
    return le.isNull() ? JDFLayoutElement(AppendElement(L"LayoutElement")) : JDFLayoutElement(le);
}

WString JDFRunList::GetFileURL() const {
    JDFLayoutElement le = GetLayoutElement();
    return le.isNull() ? WString() : le.GetFileSpec().GetURL();
}

void JDFRunList::SetFileURL(const WString& url) { GetCreateLayoutElement().GetCreateFileSpec().SetURL(url); }

JDFRunList JDFRunList::AddRun(const WString& fileName, int first, int last) {
    if (isNull()) return {};
    // A fresh Run value: the partition's position, moved on past values already in use.
    int n = NumChildElements(GetNodeName());
    JDFRunList part;
    for (;; ++n) {
        WString value = WString::valueOf(n);
        if (GetChildByTagName(GetNodeName(), L"", 0, JDFAttributeMap(L"Run", value)).isNull()) {
            part = GetCreatePartition(20, value);
            break;
        }
    }
    JDFIntegerRangeList pages;
    if (first == last) pages.Append(first);
    else pages.Append(first, last);
    part.SetPages(pages);
    part.SetFileURL(fileName);
    return part;
}

JDFRunList JDFRunList::AddPDF(const WString& fileName, int first, int last) {
    JDFRunList part = AddRun(fileName, first, last);
    if (!part.isNull()) part.GetLayoutElement().GetFileSpec().SetMimeType(L"application/pdf");
    return part;
}

}  // namespace JDF
