// Reads RunList resources into content and mark runs and the PDFs they name.
#include <cstdio>
#include <cstdlib>
#include <cwctype>
#include <memory>

#include "jdf/ticket_reading.h"
#include "pdf/page_geometry.h"
#include "platform/os/text.h"

namespace vorlan::jdf {

std::wstring urlKey(const wchar_t* url) {
    std::wstring key(url ? url : L"");
    for (wchar_t& c : key) c = static_cast<wchar_t>(std::towlower(static_cast<wint_t>(c)));
    return key;
}

PdfPositions::PdfPositions(const std::vector<LD_PDF*>& pdfs) {
    for (size_t i = 0; i < pdfs.size(); ++i)
        if (pdfs[i]) add(pdfs[i]->url, static_cast<int>(i));
}

int PdfPositions::find(const wchar_t* url) const {
    auto it = first_.find(urlKey(url));
    return it == first_.end() ? -1 : it->second;
}

void PdfPositions::add(const wchar_t* url, int position) { first_.emplace(urlKey(url), position); }

// The length a Pages range that counts from the end is read against when the PDF's own page
// count is not known.
constexpr int kUnknownPdfLength = 1000;

int PdfPageCounts::of(const wchar_t* url) {
    std::wstring key = urlKey(url);
    auto known = counts_.find(key);
    if (known != counts_.end()) return known->second;
    int count = 0;
    wchar_t* found = worker_.findTicketFileInDir(folder_.data(), url);
    if (found) count = getPDFPageCount(worker_.zipFileSystem, vorlan::os::narrow(found).c_str());
    std::free(found);
    if (count <= 0)
        std::fprintf(stderr, "\"%s\": PDF not found or unreadable; its page range is read against %d pages\n",
                     vorlan::os::narrow(url).c_str(), kUnknownPdfLength);
    counts_.emplace(std::move(key), count);
    return count;
}

namespace {

// The element's Pages as single page numbers; ends that count from the end of the PDF are
// resolved against its page count when pageCounts is given.
std::vector<int32_t> expandPages(const JDF::JDFRunList& element, PdfPageCounts* pageCounts) {
    JDF::JDFIntegerRangeList pages = element.GetPages();
    if (!pageCounts || !pages.CountsFromEnd()) return pages.ToVInt(kUnknownPdfLength);
    std::wstring url = element.GetLayoutElement().GetFileSpec().GetURL();
    int length = pageCounts->of(url.c_str());
    return pages.ToVInt(length > 0 ? length : kUnknownPdfLength);
}

}  // namespace

std::unique_ptr<LD_Run> makeRun(const JDF::JDFRunList& element, int32_t runNumber, bool partition,
                                PdfPageCounts* pageCounts) {
    auto run = std::make_unique<LD_Run>();
    run->runNumber = runNumber;
    run->NPage = element.GetNPage();
    run->FirstPage = element.GetFirstPage();
    run->SkipPage = element.GetSkipPage();
    run->EndOfDocument = element.GetEndOfDocument();
    if (partition) run->IsBlank = element.GetLayoutElement().IsBlank();
    run->contentType = CONTENT_CONTENT;
    LD_SetText(run->runName, element.GetRun().c_str());
    try {
        run->pages = expandPages(element, pageCounts);
    } catch (const JDF::JDFException&) {
        run->pages.clear();  // a page list too large to expand is read as absent
    }
    return run;
}

namespace {

// The PDF record of a run-list element's FileSpec.
std::unique_ptr<LD_PDF> makePdf(const JDF::JDFRunList& element, LD_Status status, bool lowerCaseMime) {
    auto pdf = std::make_unique<LD_PDF>();
    JDF::JDFFileSpec fileSpec = element.GetLayoutElement().GetFileSpec();
    LD_SetText(pdf->url, fileSpec.GetURL().c_str());
    std::wstring mime = fileSpec.GetMimeType();
    if (lowerCaseMime)
        for (wchar_t& c : mime) c = static_cast<wchar_t>(std::towlower(static_cast<wint_t>(c)));
    LD_SetText(pdf->mimeType, mime.c_str());
    pdf->status = status;
    return pdf;
}

// Appends the run to its list, pointing it to the PDF of the same URL when there is one.
void addRun(RunListReading& reading, bool marks, std::unique_ptr<LD_Run> run, std::unique_ptr<LD_PDF> pdf) {
    LD_JDF& w = reading.worker;
    if (pdf) {
        std::vector<LD_PDF*>& pdfs = marks ? w.markPDFs : w.contentPDFs;
        PdfPositions& positions = marks ? reading.markPositions : reading.contentPositions;
        int existing = positions.find(pdf->url);
        if (existing >= 0 && static_cast<size_t>(existing) < pdfs.size()) {
            run->pdf = pdfs[static_cast<size_t>(existing)];
        } else {
            if (!marks) pdf->index = static_cast<int32_t>(pdfs.size());
            positions.add(pdf->url, static_cast<int>(pdfs.size()));
            run->pdf = pdf.get();
            pdfs.push_back(pdf.release());
        }
    }
    (marks ? w.markRuns : w.contentRuns).push_back(run.release());
}

}  // namespace

void readRunListResource(RunListReading& reading, const JDF::JDFResource& resource) {
    LD_JDF& w = reading.worker;
    bool marks = reading.linkCandidates ? hasLinkWithUsage(resource, "Marks", *reading.linkCandidates)
                                        : w.isProcessUsageMarks(resource);
    JDF::JDFRunList runList(resource);

    if (vorlan::os::equalsIgnoreCase(resource.KElement::GetAttribute(L"PartIDKeys").c_str(), L"Run")) {
        LD_Status status = resource.GetStatus();
        int32_t i = 0;
        for (const JDF::KElement& child : resource.GetChildElementVector(L"RunList", L"*", {}, true, 0, false)) {
            JDF::JDFRunList partition(child);
            if (partition.GetStatus() == 7) {
                std::unique_ptr<LD_Run> run = makeRun(partition, i, true, &reading.pageCounts);
                std::unique_ptr<LD_PDF> pdf;
                if (!run->IsBlank) pdf = makePdf(partition, status, true);
                addRun(reading, marks, std::move(run), std::move(pdf));
            }
            ++i;
        }
        return;
    }

    LD_Status status = resource.GetStatus();
    if (status != 7) return;
    if (!runList.GetRun().empty()) {
        addRun(reading, marks, makeRun(runList, 0, false, &reading.pageCounts), makePdf(runList, status, false));
        return;
    }
    // A run list without a Run value names a file but no pages: a PDF without run.
    std::unique_ptr<LD_PDF> pdf = makePdf(runList, status, false);
    std::vector<LD_PDF*>& pdfs = marks ? w.markPDFs : w.contentPDFs;
    if (!marks) pdf->index = static_cast<int32_t>(pdfs.size());
    (marks ? reading.markPositions : reading.contentPositions).add(pdf->url, static_cast<int>(pdfs.size()));
    pdfs.push_back(pdf.release());
}

}  // namespace vorlan::jdf

int LD_JDF::isPDFPresent(std::vector<LD_PDF*>& pdfs, LD_PDF* pdf) {
    if (!pdf) return -1;
    for (size_t i = 0; i < pdfs.size(); ++i)
        if (pdfs[i] && vorlan::os::equalsIgnoreCase(pdfs[i]->url, pdf->url)) return static_cast<int>(i);
    return -1;
}
