// The writer's per-ordinal resources: InterpretingParams with the OCG switches of every logical
// page, the content run list and the marks run list; and the per-partition PDF copies of die
// pages.
#include <cstdlib>
#include <string>

#include "jdf/ticket_handles.h"
#include "jdf/ticket_writing.h"
#include "platform/os/file_system.h"
#include "platform/os/text.h"

namespace {

using namespace vorlan::jdf;

void writeSwitches(JDF::JDFPDFInterpretingParams pdf, const LD_OCG_InterpretingParams* params) {
    pdf.SetOCGDefault(2);
    pdf.SetOCGIntent(params && params->OCGIntent && *params->OCGIntent ? params->OCGIntent : L"View");
    pdf.SetOCGProcess(2);
    if (!params) return;
    int n = 0;
    for (const auto* names : {&params->m_OCGOn, &params->m_OCGOff}) {
        bool include = names == &params->m_OCGOn;
        for (const wchar_t* name : *names) {
            JDF::JDFOCGControl control = need(pdf.GetCreateOCGControl(n++));
            control.SetIncludeOCG(include);
            control.SetOCGName(name ? name : L"");
        }
    }
}

void writeFileSpec(LD_JDF& w, JDF::JDFLayoutElement& element, LD_PDF* pdf) {
    JDF::JDFFileSpec fileSpec = need(element.GetCreateFileSpec());
    fileSpec.SetURL(pdfURL(w, pdf));
    fileSpec.SetMimeType(pdf->mimeType);
}

int32_t tableSize(const LD_JDF& w) { return static_cast<int32_t>(w.m_OrdinalTable.size()); }

}  // namespace

namespace vorlan::jdf {

void setSinglePage(JDF::JDFRunList& part, int32_t page) {
    JDF::JDFIntegerRangeList pages;
    pages.Append(page);
    part.SetPages(pages);
}

LD_OrdinalTableElement* rowOf(LD_JDF& w, int32_t k) {
    auto& table = w.m_OrdinalTable;
    if (static_cast<size_t>(k) < table.size() && table[static_cast<size_t>(k)] && table[static_cast<size_t>(k)]->ordinal == k)
        return table[static_cast<size_t>(k)];
    return w.getOrdinalElementByOrdNum(k);
}

bool writeInterpretingParams(LD_JDF& w, JDF::JDFNode& root) {
    if (w.m_OrdinalTable.empty()) return false;
    JDF::JDFInterpretingParams resource = need(root.AppendMatchingResource(L"InterpretingParams", 1));
    resource.SetStatus(LD_RESOURCE_AVAILABLE);
    if (w.layerDataMap.empty()) return true;  // no layers: one unpartitioned resource
    writeRunPartitions(resource, tableSize(w), PartitionWriting::Deferred,
                       [&w](JDF::JDFInterpretingParams& parent, int32_t k) {
                           LD_OrdinalTableElement* row = rowOf(w, k);
                           const LD_OCG_InterpretingParams* params =
                               row && row->content ? row->content->interpretingParams : nullptr;
                           JDF::JDFInterpretingParams part = runPartition(parent, k);
                           writeSwitches(need(part.GetCreatePDFInterpretingParams(k)), params);
                       });
    return true;
}

void writeContentRunList(LD_JDF& w, JDF::JDFNode& root, PartitionWriting writing) {
    JDF::JDFRunList runList = need(root.AppendMatchingResource(L"RunList", 10));
    runList.SetStatus(LD_RESOURCE_AVAILABLE);
    // A row without content makes no partition: a list that would have none is left as it is.
    bool anyContent = false;
    for (int32_t k = 0; k < tableSize(w); ++k) {
        LD_OrdinalTableElement* row = rowOf(w, k);
        if (!row) throw WriteFailure{};
        anyContent = anyContent || row->content;
    }
    if (!anyContent) return;
    const bool dieTags = !w.jobHasTicket || !w.ticket->hasLayout();
    writeRunPartitions(runList, tableSize(w), writing, [&w, dieTags](JDF::JDFRunList& parent, int32_t k) {
        LD_OrdinalTableElement* row = rowOf(w, k);
        if (!row) throw WriteFailure{};
        if (!row->content) return;
        LD_Run* run = row->content->run;
        if (!run) throw WriteFailure{};
        JDF::JDFRunList part = runPartition(parent, k);
        bool backSide = false;
        if (row->content->page != -1) {
            setSinglePage(part, row->content->page);
            backSide = row->content->page % 2 != 0;
        }
        if (run->VersionName) setVersionTags(part, run->VersionName, run->VersionIndex, run->VersionCopyCount);
        if (dieTags) w.addRunDieTags(part, run, backSide);
        JDF::JDFLayoutElement element = need(part.GetCreateLayoutElement());
        element.SetIsTrapped(false);
        if (run->IsBlank) element.SetIsBlank(true);
        else if (run->pdf) writeFileSpec(w, element, run->pdf);
    });
}

void writeMarksRunList(LD_JDF& w, JDF::JDFNode& root, PartitionWriting writing) {
    JDF::JDFRunList runList = need(root.AppendMatchingResource(L"RunList", 9));
    runList.SetStatus(LD_RESOURCE_AVAILABLE);
    writeRunPartitions(runList, tableSize(w), writing, [&w](JDF::JDFRunList& parent, int32_t k) {
        LD_OrdinalTableElement* row = rowOf(w, k);
        if (!row) throw WriteFailure{};
        LD_MarkTableElement* mark = row->mark;
        if (!mark) {  // logical pages beyond the mark pages repeat the mark of ordinal 0
            LD_OrdinalTableElement* first = rowOf(w, 0);
            mark = first ? first->mark : nullptr;
        }
        if (!mark || !mark->run) throw WriteFailure{};
        JDF::JDFRunList part = runPartition(parent, k);
        setSinglePage(part, mark->page);
        JDF::JDFLayoutElement element = need(part.GetCreateLayoutElement());
        element.SetIsTrapped(false);
        if (mark->run->pdf) writeFileSpec(w, element, mark->run->pdf);
    });
}

}  // namespace vorlan::jdf

