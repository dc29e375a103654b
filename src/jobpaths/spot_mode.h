// Ticket jobs in separation mode: PDF variants in which chosen separations print nothing or
// print alone, and a ticket that points content and die sheets at them.
//
// For every PDF of the description's layer data three variants are written, in files the host
// names: the switched-on separations print nothing (content sheets), the die separations print
// alone (die-only sheet), the content separations print nothing (die-with-content sheet). A
// variant that fails is not referenced; its pass falls back to the PDF itself. With an enabled
// die cut two die sheets are appended whose objects refer to the ordinals n … 3n - 1, which exist
// only as run-list partitions of the written ticket.
#pragma once

#include <string>

#include "jobpaths/separation_names.h"
#include "vorlan/vorlan.h"

class LD_JDF;

class SpotModeProcessingJdf {
public:
    // Keeps a copy of the output path; the caller's text is left as it is.
    SpotModeProcessingJdf(const char* outputPath, LD_JDF* worker);

    // The whole job: LD_OK when the ticket was written; LD_REFERENCE_OUT_OF_RANGE when the first
    // version names a surface or content object the layout lacks (nothing is written);
    // LD_JDF_WRITE_FAILED when the ticket could not be built or saved (nothing new at the path).
    LDError run();

    // The lists the variants are made with (filled by run, or by buildSeparationLists alone).
    LDError buildSeparationLists();
    const vorlan::jobpaths::NameList& switchedOnSeparations() const { return switchedOn_; }
    const vorlan::jobpaths::NameList& dieSeparations() const { return dieSeparations_; }
    const vorlan::jobpaths::NameList& contentSeparations() const { return contentSeparations_; }

private:
    void writeVariants();
    void addDieSheets();
    LDError writeTicket();

    vorlan::jobpaths::NameList dieSeparations_;
    vorlan::jobpaths::NameList switchedOn_;
    vorlan::jobpaths::NameList contentSeparations_;
    std::string outputPath_;
    LD_JDF* worker_;
};
