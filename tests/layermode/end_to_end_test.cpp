// Layer-mode jobs through vorlan_consume_job: the versioned ticket each writes, checked against
// the JDF 1.8 schema and read back.
#include <filesystem>

#include <gtest/gtest.h>

#include "job_builder.h"
#include "test_support.h"
#include "ticket_view.h"

namespace fs = std::filesystem;
using namespace layermode_test;

namespace {

const std::vector<LayerSpec> kLanguages = {{"English", false, true}, {"German", false, false}, {"Varnish", true, true}};

VersionSpec language(const std::string& name, long long copies, std::initializer_list<int> surfaces,
                     const std::string& on, const std::string& off) {
    VersionSpec v{name, copies, true, {}};
    for (int s : surfaces) v.surfaces.push_back({s, {{s, on, off, "", ""}}});  // one object per surface
    return v;
}

using LayerMode = vorlan::test::JobStoreTest;

}  // namespace

TEST_F(LayerMode, TwoVersionsOnTheirOwnSheets) {
    VORLAN_REQUIRE_CORPUS();
    Job job = writeTicketJob(tmp.path(), TicketSpec{},
                             descriptionXml(kLanguages, {language("English", 500, {0, 1}, "English", "German"),
                                                         language("German", 300, {2, 3}, "German", "English")}));
    TicketView t = consumeAndRead(job);
    ASSERT_TRUE(t.loaded());
    EXPECT_EQ(t.attr("/JDF", "Types"), "Imposition Interpreting Rendering DigitalPrinting");
    EXPECT_EQ(t.attr("/JDF", "xsi:type"), "Combined");
    EXPECT_EQ(t.attr("/JDF", "xmlns:xsi"), "http://www.w3.org/2001/XMLSchema-instance");
    EXPECT_EQ(t.count("//Surface[@KAV_tkt:VersionName='English'][@KAV_tkt:VersionCopyCount='500'][@KAV_tkt:VersionIndex='0']"), 2u);
    EXPECT_EQ(t.count("//Surface[@KAV_tkt:VersionName='German'][@KAV_tkt:VersionCopyCount='300'][@KAV_tkt:VersionIndex='1']"), 2u);
    EXPECT_EQ(t.count("//Surface[@KAV_tkt:is_duplex='1']"), 4u);
    EXPECT_EQ(t.count("//Surface[@Side='Back'][@KAV_tkt:IsBackDie='true']"), 2u);
    // Four rows from the ticket and one new pair per versioned object, each with its switches.
    EXPECT_EQ(t.count("/JDF/ResourcePool/InterpretingParams/InterpretingParams"), 8u);
    EXPECT_EQ(t.count("/JDF/ResourcePool/RunList[@PartIDKeys='Run']/RunList"), 8u);
    // The schema leaves these tokens open: every row takes the default from the PDF, printed.
    EXPECT_EQ(t.count("//InterpretingParams[@Run]/PDFInterpretingParams[@OCGDefault='FromPDF'][@OCGProcess='Print']"), 8u);
    for (auto surface : t.all("//Surface")) {
        std::string version = surface.node().attribute("KAV_tkt:VersionName").value();
        int ord = surface.node().child("ContentObject").attribute("Ord").as_int();
        EXPECT_GE(ord, 4);
        EXPECT_EQ(t.switches(ord), version == "English" ? "+English +KVVersionSpecialOCGName -German"
                                                        : "+German +KVVersionSpecialOCGName -English");
    }
    // Pages follow the content page of each row; the file is the PDF of the data folder.
    EXPECT_EQ(t.attr("//RunList[@Run='4']", "Pages"), "0");
    EXPECT_EQ(t.attr("//RunList[@Run='7']", "Pages"), "3");
    EXPECT_EQ(t.attr("//RunList[@Run='4']/LayoutElement/FileSpec", "URL"),
              "file://" + (job.dataFolder / "content.pdf").string());
    EXPECT_EQ(vorlan::test::readFile(tmp / "job1.dieinfo"), "OrigPageCount=4\r\n");
}

