// Debug printers: a description of JDF elements on the standard output.
#include <cstdio>
#include <cwchar>
#include <string>

#include "platform/jdf/jdf.h"
#include "platform/os/text.h"
#include "vorlan/LD_JDF.h"

namespace {

// What the JDF schema declares for the element kinds the reader works with.
struct ElementDeclaration {
    const wchar_t* name;
    const wchar_t* optionalAttributes;
    const wchar_t* requiredAttributes;
    const wchar_t* partAttributes;  // null: the kind is not partitionable
    const wchar_t* optionalElements;
};

const ElementDeclaration kDeclarations[] = {
    {L"JDF", L"Activation Category DescriptiveName ICSVersions MaxVersion NamedFeatures ProjectID SpawnID Template Types Version",
     L"ID JobPartID Status Type", nullptr, L"AncestorPool AuditPool CustomerInfo NodeInfo ResourceLinkPool ResourcePool StatusPool"},
    {L"Layout", L"Automated BaseOrdReset MaxOrd Name OrdReset SheetCountReset SourceWorkStyle SurfaceContentsBox",
     L"Class ID Status", L"SignatureName SheetName Side", L"ContentObject LayoutElement MarkObject Media MediaSource Signature TransferCurvePool"},
    {L"AuditPool", L"", L"", nullptr, L"Created Modified PhaseTime ProcessRun ResourceAudit Spawned Merged Notification"},
    {L"ResourcePool", L"", L"", nullptr, L"(any resource)"},
    {L"RunList", L"ComponentGranularity DocCopies EndOfBundleItem EndOfDocument EndOfSet FirstPage IgnoreContext IsPage "
                 L"LogicalPage NDoc NPage NSet PageListIndex Pages SetCopies SkipPage Sorted",
     L"Class ID Status", L"Run RunIndex RunPage RunSet RunTags DocIndex", L"ByteMap DynamicInput InsertSheet LayoutElement PageList"},
    {L"FileSpec", L"Application CheckSum Compression Disposition FileFormat FileSize FileVersion MimeType OverwritePolicy URL UserFileName",
     L"", nullptr, L"Container Disposition FileAlias NetworkHeader"},
    {L"ContentObject", L"ClipBox ClipPath CompensationCTMFormat HalfTonePhaseOrigin LayerID LogicalStackOrd Ord OrdExpression "
                       L"SourceClipPath TrimClipPath TrimCTM TrimSize",
     L"CTM", nullptr, L"FitPolicy"},
    {L"MarkObject", L"ClipBox ClipPath LayerID LayoutElementPageNum Ord OrdExpression SourceClipPath TrimClipPath TrimCTM TrimSize",
     L"CTM", nullptr, L"DeviceMark DynamicField JobField LayoutElement RefAnchor"},
    {L"InterpretingParams", L"Center FitToPage MirrorAround Poster PosterOverlap PrintQuality Scaling ScalingOrigin",
     L"Class ID Status", L"Run RunIndex", L"InterpretingDetails ObjectResolution PDFInterpretingParams"},
    {L"RenderingParams", L"BandHeight BandOrdering BandWidth ColorantDepth Interleaved MimeType", L"Class ID Status",
     L"Run Separation", L"AutomatedOverPrintParams ObjectResolution TIFFFormatParams"},
    {L"DigitalPrintingParams", L"Collate ManualFeed NonPrintableMarginBottom NonPrintableMarginLeft NonPrintableMarginRight "
                               L"NonPrintableMarginTop OutputBin PageDelivery PrintingType SheetLay",
     L"Class ID Status", L"Run SheetName Side", L"ApprovalParams Component Disjointing Media"},
    {L"Media", L"Dimension FrontCoatings BackCoatings Grade GrainDirection MediaColorName MediaType MediaUnit Thickness Weight",
     L"Class ID Status", L"Location SheetName Side", L"Color ColorMeasurementConditions HoleList TabDimensions"},
};

void printLine(const std::wstring& text) { std::printf("%s\n", vorlan::os::toUtf8(text).c_str()); }

void collectDescendants(const JDF::KElement& element, std::vector<JDF::KElement>& out) {
    for (JDF::KElement child = element.GetFirstChildElement(); !child.isNull(); child = child.GetNextSiblingElement()) {
        out.push_back(child);
        collectDescendants(child, out);
    }
}

}  // namespace

LDError LD_JDF::Debug_TestElement(JDF::KElement& element, char flags) {
    std::string name = element.GetNodeName().getUTF8();
    std::printf("\n\n\nTesting %s\n", name.c_str());
    if (flags & 1) {
        JDF::JDFAttributeMap attributes = element.GetAttributeMap();
        std::printf("Printing the %zu attribute(s) of %s\n", attributes.size(), name.c_str());
        for (const auto& [key, value] : attributes) std::printf("%s: %s\t", key.getUTF8().c_str(), value.getUTF8().c_str());
        std::printf("\n");
    }
    if (flags & 2) {
        JDF::vElement children = element.GetChildElementVector(L"*", L"*", JDF::JDFAttributeMap(), true, 0, false);
        std::printf("Printing the %zu direct child(ren) of %s\n", children.size(), name.c_str());
        for (const JDF::KElement& child : children) std::printf("%s\n", child.GetNodeName().getUTF8().c_str());
    }
    if (flags & 4) {
        std::vector<JDF::KElement> all;
        collectDescendants(element, all);
        std::printf("Printing all the %zu child(ren) of %s\n", all.size(), name.c_str());
        for (const JDF::KElement& child : all) std::printf("%s\n", child.GetNodeName().getUTF8().c_str());
    }
    if ((flags & 5) == 5) {
        const ElementDeclaration* found = nullptr;
        for (const ElementDeclaration& d : kDeclarations)
            if (vorlan::os::equalsIgnoreCase(element.GetLocalName().c_str(), d.name)) found = &d;
        if (!found) {
            std::printf("Skipping node\n");
        } else {
            printLine(std::wstring(L"Optional Attributes: ") + found->optionalAttributes);
            printLine(std::wstring(L"Required Attributes: ") + found->requiredAttributes);
            if (found->partAttributes) printLine(std::wstring(L"Part Attributes: ") + found->partAttributes);
            printLine(std::wstring(L"Optional Element: ") + found->optionalElements);
        }
    }
    return LD_OK;
}

LDError LD_JDF::Debug_TestVector(JDF::vElement& elements) {
    for (JDF::KElement& element : elements) {
        if (element.isNull()) return LD_FAILED;
        Debug_TestElement(element, 1);
    }
    return LD_OK;
}
