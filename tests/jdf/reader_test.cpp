// The ticket reader: process nodes, resources, run lists and PDFs, rendering parameters,
// automated layouts, injected layouts and result codes.
#include <gtest/gtest.h>

#include "ticket_fixture.h"

namespace {

using vorlan::test::jdfTicket;
using vorlan::test::ReadTicket;
using vorlan::test::runListByRun;
using vorlan::test::runPartition;

const std::string kDocumentLink = R"(<RunListLink rRef="RL" Usage="Input" ProcessUsage="Document"/>)";

TEST(TicketReader, ResultCodesForUnusableInput) {
    LD_JDF worker;
    EXPECT_EQ(worker.JDF_InitializeAndParseJDF(static_cast<wchar_t*>(nullptr)), LD_JDF_UNUSABLE);
    EXPECT_EQ(worker.JDF_InitializeAndParseJDF(const_cast<wchar_t*>(L"")), LD_FAILED);
    EXPECT_EQ(worker.JDF_GetLastErrorCode(), LD_FAILED);
    EXPECT_EQ(worker.JDF_InitializeAndParseJDF("/nonexistent/ticket.jdf"), LD_JDF_UNUSABLE);
    ReadTicket notJdf("<Other/>");
    EXPECT_EQ(notJdf.result, LD_JDF_UNUSABLE);
    ReadTicket broken("<JDF><ResourcePool>");
    EXPECT_EQ(broken.result, LD_JDF_UNUSABLE);
}

TEST(TicketReader, PartitionedRunListSkipsUnavailablePartitionsAndSharesPdfs) {
    std::string runs = runListByRun(
        "RL", runPartition(0, "file:///job/Art.pdf", R"(NPage="2")") +
                  runPartition(1, "file:///job/skip.pdf", R"(NPage="1")", R"(Status="Unavailable")") +
                  runPartition(2, "FILE:///JOB/ART.PDF", R"(Pages="3 ~ 4")", R"(EndOfDocument="true")"));
    ReadTicket t(jdfTicket(runs, kDocumentLink));
    ASSERT_EQ(t.result, LD_OK);
    ASSERT_EQ(t->contentRuns.size(), 2u);
    EXPECT_EQ(t->contentRuns[0]->runNumber, 0);
    EXPECT_EQ(t->contentRuns[1]->runNumber, 2);
    EXPECT_EQ(t->contentRuns[1]->pages, (std::vector<int32_t>{3, 4}));
    EXPECT_TRUE(t->contentRuns[1]->EndOfDocument);
    ASSERT_EQ(t->contentPDFs.size(), 1u);  // the two URLs differ only in case
    EXPECT_EQ(t->contentRuns[0]->pdf, t->contentRuns[1]->pdf);
    EXPECT_STREQ(t->contentPDFs[0]->mimeType, L"application/pdf");  // lower-cased for partitions
    // Pages: 0, 1 from the range of the first run, then 3, 4.
    EXPECT_EQ(t->JDF_GetMaxOrdinalNumber(), 3);
    EXPECT_EQ(t->JDF_GetLogicalContentPageByOrdinalNumber(2)->page, 3);
    EXPECT_EQ(t->JDF_GetNumberOfLogicalDocs(), 2);
}

TEST(TicketReader, MarksRunListAndBlankPartitions) {
    std::string marks = runListByRun(
        "RM", runPartition(0, "marks.pdf", R"(NPage="1")") +
                  R"(<RunList Run="1" NPage="1"><LayoutElement IsBlank="true"/></RunList>)");
    std::string content = runListByRun("RL", runPartition(0, "a.pdf", R"(NPage="2")"));
    ReadTicket t(jdfTicket(content + marks, kDocumentLink + R"(<RunListLink rRef="RM" Usage="Input" ProcessUsage="marks"/>)"));
    ASSERT_EQ(t.result, LD_OK);
    ASSERT_EQ(t->markRuns.size(), 2u);
    EXPECT_EQ(t->markPDFs.size(), 1u);
    EXPECT_TRUE(t->markRuns[1]->IsBlank);
    EXPECT_EQ(t->markRuns[1]->pdf, nullptr);
    EXPECT_EQ(t->JDF_GetLogicalMarkPageByOrdinalNumber(1)->run, t->markRuns[1]);
}

TEST(TicketReader, UnpartitionedRunLists) {
    std::string withRun =
        R"(<RunList ID="RL" Class="Parameter" Status="Available" Run="R7" NPage="3" FirstPage="1" MimeType="x">
           <LayoutElement><FileSpec URL="one.pdf" MimeType="Application/PDF"/></LayoutElement></RunList>)";
    std::string withoutRun =
        R"(<RunList ID="R2" Class="Parameter" Status="Available"><LayoutElement><FileSpec URL="one.pdf"/></LayoutElement></RunList>
           <RunList ID="R3" Class="Parameter" Status="Unavailable" Run="x"><LayoutElement><FileSpec URL="no.pdf"/></LayoutElement></RunList>)";
    ReadTicket t(jdfTicket(withRun + withoutRun, kDocumentLink));
    ASSERT_EQ(t.result, LD_OK);
    ASSERT_EQ(t->contentRuns.size(), 1u);
    EXPECT_EQ(t->contentRuns[0]->runNumber, 0);
    EXPECT_STREQ(t->contentRuns[0]->runName, L"R7");
    EXPECT_STREQ(t->contentPDFs[0]->mimeType, L"Application/PDF");  // as written
    // The run list without Run adds its PDF, even a duplicate, and no run or ordinal rows.
    ASSERT_EQ(t->contentPDFs.size(), 2u);
    EXPECT_EQ(t->JDF_GetNumberOfLogicalPages(), 2);  // pages 1 and 2 of the range
}

