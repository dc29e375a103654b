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

struct RunListReading {
    LD_JDF& worker;
    PdfPositions contentPositions;
    PdfPositions markPositions;
    // The document's link candidates while it is unchanged since they were gathered; when
    // null, the worker is asked.
    const std::vector<LinkCandidate>* linkCandidates = nullptr;
    explicit RunListReading(LD_JDF& w) : worker(w), contentPositions(w.contentPDFs), markPositions(w.markPDFs) {}
};

// A content run from a run-list element (a partition or an unpartitioned resource): NPage,
// FirstPage, SkipPage, EndOfDocument, the Run value and the Pages expanded with ToVInt(1000) (a
// list too large to expand reads as none); IsBlank from its LayoutElement only for a partition.
std::unique_ptr<LD_Run> makeRun(const JDF::JDFRunList& element, int32_t runNumber, bool partition);

// Reads one RunList resource into runs and PDFs.
void readRunListResource(RunListReading& reading, const JDF::JDFResource& runList);

// Reads one Layout resource into the layout tree; LD_FAILED when a text copy cannot be made.
LDError readLayoutResource(LD_JDF& worker, const JDF::KElement& layout);

// Lower-case form of a URL, the key PDFs are shared by.
std::wstring urlKey(const wchar_t* url);

}  // namespace vorlan::jdf
