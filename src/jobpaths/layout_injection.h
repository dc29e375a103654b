// Tickets without a Layout: a new, simpler ticket built from the ticket's run lists.
//
// The ticket is parsed again from its file (the reader's copy carries an injected layout and
// filled-in page counts). Every partition of the root's RunList resources becomes a run: die only
// or die with content when Esko's eg:DieContent is "Die" or "Die Content" (case ignored),
// content otherwise. The new ticket lists the content runs whole ("All") or one part per
// selected page (any other page range), the die runs whole only when the die line is printed,
// and, for an explicit page list, a layout with one sheet per listed page.
#pragma once

#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "platform/jdf/jdf.h"
#include "vorlan/LD_JDF.h"

class LayoutInjectionProcessingJdf {
public:
    // Keeps copies of the three texts; the caller's are left as they are.
    LayoutInjectionProcessingJdf(const wchar_t* jdfPath, const wchar_t* dataPath, const char* outputPath,
                                 LD_JDF* worker);
    ~LayoutInjectionProcessingJdf();

    // The whole job: LD_OK when the new ticket was written; LD_JDF_UNUSABLE when the ticket
    // cannot be parsed (again), has no JDF root, or claims more content pages than a layout can
    // be given (nothing is written); LD_JDF_WRITE_FAILED when the new ticket cannot be built or
    // saved (nothing new at the output path). Sets the worker's last error.
    LDError run();

private:
    // One partition of the ticket's run lists: its run and where its file is.
    struct Part {
        std::unique_ptr<LD_Run> run;
        JDF::WString url;       // the file URL the new ticket gives it
        std::string localPath;  // the file on this machine; empty when the URL names none
    };
    // One content page: the part and the page of its file.
    struct Row {
        const Part* part;
        int32_t page;
    };

    bool parseTicket();
    void collectRuns();
    // Where a partition's file is. A relative URL (a leading "./" dropped) names a file in the
    // data folder; a file URL with a path names that file; any other URL is kept as written
    // and names no file here.
    void locateFile(Part& part, std::wstring url) const;
    // The page count of the part's PDF (0 when it cannot be read); each file is read once. A part
    // naming no file here keeps its NPage.
    int32_t countPages(const Part& part);
    bool buildRows();
    LDError writeTicket();

    std::wstring jdfPath_;
    std::wstring dataPath_;
    std::string outputPath_;
    LD_JDF* worker_;
    JDF::JDFNode root_;
    JDF::JDFMedia media_;
    std::vector<std::unique_ptr<Part>> parts_;  // in ticket order; the lists below point into it
    std::vector<Part*> content_, dieOnly_, dieWithContent_;
    std::vector<Row> rows_;
    std::vector<bool> selected_;  // one bit per row
    std::unordered_map<std::string, int32_t> pageCounts_;  // by local path
};