// Interleaved unless an available RenderingParams says otherwise; only "true" counts.
TEST(TicketReader, RenderingParameters) {
    std::string runs = runListByRun("RL", runPartition(0, "a.pdf", R"(NPage="1")"));
    const std::pair<const char*, bool> cases[] = {
        {"", true},
        {R"(<RenderingParams ID="RP" Class="Parameter" Status="Available"/>)", false},
        {R"(<RenderingParams ID="RP" Status="Available" Interleaved="TRUE"/>)", false},
        {R"(<RenderingParams ID="RP" Status="Available" Interleaved="true"/>)", true},
        {R"(<RenderingParams ID="RP" Status="Unavailable"/>)", true},
    };
    for (auto [params, interleaved] : cases) {
        ReadTicket t(jdfTicket(runs + params, kDocumentLink));
        EXPECT_EQ(t.result, LD_OK) << params;  // no DigitalPrintingParams either
        EXPECT_EQ(t->renderingParams.Interleaved, interleaved) << params;
    }
    EXPECT_EQ(ReadTicket(jdfTicket(runs + cases[1].first, kDocumentLink))->renderingParams.status, 7);
}

TEST(TicketReader, ProcessNodeSearch) {
    std::string runs = runListByRun("RL", runPartition(0, "a.pdf", R"(NPage="1")"));
    ReadTicket combined(jdfTicket(runs, kDocumentLink, R"(Type="Combined" Types="Imposition Interpreting Rendering")"));
    EXPECT_EQ(combined->ticket->processNode, combined->ticket->rootNode);

    // A ProcessGroup child with Imposition in its Types is not an imposition node.
    std::string child = R"(<JDF ID="c1" Type="ProcessGroup" Types="Imposition Rendering" Status="Waiting"/>)";
    std::string ticket = jdfTicket(runs, kDocumentLink, R"(Type="Product")");
    ticket.insert(ticket.find("<ResourcePool>"), child);
    vorlan::test::TempDir dir;
    vorlan::test::writeFile(dir / "t.jdf", ticket);
    JDF::JDFParser parser;
    ASSERT_TRUE(parser.Parse(JDF::WString((dir / "t.jdf").string())));
    JDF::JDFNode root = JDF::JDFDoc(parser.GetDocument()).GetJDFRoot(), found;
    LD_JDF worker;
    EXPECT_EQ(worker.FindImpositionNode(root, found), 1);
    EXPECT_TRUE(found.isNull());
    JDF::JDFNode group = root.GetChildByTagName(L"JDF");
    EXPECT_EQ(worker.IncludesType(group, "Imposition"), 1);
    EXPECT_EQ(worker.IncludesType(group, "Cutting"), 0);

    // A Combined child with Imposition is found.
    std::string nested = jdfTicket(runs, kDocumentLink, R"(Type="Product")");
    nested.insert(nested.find("<ResourcePool>"), R"(<JDF ID="c2" Type="Combined" Types="Imposition" Status="Waiting"/>)");
    vorlan::test::writeFile(dir / "n.jdf", nested);
    ASSERT_TRUE(parser.Parse(JDF::WString((dir / "n.jdf").string())));
    root = JDF::JDFDoc(parser.GetDocument()).GetJDFRoot();
    EXPECT_EQ(worker.FindImpositionNode(root, found), 0);
    EXPECT_EQ(found.GetID(), L"c2");
}

