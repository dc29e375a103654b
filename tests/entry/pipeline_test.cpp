// The pipeline's early exits and what vorlan_consume_job does before the worker runs.
#include <filesystem>

#include <gtest/gtest.h>

#include "job_builder.h"
#include "platform/jobstore/job_store.h"
#include "test_support.h"
#include "vorlan/JDFinterface.h"
#include "vorlan/vorlan.h"

namespace fs = std::filesystem;
using vorlan::jobstore::JobAttributeStore;
using vorlan::test::writeFile;

namespace {

class Pipeline : public vorlan::test::JobStoreTest {
protected:
    // Runs a job through the C entry point.
    int consume(const fs::path& dataFile, const std::string& description = "", const char* pageRange = "All") {
        std::string impinfo;
        if (!description.empty()) {
            impinfo = (tmp / "job5.impinfo").string();
            writeFile(impinfo, description);
        }
        std::string output = (tmp / "out.jdf").string();
        return vorlan_consume_job(dataFile.c_str(), impinfo.empty() ? nullptr : impinfo.c_str(), output.data(),
                                  tmp.path().c_str(), pageRange, nullptr, nullptr, nullptr);
    }

    // Runs the worker's entry directly, into an output folder that does not exist.
    LDError create(JDFinterface& job, const char* dataFile, const char* pageRange = "All") {
        char output[] = "/nonexistent-folder/out.jdf";
        std::string data = (tmp / dataFile).string();
        return job.JDF_InitializeAndCreateNewJDF(output, nullptr, 0, data.c_str(), tmp.path().c_str(), pageRange, 5);
    }
};

}  // namespace

TEST_F(Pipeline, MissingDataFileGivesInvalidInput) {
    testing::internal::CaptureStderr();
    EXPECT_EQ(consume(tmp / "nothing.0001"), LD_INVALID_INPUT);
    std::string said = testing::internal::GetCapturedStderr();
    EXPECT_EQ(said, "Invalid or absent xml buffer file, continuing as unversioned job... \n");  // once
}

TEST_F(Pipeline, ExistingFileOfUnknownKindGivesInvalidInput) {
    writeFile(tmp / "textD0001", "plain text");
    JDFinterface job(nullptr, nullptr, nullptr);
    EXPECT_EQ(create(job, "text.0001"), LD_INVALID_INPUT);
    EXPECT_EQ(job.JDF_GetLastErrorCode(), LD_INVALID_INPUT);
}

TEST_F(Pipeline, FolderWithNeitherTicketNorPdfGivesFileNotFound) {
    fs::create_directories(tmp / "job5D0001");
    writeFile(tmp / "job5D0001" / "readme.txt", "nothing to print");
    EXPECT_EQ(consume(tmp / "job5.0001"), LD_FILE_NOT_FOUND);
}

TEST_F(Pipeline, EveryRunMarksTheDieUndefinedFirst) {
    JobAttributeStore store(tmp / "store");
    ASSERT_TRUE(store.open());
    ASSERT_TRUE(store.set(5, "KVDieDefined", "True"));
    fs::create_directories(tmp / "job5D0001");
    consume(tmp / "job5.0001", "<OptionalContentGroupData/>");
    EXPECT_EQ(store.get(5, "KVDieDefined"), "False");
}

TEST_F(Pipeline, NullArgumentsFailCleanly) {
    std::string output = (tmp / "out.jdf").string();
    EXPECT_EQ(vorlan_consume_job(nullptr, nullptr, output.data(), nullptr, nullptr, nullptr, nullptr, nullptr),
              LD_FAILED);
}

TEST_F(Pipeline, MalformedDescriptionStopsTheJob) {
    fs::create_directories(tmp / "job5D0001");
    writeFile(tmp / "job5D0001" / "art.pdf", vorlan::test::minimalPdf());
    EXPECT_EQ(consume(tmp / "job5.0001", "<OptionalContentGroupData><unclosed>"), LD_FAILED);
}

TEST_F(Pipeline, EarlyExitLeavesNothingToLeak) {
    // A description that is read and then a PDF that is missing: records made so far are released
    // by the worker's destructor (LeakSanitizer checks this in the sanitizer build).
    fs::create_directories(tmp / "job5D0001");
    EXPECT_EQ(consume(tmp / "job5.0001",
                      "<OptionalContentGroupData DefaultLayerMode='true'><DieCut enable='true'>"
                      "<Surface index='0' dieSepInternalNames='Die'/></DieCut></OptionalContentGroupData>"),
              LD_FILE_NOT_FOUND);
}

namespace {

// A one-sheet, two-sided ticket whose run list names pdfUrl.
std::string ticketNaming(const std::string& pdfUrl) {
    layermode_test::TicketSpec shape;
    shape.sheets = 1;
    shape.pdfs = {pdfUrl};
    return layermode_test::ticketXml(shape);
}

}  // namespace

TEST_F(Pipeline, TicketNamingAMissingPdfGivesFileNotFound) {
    writeFile(tmp / "job5D0001" / "ticket.jdf", ticketNaming("art.pdf"));
    EXPECT_EQ(consume(tmp / "job5.0001", "<OptionalContentGroupData DefaultLayerMode='true'/>"), LD_FILE_NOT_FOUND);
    // The surfaces were counted before the PDFs were looked for.
    EXPECT_EQ(vorlan::test::readFile(tmp / "job5.dieinfo"), "OrigPageCount=2\r\n");
}

TEST_F(Pipeline, PercentTwentyUrlFindsTheFileInASubFolder) {
    writeFile(tmp / "job5D0001" / "ticket.jdf", ticketNaming("file:///elsewhere/Page%201.pdf"));
    writeFile(tmp / "job5D0001" / "pdfs" / "Page 1.pdf", vorlan::test::minimalPdf());
    JDFinterface job(nullptr, nullptr, nullptr);
    // No description and no ticket-less path: the job leaves after the PDFs were found.
    create(job, "job5.0001");
    EXPECT_NE(job.JDF_GetLastErrorCode(), LD_FILE_NOT_FOUND);
}

TEST_F(Pipeline, OnlyTheExactValueTrueSetsTheDieFlags) {
    JobAttributeStore store(tmp / "store");
    ASSERT_TRUE(store.open());
    ASSERT_TRUE(store.set(5, "KVPrintDieLine", "true"));
    ASSERT_TRUE(store.set(5, "KVAutoDieControl", "True"));
    fs::create_directories(tmp / "job5D0001");
    JDFinterface job(nullptr, nullptr, nullptr);
    EXPECT_EQ(create(job, "job5.0001", "all"), LD_FILE_NOT_FOUND);
    EXPECT_FALSE(job.worker()->printDieLine);
    EXPECT_TRUE(job.worker()->autoDieControl);
    EXPECT_EQ(job.worker()->pageRangeMode, 3);  // page-range texts are exact: "all" is a page list
}
