// The stages of one ticket rewrite (ticket_rewrite.cpp runs them in order).
// A stage edits the parsed ticket through the JDF layer, records what it changed, and lets the
// layer's JDFException through: the rewrite then fails and nothing is written.
#pragma once

#include "autoimpose/auto_imposition.h"
#include "platform/jdf/jdf.h"
#include "vorlan/LD_Records.h"

namespace vorlan::autoimpose {

// Namespaces of the delivery-options extension: the prefix KAV on the root, and the element's own.
inline const wchar_t* const kMakerTicketNs = L"http://www.vorlan.org/JDF/1.0";
inline const wchar_t* const kDeliveryOptionsNs = L"http://www.vorlan.org/JDF/delivery/1.0";

struct TicketRewrite {
    TicketRewrite(AutoImpositionSettings& s, ImpositionChanges& c) : settings(s), changes(c) {}

    AutoImpositionSettings& settings;
    ImpositionChanges& changes;
    JDF::JDFNode rootNode;
    JDF::JDFLayout rootLayout;
    JDF::JDFLayout signatureLayout;
    JDF::JDFLayout sheetLayout;  // may be null
    int markCount = 0;           // template pages that are marks
    int labelCount = 0;          // ... and sheet labels

    // The run tag of the job's pages.
    const wchar_t* runTag() const { return settings.variableData() ? L"PDFVT_Job" : L"PDF_Job"; }
    // The side partitions of the sheet layout (none without one).
    JDF::vElement sides() const;
};

// Run lists.
// With reverse delivery: the KAV:OrvelDeliveryOptions child of the document run list.
void writeDeliveryOptions(TicketRewrite& t);
// Removes the template's "Mark.tmp" and "SheetLabel.tmp" run partitions, counting their pages,
// and gives the mark file a Marks run list of its own.
void moveTemplateRuns(TicketRewrite& t);
// Every document run partition: all pages and the run tag (variable data: a metadata map too).
void tagDocumentRuns(TicketRewrite& t);
// Sheet or set selection by RangeType (1 odd sheets, 2 even sheets, 3 pages of the first run,
// 4 sheet ranges, 5 set ranges; other values an output run list without parts).
void writeSheetRanges(TicketRewrite& t);

// Layout.
// Template content objects become mark objects (marks) or labelled mark objects (sheet labels);
// the job's content objects are renumbered from 0. Reverse delivery turns the sides.
void convertMarksAndLabels(TicketRewrite& t);
// TrimSize of every content object, and its FitPolicy when a policy is not the default.
void setTrimSizesAndFitPolicies(TicketRewrite& t);
// Logical stacks on the root layout and stack positions of the first row × col content objects
// of the front and back sides.
void writeStacking(TicketRewrite& t);

}  // namespace vorlan::autoimpose