TEST(TicketReader, AutomatedLayoutIsWrittenUnchangedWithAnchoredUrls) {
    std::string resources =
        runListByRun("RL", runPartition(0, "./art.pdf", R"(NPage="1")") + runPartition(1, "http://x/b.pdf", R"(NPage="1")")) +
        R"(<Layout ID="L" Class="Parameter" Status="Available" Automated="true"/>)";
    vorlan::test::TempDir out;
    std::string output = (out / "out.jdf").string();
    LD_JDF worker;
    worker.lastError = LD_FILE_NOT_FOUND;
    worker.ticketDataPath = const_cast<wchar_t*>(L"/data/job 1");
    worker.outputJdfPath = output.data();
    vorlan::test::writeFile(out / "in.jdf", jdfTicket(resources, kDocumentLink + R"(<LayoutLink rRef="L" Usage="Input"/>)"));
    ::testing::internal::CaptureStdout();
    EXPECT_EQ(worker.JDF_InitializeAndParseJDF((out / "in.jdf").string().c_str()), LD_JDF_UNUSABLE);
    ::testing::internal::GetCapturedStdout();
    worker.ticketDataPath = nullptr;
    EXPECT_EQ(worker.lastError, LD_FILE_NOT_FOUND);  // left as it was
    std::string written = vorlan::test::readFile(output);
    EXPECT_NE(written.find(R"(URL="file:///data/job 1/art.pdf")"), std::string::npos) << written;
    EXPECT_NE(written.find(R"(URL="http://x/b.pdf")"), std::string::npos);
    EXPECT_TRUE(worker.contentRuns.empty());
}

TEST(TicketReader, TicketWithoutLayoutGetsOneSheetPerPage) {
    std::string runs = runListByRun("RL", runPartition(0, "a.pdf", R"(NPage="3")") +
                                              runPartition(1, "b.pdf", R"(Pages="0 2")") +
                                              R"(<RunList Run="2"><LayoutElement><FileSpec URL="c.pdf"/></LayoutElement></RunList>)");
    std::string media = R"(<Media ID="M" Class="Consumable" Status="Available" Dimension="595 842" MediaType="Paper"/>)";
    ReadTicket t(jdfTicket(runs + media, kDocumentLink, R"(Type="Combined" Types="Interpreting Rendering")"));
    ASSERT_EQ(t.result, LD_OK);
    EXPECT_FALSE(t->ticket->ticketHasLayout);  // the injected one does not count
    EXPECT_EQ(t->JDF_GetNumberOfSheets(), 6);
    ASSERT_EQ(t->contentObjects.size(), 6u);
    EXPECT_EQ(t->contentObjects[5]->Ord, 5);
    EXPECT_EQ(t->surfaces[0]->SurfaceContentsBox->upperRight.x, 595);
    // The third partition had neither NPage nor Pages: it is given NPage 1.
    JDF::KElement third = t->ticket->runListElement.GetChildByTagName(L"RunList", L"", 2);
    EXPECT_EQ(third.GetAttribute(L"NPage"), L"1");
}

TEST(TicketReader, SurfacesWithoutContentPagesAreReportedNotAsserted) {
    std::string layout = R"(<Layout ID="L" Class="Parameter" Status="Available"><Signature Name="S"><Sheet Name="A">
        <Surface Side="Front"><ContentObject CTM="1 0 0 1 0 0" Ord="0"/></Surface></Sheet></Signature></Layout>)";
    ReadTicket withTicket(jdfTicket(layout), true);
    EXPECT_EQ(withTicket.result, LD_JDF_UNUSABLE);
    EXPECT_EQ(withTicket->JDF_GetNumberOfSurfaces(), 1);
    ReadTicket readOnly(jdfTicket(layout), false);
    EXPECT_EQ(readOnly.result, LD_OK);
}

}  // namespace
