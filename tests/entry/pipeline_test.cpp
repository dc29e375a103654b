// The pipeline's early exits and what vorlan_consume_job does before the worker runs.
#include <filesystem>

#include <gtest/gtest.h>

#include "platform/jobstore/job_store.h"
#include "test_support.h"
#include "vorlan/JDFinterface.h"
#include "vorlan/vorlan.h"

namespace fs = std::filesystem;
using vorlan::jobstore::JobAttributeStore;
using vorlan::test::TempDir;
using vorlan::test::writeFile;

namespace {

class Pipeline : public testing::Test {
protected:
    void SetUp() override { setenv("VORLAN_JOB_STORE", (jobs / "store").c_str(), 1); }
    void TearDown() override { unsetenv("VORLAN_JOB_STORE"); }

    // Runs a job through the C entry point.
    int consume(const fs::path& dataFile, const std::string& description = "", const char* pageRange = "All") {
        std::string impinfo;
        if (!description.empty()) {
            impinfo = (jobs / "job5.impinfo").string();
            writeFile(impinfo, description);
        }
        std::string output = (jobs / "out.jdf").string();
        return vorlan_consume_job(dataFile.c_str(), impinfo.empty() ? nullptr : impinfo.c_str(), output.data(),
                                  jobs.path().c_str(), pageRange, nullptr, nullptr, nullptr);
    }

    TempDir jobs;
};

}  // namespace

TEST_F(Pipeline, MissingDataFileGivesInvalidInput) {
    testing::internal::CaptureStderr();
    EXPECT_EQ(consume(jobs / "nothing.0001"), LD_INVALID_INPUT);
    std::string said = testing::internal::GetCapturedStderr();
    EXPECT_EQ(said, "Invalid or absent xml buffer file, continuing as unversioned job... \n");  // once
}

TEST_F(Pipeline, ExistingFileOfUnknownKindGivesInvalidInput) {
    writeFile(jobs / "textD0001", "plain text");
    JDFinterface job(nullptr, nullptr, nullptr);
    char output[] = "/nonexistent/out.jdf";
    std::string data = (jobs / "text.0001").string();
    EXPECT_EQ(job.JDF_InitializeAndCreateNewJDF(output, nullptr, 0, data.c_str(), jobs.path().c_str(), "All", 5),
              LD_INVALID_INPUT);
    EXPECT_EQ(job.JDF_GetLastErrorCode(), LD_INVALID_INPUT);
}

TEST_F(Pipeline, FolderWithNeitherTicketNorPdfGivesFileNotFound) {
    fs::create_directories(jobs / "job5D0001");
    writeFile(jobs / "job5D0001" / "readme.txt", "nothing to print");
    EXPECT_EQ(consume(jobs / "job5.0001"), LD_FILE_NOT_FOUND);
}

TEST_F(Pipeline, EveryRunMarksTheDieUndefinedFirst) {
    JobAttributeStore store(jobs / "store");
    ASSERT_TRUE(store.open());
    ASSERT_TRUE(store.set(5, "KVDieDefined", "True"));
    fs::create_directories(jobs / "job5D0001");
    consume(jobs / "job5.0001", "<OptionalContentGroupData/>");
    EXPECT_EQ(store.get(5, "KVDieDefined"), "False");
}

TEST_F(Pipeline, NullArgumentsFailCleanly) {
    std::string output = (jobs / "out.jdf").string();
    EXPECT_EQ(vorlan_consume_job(nullptr, nullptr, output.data(), nullptr, nullptr, nullptr, nullptr, nullptr),
              LD_FAILED);
    EXPECT_FALSE(vorlan_is_valid_job(nullptr));
    LD_JDF worker;
    EXPECT_EQ(worker.JDF_InitializeAndParseJDF(static_cast<wchar_t*>(nullptr)), LD_JDF_UNUSABLE);
}

TEST_F(Pipeline, MalformedDescriptionStopsTheJob) {
    fs::create_directories(jobs / "job5D0001");
    writeFile(jobs / "job5D0001" / "art.pdf", vorlan::test::minimalPdf());
    EXPECT_EQ(consume(jobs / "job5.0001", "<OptionalContentGroupData><unclosed>"), LD_FAILED);
}

TEST_F(Pipeline, EarlyExitLeavesNothingToLeak) {
    // A description that is read and then a PDF that is missing: records made so far are released
    // by the worker's destructor (LeakSanitizer checks this in the sanitizer build).
    fs::create_directories(jobs / "job5D0001");
    EXPECT_EQ(consume(jobs / "job5.0001",
                      "<OptionalContentGroupData DefaultLayerMode='true'><DieCut enable='true'>"
                      "<Surface index='0' dieSepInternalNames='Die'/></DieCut></OptionalContentGroupData>"),
              LD_FILE_NOT_FOUND);
}
