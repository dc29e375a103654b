// Real tickets from the corpus: every one is read without a crash, and for the tickets with
// placed objects the counts match what xmllint finds in the file.
#include <algorithm>
#include <filesystem>
#include <set>

#include <gtest/gtest.h>

#include "jdf/ticket_handles.h"
#include "test_support.h"
#include "vorlan/LD_JDF.h"

namespace {

namespace fs = std::filesystem;

std::vector<fs::path> corpusTickets() {
    std::vector<fs::path> tickets;
    for (const auto& entry : fs::directory_iterator(vorlan::test::corpusDir() / "jdf")) {
        std::string ext = entry.path().extension().string();
        std::transform(ext.begin(), ext.end(), ext.begin(), ::tolower);
        if (ext == ".jdf") tickets.push_back(entry.path());
    }
    std::sort(tickets.begin(), tickets.end());
    return tickets;
}

LDError readQuietly(LD_JDF& worker, const fs::path& path) {
    ::testing::internal::CaptureStdout();
    LDError result = worker.JDF_InitializeAndParseJDF(path.string().c_str());
    ::testing::internal::GetCapturedStdout();
    return result;
}

// The model's own consistency: counters match lists, indices are identities, runs point into
// the PDF lists, and row i of the ordinal table carries ordinal i.
void expectConsistentModel(LD_JDF& w, const std::string& name) {
    SCOPED_TRACE(name);
    EXPECT_EQ(w.signatures.size(), static_cast<size_t>(w.numberOfSignatures));
    EXPECT_EQ(w.sheets.size(), static_cast<size_t>(w.numberOfSheets));
    EXPECT_EQ(w.surfaces.size(), static_cast<size_t>(w.numberOfSurfaces));
    EXPECT_EQ(w.contentObjects.size(), static_cast<size_t>(w.contentObjectCount));
    EXPECT_EQ(w.markObjects.size(), static_cast<size_t>(w.markObjectCount));
    EXPECT_EQ(w.contentObjectOrdinalMap.size(), w.contentObjects.size());
    for (size_t i = 0; i < w.sheets.size(); ++i) EXPECT_EQ(w.sheets[i]->index, static_cast<int32_t>(i));
    for (size_t i = 0; i < w.surfaces.size(); ++i) EXPECT_EQ(w.surfaces[i]->index, static_cast<int32_t>(i));
    for (size_t i = 0; i < w.contentObjects.size(); ++i)
        EXPECT_EQ(w.contentObjects[i]->contentObjectIndex, static_cast<int32_t>(i));
    std::set<LD_PDF*> pdfs(w.contentPDFs.begin(), w.contentPDFs.end());
    pdfs.insert(w.markPDFs.begin(), w.markPDFs.end());
    for (auto* list : {&w.contentRuns, &w.markRuns})
        for (LD_Run* run : *list) EXPECT_TRUE(!run->pdf || pdfs.count(run->pdf));
    for (size_t i = 0; i < w.m_OrdinalTable.size(); ++i) EXPECT_EQ(w.m_OrdinalTable[i]->ordinal, static_cast<int32_t>(i));
    EXPECT_EQ(w.numberOfLogicalPages, static_cast<int32_t>(w.m_OrdinalTable.size()));
}

TEST(CorpusTickets, EveryTicketIsReadAsFarAsItGoes) {
    VORLAN_REQUIRE_CORPUS();
    std::vector<fs::path> tickets = corpusTickets();
    ASSERT_GE(tickets.size(), 50u);
    for (const fs::path& path : tickets) {
        LD_JDF worker;
        LDError result = readQuietly(worker, path);
        std::string name = path.filename().string();
        // Only the two files that are not well-formed, and the one automated layout, are refused.
        if (name == "libj_corrupt.jdf" || name == "sch_invalid_INVALID-MISPrepress-ICS-Complex.jdf" ||
            name == "sch_impositionTemplateLayout.jdf")
            EXPECT_EQ(result, LD_JDF_UNUSABLE) << name;
        else
            EXPECT_EQ(result, LD_OK) << name;
        expectConsistentModel(worker, name);
        // A host may ask every query of a read ticket.
        for (long i = 0; i <= worker.JDF_GetMaxOrdinalNumber(); ++i) worker.JDF_GetLogicalContentPageByOrdinalNumber(i);
        for (long i = 0; i < worker.JDF_GetNumberOfSignatures(); ++i) worker.JDF_GetRangeOfSheetsPerSignature(i);
        for (int type = 0; type < 5; ++type) worker.JDF_GetStatusOfNodeByType(static_cast<JDFNode_Types>(type));
    }
}

using vorlan::test::xpathCount;

struct Expected {
    const char* file;
    // Recorded from the files: distinct FileSpec URLs of the Available content and mark run
    // lists (xmllint --xpath '//*[local-name()="RunList"]//*[local-name()="FileSpec"]/@URL' FILE,
    // sorted case-insensitively, output run lists left out), and the number of logical pages
    // (the content pages of the Pages / NPage attributes, or the mark pages when there are more).
    int contentPdfs, markPdfs, ordinals;
};

// Tickets whose layouts hold placed objects, written without SheetRef / SurfaceRef.
const Expected kPlaced[] = {
    {"elk_J04-2000v14-SLink28791_Grp1.jdf", 0, 0, 0},
    {"elk_JDFMergedOutput.jdf", 1, 1, 16},    // 16 partitions of Pages="0~0"; marks Pages="0~3"
    {"libjzip_40pages-8up.jdf", 1, 1, 40},    // content Pages="0 ~ 39", marks Pages="0 ~ 11"
    {"libjzip_LayCrImp_10_J02.jdf", 1, 2, 0},  // content run list without Run; marks without pages
    {"sch_invalidMarkObject.jdf", 0, 0, 0},
    {"sch_markObject.jdf", 0, 0, 0},
};

TEST(CorpusTickets, CountsMatchXPathForTicketsWithPlacedObjects) {
    VORLAN_REQUIRE_CORPUS();
    if (!vorlan::test::haveProgram("xmllint")) GTEST_SKIP() << "xmllint not installed; skipping";
    const std::string pool = R"(//*[local-name()="ResourcePool"])";
    const std::string layout = pool + R"(/*[local-name()="Layout"])";
    const std::string signatures = layout + R"(/*[local-name()="Signature" or local-name()="Layout"])";
    const std::string sheets = signatures + R"(/*[local-name()="Sheet" or local-name()="Layout"])";
    const std::string surfaces = sheets + R"(/*[local-name()="Surface" or local-name()="Layout"])";
    // A ticket without an imposition node is given an injected layout: one more signature.
    const std::string impositionNodes = R"(//*[local-name()="JDF"][@Type="Imposition" or contains(@Types,"Imposition")])";
    const std::string runLists = pool + R"(/*[local-name()="RunList"][@Status="Available"])";
    const std::string marks = R"(@ID=//*[local-name()="RunListLink"][@ProcessUsage="Marks"]/@rRef)";
    const std::string partitions = R"([@PartIDKeys="Run"]/*[local-name()="RunList"][not(@Status) or @Status="Available"])";
    const std::string unpartitionedRuns = R"([not(@PartIDKeys)][@Run])";

    for (const Expected& e : kPlaced) {
        fs::path file = vorlan::test::corpusDir() / "jdf" / e.file;
        SCOPED_TRACE(e.file);
        LD_JDF w;
        ASSERT_EQ(readQuietly(w, file), LD_OK);
        EXPECT_TRUE(w.ticket->ticketHasLayout);
        int injected = xpathCount(file, impositionNodes) == 0 ? 1 : 0;
        EXPECT_EQ(w.JDF_GetNumberOfSignatures(), xpathCount(file, signatures) + injected);
        EXPECT_EQ(w.JDF_GetNumberOfSheets(), xpathCount(file, sheets));
        EXPECT_EQ(w.JDF_GetNumberOfSurfaces(), xpathCount(file, surfaces));
        EXPECT_EQ(static_cast<int>(w.contentObjects.size()), xpathCount(file, surfaces + R"(/*[local-name()="ContentObject"])"));
        EXPECT_EQ(static_cast<int>(w.markObjects.size()), xpathCount(file, surfaces + R"(/*[local-name()="MarkObject"])"));
        EXPECT_GT(w.contentObjects.size() + w.markObjects.size(), 0u);
        EXPECT_EQ(static_cast<int>(w.contentRuns.size()), xpathCount(file, runLists + "[not(" + marks + ")]" + partitions) +
                                                             xpathCount(file, runLists + "[not(" + marks + ")]" + unpartitionedRuns));
        EXPECT_EQ(static_cast<int>(w.markRuns.size()), xpathCount(file, runLists + "[" + marks + "]" + partitions) +
                                                          xpathCount(file, runLists + "[" + marks + "]" + unpartitionedRuns));
        EXPECT_EQ(static_cast<int>(w.contentPDFs.size()), e.contentPdfs);
        EXPECT_EQ(static_cast<int>(w.markPDFs.size()), e.markPdfs);
        EXPECT_EQ(w.JDF_GetMaxOrdinalNumber() + 1, e.ordinals);
    }
}

}  // namespace

namespace {

// vorlan inspect --json prints the reader's view on standard output; the timing line goes to
// standard error.
TEST(CorpusTickets, InspectCommandPrintsTheQueryView) {
    VORLAN_REQUIRE_CORPUS();
    const char* cli = VORLAN_CLI_PATH;
    std::string out;
    fs::path file = vorlan::test::corpusDir() / "jdf" / "libjzip_40pages-8up.jdf";
    EXPECT_EQ(vorlan::test::runCommand("{ " + std::string(cli) + " inspect --json '" + file.string() + "' 2>/dev/null; }", &out),
              0);
    EXPECT_EQ(out.rfind("{", 0), 0u) << out.substr(0, 200);
    EXPECT_NE(out.find(R"("contentObjectCount": 40)"), std::string::npos);
    EXPECT_NE(out.find(R"("markObjectCount": 12)"), std::string::npos);
    EXPECT_EQ(out.find("Total initialization time"), std::string::npos);
}

}  // namespace
