// Tickets without a layout through vorlan_consume_job: the new ticket's parts per page range and
// die line, its injected layout, where its files are, the failures it reports, and a sweep of
// the corpus tickets without a Layout. Written tickets are checked against the JDF 1.8 schema.
#include <filesystem>
#include <tuple>

#include <gtest/gtest.h>

#include "job_builder.h"
#include "jobpaths/layout_injection.h"
#include "test_support.h"
#include "ticket_view.h"

namespace fs = std::filesystem;
using namespace layermode_test;
using vorlan::test::runPartition;

namespace {

const char* const kMedia = R"(<Media ID="M" Class="Consumable" Status="Available" Dimension="595 842"/>)";

// A Combined ticket without a layout: media (unless empty) and one run list of the partitions.
std::string ticketXml(const std::string& partitions, const std::string& media = kMedia) {
    return vorlan::test::jdfTicket(
        media + vorlan::test::runListByRun("RL", partitions),
        (media.empty() ? "" : R"(<MediaLink rRef="M" Usage="Input"/>)") +
            std::string(R"(<RunListLink rRef="RL" Usage="Input" ProcessUsage="Document"/>)"),
        R"(xmlns:eg="http://www.esko-graphics.com/EskoJDF" Type="Combined" Types="Interpreting Rendering DigitalPrinting")");
}

Job writeJob(const fs::path& root, const std::string& ticket) {
    Job job = ticketJobAt(root);
    vorlan::test::writeFile(job.dataFile, "data file of job 1\n");
    vorlan::test::writeFile(job.dataFolder / "ticket.jdf", ticket);
    return job;
}

void writePdf(const fs::path& file, int pages) {
    vorlan::test::writeFile(file, vorlan::test::minimalPdf("0 0 m 10 10 l S", pages));
}

// What one part of the written run list shows: file name, Pages, NPage, content type.
using PartText = std::tuple<std::string, std::string, std::string, std::string>;

std::vector<PartText> partsOf(const TicketView& t) {
    std::vector<PartText> parts;
    for (auto p : t.all("/JDF/ResourcePool/RunList/RunList")) {
        std::string url = p.node().select_node("LayoutElement/FileSpec").node().attribute("URL").value();
        parts.emplace_back(fs::path(url).filename().string(), p.node().attribute("Pages").value(),
                           p.node().attribute("NPage").value(), p.node().attribute("KAV_tkt:VersContentType").value());
    }
    return parts;
}

using LayoutInjection = vorlan::test::JobStoreTest;

}  // namespace

// Content runs: a (NPage 3), b (Pages 0 2), c (neither: its PDF's 2 pages), cut (an Esko value
// that is no die: content, its PDF's 1 page); die runs: dwc (die with content), die (die only).
// Rows: a0 a1 a2 b0 b2 c0 c1 cut0.
TEST_F(LayoutInjection, PartsFollowThePageRangeAndTheDieLine) {
    const std::string partitions =
        runPartition(0, "./a.pdf", R"(NPage="3")") + runPartition(1, "b.pdf", R"(Pages="0 2")") +
        runPartition(2, "dwc.pdf", R"(eg:DieContent="die CONTENT")") + runPartition(3, "c.pdf", "") +
        runPartition(4, "die.pdf", R"(eg:DieContent="DIE")") + runPartition(5, "cut.pdf", R"(eg:DieContent="Cut")");
    const PartText dwc{"dwc.pdf", "0", "1", "DieWithContent"}, die{"die.pdf", "0", "1", "DieOnly"};
    auto content = [](const char* file, const char* page) { return PartText{file, page, "1", "Content"}; };
    struct Case {
        const char* range;
        bool dieLine;
        std::vector<PartText> parts;
    };
    const Case cases[] = {
        {"All", false,
         {{"a.pdf", "0 ~ 2", "3", "Content"}, {"b.pdf", "0 2", "", "Content"}, {"c.pdf", "0 ~ 1", "2", "Content"},
          {"cut.pdf", "0", "1", "Content"}}},
        {"All", true,
         {{"a.pdf", "0 ~ 2", "3", "Content"}, {"b.pdf", "0 2", "", "Content"}, {"c.pdf", "0 ~ 1", "2", "Content"},
          {"cut.pdf", "0", "1", "Content"}, dwc, die}},
        {"Odd", false, {content("a.pdf", "0"), content("a.pdf", "2"), content("b.pdf", "2"), content("c.pdf", "1")}},
        {"Even", true,
         {content("a.pdf", "1"), content("b.pdf", "0"), content("c.pdf", "0"), content("cut.pdf", "0"), dwc, die}},
        {"2-4,8,20", true, {content("a.pdf", "1"), content("a.pdf", "2"), content("b.pdf", "0"), content("cut.pdf", "0"), dwc, die}},
        {"1-5", false,
         {content("a.pdf", "0"), content("a.pdf", "1"), content("a.pdf", "2"), content("b.pdf", "0"), content("b.pdf", "2")}},
    };
    std::vector<fs::path> outputs;
    for (const Case& c : cases) {
        SCOPED_TRACE(std::string(c.range) + (c.dieLine ? " with die line" : ""));
        fs::path root = tmp / ("job" + std::to_string(outputs.size()));
        Job job = writeJob(root, ticketXml(partitions));
        for (auto [file, pages] : {std::pair{"a.pdf", 3}, {"b.pdf", 3}, {"c.pdf", 2}, {"dwc.pdf", 1}, {"die.pdf", 1}, {"cut.pdf", 1}})
            writePdf(job.dataFolder / file, pages);
        setJobAttribute("KVPrintDieLine", c.dieLine ? "True" : "False");
        ASSERT_EQ(consume(job, c.range, true), LD_OK);
        outputs.push_back(job.output);

        TicketView t(job.output);
        ASSERT_TRUE(t.loaded());
        EXPECT_EQ(partsOf(t), c.parts);
        EXPECT_EQ(t.attr("//RunList/RunList/LayoutElement/FileSpec", "URL"), "file://" + (job.dataFolder / "a.pdf").string());
        EXPECT_EQ(t.attr("/JDF/ResourcePool/Media", "Dimension"), "595 842");
        EXPECT_EQ(vorlan::test::readFile(root / "job1.dieinfo"), c.dieLine ? "KVDieDefined=1\r\n" : "");

        // An explicit page list gets a layout: one sheet per listed page, in part order.
        const bool listed = c.range[0] != 'A' && c.range[0] != 'O' && c.range[0] != 'E';
        EXPECT_EQ(t.attr("/JDF", "Types"), listed ? "Imposition Interpreting Rendering DigitalPrinting"
                                                  : "Interpreting Rendering DigitalPrinting");
        auto sheets = t.all("/JDF/ResourcePool/Layout/Layout[@SignatureName='SignatureName1']/Layout");
        ASSERT_EQ(sheets.size(), listed ? c.parts.size() : 0u);
        for (size_t k = 0; k < sheets.size(); ++k) {
            pugi::xml_node sheet = sheets[k].node();
            EXPECT_EQ(std::string(sheet.attribute("SheetName").value()), "SheetName" + std::to_string(k + 1));
            EXPECT_STREQ(sheet.attribute("SurfaceContentsBox").value(), "0 0 595 842");
            EXPECT_STREQ(sheet.select_node("Media").node().attribute("Dimension").value(), "595 842");
            pugi::xml_node side = sheet.select_node("Layout[@Side='Front']").node();
            EXPECT_EQ(side.attribute("KAV_tkt:VersContentType").value(), std::get<3>(c.parts[k]));
            EXPECT_EQ(side.select_node("ContentObject").node().attribute("Ord").as_int(), static_cast<int>(k));
        }
    }
    VORLAN_REQUIRE_CORPUS();
    EXPECT_EQ(schemaErrors(outputs), "");
}

TEST_F(LayoutInjection, FilesAreFoundInTheDataFolderUnlessTheUrlIsAbsolute) {
    // No Media either: the injected sheets are 0 by 0.
    const std::string ticket = ticketXml(runPartition(0, "sub/a.pdf", "") + runPartition(1, "http://example.com/x.pdf", "") +
                                             runPartition(2, "file:///nowhere/y.pdf", R"(NPage="1")") +
                                             runPartition(3, R"(file://H:\docs\z.pdf)", R"(NPage="1")"),
                                         "");
    for (const char* range : {"All", "1-9"}) {
        SCOPED_TRACE(range);
        Job job = writeJob(tmp / range, ticket);
        fs::create_directories(job.dataFolder / "sub");
        writePdf(job.dataFolder / "sub" / "a.pdf", 2);
        ASSERT_EQ(consume(job, range, true), LD_OK);
        TicketView t(job.output);
        std::vector<std::string> urls;
        for (auto f : t.all("//RunList/RunList/LayoutElement/FileSpec")) urls.push_back(f.node().attribute("URL").value());
        const std::string a = "file://" + (job.dataFolder / "sub" / "a.pdf").string();
        const std::string y = "file:///nowhere/y.pdf", z = "file:///H:/docs/z.pdf";
        if (range[0] == 'A') {
            EXPECT_EQ(urls, (std::vector<std::string>{a, "http://example.com/x.pdf", y, z}));
        } else {  // x.pdf has no pages known here, so no rows
            EXPECT_EQ(urls, (std::vector<std::string>{a, a, y, z}));
            EXPECT_EQ(t.count("//Layout[@SurfaceContentsBox='0 0 0 0']/Media[@Dimension='0 0']"), 4u);
        }
        EXPECT_EQ(t.count("/JDF/ResourcePool/Media"), 0u);
    }
}

TEST_F(LayoutInjection, FailuresAreReportedAndLeaveNoTicket) {
    // The new ticket cannot be saved.
    Job job = writeJob(tmp.path(), ticketXml(runPartition(0, "a.pdf", R"(NPage="2")")));
    Job unwritable = job;
    unwritable.output = tmp / "missing-folder" / "out.jdf";
    EXPECT_EQ(consume(unwritable, "All", true), LD_JDF_WRITE_FAILED);
    EXPECT_FALSE(fs::exists(unwritable.output));
    EXPECT_EQ(consume(job, "All", true), LD_OK);

    // A ticket that cannot be parsed (again), or none at all, and one claiming more pages than
    // a layout can be given.
    vorlan::test::writeFile(tmp / "broken.jdf", "<JDF");
    vorlan::test::writeFile(tmp / "huge.jdf", ticketXml(runPartition(0, "a.pdf", R"(NPage="2000000000")")));
    const std::pair<std::string, int32_t> tickets[] = {{"broken.jdf", 0}, {"", 0}, {"huge.jdf", 1}};
    for (const auto& [name, mode] : tickets) {
        LD_JDF w;
        w.pageRangeMode = mode;
        const std::wstring path = name.empty() ? L"" : (tmp / name).wstring();
        const std::string out = (tmp / "never.jdf").string();
        LayoutInjectionProcessingJdf injection(path.c_str(), tmp.path().wstring().c_str(), out.c_str(), &w);
        EXPECT_EQ(injection.run(), LD_JDF_UNUSABLE) << name;
        EXPECT_FALSE(fs::exists(out));
    }
}

// Every well-formed corpus ticket without a Layout gives a valid ticket with one content part per
// partition of the root's run lists ("All"), and with an explicit page list one sheet per part;
// one whose run lists have no partition has nothing to print and gives no ticket.
TEST_F(LayoutInjection, CorpusTicketsWithoutLayout) {
    VORLAN_REQUIRE_CORPUS();
    const std::string pool = R"(/*[local-name()="JDF"]/*[local-name()="ResourcePool"])";
    const std::string partitions = pool + R"(/*[local-name()="RunList"]/*[local-name()="RunList"])";
    std::vector<fs::path> outputs;
    int run = 0, empty = 0, partsWritten = 0;
    for (const auto& entry : fs::directory_iterator(vorlan::test::corpusDir() / "jdf")) {
        pugi::xml_document input;
        if (!input.load_file(entry.path().c_str()) || input.select_node(R"(//*[local-name()="Layout"])")) continue;
        const std::string name = entry.path().filename().string();
        SCOPED_TRACE(name);
        for (const char* range : {"All", "1-3,5"}) {
            fs::path root = tmp / (name + "-" + (range[0] == 'A' ? "all" : "list"));
            Job job = writeJob(root, "");
            fs::copy_file(entry.path(), job.dataFolder / "ticket.jdf", fs::copy_options::overwrite_existing);
            if (input.select_nodes(partitions.c_str()).empty()) {
                EXPECT_EQ(consume(job, range, true), LD_JDF_RESOURCE_MISSING) << range;
                EXPECT_FALSE(fs::exists(job.output));
                empty += range[0] == 'A';
                continue;
            }
            ASSERT_EQ(consume(job, range, true), LD_OK) << range;
            outputs.push_back(job.output);
            TicketView t(job.output);
            const size_t parts = t.count("/JDF/ResourcePool/RunList/RunList");
            if (range[0] == 'A') {
                ++run;
                partsWritten += static_cast<int>(parts);
                EXPECT_EQ(parts, input.select_nodes(partitions.c_str()).size());
            } else {
                EXPECT_EQ(t.count("/JDF/ResourcePool/Layout/Layout/Layout"), parts);
            }
        }
    }
    std::printf("corpus tickets without a layout run: %d, with nothing to print: %d, content parts written: %d\n",
                run, empty, partsWritten);
    EXPECT_GE(run + empty, 20);
    EXPECT_GE(run, 10);
    EXPECT_EQ(schemaErrors(outputs), "");
}
