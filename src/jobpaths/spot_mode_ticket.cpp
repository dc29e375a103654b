// The spot-mode ticket: the layout as the versioned writer writes it, one unpartitioned
// InterpretingParams, and content and marks run lists in up to three passes over the ordinals
// (content sheets, die-with-content sheet, die-only sheet), each pass pointing at its variants.
#include <cstdlib>

#include "jdf/ticket_writing.h"
#include "jobpaths/spot_mode.h"

namespace {

using namespace vorlan::jdf;

// The file a pass shows of a PDF: its variant when that was written, else the PDF itself.
// Pass 0 (content) uses the first variant, pass 1 (die with content) the third, pass 2 (die
// only) the second.
const wchar_t* passFile(const LD_PDF& pdf, int pass) {
    switch (pass) {
        case 0: return pdf.firstVariantWritten ? pdf.firstVariantPath : pdf.nativePath;
        case 1: return pdf.thirdVariantWritten ? pdf.thirdVariantPath : pdf.nativePath;
        default: return pdf.secondVariantWritten ? pdf.secondVariantPath : pdf.nativePath;
    }
}

void writeFile(LD_JDF& w, JDF::JDFRunList& part, LD_Run* run, int pass) {
    JDF::JDFLayoutElement element = need(part.GetCreateLayoutElement());
    element.SetIsTrapped(false);
    if (run->IsBlank) {
        element.SetIsBlank(true);
        return;
    }
    if (!run->pdf) return;
    wchar_t* url = w.getNativeFilePath(const_cast<wchar_t*>(passFile(*run->pdf, pass)));
    if (!url) throw WriteFailure{};
    JDF::WString text(url);
    std::free(url);
    JDF::JDFFileSpec fileSpec = need(element.GetCreateFileSpec());
    fileSpec.SetURL(text);
    fileSpec.SetMimeType(run->pdf->mimeType);
}

// One run list: `passes` passes over the n ordinals, pass p writing partitions p·n … p·n + n - 1.
// A row without a page of the kind shows the page of ordinal 0.
void writePasses(LD_JDF& w, JDF::JDFNode& root, bool marks, int passes) {
    JDF::JDFRunList runList = need(root.AppendMatchingResource(L"RunList", marks ? 9 : 10));
    runList.SetStatus(LD_RESOURCE_AVAILABLE);
    const int32_t n = static_cast<int32_t>(w.m_OrdinalTable.size());
    LD_OrdinalTableElement* first = rowOf(w, 0);
    writeRunPartitions(runList, passes * n, PartitionWriting::Deferred, [&w, marks, n, first](JDF::JDFRunList& parent, int32_t i) {
        const int pass = i / n;
        LD_OrdinalTableElement* row = rowOf(w, i % n);
        if (!row) throw WriteFailure{};
        LD_Run* run = nullptr;
        int32_t page = -1;
        if (marks) {
            LD_MarkTableElement* mark = row->mark ? row->mark : first ? first->mark : nullptr;
            if (mark) {
                run = mark->run;
                page = mark->page;
            }
        } else {
            LD_ContentTableElement* content = row->content ? row->content : first ? first->content : nullptr;
            if (content) {
                run = content->run;
                page = content->page;
            }
        }
        if (!run) throw WriteFailure{};
        JDF::JDFRunList part = runPartition(parent, i);
        if (page != -1) setSinglePage(part, page);
        writeFile(w, part, run, pass);
    });
}

}  // namespace

LDError SpotModeProcessingJdf::writeTicket() {
    LD_JDF& w = *worker_;
    return vorlan::jdf::writeTicket(w, outputPath_.c_str(), [&w](JDF::JDFDoc& doc) {
        JDF::JDFNode root = startCombinedNode(doc, L"Imposition Interpreting Rendering DigitalPrinting");
        writeLayout(w, root);
        need(root.AppendMatchingResource(L"InterpretingParams", 1)).SetStatus(LD_RESOURCE_AVAILABLE);
        const int passes = w.dieEnabled ? 3 : 1;
        if (!w.contentRuns.empty()) writePasses(w, root, false, passes);
        if (!w.markRuns.empty()) writePasses(w, root, true, passes);
        return root.AppendMatchingResource(L"Component", 2).isNull() ? LD_FAILED : LD_OK;
    });
}
