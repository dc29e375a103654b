// Rewrite stages on the ticket's run lists: delivery options, the template's mark and label runs,
// the document runs' pages and tags, and sheet ranges.
#include <algorithm>
#include <climits>

#include "autoimpose/rewrite_stages.h"

namespace vorlan::autoimpose {
namespace {

bool endsWith(const JDF::WString& text, const wchar_t* suffix) {
    const std::wstring tail(suffix);
    return text.size() >= tail.size() && text.compare(text.size() - tail.size(), tail.size(), tail) == 0;
}

// A 1-based settings index as the 0-based value the ticket holds.
int zeroBased(int32_t index) { return static_cast<int>(std::max<int64_t>(int64_t{index} - 1, INT_MIN)); }

JDF::JDFIntegerRangeList zeroBasedRange(const std::pair<int32_t, int32_t>& range) {
    JDF::JDFIntegerRangeList list;
    list.Append(zeroBased(range.first), zeroBased(range.second));
    return list;
}

// One part per range, selecting it with select (JDFPart::SetSheetIndex or SetSetIndex).
int appendRangeParts(JDF::JDFResourceLink& link, const std::vector<std::pair<int32_t, int32_t>>& ranges,
                     void (JDF::JDFPart::*select)(const JDF::JDFIntegerRangeList&)) {
    for (const auto& range : ranges) (link.AppendPart().*select)(zeroBasedRange(range));
    return static_cast<int>(ranges.size());
}

// One part per index first, first + 2, ... below total.
int appendEveryOtherSheet(JDF::JDFResourceLink& link, int first, int32_t total) {
    int parts = 0;
    for (int64_t i = first; i < total; i += 2, ++parts) {
        JDF::JDFIntegerRangeList sheet;
        sheet.Append(static_cast<int>(i));
        link.AppendPart().SetSheetIndex(sheet);
    }
    return parts;
}

}  // namespace

void writeDeliveryOptions(TicketRewrite& t) {
    if (!t.settings.reverseDelivery()) return;
    t.rootNode.SetAttribute(L"xmlns:KAV", kMakerTicketNs);
    JDF::JDFRunList document = t.rootNode.GetMatchingResource(L"RunList", 10);
    if (document.isNull()) return;
    JDF::KElement options = document.GetCreateElement(L"KAV:OrvelDeliveryOptions", kDeliveryOptionsNs);
    options.SetAttribute(L"OutputDelivery", L"reverse");
    // Read as unsigned: a negative isDuplex counts as two-sided.
    options.SetAttribute(L"TwoSided", static_cast<uint32_t>(t.settings.isDuplex) < 2 ? L"false" : L"true");
    t.changes.deliveryOptions = true;
}

void moveTemplateRuns(TicketRewrite& t) {
    JDF::JDFRunList runs = t.rootNode.GetMatchingResource(L"RunList", 3);
    if (runs.isNull()) return;
    JDF::WString markFile;
    for (const JDF::KElement& element : runs.GetChildrenByTagName(L"RunList")) {
        JDF::JDFRunList part(element);
        const JDF::WString url = part.GetFileURL();
        const bool marks = endsWith(url, L"Mark.tmp");
        if (!marks && !endsWith(url, L"SheetLabel.tmp")) continue;
        (marks ? t.markCount : t.labelCount) = part.GetPages().NElements();
        if (marks) markFile = url;
        part.DeleteNode();
    }
    t.changes.markPages = t.markCount;
    t.changes.labelPages = t.labelCount;
    if (t.markCount == 0) return;
    JDF::JDFRunList markRuns = t.rootNode.AppendMatchingResource(L"RunList", 9);
    markRuns.AddRun(markFile, 0, -1);
    markRuns.SetStatus(LD_RESOURCE_AVAILABLE);
    markRuns.SetRunTag(t.runTag());
    t.changes.marksRunList = true;
}

void tagDocumentRuns(TicketRewrite& t) {
    JDF::JDFRunList document = t.rootNode.GetMatchingResource(L"RunList", 10);
    if (document.isNull()) return;
    for (const JDF::KElement& element : document.GetChildrenByTagName(L"RunList")) {
        JDF::JDFRunList part(element);
        part.SetPages(JDF::JDFIntegerRangeList(L"0 ~ -1"));
        part.SetRunTag(t.runTag());
        if (t.settings.variableData()) {
            // The engine reads each document's run tag from its "doctype" metadata.
            JDF::JDFMetadataMap map = part.AppendMetadataMap();
            map.SetDataType(8);
            map.SetName(L"RunTags");
            map.SetValueFormat(L"%s");
            map.SetValueTemplate(L"doctype");
            map.SetContext(2);
            map.AppendExpr(L"doctype", L"PDFVT_Job");
        }
        ++t.changes.documentRuns;
    }
}

void writeSheetRanges(TicketRewrite& t) {
    const AutoImpositionSettings& s = t.settings;
    int& parts = t.changes.sheetRangeParts;
    if (s.RangeType == 5) {
        JDF::JDFResourceLink link = t.rootNode.GetMatchingLink(L"RunList", 10);
        if (!link.isNull()) parts += appendRangeParts(link, s.ranges, &JDF::JDFPart::SetSetIndex);
        return;
    }
    if (s.RangeType == 3) {
        JDF::JDFRunList first = t.rootNode.GetMatchingResource(L"RunList", 10).GetElement(L"RunList");
        if (first.isNull()) return;
        JDF::JDFIntegerRangeList pages;
        for (const auto& range : s.ranges) pages.Append(zeroBased(range.first), zeroBased(range.second));
        first.SetPages(pages);
        return;
    }
    JDF::JDFRunList output = t.rootNode.AppendMatchingResource(L"RunList", 2);
    output.SetStatus(LD_RESOURCE_AVAILABLE);
    output.setPartIDKeys(JDF::vWString{L"SheetIndex"});
    JDF::JDFResourceLink link = t.rootNode.GetLink(output);
    if (s.RangeType == 4)
        parts += appendRangeParts(link, s.ranges, &JDF::JDFPart::SetSheetIndex);
    else if (s.RangeType == 1)
        parts += appendEveryOtherSheet(link, 1, s.TotalCount);
    else if (s.RangeType == 2)
        parts += appendEveryOtherSheet(link, 0, s.TotalCount);
}

}  // namespace vorlan::autoimpose
