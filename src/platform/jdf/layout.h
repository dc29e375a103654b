// Layout resources and what they hold: signatures, sheets, surfaces, placed objects, stacking.
//
// GetCreateSignature / GetCreateSheet / GetCreate…Surface build the nested form
// (<Signature Name>, <Sheet Name>, <Surface Side="Front|Back">); the partitioned form comes from
// JDFResource::GetCreatePartition (keys 33 SignatureName, 31 SheetName, 32 Side). Signature,
// Sheet and Surface share the Layout setters. GetCreateX(i) returns the i-th X child and
// appends one when fewer than i+1 exist.
#pragma once

#include "platform/jdf/geometry.h"
#include "platform/jdf/media.h"

namespace JDF {

class JDFFitPolicy : public JDFElement {
public:
    JDFFitPolicy() = default;
    JDFFitPolicy(const KElement& e) : JDFElement(e) {}
    void SetSizePolicy(int value);    // 1 ClipToMaxPage, 3 FitToPage; 0 throws
    void SetRotatePolicy(int value);  // 1 NoRotate, 3 RotateClockwise, 4 RotateCounterClockwise
};

class JDFAutoPlacedObject : public JDFElement {
public:
    JDFAutoPlacedObject() = default;
    JDFAutoPlacedObject(const KElement& e) : JDFElement(e) {}
    // Geometry getters return the default value (identity, 0 0 0 0, 0 0) for missing or bad text.
    JDFMatrix GetCTM() const;
    void SetCTM(const JDFMatrix& m) { SetAttribute(L"CTM", m.GetString()); }
    JDFRectangle GetClipBox() const;
    void SetClipBox(const JDFRectangle& r) { SetAttribute(L"ClipBox", r.GetString()); }
    int GetOrd() const { return GetIntAttribute(L"Ord"); }
    void SetOrd(int ord) { SetAttribute(L"Ord", ord); }
    void SetTrimCTM(const JDFMatrix& m) { SetAttribute(L"TrimCTM", m.GetString()); }
    void SetTrimSize(const JDFXYPair& p) { SetAttribute(L"TrimSize", p.GetString()); }
    void SetLogicalStackOrd(int ord) { SetAttribute(L"LogicalStackOrd", ord); }
};

class JDFAutoContentObject : public JDFAutoPlacedObject {
public:
    using JDFAutoPlacedObject::JDFAutoPlacedObject;
    JDFFitPolicy GetCreateFitPolicy() { return GetCreateElement(L"FitPolicy"); }
};
class JDFContentObject : public JDFAutoContentObject {
public:
    using JDFAutoContentObject::JDFAutoContentObject;
};

class JDFJobField : public JDFElement {
public:
    JDFJobField() = default;
    JDFJobField(const KElement& e) : JDFElement(e) {}
    void SetJobTemplate(const WString& t) { SetAttribute(L"JobTemplate", t); }
    void SetJobFormat(const WString& f) { SetAttribute(L"JobFormat", f); }
};

class JDFDeviceMark : public JDFElement {
public:
    JDFDeviceMark() = default;
    JDFDeviceMark(const KElement& e) : JDFElement(e) {}
    void SetFont(const WString& font) { SetAttribute(L"Font", font); }
    void SetFontSize(double size) { SetAttribute(L"FontSize", size); }
};

class JDFAutoMarkObject : public JDFAutoPlacedObject {
public:
    using JDFAutoPlacedObject::JDFAutoPlacedObject;
    JDFJobField AppendJobField() { return AppendElement(L"JobField"); }
    JDFDeviceMark AppendDeviceMark() { return AppendElement(L"DeviceMark"); }
};
class JDFMarkObject : public JDFAutoMarkObject {
public:
    using JDFAutoMarkObject::JDFAutoMarkObject;
};

class JDFStack : public JDFElement {
public:
    JDFStack() = default;
    JDFStack(const KElement& e) : JDFElement(e) {}
    void SetLogicalStackOrd(int ord) { SetAttribute(L"LogicalStackOrd", ord); }
    void SetLogicalStackSequence(int value);  // 1 SheetIndex
};

class JDFLogicalStackParams : public JDFElement {
public:
    JDFLogicalStackParams() = default;
    JDFLogicalStackParams(const KElement& e) : JDFElement(e) {}
    void SetRestrictions(int value);  // 1 None
    void SetMaxStackDepth(int depth) { SetAttribute(L"MaxStackDepth", depth); }
    JDFStack AppendStack() { return AppendElement(L"Stack"); }
};

class JDFAutoLayout : public JDFResource {
public:
    JDFAutoLayout() = default;
    JDFAutoLayout(const KElement& e) : JDFResource(e) {}
    WString GetName() const { return GetAttribute(L"Name"); }
    void SetName(const WString& name) { SetAttribute(L"Name", name); }
    void SetSurfaceContentsBox(const JDFRectangle& r) { SetAttribute(L"SurfaceContentsBox", r.GetString()); }
    // Automated="true" (inherited); false when absent.
    bool GetAutomated() const { return GetAttribute(L"Automated") == L"true"; }
    void SetAutomated(bool value) { SetAttribute(L"Automated", value ? L"true" : L"false"); }
    void SetBaseOrdReset(int value);  // 2 PagePoolList

    JDFMedia GetMedia(int i = 0) const { return GetElement(L"Media", L"", i); }
    JDFMedia GetCreateMedia(int i = 0) { return GetCreateElement(L"Media", L"", i); }
    // Appends <MediaRef rRef="media ID"/> (the media gets an ID when it has none).
    KElement RefMedia(const JDFMedia& media);

    JDFContentObject GetContentObject(int i = 0) const { return GetElement(L"ContentObject", L"", i); }
    JDFContentObject GetCreateContentObject(int i = 0) { return GetCreateElement(L"ContentObject", L"", i); }
    JDFContentObject AppendContentObject() { return AppendElement(L"ContentObject"); }
    JDFMarkObject GetMarkObject(int i = 0) const { return GetElement(L"MarkObject", L"", i); }
    JDFMarkObject GetCreateMarkObject(int i = 0) { return GetCreateElement(L"MarkObject", L"", i); }
    JDFMarkObject AppendMarkObject() { return AppendElement(L"MarkObject"); }

    JDFLogicalStackParams GetLogicalStackParams() const { return GetElement(L"LogicalStackParams"); }
    JDFLogicalStackParams AppendLogicalStackParams() { return AppendElement(L"LogicalStackParams"); }
};

class JDFSurface : public JDFAutoLayout {
public:
    using JDFAutoLayout::JDFAutoLayout;
};

class JDFSheet : public JDFAutoLayout {
public:
    using JDFAutoLayout::JDFAutoLayout;
    // The Surface child with Side Front / Back, created when missing.
    JDFSurface GetCreateFrontSurface() { return surface(L"Front"); }
    JDFSurface GetCreateBackSurface() { return surface(L"Back"); }

private:
    JDFSurface surface(const wchar_t* side);
};

class JDFSignature : public JDFAutoLayout {
public:
    using JDFAutoLayout::JDFAutoLayout;
    JDFSheet GetCreateSheet(int i = 0) { return GetCreateElement(L"Sheet", L"", i); }
};

class JDFLayout : public JDFAutoLayout {
public:
    using JDFAutoLayout::JDFAutoLayout;
    JDFSignature GetCreateSignature(int i = 0) { return GetCreateElement(L"Signature", L"", i); }
};

}  // namespace JDF
