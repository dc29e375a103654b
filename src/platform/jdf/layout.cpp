// Layout: media references, surfaces, placed-object geometry and enumeration setters.
#include "platform/jdf/layout.h"

#include "platform/jdf/enum_tables.h"
#include "platform/jdf/exception.h"

namespace JDF {

void JDFFitPolicy::SetSizePolicy(int value) { SetEnumAttribute(L"SizePolicy", value, Tables::SizePolicy); }
void JDFFitPolicy::SetRotatePolicy(int value) { SetEnumAttribute(L"RotatePolicy", value, Tables::RotatePolicy); }
void JDFStack::SetLogicalStackSequence(int value) {
    SetEnumAttribute(L"LogicalStackSequence", value, Tables::LogicalStackSequence);
}
void JDFLogicalStackParams::SetRestrictions(int value) {
    SetEnumAttribute(L"Restrictions", value, Tables::StackRestrictions);
}
void JDFAutoLayout::SetBaseOrdReset(int value) { SetEnumAttribute(L"BaseOrdReset", value, Tables::BaseOrdReset); }

JDFMatrix JDFAutoPlacedObject::GetCTM() const {
    try {
        return HasAttribute(L"CTM") ? JDFMatrix(GetAttribute(L"CTM")) : JDFMatrix();
    } catch (const JDFException&) {
        return JDFMatrix();
    }
}

JDFRectangle JDFAutoPlacedObject::GetClipBox() const {
    try {
        return HasAttribute(L"ClipBox") ? JDFRectangle(GetAttribute(L"ClipBox")) : JDFRectangle();
    } catch (const JDFException&) {
        return JDFRectangle();
    }
}

KElement JDFAutoLayout::RefMedia(const JDFMedia& media) {
    if (isNull() || media.isNull() || !doc_) return {};
    WString id = media.GetID();
    if (id.empty()) {
        id = WString(doc_->NewID("r"));
        JDFMedia(media).KElement::SetAttribute(L"ID", id);
    }
    KElement ref = AppendElement(L"MediaRef");
    ref.SetAttribute(L"rRef", id);
    return ref;
}

JDFSurface JDFSheet::surface(const wchar_t* side) {
    KElement s = GetChildByTagName(L"Surface", L"", 0, JDFAttributeMap(L"Side", side));
    if (!s.isNull()) return s;
    s = AppendElement(L"Surface");
    s.SetAttribute(L"Side", side);
    return s;
}

}  // namespace JDF