TEST_F(LayerMode, EqualSwitchesForTheSamePageShareOneRow) {
    VORLAN_REQUIRE_CORPUS();
    TicketSpec shape;
    shape.extraOrd = 0;  // a second object on surface 0 showing page 0
    VersionSpec v{"English", 1, true, {{0, {{0, "English", "German", "", ""}, {1, "English", "German", "", ""}}}}};
    Job job = writeTicketJob(tmp.path(), shape, descriptionXml(kLanguages, {v}));
    TicketView t = consumeAndRead(job);
    EXPECT_EQ(t.count("//InterpretingParams[@Run]"), 5u);
    EXPECT_EQ(t.count("//Surface[@Side='Front']/ContentObject[@Ord='4']"), 2u);
}

TEST_F(LayerMode, DisabledVersionContributesNothing) {
    VORLAN_REQUIRE_CORPUS();
    VersionSpec off = language("Off", 9, {0, 1}, "German", "English");
    off.enabled = false;
    Job job = writeTicketJob(tmp.path(), TicketSpec{}, descriptionXml(kLanguages, {off}));
    TicketView t = consumeAndRead(job);
    EXPECT_EQ(t.count("//Surface[@KAV_tkt:VersionName]"), 0u);
    EXPECT_EQ(t.count("//RunList[@Run]"), 4u);
}

TEST_F(LayerMode, MarkRunsAreCopiedWithNewContentRuns) {
    VORLAN_REQUIRE_CORPUS();
    TicketSpec shape;
    shape.marks = true;
    shape.objectsPerSurface = 2;  // content, mark, content on every surface
    VersionSpec v{"German", 1, true, {{0, {{0, "German", "English", "", ""}}}}};
    Job job = writeTicketJob(tmp.path(), shape, descriptionXml(kLanguages, {v}));
    TicketView t = consumeAndRead(job);
    // 8 rows from the ticket plus the German one; the mark objects that showed ordinal 0 follow it.
    EXPECT_EQ(t.count("/JDF/ResourcePool/RunList[@PartIDKeys='Run']"), 2u);
    EXPECT_EQ(t.count("//RunListLink[@ProcessUsage='Marks']"), 1u);
    EXPECT_EQ(t.count("//InterpretingParams[@Run]"), 9u);
    EXPECT_EQ(t.count("//MarkObject[@Ord='8']"), 4u);
    EXPECT_EQ(t.count("//MarkObject[@Ord='0']"), 0u);
    // Every ordinal has a marks partition; beyond the mark pages they repeat the mark of ordinal 0.
    std::string marks = "/JDF/ResourcePool/RunList[@ID=/JDF/ResourceLinkPool/RunListLink[@ProcessUsage='Marks']/@rRef]";
    EXPECT_EQ(t.count(marks + "/RunList"), 9u);
    EXPECT_EQ(t.attr(marks + "/RunList[@Run='8']", "Pages"), "0");
    // Placed objects keep their order: content, mark, content.
    auto first = t.one("//Surface[@Side='Front']").first_child();
    EXPECT_STREQ(first.name(), "ContentObject");
    EXPECT_STREQ(first.next_sibling().name(), "MarkObject");
    EXPECT_STREQ(first.next_sibling().next_sibling().name(), "ContentObject");
}

TEST_F(LayerMode, PageRangesSelectSurfacesAndDropEmptySheets) {
    VORLAN_REQUIRE_CORPUS();
    Job job = writeTicketJob(tmp.path(), TicketSpec{}, descriptionXml(kLanguages, {}));
    TicketView list = consumeAndRead(job, "3-4");
    EXPECT_EQ(list.count("//Sheet"), 1u);
    EXPECT_EQ(list.attr("//Sheet", "Name"), "Sheet2");
    EXPECT_EQ(list.count("//Sheet/Surface"), 2u);

    TicketView even = consumeAndRead(job, "Even");
    EXPECT_EQ(even.count("//Sheet"), 2u);
    EXPECT_EQ(even.count("//Surface[@Side='Front']"), 0u);
    EXPECT_EQ(even.count("//Surface[@Side='Back']"), 2u);
}

TEST_F(LayerMode, SheetWithoutMediaReferencesANewMedia) {
    VORLAN_REQUIRE_CORPUS();
    TicketSpec shape;
    shape.sheets = 1;
    shape.twoSided = false;
    shape.sheetMedia = false;
    shape.surfaceBoxes = false;
    Job job = writeTicketJob(tmp.path(), shape, descriptionXml(kLanguages, {}));
    TicketView t = consumeAndRead(job);
    std::string id = t.attr("//Sheet/MediaRef", "rRef");
    EXPECT_EQ(t.attr("/JDF/ResourcePool/Media[@ID='" + id + "']", "Dimension"), "612 792");
    EXPECT_EQ(t.count("//Surface[@SurfaceContentsBox]"), 0u);
}

