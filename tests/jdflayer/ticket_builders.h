// Documents built through the JDF layer the way the ticket writers build them.
#pragma once

#include "platform/jdf/jdf.h"

namespace jdflayer_test {

inline const wchar_t* const kTicketNs = L"http://www.vorlan.org/JDF/ticket/1.0";
inline const wchar_t* const kAdobeNs = L"http://ns.adobe.com/jdf/1.0/";

// Root of a new document with the writers' node settings.
inline JDF::JDFNode newCombinedRoot(JDF::JDFDoc& doc, const wchar_t* types) {
    JDF::JDFNode root = doc.GetRoot();
    root.SetActivation(6);
    root.SetStatus(3);
    root.SetType(L"Combined");
    root.SetTypes(JDF::vWString(types));
    root.SetAttribute(L"xmlns:KAV_tkt", kTicketNs);
    root.SetAttribute(L"xmlns:ADBE", kAdobeNs);
    return root;
}

// The versioned ticket: nested layout with media, objects and extension tags, Run-partitioned
// interpreting parameters with OCG switches, content and marks run lists, output component.
inline JDF::JDFDoc buildVersionedTicket() {
    using namespace JDF;
    JDFDoc doc(0);
    JDFNode root = newCombinedRoot(doc, L"Imposition Interpreting DigitalPrinting Rendering");
    JDFRenderingParams rp = root.AppendMatchingResource(L"RenderingParams", 1);
    rp.SetInterleaved(true);
    rp.SetStatus(7);
    root.AppendMatchingResource(L"DigitalPrintingParams", 1).SetStatus(7);

    JDFLayout layout = root.AppendMatchingResource(L"Layout", 1);
    layout.SetStatus(7);
    layout.SetPartUsage(3);
    JDFSignature sig = layout.GetCreateSignature(0);
    sig.SetName(L"Sig 1");
    sig.GetCreateMedia(0).SetDimension(JDFXYPair(612.5, 792));
    JDFSheet sheet = sig.GetCreateSheet(0);
    sheet.SetName(L"Sheet 1");
    JDFMedia media = root.AppendMatchingResource(L"Media", 1);
    media.SetStatus(7);
    media.SetDimension(JDFXYPair(612, 792));
    sheet.RefMedia(media);
    for (int side = 0; side < 2; ++side) {
        JDFSurface s = side == 0 ? sheet.GetCreateFrontSurface() : sheet.GetCreateBackSurface();
        s.SetAttribute(L"KAV_tkt:VersionName", L"Version A", kTicketNs);
        s.SetAttribute(L"KAV_tkt:VersionIndex", -1, kTicketNs);
        s.SetAttribute(L"KAV_tkt:VersionCopyCount", 4294967295u, kTicketNs);
        s.SetAttribute(L"KAV_tkt:IsBackDie", side ? L"true" : L"false", kTicketNs);
        s.SetAttribute(L"KAV_tkt:is_duplex", L"1", kTicketNs);
        s.SetAttribute(L"KAV_tkt:VersContentType", L"Content", kTicketNs);
        s.SetAttribute(L"ADBE:StepAndRepeat", L"true", kAdobeNs);
        s.SetSurfaceContentsBox(JDFRectangle(0, 0, 612, 792));
        JDFContentObject co = s.GetCreateContentObject(0);
        co.SetCTM(JDFMatrix(1, 0, 0, 1, 10, 20));
        co.SetClipBox(JDFRectangle(0, 0, 300, 400));
        co.SetAttribute(L"SourceClipPath", L"0 0 m 100 0 l 100 100 l h");
        co.SetOrd(side);
        co.SetTrimCTM(JDFMatrix());
        co.SetTrimSize(JDFXYPair(300, 400));
        co.SetAttribute(L"ADBE:CachePlacedObject", L"true", kAdobeNs);
        JDFMarkObject mo = s.GetCreateMarkObject(0);
        mo.SetCTM(JDFMatrix());
        mo.SetOrd(0);
    }

    JDFInterpretingParams ip = root.AppendMatchingResource(L"InterpretingParams", 1);
    ip.SetStatus(7);
    for (int k = 0; k < 2; ++k) {
        JDFInterpretingParams part = ip.GetCreatePartition(20, WString::valueOf(k));
        JDFPDFInterpretingParams pdf = part.GetCreatePDFInterpretingParams(k);
        pdf.SetOCGDefault(2);
        pdf.SetOCGIntent(L"View");
        pdf.SetOCGProcess(2);
        JDFOCGControl on = pdf.GetCreateOCGControl(0);
        on.SetIncludeOCG(true);
        on.SetOCGName(L"KVVersionSpecialOCGName");
        JDFOCGControl off = pdf.GetCreateOCGControl(1);
        off.SetIncludeOCG(false);
        off.SetOCGName(L"Layer B");
    }

    for (int pu : {10, 9}) {
        JDFRunList rl = root.AppendMatchingResource(L"RunList", pu);
        rl.SetStatus(7);
        for (int k = 0; k < 2; ++k) {
            JDFRunList part = rl.GetCreatePartition(20, WString::valueOf(k));
            JDFIntegerRangeList pages;
            pages.Append(k);
            part.SetPages(pages);
            part.SetAttribute(L"KAV_tkt:VersContentType", L"Content", kTicketNs);
            JDFLayoutElement le = part.GetCreateLayoutElement();
            le.SetIsTrapped(false);
            if (k == 1 && pu == 10) {
                le.SetIsBlank(true);
                continue;
            }
            JDFFileSpec fs = le.GetCreateFileSpec();
            fs.SetURL(L"file:///tmp/job/a%20b.pdf");
            fs.SetMimeType(L"application/pdf");
        }
    }
    root.AppendMatchingResource(L"Component", 2);
    root.SetTypes(vWString(L"Imposition Interpreting Rendering DigitalPrinting"));
    return doc;
}

// A layout partitioned by SignatureName / SheetName / Side, as layout injection writes it,
// inside a ticket with one content run list added by AddPDF.
inline JDF::JDFDoc buildInjectedLayoutTicket(int sheets) {
    using namespace JDF;
    JDFDoc doc(0);
    JDFNode root = newCombinedRoot(doc, L"Imposition Interpreting Rendering DigitalPrinting");
    root.AppendMatchingResource(L"InterpretingParams", 1).SetStatus(7);
    JDFRenderingParams rp = root.AppendMatchingResource(L"RenderingParams", 1);
    rp.SetInterleaved(true);
    rp.SetStatus(7);
    root.AppendMatchingResource(L"DigitalPrintingParams", 1).SetStatus(7);
    JDFRunList rl = root.AppendMatchingResource(L"RunList", 10);
    rl.SetStatus(7);
    JDFRunList part = rl.AddPDF(L"file:///tmp/job/in.pdf", 0, -1);
    part.SetAttribute(L"KAV_tkt:VersContentType", L"Content", kTicketNs);
    part.SetNPage(sheets);

    JDFLayout layout = root.AppendMatchingResource(L"Layout", 1);
    layout.SetStatus(7);
    layout.setPartIDKeys(vWString(L"SignatureName SheetName Side"));
    layout.SetPartUsage(3);
    JDFLayout sig = layout.GetCreatePartition(33, L"SignatureName1");
    for (int k = 1; k <= sheets; ++k) {
        JDFLayout sheet = sig.GetCreatePartition(31, WString(L"SheetName" + WString::valueOf(k)));
        sheet.SetSurfaceContentsBox(JDFRectangle(0, 0, 612, 792));
        sheet.SetName(L"Sheet_1");
        sheet.GetCreateMedia(0).SetDimension(JDFXYPair(612, 792));
        JDFLayout side = sheet.GetCreatePartition(32, L"Front");
        side.SetAttribute(L"KAV_tkt:VersContentType", L"Content", kTicketNs);
        JDFContentObject co = side.GetCreateContentObject(0);
        co.SetCTM(JDFMatrix(1, 0, 0, 1, 0, 0));
        co.SetOrd(k - 1);
    }
    return doc;
}

// Auto-imposition additions: stacking, marks with job fields, link parts, delivery options in
// the maker's delivery namespace. With schemaForeign, also the two structures the JDF 1.8 schema
// does not allow where auto-imposition puts them (RunList/MetadataMap, ContentObject/FitPolicy).
inline JDF::JDFDoc buildAutoImposedTicket(bool schemaForeign = false) {
    using namespace JDF;
    JDFDoc doc = buildInjectedLayoutTicket(2);
    JDFNode root = doc.GetJDFRoot();
    root.SetAttribute(L"xmlns:KAV", L"http://www.vorlan.org/JDF/1.0");
    JDFRunList rl = root.GetMatchingResource(L"RunList", 10);
    KElement delivery = rl.GetCreateElement(L"KAV:OrvelDeliveryOptions", L"http://www.vorlan.org/JDF/delivery/1.0");
    delivery.SetAttribute(L"OutputDelivery", L"reverse");
    delivery.SetAttribute(L"TwoSided", L"false");
    JDFRunList run = rl.GetElement(L"RunList");
    run.SetPages(JDFIntegerRangeList(L"0 ~ -1"));
    run.SetRunTag(L"PDFVT_Job");
    if (schemaForeign) {
        JDFMetadataMap mm = run.AppendMetadataMap();
        mm.SetDataType(8);
        mm.SetName(L"RunTags");
        mm.SetValueFormat(L"%s");
        mm.SetValueTemplate(L"doctype");
        mm.SetContext(2);
        mm.AppendExpr(L"doctype", L"PDFVT_Job");
    }

    JDFLayout layout = root.GetMatchingResource(L"Layout", 3);
    layout.SetAutomated(true);
    layout.SetBaseOrdReset(2);
    JDFLogicalStackParams lsp = layout.AppendLogicalStackParams();
    lsp.SetRestrictions(1);
    lsp.SetMaxStackDepth(3);
    for (int i = 0; i < 2; ++i) {
        JDFStack st = lsp.AppendStack();
        st.SetLogicalStackOrd(i);
        st.SetLogicalStackSequence(1);
    }
    JDFLayout sig = layout.GetElement(L"Layout");
    sig.SetRunTags(vWString{L"PDFVT_Job"});
    sig.RemoveAttribute(L"SignatureName");
    layout.setPartIDKeys(vWString{L"RunTags", L"SheetName", L"Side"});
    JDFLayout side = sig.GetElement(L"Layout").GetElement(L"Layout");
    side.SetSide(2);
    JDFContentObject co = side.GetContentObject(0);
    co.SetTrimSize(JDFXYPair(100, 200));
    co.SetLogicalStackOrd(0);
    if (schemaForeign) {
        JDFFitPolicy fp = co.GetCreateFitPolicy();
        fp.SetSizePolicy(3);
        fp.SetRotatePolicy(4);
    }
    JDFMarkObject mo = side.AppendMarkObject();
    mo.SetCTM(co.GetCTM());
    mo.SetClipBox(JDFRectangle(0, 0, 10, 10));
    JDFJobField jf = mo.AppendJobField();
    jf.SetJobFormat(L"Sheet %d/%s");
    jf.SetJobTemplate(L"SheetCount, Side");
    JDFDeviceMark dm = mo.AppendDeviceMark();
    dm.SetFont(L"Times-Roman");
    dm.SetFontSize(9);

    JDFRunList out = root.AppendMatchingResource(L"RunList", 2);
    out.SetStatus(7);
    out.setPartIDKeys(vWString{L"SheetIndex"});
    JDFResourceLink link = root.GetLink(out);
    for (int i : {1, 3}) {
        JDFIntegerRangeList r;
        r.Append(i);
        link.AppendPart().SetSheetIndex(r);
    }
    return doc;
}

}  // namespace jdflayer_test
