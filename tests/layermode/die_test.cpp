// Die cuts through vorlan_consume_job: die sheets of a layout, die runs of a bare PDF with their
// own file copies, the die-info file, and the faults that now fail instead of aborting.
#include <filesystem>

#include <gtest/gtest.h>

#include "job_builder.h"
#include "test_support.h"
#include "ticket_view.h"

namespace fs = std::filesystem;
using namespace layermode_test;

namespace {

// White, a separation, is dropped from the switches by the layer-mode client changes.
const std::vector<LayerSpec> kLayers = {{"Art", false, true}, {"Die", false, false}, {"White", true, true}};

class DieCuts : public vorlan::test::JobStoreTest {
protected:
    void SetUp() override {
        JobStoreTest::SetUp();
        setJobAttribute("KVPrintDieLine", "True");
    }

    std::string dieInfo() { return vorlan::test::readFile(tmp / "job1.dieinfo"); }

    DieSpec die{true, "Die", "", 1};
};

}  // namespace

TEST_F(DieCuts, OneSidedLayoutGainsTwoDieSheets) {
    VORLAN_REQUIRE_CORPUS();
    TicketSpec shape;
    shape.twoSided = false;
    Job job = writeTicketJob(tmp.path(), shape, descriptionXml(kLayers, {}, &die));
    TicketView t = consumeAndRead(job);
    ASSERT_EQ(t.count("//Sheet"), 4u);
    EXPECT_EQ(t.count("//Sheet[@Name='DieSheet']"), 2u);
    auto withContent = t.one("//Sheet[3]/Surface");
    auto dieOnly = t.one("//Sheet[4]/Surface");
    EXPECT_STREQ(withContent.attribute("KAV_tkt:VersContentType").value(), "DieWithContent");
    EXPECT_STREQ(dieOnly.attribute("KAV_tkt:VersContentType").value(), "DieOnly");
    EXPECT_FALSE(withContent.attribute("KAV_tkt:VersionName"));
    EXPECT_EQ(t.count("//Sheet[@Name='DieSheet']/Surface[@Side='Back']"), 0u);
    // Content pages keep their switches with the die off and the catch-all group on; the die
    // pages show the content with the die, or the die alone.
    EXPECT_EQ(t.switches(0), "+Art +KVVersionSpecialOCGName -Die");
    EXPECT_EQ(t.switches(withContent.child("ContentObject").attribute("Ord").as_int()),
              "+Art +KVVersionSpecialOCGName +Die");
    EXPECT_EQ(t.switches(dieOnly.child("ContentObject").attribute("Ord").as_int()),
              "+Die -Art -KVVersionSpecialOCGName");
    EXPECT_EQ(dieInfo(), "OrigPageCount=2\r\nKVDieDefined=1\r\n");
}

TEST_F(DieCuts, TwoSidedLayoutGivesTwoSidedDieSheets) {
    VORLAN_REQUIRE_CORPUS();
    Job job = writeTicketJob(tmp.path(), TicketSpec{}, descriptionXml(kLayers, {}, &die));
    TicketView t = consumeAndRead(job);
    EXPECT_EQ(t.count("//Sheet[@Name='DieSheet']/Surface[@Side='Front']"), 2u);
    EXPECT_EQ(t.count("//Sheet[@Name='DieSheet']/Surface[@Side='Back'][@KAV_tkt:IsBackDie='true']"), 2u);
    // Both surfaces of the die-only sheet show the die alone, each its own page.
    auto front = t.one("//Sheet[4]/Surface[@Side='Front']/ContentObject").attribute("Ord").as_int();
    auto back = t.one("//Sheet[4]/Surface[@Side='Back']/ContentObject").attribute("Ord").as_int();
    EXPECT_NE(front, back);
    EXPECT_EQ(t.attr("//RunList[@Run='" + std::to_string(back) + "']", "Pages"), "1");
}

// Both objects of a one-sided sheet show page 0: each die sheet gets one row for both.
TEST_F(DieCuts, DieSheetObjectsShowingOnePageShareOneRow) {
    VORLAN_REQUIRE_CORPUS();
    TicketSpec shape;
    shape.sheets = 1;
    shape.twoSided = false;
    shape.extraOrd = 0;
    Job job = writeTicketJob(tmp.path(), shape, descriptionXml(kLayers, {}, &die));
    TicketView t = consumeAndRead(job);
    ASSERT_EQ(t.count("//Sheet"), 3u);
    EXPECT_EQ(t.count("//InterpretingParams[@Run]"), 3u);
    for (const char* sheet : {"2", "3"}) {
        auto objects = t.all(std::string("//Sheet[") + sheet + "]/Surface/ContentObject");
        ASSERT_EQ(objects.size(), 2u) << sheet;
        EXPECT_STREQ(objects[0].node().attribute("Ord").value(), objects[1].node().attribute("Ord").value()) << sheet;
    }
    EXPECT_EQ(t.attr("//Sheet[1]/Surface/ContentObject[2]", "Ord"), "0");  // the content sheet is untouched
}

