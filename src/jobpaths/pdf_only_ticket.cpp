// The PDF-only ticket: no layout, one Media of the first page's size, and one run list holding
// the selected pages once per group (content, die with content, die only), each part tagged with
// what it shows.
#include "jdf/ticket_writing.h"
#include "jobpaths/pdf_only.h"
#include "pdf/page_geometry.h"
#include "platform/os/text.h"

namespace {

using namespace vorlan::jdf;

// Appends one Run partition per page, numbered on from `next`: the page of the run's file.
void appendParts(LD_JDF& w, JDF::JDFRunList& runList, int32_t& next, const LD_Run& run,
                 const std::vector<int32_t>& pages) {
    const JDF::WString url = pdfURL(w, run.pdf);
    const bool die = run.contentType != CONTENT_CONTENT;
    for (int32_t page : pages) {
        JDF::JDFRunList part = appendFilePart(runList, next, url, L"application/pdf", run.contentType);
        setSinglePage(part, page);
        if (!die) {
            if (run.VersionName) setVersionTags(part, run.VersionName, run.VersionIndex, run.VersionCopyCount);
            continue;
        }
        if (run.NPage < 2) continue;  // a one-page die prints on one side
        setTicketAttribute(part, L"is_duplex", L"1");
        if (page == 0) setTicketAttribute(part, L"IsBackDie", L"false");
        if (page == 1) setTicketAttribute(part, L"IsBackDie", L"true");
    }
}

}  // namespace

LDError PdfOnlyProcessingJdf::writeTicket() {
    LD_JDF& w = *worker_;
    return vorlan::jdf::writeTicket(w, outputPath_.c_str(), [&](JDF::JDFDoc& doc) {
        JDF::JDFNode root = startCombinedNode(doc, L"Interpreting Rendering DigitalPrinting");
        need(root.AppendMatchingResource(L"InterpretingParams", 1)).SetStatus(LD_RESOURCE_AVAILABLE);

        // The first page's size as shown (width first); 0 0 when the page cannot be read.
        double height = 0, width = 0;
        const std::string input = vorlan::os::narrow(w.inputPDF->nativePath);
        getFirstPageSize(w.zipFileSystem, input.c_str(), &height, &width);
        JDF::JDFMedia media = need(JDF::JDFMedia(root.AppendMatchingResource(L"Media", 10)));
        media.SetStatus(LD_RESOURCE_AVAILABLE);
        media.SetDimension(JDF::JDFXYPair(width, height));

        JDF::JDFRunList runList = need(JDF::JDFRunList(root.AppendMatchingResource(L"RunList", 10)));
        runList.SetStatus(LD_RESOURCE_AVAILABLE);
        int32_t next = 0;
        appendParts(w, runList, next, *contentRun_, pages_);
        if (w.dieEnabled && dieWithContentRun_) appendParts(w, runList, next, *dieWithContentRun_, pages_);
        if (w.dieEnabled && dieOnlyRun_) appendParts(w, runList, next, *dieOnlyRun_, pages_);
        return root.AppendMatchingResource(L"Component", 2).isNull() ? LD_FAILED : LD_OK;
    });
}
