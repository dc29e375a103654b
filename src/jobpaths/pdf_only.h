// Jobs without a ticket in separation mode: PDF variants and a short ticket without a layout.
//
// The content pages come from a variant of the PDF in which the separations the first content
// object does not switch on print nothing; with an enabled die cut the same pages follow from a
// die-with-content variant (content separations dropped, die kept) and a die-only variant (only
// the die separations print). A variant that cannot be written falls back to the PDF itself (the
// die-only pages are then left out).
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "jobpaths/separation_names.h"
#include "vorlan/LD_JDF.h"

class PdfOnlyProcessingJdf {
public:
    // Keeps a copy of the output path; the caller's text is left as it is.
    PdfOnlyProcessingJdf(const char* outputPath, LD_JDF* worker);
    ~PdfOnlyProcessingJdf();

    // The whole job: LD_OK when the ticket was written; LD_INVALID_INPUT when the job has no PDF
    // or its PDF has no readable page (nothing would be printed); LD_JDF_WRITE_FAILED when the
    // ticket could not be built or saved (nothing new at the path).
    LDError run();

    // The lists the variants are made with (filled by run, or by buildSeparationLists alone).
    void buildSeparationLists();
    const vorlan::jobpaths::NameList& switchedOffSeparations() const { return switchedOff_; }
    const vorlan::jobpaths::NameList& contentOffSeparations() const { return contentOff_; }
    const vorlan::jobpaths::NameList& dieSeparations() const { return die_; }

private:
    const XMLContentObjectData* firstContentObject() const;
    void makeRuns(int32_t pages);
    LD_PDF* variantPdf(const std::string& path);
    LDError writeTicket();

    std::string outputPath_;
    LD_JDF* worker_;
    std::unique_ptr<LD_Run> contentRun_;
    std::unique_ptr<LD_Run> dieWithContentRun_;
    std::unique_ptr<LD_Run> dieOnlyRun_;
    std::vector<std::unique_ptr<LD_PDF>> variants_;  // the records of the variant files
    vorlan::jobpaths::NameList all_, die_, switchedOff_, contentOff_;
    std::vector<int32_t> pages_;  // the content pages the ticket lists, in order
};