void LD_JDF::addRunDieTags(JDF::JDFRunList& runList, LD_Run* run, bool backSide) {
    if (!run) return;
    if (const wchar_t* text = contentTypeText(run->contentType)) setTicketAttribute(runList, L"VersContentType", text);
    if (run->contentType == CONTENT_DIE_ONLY && pageSelection.size() >= 2) {
        setTicketAttribute(runList, L"is_duplex", L"1");
        if (backSide) setTicketAttribute(runList, L"IsBackDie", L"true");
    }
}

void LD_JDF::duplicateRunListFiles(JDF::JDFNode& node) {
    // Each die partition gets its own copy of its PDF in the job folder, numbered in partition
    // order ("name_1.pdf", "name_2.pdf", …); a copy that fails leaves the partition as it was.
    int counter = 1;
    JDF::JDFResourcePool pool = node.GetResourcePool();
    for (const JDF::KElement& resource : pool.GetPoolChildren(L"RunList")) {
        for (const JDF::KElement& child : resource.GetChildrenByTagName(L"RunList")) {
            JDF::JDFRunList part(child);
            JDF::WString type = part.KElement::GetAttribute(L"KAV_tkt:VersContentType");
            if (!vorlan::os::equalsIgnoreCase(type.c_str(), L"DieWithContent") &&
                !vorlan::os::equalsIgnoreCase(type.c_str(), L"DieOnly"))
                continue;
            std::string url = vorlan::os::narrow(part.GetFileURL().c_str());
            size_t slash = url.rfind('/');
            size_t dot = url.rfind('.');
            if (slash == std::string::npos) continue;
            if (dot == std::string::npos || dot < slash) dot = url.size();
            std::string base = url.substr(slash, dot - slash);  // still starts with "/"
            std::string extension = url.substr(dot);
            std::string source = url.rfind("file://", 0) == 0 ? url.substr(7) : url;
            std::string target = std::string(jobFolder ? jobFolder : ".") + base + "_" + std::to_string(counter) + extension;
            if (!vorlan::os::copyFile(source, target)) continue;
            ++counter;
            std::wstring wideTarget = vorlan::os::widen(target.c_str());
            wchar_t* newURL = getNativeFilePath(wideTarget.data());
            if (!newURL) continue;
            part.SetFileURL(newURL);
            std::free(newURL);
        }
    }
}
