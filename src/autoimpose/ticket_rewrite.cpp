// One rewrite of a template ticket: parse, run the stages in order, write back atomically.
#include <exception>

#include "autoimpose/rewrite_stages.h"

namespace vorlan::autoimpose {
namespace {

// The layout edits that open the rewrite: automated layout, the signature layout's run tag.
// False when the ticket has no Layout or no signature layout.
bool automateLayout(TicketRewrite& t) {
    t.rootLayout = t.rootNode.GetMatchingResource(L"Layout", 3);
    if (t.rootLayout.isNull()) return false;
    t.rootLayout.SetAutomated(true);
    if (t.settings.variableData()) t.rootLayout.SetBaseOrdReset(2);
    t.signatureLayout = t.rootLayout.GetElement(L"Layout");
    if (t.signatureLayout.isNull()) return false;
    t.signatureLayout.SetRunTags(JDF::vWString{t.runTag()});
    t.signatureLayout.RemoveAttribute(L"SignatureName");
    t.sheetLayout = t.signatureLayout.GetElement(L"Layout");
    return true;
}

bool rewrite(TicketRewrite& t, const JDF::XMLDoc& document) {
    if (t.rootNode.isNull() || !t.rootNode.IsValid(5)) return false;
    JDF::JDFRenderingParams rendering = t.rootNode.GetMatchingResource(L"RenderingParams", 3);
    if (rendering.isNull()) {
        rendering = t.rootNode.AppendMatchingResource(L"RenderingParams", 1);
        if (rendering.isNull()) return false;
        t.changes.renderingParamsAdded = true;
    }
    rendering.SetInterleaved(true);
    rendering.SetStatus(LD_RESOURCE_AVAILABLE);

    writeDeliveryOptions(t);
    moveTemplateRuns(t);
    tagDocumentRuns(t);
    if (!automateLayout(t)) return false;
    const AutoImpositionSettings& s = t.settings;
    if (t.markCount + t.labelCount >= 1 && !t.sheetLayout.isNull()) convertMarksAndLabels(t);
    if (s.rotatePolicy != 1 || s.sizePolicy != 0) setTrimSizesAndFitPolicies(t);
    if (s.BindingType == 10 || s.BindingType == 12 || (s.BindingType == 17 && s.variableData())) writeStacking(t);
    t.rootLayout.setPartIDKeys(JDF::vWString{L"RunTags", L"SheetName", L"Side"});
    if (s.RangeType != 0) writeSheetRanges(t);
    return document.Write2File(JDF::WString(s.jdfPath));
}

}  // namespace

bool rewriteTicket(AutoImpositionSettings& settings, ImpositionChanges& changes) {
    try {
        JDF::JDFParser parser;
        if (settings.jdfPath.empty() || !parser.Parse(JDF::WString(settings.jdfPath))) return false;
        TicketRewrite t(settings, changes);
        t.rootNode = JDF::JDFDoc(parser.GetDocument()).GetJDFRoot();
        return rewrite(t, parser.GetDocument());
    } catch (const std::exception&) {
        // A refused edit (JDFException) or exhausted memory: nothing was written.
        return false;
    }
}

}  // namespace vorlan::autoimpose
