// Separation-variant jobs through vorlan_consume_job: spot-mode ticket jobs and bare PDFs. The
// written tickets are checked against the JDF 1.8 schema and read back; every variant they name
// is judged plate by plate with Ghostscript's tiffsep.
#include <filesystem>
#include <map>

#include <gtest/gtest.h>

#include "job_builder.h"
#include "jobpaths/pdf_only.h"
#include "jobpaths/spot_mode.h"
#include "plates.h"
#include "test_pdf.h"
#include "test_support.h"
#include "ticket_view.h"

namespace fs = std::filesystem;
using namespace layermode_test;

namespace {

const std::vector<std::string> kInks = {"Gold", "Silver", "CutContour"};

void writeSpotPdf(const fs::path& file, int pages) {
    vorlan::test::writeSpotPdf(file.string(), vorlan::test::samePages(kInks, pages));
}

using Plates = std::map<std::string, long>;

// Inked plates of page 1 (blank and absent plates compare equal); fails the test when gs fails.
Plates inkedPlates(const fs::path& pdf) { return vorlan::test::inkedPlates(pdf.string(), 1); }

// The input's plates without the named ones, or with only the named ones.
Plates expectedPlates(const Plates& input, const std::vector<std::string>& names, bool keep) {
    Plates out;
    for (auto& [name, pixels] : input) {
        bool listed = std::find(names.begin(), names.end(), name) != names.end();
        if (listed == keep) out[name] = pixels;
    }
    return out;
}

std::string fileOf(const TicketView& t, int run) {
    std::string url = t.attr("//RunList[@Run='" + std::to_string(run) + "']/LayoutElement/FileSpec", "URL");
    return url.rfind("file://", 0) == 0 ? url.substr(7) : url;
}

class SeparationJobs : public vorlan::test::JobStoreTest {
protected:
    void SetUp() override {
        JobStoreTest::SetUp();
        setJobAttribute("KVPrintDieLine", "True");
    }
};

const std::vector<LayerSpec> kSeparations = {{"Gold", true}, {"Silver", true}, {"CutContour", true}};

}  // namespace

TEST_F(SeparationJobs, SpotModeTicketPointsEachSheetAtItsVariant) {
    VORLAN_REQUIRE_CORPUS();
    const DieSpec die{true, "", "CutContour"};
    VersionSpec version{"Gold", 10, true, {{0, {{0, "", "", "Gold", "Silver"}}}}};
    Job job = writeTicketJob(tmp.path(), TicketSpec{},
                             descriptionXml(kSeparations, {version}, &die, true, false));
    writeSpotPdf(job.dataFolder / "content.pdf", 4);
    const std::string before = vorlan::test::readFile(job.dataFolder / "content.pdf");

    TicketView t = consumeAndRead(job);
    ASSERT_TRUE(t.loaded());
    const int n = 4;  // one ordinal per surface
    EXPECT_EQ(t.attr("/JDF", "Types"), "Imposition Interpreting Rendering DigitalPrinting");
    EXPECT_EQ(t.count("/JDF/ResourcePool/InterpretingParams/*"), 0u);
    EXPECT_EQ(t.count("//OCGControl"), 0u);
    EXPECT_EQ(t.count("/JDF/ResourcePool/RunList/RunList"), size_t(3 * n));
    for (int k = 0; k < 3 * n; ++k) EXPECT_EQ(t.attr("//RunList[@Run='" + std::to_string(k) + "']", "Pages"), std::to_string(k % n));
    // Two die sheets: die with content refers to ordinals n … 2n-1, die only to 2n … 3n-1.
    auto dieOrds = t.all("//Sheet[@Name='DieSheet']//ContentObject");
    ASSERT_EQ(dieOrds.size(), 4u);
    EXPECT_EQ(dieOrds[0].node().attribute("Ord").as_int(), n);
    EXPECT_EQ(dieOrds[2].node().attribute("Ord").as_int(), 2 * n);
    EXPECT_EQ(vorlan::test::readFile(tmp / "job1.dieinfo"), "OrigPageCount=4\r\nKVDieDefined=1\r\n");
    EXPECT_EQ(vorlan::test::readFile(job.dataFolder / "content.pdf"), before);

    // Content: the switched-on inks (Gold, and the die) print nothing; die with content: the
    // content inks print nothing; die only: the die alone.
    const Plates input = inkedPlates(job.dataFolder / "content.pdf");
    ASSERT_EQ(input.count("Gold") + input.count("CutContour"), 2u);
    EXPECT_EQ(inkedPlates(fileOf(t, 0)), expectedPlates(input, {"Gold", "CutContour"}, false));
    EXPECT_EQ(inkedPlates(fileOf(t, n)), expectedPlates(input, {"Gold"}, false));
    EXPECT_EQ(inkedPlates(fileOf(t, 2 * n)), expectedPlates(input, {"CutContour"}, true));
}

TEST_F(SeparationJobs, SpotModeWithoutPrintedDieWritesOnePass) {
    const DieSpec die{false, "", "CutContour"};
    VersionSpec version{"Gold", 10, true, {{0, {{0, "", "", "Gold", ""}}}}};
    Job job = writeTicketJob(tmp.path(), TicketSpec{}, descriptionXml(kSeparations, {version}, &die, true, false));
    TicketView t = consumeAndRead(job);
    EXPECT_EQ(t.count("/JDF/ResourcePool/RunList/RunList"), 4u);
    EXPECT_EQ(t.count("//Sheet[@Name='DieSheet']"), 0u);
    EXPECT_EQ(std::distance(fs::directory_iterator(tmp / "out"), fs::directory_iterator()), 3);
}