TEST_F(DieCuts, DisabledDieOnlySwitchesTheDieOff) {
    VORLAN_REQUIRE_CORPUS();
    die.enable = false;
    Job job = writeTicketJob(tmp.path(), TicketSpec{}, descriptionXml(kLayers, {}, &die));
    TicketView t = consumeAndRead(job);
    EXPECT_EQ(t.count("//Sheet[@Name='DieSheet']"), 0u);
    EXPECT_EQ(t.switches(3), "+Art +KVVersionSpecialOCGName -Die");
}

TEST_F(DieCuts, BarePdfDiePagesGetTheirOwnFileCopies) {
    VORLAN_REQUIRE_CORPUS();
    VersionSpec pages{"Pages", 1, true, {{0, {}}, {1, {}}, {2, {}}, {3, {}}}};
    Job job = writeBarePdfJob(tmp.path(), descriptionXml(kLayers, {pages}, &die, false));
    TicketView t = consumeAndRead(job);
    // Four content pages, die with content for pages 0 and 1, die alone for pages 0 and 1.
    EXPECT_EQ(t.count("//RunList[@Run]"), 8u);
    EXPECT_EQ(t.count("//RunList[@KAV_tkt:VersContentType='DieWithContent']"), 2u);
    EXPECT_EQ(t.count("//RunList[@KAV_tkt:VersContentType='DieOnly'][@KAV_tkt:is_duplex='1']"), 2u);
    EXPECT_EQ(t.count("//RunList[@KAV_tkt:VersContentType='DieOnly'][@KAV_tkt:IsBackDie='true']"), 1u);
    EXPECT_EQ(t.switches(6), t.switches(7));
    EXPECT_EQ(t.switches(6), "+Die -Art -KVVersionSpecialOCGName");
    // Each die partition names its own copy of the content file (the converted one when the PDF
    // was converted) in the job folder: <base>_1.pdf … <base>_4.pdf, in partition order.
    std::string content = t.attr("//RunList[@Run='0']/LayoutElement/FileSpec", "URL");
    ASSERT_EQ(content.rfind("file://", 0), 0u);
    std::string base = fs::path(content.substr(7)).stem().string();
    for (int n = 1; n <= 4; ++n) {
        fs::path copy = tmp / (base + "_" + std::to_string(n) + ".pdf");
        EXPECT_TRUE(fs::exists(copy)) << copy;
        EXPECT_EQ(t.attr("//RunList[@Run='" + std::to_string(n + 3) + "']/LayoutElement/FileSpec", "URL"),
                  "file://" + copy.string());
    }
    EXPECT_EQ(t.count("//RunList[@KAV_tkt:VersContentType='Content']/LayoutElement/FileSpec[@URL='" + content + "']"),
              4u);
}

TEST_F(DieCuts, BarePdfWithItsDiePageDeselectedGetsNoDieRuns) {
    VORLAN_REQUIRE_CORPUS();
    VersionSpec pages{"Pages", 1, true, {{0, {}}}};
    Job job = writeBarePdfJob(tmp.path(), descriptionXml(kLayers, {pages}, &die, false));
    TicketView t = consumeAndRead(job, "2");
    EXPECT_EQ(t.count("//RunList[@Run]"), 0u);
}

TEST_F(DieCuts, TwoDieCutsToPrintFailInsteadOfAborting) {
    die.count = 2;
    Job job = writeTicketJob(tmp.path(), TicketSpec{}, descriptionXml(kLayers, {}, &die));
    EXPECT_EQ(consume(job), 1);
    EXPECT_FALSE(fs::exists(job.output));
    EXPECT_EQ(dieInfo(), "OrigPageCount=4\r\n");  // two die cuts define no die
}

TEST_F(DieCuts, DieNamesThePdfLacksFail) {
    die.layers = "NoSuchLayer";
    VersionSpec pages{"Pages", 1, true, {{0, {}}}};
    Job job = writeBarePdfJob(tmp.path(), descriptionXml(kLayers, {pages}, &die, false));
    EXPECT_EQ(consume(job), 1);
}

TEST_F(DieCuts, ObjectWithoutContentPageOnTheDieSurfaceFails) {
    TicketSpec shape;
    shape.extraOrd = 40;
    Job job = writeTicketJob(tmp.path(), shape, descriptionXml(kLayers, {}, &die));
    EXPECT_EQ(consume(job), 1);
    EXPECT_FALSE(fs::exists(job.output));
}
