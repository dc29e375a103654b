// The ticket of a job whose ticket had no layout: one Combined node with interpreting, rendering
// and digital-printing parameters, a copy of the ticket's Media, one run list of the content
// (and, with the die line printed, the die) parts, and for an explicit page list an injected
// layout with one sheet per listed page.
#include "jdf/injected_layout.h"
#include "jdf/ticket_writing.h"
#include "jobpaths/layout_injection.h"

namespace {

using namespace vorlan::jdf;

// A whole run as one part: the file's pages 0 … -1, then NPage when positive and Pages = the
// run's own pages, or FirstPage … NPage - 1 when it lists none.
void appendWholeRun(LD_JDF& w, JDF::JDFRunList& runList, int32_t& next, const LD_Run& run, const JDF::WString& url) {
    JDF::JDFRunList part = appendFilePart(runList, next, url, L"application/pdf", run.contentType);
    JDF::JDFIntegerRangeList pages;
    pages.Append(0, -1);
    if (run.NPage > 0) part.SetNPage(run.NPage);
    if (!run.pages.empty()) {
        std::vector<int32_t> listed = run.pages.values();
        pages = JDF::JDFIntegerRangeList();
        w.convertPagesVecToJDFRangeList(listed, pages);
    } else if (run.FirstPage < run.NPage) {
        pages = JDF::JDFIntegerRangeList();
        if (run.FirstPage == run.NPage - 1) pages.Append(run.FirstPage);
        else pages.Append(run.FirstPage, run.NPage - 1);
    }
    part.SetPages(pages);
}

}  // namespace

LDError LayoutInjectionProcessingJdf::writeTicket() {
    LD_JDF& w = *worker_;
    const bool listed = w.pageRangeMode == 3;
    return vorlan::jdf::writeTicket(w, outputPath_.c_str(), [&](JDF::JDFDoc& doc) {
        JDF::JDFNode root = startCombinedNode(doc, listed ? L"Imposition Interpreting Rendering DigitalPrinting"
                                                          : L"Interpreting Rendering DigitalPrinting");
        need(root.AppendMatchingResource(L"InterpretingParams", 1)).SetStatus(7);
        if (!media_.isNull()) {
            JDF::JDFResource media = need(root.GetResourcePool().AppendResource(media_));
            need(JDF::JDFResourceLinkPool(root.GetResourceLinkPool()).AppendResource(media, true));
        }
        JDF::JDFRunList runList = need(JDF::JDFRunList(root.AppendMatchingResource(L"RunList", 10)));
        runList.SetStatus(7);

        int32_t next = 0;
        if (w.pageRangeMode == 0) {
            for (const Part* p : content_) appendWholeRun(w, runList, next, *p->run, p->url);
        } else {
            // One part per selected page, holding that page alone (not its run's whole page list,
            // which would print every page of the run once per selected page).
            for (size_t i = 0; i < rows_.size(); ++i) {
                if (!selected_[i]) continue;
                JDF::JDFRunList part = appendFilePart(runList, next, rows_[i].part->url, L"application/pdf", CONTENT_CONTENT);
                setSinglePage(part, rows_[i].page);
                part.SetNPage(1);
            }
        }
        if (w.printDieLine) {
            for (const Part* p : dieWithContent_) appendWholeRun(w, runList, next, *p->run, p->url);
            for (const Part* p : dieOnly_) appendWholeRun(w, runList, next, *p->run, p->url);
        }
        if (listed) {
            JDF::JDFLayout layout;
            if (!injectLayout(root, layout, InjectedSheets::Written)) throw WriteFailure{};
        }
        return root.AppendMatchingResource(L"Component", 2).isNull() ? LD_FAILED : LD_OK;
    });
}