TEST_F(LayerMode, BarePdfWithTwoVersionsGetsOneRunPerVersionPage) {
    VORLAN_REQUIRE_CORPUS();
    Job job = writeBarePdfJob(tmp.path(), descriptionXml(kLanguages, {language("English", 5, {0, 1}, "English", "German"),
                                                                     language("German", 7, {0, 1}, "German", "English")}));
    TicketView t = consumeAndRead(job);
    EXPECT_EQ(t.attr("/JDF", "Types"), "Interpreting Rendering DigitalPrinting");
    EXPECT_EQ(t.count("//Layout"), 0u);
    EXPECT_EQ(t.count("//InterpretingParams[@Run]"), 4u);
    EXPECT_EQ(t.count("//RunList[@Run][@KAV_tkt:VersContentType='Content']"), 4u);
    EXPECT_EQ(t.attr("//RunList[@Run='1']", "KAV_tkt:VersionName"), "English");
    EXPECT_EQ(t.attr("//RunList[@Run='1']", "Pages"), "1");
    EXPECT_EQ(t.attr("//RunList[@Run='2']", "KAV_tkt:VersionName"), "German");
    EXPECT_EQ(t.attr("//RunList[@Run='2']", "KAV_tkt:VersionCopyCount"), "7");
    EXPECT_EQ(t.attr("//RunList[@Run='2']", "KAV_tkt:VersionIndex"), "1");
    EXPECT_EQ(t.switches(3), "+German +KVVersionSpecialOCGName -English");
}

TEST_F(LayerMode, BarePdfWithoutVersionsUsesTheDefaultSwitches) {
    VORLAN_REQUIRE_CORPUS();
    // Without "export" the first version only lists the surfaces of the PDF.
    Job job = writeBarePdfJob(tmp.path(), descriptionXml(kLanguages, {language("Pages", 1, {0, 1, 2}, "", "")},
                                                         nullptr, false));
    TicketView t = consumeAndRead(job, "Odd");
    EXPECT_EQ(t.count("//InterpretingParams[@Run]"), 2u);  // pages 1 and 3
    EXPECT_EQ(t.attr("//RunList[@Run='1']", "Pages"), "2");
    // Without a die cut the separation Varnish keeps its default switch.
    EXPECT_EQ(t.switches(0), "+English +Varnish +KVVersionSpecialOCGName -German");
}

TEST_F(LayerMode, FailedSaveIsReportedAndLeavesNothing) {
    Job job = writeTicketJob(tmp.path(), TicketSpec{}, descriptionXml(kLanguages, {}));
    job.output = tmp / "missing-folder" / "out.jdf";
    EXPECT_EQ(consume(job), 13);
    EXPECT_FALSE(fs::exists(tmp / "missing-folder"));
}

TEST_F(LayerMode, VersionOfAnObjectWithoutContentPageIsOutOfRange) {
    TicketSpec shape;
    shape.extraOrd = 40;  // content object 1 shows a page the run list does not have
    VersionSpec v{"German", 1, true, {{0, {{1, "German", "English", "", ""}}}}};
    Job job = writeTicketJob(tmp.path(), shape, descriptionXml(kLanguages, {v}));
    EXPECT_EQ(consume(job), 9);
    EXPECT_FALSE(fs::exists(job.output));
}

TEST_F(LayerMode, PdfWithoutLayerDataPrintsWithItsOwnSwitches) {
    TicketSpec shape;
    shape.pdfs = {"a.pdf", "b.pdf"};  // the description describes only the first
    Job job = writeTicketJob(tmp.path(), shape, descriptionXml(kLanguages, {}));
    TicketView t = consumeAndRead(job);
    for (auto part : t.all("/JDF/ResourcePool/RunList/RunList[@Run]")) {
        const std::string url = part.node().child("LayoutElement").child("FileSpec").attribute("URL").value();
        const int ordinal = part.node().attribute("Run").as_int();
        EXPECT_EQ(t.switches(ordinal), url.find("b.pdf") != std::string::npos
                                           ? "+KVVersionSpecialOCGName"
                                           : "+English +Varnish +KVVersionSpecialOCGName -German")
            << url;
    }
}
