// The parts of the ticket reader that walk one resource each.
#pragma once

#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "platform/jdf/jdf.h"
#include "vorlan/LD_JDF.h"

namespace vorlan::jdf {

// Where each PDF of the worker's lists stands, by URL ignoring case, so that a ticket with many
// runs finds the PDF it shares without searching the whole list each time.
class PdfPositions {
public:
    // Indexes the PDFs already in the list.
    explicit PdfPositions(const std::vector<LD_PDF*>& pdfs);
    // Position of the first PDF with that URL (ignoring case), or -1.
    int find(const wchar_t* url) const;
    void add(const wchar_t* url, int position);

private:
    std::unordered_map<std::wstring, int> first_;
};

// An element that may link a resource: a child of a ResourceLinkPool (inPool), or an element
// whose name ends in "Ref".
struct LinkCandidate {
    pugi::xml_node node;
    bool inPool;
};

// Whether one of the candidates links the resource with that ProcessUsage (ASCII, ignoring
// case): the answer of LD_JDF::isProcessUsageMarks / isProcessUsageDocument, without a walk.
bool hasLinkWithUsage(const JDF::JDFResource& resource, const char* usage, const std::vector<LinkCandidate>& candidates);

// Page counts of the PDFs a ticket names, each found in the job's folder as the pipeline finds
// it (LD_JDF::findTicketFileInDir) and opened once.
class PdfPageCounts {
public:
    PdfPageCounts(LD_JDF& worker, std::wstring folder) : worker_(worker), folder_(std::move(folder)) {}
    // The page count of the PDF that url names; 0 when it is not found, cannot be read or has
    // no pages.
    int of(const wchar_t* url);

private:
    LD_JDF& worker_;
    std::wstring folder_;
    std::unordered_map<std::wstring, int> counts_;
};

struct RunListReading {
    LD_JDF& worker;
    PdfPositions contentPositions;
    PdfPositions markPositions;
    // Resolves Pages ranges that count from the end of the PDF ("0 ~ -1").
    PdfPageCounts pageCounts;
    // The document's link candidates while it is unchanged since they were gathered; when
    // null, the worker is asked.
    const std::vector<LinkCandidate>* linkCandidates = nullptr;
    // pdfFolder: where the ticket's PDFs are looked for.
    RunListReading(LD_JDF& w, std::wstring pdfFolder)
        : worker(w), contentPositions(w.contentPDFs), markPositions(w.markPDFs), pageCounts(w, std::move(pdfFolder)) {}
};

// A content run from a run-list element (a partition or an unpartitioned resource): NPage,
// FirstPage, SkipPage, EndOfDocument, the Run value and the Pages as single page numbers (a list
// too large to expand reads as none); IsBlank from its LayoutElement only for a partition.
// Pages ends that count from the end ("0 ~ -1") are resolved against the PDF's page count from
// pageCounts; without pageCounts, or when the PDF cannot be counted, against 1000 pages.
std::unique_ptr<LD_Run> makeRun(const JDF::JDFRunList& element, int32_t runNumber, bool partition,
                                PdfPageCounts* pageCounts = nullptr);

// Reads one RunList resource into runs and PDFs.
void readRunListResource(RunListReading& reading, const JDF::JDFResource& runList);

// Reads one Layout resource into the layout tree; LD_FAILED when a text copy cannot be made.
LDError readLayoutResource(LD_JDF& worker, const JDF::KElement& layout);

// Lower-case form of a URL, the key PDFs are shared by.
std::wstring urlKey(const wchar_t* url);

}  // namespace vorlan::jdf
