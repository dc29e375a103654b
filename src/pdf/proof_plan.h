// What a proof shows, as plain records: per version, the pages (one per printed surface) and
// the objects placed on each. The ticket side fills them in (proof_ticket.h); the PDF side draws
// them (proof_writer.h). No qpdf here.
#pragma once

#include <map>
#include <string>
#include <vector>

namespace vorlan::pdf {

// One content or mark object: which page of which file, where it goes on the sheet, and the
// optional-content switches of its ordinal's interpreting parameters.
struct ProofObject {
    std::string file;  // the PDF as a local path; empty when the ticket names none
    std::string url;   // as the ticket names it, for messages
    int page = -1;     // 0-based; -1 when the ordinal has no page
    int ord = -1;
    double ctm[6] = {1, 0, 0, 1, 0, 0};  // page (crop box origin, /Rotate applied) to sheet
    bool clipped = false;
    double clip[4] = {0, 0, 0, 0};       // ClipBox on the sheet: x0 y0 x1 y1
    // Group name -> shown; groups not listed keep the PDF's default state.
    std::map<std::string, bool> groups;
};

struct ProofPage {
    double width = 0, height = 0;  // the sheet's media; 0 x 0: the first object's page as shown
    std::string label;             // version, copies, sheet, side, content type
    std::vector<ProofObject> objects;
};

struct ProofVersion {
    std::string name;      // "Default" for surfaces and runs without one
    std::string fileName;  // <name>.pdf made safe for a file name
    std::vector<ProofPage> pages;
};

}  // namespace vorlan::pdf
