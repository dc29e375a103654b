// Real tickets made by others through vorlan_consume_job, each with PDFs of the names and page
// counts its run lists ask for: what the written ticket keeps, counted on the input by xmllint.
#include <filesystem>
#include <set>

#include <gtest/gtest.h>

#include "job_builder.h"
#include "test_support.h"
#include "ticket_view.h"
#include "vorlan/LD_JDF.h"

namespace fs = std::filesystem;
using namespace layermode_test;
using vorlan::test::xpathCount;

namespace {

class CorpusJobs : public vorlan::test::JobStoreTest {
protected:
    static fs::path ticket(const std::string& name) { return vorlan::test::corpusDir() / "jdf" / name; }
};

// Input: the Available partitions of the run lists not linked as marks (each names one page in
// the tickets below). Output: the content run list's partitions.
const std::string kInputContentRuns =
    "//*[local-name()='RunList'][@PartIDKeys='Run'][not(@ID=//*[local-name()='RunListLink'][@ProcessUsage='Marks']/@rRef)]"
    "/*[local-name()='RunList'][@Status='Available' or (not(@Status) and ../@Status='Available')]";
const std::string kOutputContentRuns =
    "/JDF/ResourcePool/RunList[not(@ID=/JDF/ResourceLinkPool/RunListLink[@ProcessUsage='Marks']/@rRef)]/RunList[@Run]";

}  // namespace

// These tickets keep their resources in the root's pool and link them from the imposition node.
TEST_F(CorpusJobs, LinkedResourcesKeepEveryPlacedObjectAndRun) {
    VORLAN_REQUIRE_CORPUS();
    if (!vorlan::test::haveProgram("xmllint")) GTEST_SKIP() << "xmllint not installed; skipping";
    std::vector<fs::path> outputs;
    for (const char* name : {"elk_16er.jdf", "elk_scale_rotate.jdf", "libjzip_Sample_BrochureLayout.jdf",
                             "libjzip_MultipleRun3.jdf"}) {
        SCOPED_TRACE(name);
        Job job = writeJobForTicket(tmp / name, ticket(name));
        ASSERT_EQ(consume(job), 0);
        outputs.push_back(job.output);
        TicketView out(job.output);
        ASSERT_TRUE(out.loaded());
        const int placed = xpathCount(ticket(name), "//*[local-name()='Surface']/*[local-name()='ContentObject']");
        EXPECT_EQ(static_cast<int>(out.count("//ContentObject")), placed);
        EXPECT_EQ(static_cast<int>(out.count("//MarkObject")),
                  xpathCount(ticket(name), "//*[local-name()='Surface']/*[local-name()='MarkObject']"));
        EXPECT_EQ(static_cast<int>(out.count(kOutputContentRuns)), xpathCount(ticket(name), kInputContentRuns));
        // Every placed page has its content run.
        std::set<std::string> runs;
        for (auto run : out.all(kOutputContentRuns)) runs.insert(run.node().attribute("Run").value());
        for (auto object : out.all("//ContentObject"))
            EXPECT_TRUE(runs.count(object.node().attribute("Ord").value())) << object.node().attribute("Ord").value();
    }
    EXPECT_EQ(schemaErrors(outputs), "");
}

TEST_F(CorpusJobs, NothingToPrintEndsWithResourceMissingAndNoTicket) {
    VORLAN_REQUIRE_CORPUS();
    // A run list that names no file; a process group that holds no imposition.
    for (const char* name : {"libj_idpxjdf_4Up.jdf", "sch_mediaFlatPlate.jdf"}) {
        SCOPED_TRACE(name);
        Job job = writeJobForTicket(tmp / name, ticket(name));
        EXPECT_EQ(consume(job), LD_JDF_RESOURCE_MISSING);
        EXPECT_FALSE(fs::exists(job.output));
    }
}

TEST_F(CorpusJobs, OpenEndedPageRangeReadsThePdfsPageCount) {
    VORLAN_REQUIRE_CORPUS();
    // Pages="0 ~ -1" of File2.pdf, here a three-page PDF: the run keeps pages 0 to 2.
    Job job = writeJobForTicket(tmp.path(), ticket("sch_SpawnedRunList.jdf"));
    vorlan::test::writeFile(job.dataFolder / "File2.pdf", vorlan::test::minimalPdf("0 0 m 10 10 l S", 3));
    ASSERT_EQ(consume(job), 0);
    TicketView out(job.output);
    ASSERT_EQ(out.count(kOutputContentRuns), 1u);
    EXPECT_EQ(out.attr(kOutputContentRuns, "Pages"), "0 ~ 2");

    // Read where the PDF is absent: the old bound of 1000 pages, and a message saying so.
    LD_JDF worker;
    testing::internal::CaptureStdout();
    testing::internal::CaptureStderr();
    EXPECT_EQ(worker.JDF_InitializeAndParseJDF(ticket("sch_SpawnedRunList.jdf").c_str()), LD_OK);
    testing::internal::GetCapturedStdout();
    EXPECT_NE(testing::internal::GetCapturedStderr().find("File2.pdf\": PDF not found"), std::string::npos);
    ASSERT_EQ(worker.contentRuns.size(), 1u);
    EXPECT_EQ(worker.contentRuns[0]->pages.size(), 1000u);
}