TEST_F(SeparationJobs, SpotModeVersionNamingAMissingObjectWritesNothing) {
    for (auto [surface, object] : {std::pair{9, 0}, std::pair{0, 9}}) {
        VersionSpec version{"Gold", 10, true, {{surface, {{object, "", "", "Gold", ""}}}}};
        Job job = writeTicketJob(tmp.path(), TicketSpec{}, descriptionXml(kSeparations, {version}, nullptr, true, false));
        consumeAndRead(job, "All", LD_REFERENCE_OUT_OF_RANGE);
    }
}

TEST_F(SeparationJobs, SeparationListsCompareNamesExactly) {
    LD_Surface surface;  // the layout lists do not own their records
    LD_ContentObject object;
    LD_JDF w;
    surface.index = 0;
    object.contentObjectIndex = 0;
    w.surfaces.push_back(&surface);
    w.contentObjects.push_back(&object);
    auto* version = new XMLVersionData;
    w.versions.push_back(version);
    version->surfaces.push_back(new XMLSurfaceData);
    for (const wchar_t* names : {L"Gold", L"Gold", L"Varnish", L"gold"}) {
        auto* entry = new XMLContentObjectData;
        entry->sepNameOn.push_back(LD_CopyText(names));
        version->surfaces[0]->contentObjects.push_back(entry);
    }
    auto* die = new LD_DieCut;
    die->dieSepInternalNames.push_back(LD_CopyText(L"CutContour"));
    w.m_XMLDieCuts.push_back(die);

    SpotModeProcessingJdf spot("", &w);
    ASSERT_EQ(spot.buildSeparationLists(), LD_OK);
    using L = vorlan::jobpaths::NameList;
    EXPECT_EQ(spot.switchedOnSeparations(), (L{"Gold", "Varnish", "gold", "CutContour"}));
    EXPECT_EQ(spot.dieSeparations(), (L{"CutContour"}));
    EXPECT_EQ(spot.contentSeparations(), (L{"Gold", "Varnish", "gold"}));
}

TEST_F(SeparationJobs, BarePdfPagesInThreeGroups) {
    VORLAN_REQUIRE_CORPUS();
    const DieSpec die{true, "", "CutContour"};
    VersionSpec surfaces{"", 1, true, {{0, {{0, "", "", "Gold", ""}}}}};
    struct Case {
        const char* range;
        std::vector<int> pages;
    };
    for (const Case& c : {Case{"All", {0, 1, 2, 3}}, Case{"Odd", {0, 2}}}) {
        vorlan::test::TempDir dir;
        Job job = writeBarePdfJob(dir.path(), descriptionXml(kSeparations, {surfaces}, &die, false, false));
        writeSpotPdf(job.dataFile, 4);
        TicketView t = consumeAndRead(job, c.range);
        ASSERT_TRUE(t.loaded()) << c.range;
        EXPECT_EQ(t.attr("/JDF", "Types"), "Interpreting Rendering DigitalPrinting");
        EXPECT_EQ(t.attr("//Media", "Dimension"), "200 100");
        const size_t m = c.pages.size();
        EXPECT_EQ(t.count("//RunList/RunList"), 3 * m);
        for (const char* group : {"Content", "DieWithContent", "DieOnly"}) {
            auto parts = t.all(std::string("//RunList/RunList[@KAV_tkt:VersContentType='") + group + "']");
            ASSERT_EQ(parts.size(), m) << group;
            for (size_t i = 0; i < m; ++i) {
                auto part = parts[i].node();
                EXPECT_EQ(part.attribute("Pages").as_int(), c.pages[i]);
                const std::string back = part.attribute("KAV_tkt:IsBackDie").value();
                EXPECT_EQ(back, std::string(group) == "Content" || c.pages[i] > 1 ? "" : c.pages[i] ? "true" : "false");
            }
        }
        // Content without Silver and the die; die with content without Silver; die only.
        const Plates input = inkedPlates(job.dataFile);
        ASSERT_EQ(input.count("Silver") + input.count("CutContour"), 2u);
        EXPECT_EQ(inkedPlates(fileOf(t, 0)), expectedPlates(input, {"Silver", "CutContour"}, false));
        EXPECT_EQ(inkedPlates(fileOf(t, int(m))), expectedPlates(input, {"Silver"}, false));
        EXPECT_EQ(inkedPlates(fileOf(t, int(2 * m))), expectedPlates(input, {"CutContour"}, true));
    }
}

TEST_F(SeparationJobs, BarePdfWithoutSeparationsUsesTheFileItself) {
    Job job = writeBarePdfJob(tmp.path(), "");
    TicketView t = consumeAndRead(job);
    EXPECT_EQ(t.count("//RunList/RunList"), 1u);
    EXPECT_EQ(fileOf(t, 0), job.dataFile.string());
    EXPECT_TRUE(fs::is_empty(tmp / "out"));
}

TEST_F(SeparationJobs, FailedTicketWriteIsReportedAndLeavesNothing) {
    Job job = writeBarePdfJob(tmp.path(), "");
    job.output = tmp / "missing-folder" / "out.jdf";
    fs::create_directories(job.output);  // a folder where the ticket should go
    EXPECT_EQ(consume(job), LD_JDF_WRITE_FAILED);
    EXPECT_TRUE(fs::is_directory(job.output));
}
