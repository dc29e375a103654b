// The mixed job batch.
#include "mixed_jobs.h"

#include <cstdlib>

#include "job_builder.h"
#include "test_pdf.h"
#include "test_support.h"
#include "vorlan/vorlan.h"

namespace fs = std::filesystem;
using namespace layermode_test;

namespace concurrency_test {
namespace {

const std::vector<std::string> kInks = {"Gold", "Varnish", "CutContour"};
const std::vector<LayerSpec> kLayers = {{"English", false, true}, {"German", false, false}, {"Varnish", true, true}};
const std::vector<LayerSpec> kSeparations = {{"Gold", true}, {"Varnish", true}, {"CutContour", true}};

// Every surface of the job switches the same object lists.
VersionSpec version(const std::string& name, int surfaces, const std::string& layerOn, const std::string& layerOff,
                    const std::string& sepOn, const std::string& sepOff = "") {
    VersionSpec v{name, 10, true, {}};
    for (int s = 0; s < surfaces; ++s) v.surfaces.push_back({s, {{s, layerOn, layerOff, sepOn, sepOff}}});
    return v;
}

TicketSpec ticketOf(int pages) {
    TicketSpec shape;
    shape.sheets = pages / 2;
    return shape;
}

}  // namespace

std::vector<MixedJob> mixedJobs(int pages) {
    const int surfaces = pages / 2 * 2;
    std::vector<MixedJob> jobs;
    jobs.push_back({"layer mode with conversion",
                    [=](const fs::path& root) {
                        const DieSpec die{true, "", "Varnish"};
                        Job job = writeTicketJob(root, ticketOf(pages),
                                                 descriptionXml(kLayers, {version("English", surfaces, "English", "German", "", "Varnish"),
                                                                          version("German", surfaces, "German", "English", "")},
                                                                &die));
                        vorlan::test::writeSpotPdf((job.dataFolder / "content.pdf").string(), vorlan::test::samePages(kInks, surfaces));
                    },
                    [=](const fs::path& root) {
                        return consume(Job{root, root / "job1.0001", root / "job1D0001", root / "job1.impinfo",
                                           root / "out.jdf"});
                    },
                    0, "out/out-0.pdf"});
    jobs.push_back({"spot mode",
                    [=](const fs::path& root) {
                        const DieSpec die{true, "", "CutContour"};
                        Job job = writeTicketJob(root, ticketOf(pages),
                                                 descriptionXml(kSeparations, {version("Gold", surfaces, "", "", "Gold")},
                                                                &die, true, false));
                        vorlan::test::writeSpotPdf((job.dataFolder / "content.pdf").string(), vorlan::test::samePages(kInks, surfaces));
                    },
                    [=](const fs::path& root) {
                        return consume(Job{root, root / "job1.0001", root / "job1D0001", root / "job1.impinfo",
                                           root / "out.jdf"});
                    },
                    0, "out/out-0.pdf"});
    jobs.push_back({"PDF only",
                    [=](const fs::path& root) {
                        const DieSpec die{true, "", "CutContour"};
                        Job job = writeBarePdfJob(root, descriptionXml(kSeparations, {version("", surfaces, "", "", "Gold")},
                                                                       &die, false, false));
                        vorlan::test::writeSpotPdf(job.dataFile.string(), vorlan::test::samePages(kInks, surfaces));
                    },
                    [=](const fs::path& root) {
                        return consume(Job{root, root / "job1.pdf", root, root / "job1.impinfo", root / "out.jdf"});
                    },
                    0, "out/out-2.pdf"});
    jobs.push_back({"ink scan",
                    [=](const fs::path& root) {
                        vorlan::test::TestPdf pdf;
                        for (int p = 0; p < pages; ++p) pdf.addPage("0 0 10 10 re f");
                        pdf.setXmp(vorlan::test::eskoXmp({{"cyan", "process", "normal"},
                                                          {"Varnish", "designer", "varnish"},
                                                          {"CutContour", "designer", "technical"}}));
                        fs::create_directories(root);
                        pdf.write((root / "scan.pdf").string());
                    },
                    [](const fs::path& root) {
                        std::string output = (root / "job1.impinfo").string();
                        return vorlan_scan_xmp((root / "scan.pdf").c_str(), output.data(), "False");
                    },
                    1, "job1.impinfo"});
    return jobs;
}

std::map<std::string, std::string> folderContents(const fs::path& root) {
    std::map<std::string, std::string> files;
    for (const auto& entry : fs::recursive_directory_iterator(root))
        if (entry.is_regular_file()) files[fs::relative(entry.path(), root).string()] = vorlan::test::readFile(entry.path());
    return files;
}

void prepareProcess(const fs::path& root) {
    setenv("VORLAN_JOB_STORE", (root / "store").c_str(), 1);
    setenv("SOURCE_DATE_EPOCH", "1700000000", 1);
}

}  // namespace concurrency_test
