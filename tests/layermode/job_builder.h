// Generated layer-mode jobs: a ticket with its PDFs and a version description in a folder laid
// out the way the print server hands jobs over (data file X/job1.0001, data folder X/job1D0001).
// Shared by the layer-mode tests and benchmark.
#pragma once

#include <filesystem>
#include <string>
#include <vector>

namespace layermode_test {

// The layout of a generated ticket.
struct TicketSpec {
    int sheets = 2;
    bool twoSided = true;
    int objectsPerSurface = 1;  // content objects per surface; each shows its own PDF page
    bool sheetMedia = true;     // each sheet carries its own Media
    bool surfaceBoxes = true;   // surfaces carry a SurfaceContentsBox
    bool marks = false;         // a marks run list and one MarkObject (Ord 0) between content objects
    bool pagePartitions = false;  // one Run partition per page instead of one for all pages
    std::vector<std::string> pdfs = {"content.pdf"};  // content objects use the PDFs in turn
    int extraOrd = -1;          // when >= 0, one more content object on the first surface with this Ord
};

// The ticket's XML.
std::string ticketXml(const TicketSpec& shape);

struct ContentSwitch {
    int index = 0;  // content object index
    std::string layerOn, layerOff, sepOn, sepOff;  // comma-separated lists
};
struct SurfaceSwitch {
    int index = 0;
    std::vector<ContentSwitch> objects;
};
struct VersionSpec {
    std::string name;
    long long copies = 1;
    bool enabled = true;
    std::vector<SurfaceSwitch> surfaces;
};
struct LayerSpec {
    std::string name;
    bool isSep = false;
    bool on = true;  // default
    int pdfIndex = 0;
};
struct DieSpec {
    bool enable = true;
    std::string layers, seps;  // comma-separated
    int count = 1;             // die-cut entries (children of DieCut)
};

// The description's XML. With exportVersions the versions are read as versions; without it a
// bare-PDF job reads the first one as its list of surfaces (no versions).
std::string descriptionXml(const std::vector<LayerSpec>& layers, const std::vector<VersionSpec>& versions,
                           const DieSpec* die = nullptr, bool exportVersions = true, bool layerMode = true);

// One generated job in a folder; files are written by the helpers below.
struct Job {
    std::filesystem::path root;        // X
    std::filesystem::path dataFile;    // X/job1.0001 (or the bare PDF)
    std::filesystem::path dataFolder;  // X/job1D0001
    std::filesystem::path description; // X/job1.impinfo
    std::filesystem::path output;      // X/out.jdf
};

// The paths of a ticket job in root (nothing is written).
Job ticketJobAt(const std::filesystem::path& root);
// A ticket job: the ticket, a one-page PDF for every name in shape.pdfs (and marks.pdf), and the
// description (none when empty).
Job writeTicketJob(const std::filesystem::path& root, const TicketSpec& shape, const std::string& description);
// A job for a ticket made by others (copied into the data folder): beside it, for every file
// its run lists name, a PDF of that name with as many pages as they use (at least one).
Job writeJobForTicket(const std::filesystem::path& root, const std::filesystem::path& ticket);
// A bare-PDF job: X/job1.pdf is the data file.
Job writeBarePdfJob(const std::filesystem::path& root, const std::string& description);

// The host's FilePathCallback: names each new PDF <folder>/out-<n>.pdf, n counting from 0.
struct HostFolder {
    std::filesystem::path folder;
    int counter = 0;
};
int newPdfPath(char* buffer, int size, void* hostFolder);

// Runs the job through vorlan_consume_job; the host's FilePathCallback names files in X/out.
// The description path is passed only when the file exists, unless alwaysNameDescription is set
// (the job number then comes from its name: job 1).
int consume(const Job& job, const char* pageRange = "All", bool alwaysNameDescription = false);

// Sets a job attribute of job number 1 in the job store named by VORLAN_JOB_STORE.
void setJobAttribute(const char* name, const char* value);

// Validates tickets against the JDF 1.8 schema of the corpus: empty when valid, else xmllint's
// report. Call VORLAN_REQUIRE_CORPUS() first.
std::string schemaErrors(const std::vector<std::filesystem::path>& tickets);

}  // namespace layermode_test
