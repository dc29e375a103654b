// The ticket rewrite on template tickets, checked with XPath queries on the rewritten ticket and
// with the JDF 1.8 schema.
#include <cstdlib>

#include <gtest/gtest.h>

#include "platform/jobstore/job_store.h"
#include "template_ticket.h"
#include "vorlan/LD_JDF.h"

using autoimpose_test::TemplateShape;
namespace fs = std::filesystem;

namespace {

// Run lists by link, side partitions by position, and the content objects of the first two sides.
const std::string kDocument = "/JDF/ResourcePool/RunList[@ID=//RunListLink[@ProcessUsage='Document']/@rRef]";
const std::string kMarks = "/JDF/ResourcePool/RunList[@ID=//RunListLink[@ProcessUsage='Marks']/@rRef]";
const std::string kOutputLink = "//RunListLink[@Usage='Output']";
const std::string kSides = "/JDF/ResourcePool/Layout/Layout/Layout/Layout";
const std::string kFront = kSides + "[1]/ContentObject";
const std::string kBack = kSides + "[2]/ContentObject";

// A template written to a folder and imposed there through the worker.
struct Imposed {
    vorlan::test::TempDir dir;
    fs::path ticket = dir / "ticket.jdf";
    LDError result;

    Imposed(const TemplateShape& shape, const std::string& settings) {
        EXPECT_TRUE(autoimpose_test::buildTemplateTicket(shape).Write2File(JDF::WString(ticket.string())));
        autoimpose_test::writeSettings(dir / "s.xml", settings);
        result = LD_JDF().JDF_AutoImposition((dir / "s.xml").c_str(), ticket.c_str());
    }
    // The values the query selects in the rewritten ticket, joined by '|': attribute values,
    // element names; or the value of a query that selects no nodes (namespace-uri(…)).
    std::string select(const std::string& query) const {
        pugi::xml_document doc;
        doc.load_file(ticket.c_str());
        pugi::xpath_query compiled(query.c_str());
        if (compiled.return_type() != pugi::xpath_type_node_set) return compiled.evaluate_string(doc);
        std::string out;
        for (const pugi::xpath_node& n : compiled.evaluate_node_set(doc))
            out += (out.empty() ? "" : "|") + std::string(n.attribute() ? n.attribute().value() : n.node().name());
        return out;
    }
};

struct Case {
    TemplateShape shape;
    std::string settings;
    std::vector<std::pair<std::string, std::string>> expect;  // query → values
};

const std::string kRanges = " Count='2'><Range StartIndex='1' EndIndex='2'/><Range StartIndex='5' EndIndex='5'/>";

const Case kCases[] = {
    // Two mark pages and one label page: Ord 0 and 1 become marks, 2 a label, 3 and 4 become 0 and 1.
    {{}, "<Layout><SheetLabels JobNamePrint='1' SurfaceNumberPrint='1' JobNameString='J'/></Layout>",
     {{"//RenderingParams/@Interleaved", "true"}, {"//RenderingParams/@Status", "Available"},
      {kDocument + "/RunList/LayoutElement/FileSpec/@URL", "file:///tmp/template/job.pdf"},
      {kDocument + "/RunList/@Pages", "0 ~ -1"}, {kDocument + "/RunList/@RunTag", "PDF_Job"},
      {kMarks + "/@RunTag", "PDF_Job"}, {kMarks + "/@Status", "Available"}, {kMarks + "/RunList/@Pages", "0 ~ -1"},
      {kMarks + "/RunList/LayoutElement/FileSpec/@URL", "file:///tmp/template/Mark.tmp"},
      {"/JDF/ResourcePool/Layout/@Automated", "true"}, {"//@BaseOrdReset", ""},
      {"/JDF/ResourcePool/Layout/@PartIDKeys", "RunTags SheetName Side"},
      {"/JDF/ResourcePool/Layout/Layout/@RunTags", "PDF_Job"}, {"//@SignatureName", ""},
      {kSides + "/@Side", "Front|Back"}, {kFront + "/@Ord", "0|1"}, {kBack + "/@CTM", "1 0 0 1 30 1|1 0 0 1 40 1"},
      {kSides + "[2]/MarkObject/@Ord", "0|1"},
      {kSides + "[2]/MarkObject/@CTM", "1 0 0 1 0 1|1 0 0 1 10 1|1 0 0 1 20 1"},
      {kSides + "[1]/MarkObject[3]/@ClipBox", "0 0 102 50"},
      {"//MarkObject/JobField/@JobFormat", "J Sheet %d/%s|J Sheet %d/%s"},
      {"//MarkObject/JobField/@JobTemplate", "SheetCount, Side|SheetCount, Side"},
      {"//MarkObject/DeviceMark/@Font", "Times-Roman|Times-Roman"}, {"//MarkObject/DeviceMark/@FontSize", "9|9"},
      {"//@TrimSize|//FitPolicy|//LogicalStackParams|//MetadataMap|//KAV:OrvelDeliveryOptions", ""}}},
    // Labels only, the job name only: no label run list, a bare job field; rendering params added.
    {{0, 1, 1, 1, false}, "<Layout><SheetLabels JobNamePrint='1' JobNameString='J'/></Layout>",
     {{kMarks, ""}, {"//MarkObject/JobField", "JobField"}, {"//MarkObject/JobField/@*", ""},
      {"//ContentObject/@Ord", "0"}, {"//RenderingParams/@Interleaved", "true"}}},
    // Reverse delivery of a variable-data job: delivery options, sides turned, PDFVT_Job tags.
    {{}, "<Layout isDuplex='2'/><JobTypePDL pdl='4'/><PageDeliveryInfo PageDelivery='ReverseOrderFaceUp'/>",
     {{kDocument + "/KAV:OrvelDeliveryOptions/@*", "reverse|true"},
      {"namespace-uri(//KAV:OrvelDeliveryOptions)", "http://www.vorlan.org/JDF/delivery/1.0"},
      {kSides + "/@Side", "Back|Front"}, {"//Layout/@BaseOrdReset", "PagePoolList"},
      {"//Layout/Layout/@RunTags", "PDFVT_Job"}, {kMarks + "/@RunTag", "PDFVT_Job"},
      {kDocument + "/RunList/@RunTag", "PDFVT_Job"},
      {kDocument + "/RunList/MetadataMap/@*", "PartIDKeys|RunTags|%s|doctype|Document"},
      {kDocument + "/RunList/MetadataMap/Expr/@*", "doctype|PDFVT_Job"}}},
    {{}, "<Layout isDuplex='1'/><PageDeliveryInfo PageDelivery='ReverseOrderFaceUp'/>",
     {{"//KAV:OrvelDeliveryOptions/@TwoSided", "false"}, {"//MetadataMap", ""}}},
    {{}, "<Layout isDuplex='-1'/><PageDeliveryInfo PageDelivery='ReverseOrderFaceUp'/>",
     {{"//KAV:OrvelDeliveryOptions/@TwoSided", "true"}}},
    // Stacking: binding 10 mirrors the back; 12 does not; 17 only for variable data, depth 1.
    {{0, 0, 3}, "<Layout><Binding Type='10' row='2' MaxStackDepth='-3'/></Layout>",
     {{"//LogicalStackParams/@Restrictions", "None"}, {"//LogicalStackParams/@MaxStackDepth", "3"},
      {"//Stack/@LogicalStackOrd", "0|1"}, {"//Stack/@LogicalStackSequence", "SheetIndex|SheetIndex"},
      {kFront + "/@Ord", "0|0|2"}, {kFront + "/@LogicalStackOrd", "0|1"},
      {kBack + "/@Ord", "1|1|2"}, {kBack + "/@LogicalStackOrd", "1|0"}}},
    {{0, 0, 3}, "<Layout><Binding Type='12' col='2'/></Layout>",
     {{"//LogicalStackParams/@MaxStackDepth", ""}, {kBack + "/@LogicalStackOrd", "0|1"}}},
    {{0, 0, 3}, "<Layout><Binding Type='17' row='2' MaxStackDepth='-5'/></Layout><JobTypePDL pdl='4'/>",
     {{"//LogicalStackParams/@MaxStackDepth", "1"}, {kBack + "/@Ord", "1|1|2"}}},
    {{0, 0, 3}, "<Layout><Binding Type='17' row='2'/></Layout>", {{"//LogicalStackParams", ""}}},
    // Trim sizes and fit policies.
    {{1, 0, 2}, "<Layout SizePolicy='7'><BleedSize x='5' y='6.5'/><FinishSize ord='0' x='1' y='2'/></Layout>",
     {{kFront + "/@TrimSize", "5 6.5|5 6.5"}, {kBack + "/FitPolicy/@SizePolicy", "FitToPage|FitToPage"},
      {kBack + "/FitPolicy/@RotatePolicy", "NoRotate|NoRotate"}}},
    {{1, 0, 2}, "<Layout SizePolicy='6' RotationPolicy='2'><FinishSize ord='0' x='210' y='297'/></Layout>",
     {{kFront + "/@TrimSize", "210 297|210 297"}, {kFront + "/FitPolicy/@SizePolicy", "ClipToMaxPage|ClipToMaxPage"},
      {kFront + "/FitPolicy/@RotatePolicy", "RotateCounterClockwise|RotateCounterClockwise"}}},
    {{1, 0, 1}, "<Layout RotationPolicy='1'><FinishSize ord='1' x='210' y='297'/></Layout>",
     {{kBack + "/@TrimSize", "0 0"}, {kBack + "/FitPolicy/@*", "RotateClockwise"}}},
    {{1, 0, 1}, "<Layout SizePolicy='5' ImpositionMode='1'/>", {{kBack + "/@TrimSize", "0 0"}, {"//FitPolicy", ""}}},
    {{1, 0, 1}, "<Layout SizePolicy='2'/>", {{"//@TrimSize", ""}}},
    // Sheet ranges by RangeType.
    {{}, "<RangeInfo Type='1' TotalCount='6'/>",
     {{kOutputLink + "/Part/@SheetIndex", "1|3|5"},
      {"/JDF/ResourcePool/RunList[@ID=" + kOutputLink + "/@rRef]/@PartIDKeys", "SheetIndex"}}},
    {{}, "<RangeInfo Type='2' TotalCount='5'/>", {{kOutputLink + "/Part/@SheetIndex", "0|2|4"}}},
    {{}, "<RangeInfo Type='3'" + kRanges + "</RangeInfo>",
     {{kDocument + "/RunList/@Pages", "0 ~ 1 4"}, {kOutputLink, ""}}},
    {{}, "<RangeInfo Type='4'" + kRanges + "</RangeInfo>", {{kOutputLink + "/Part/@SheetIndex", "0 ~ 1|4"}}},
    {{}, "<RangeInfo Type='5'" + kRanges + "</RangeInfo>",
     {{"//RunListLink[@ProcessUsage='Document']/Part/@SetIndex", "0 ~ 1|4"}, {kOutputLink, ""}}},
    {{}, "<RangeInfo Type='9' TotalCount='4'/>", {{kOutputLink, "RunListLink"}, {kOutputLink + "/Part", ""}}},
};

}  // namespace

TEST(AutoImposeRewrite, TemplatesBecomeTicketsThatStayValid) {
    vorlan::test::TempDir dir;
    std::vector<fs::path> valid;
    ASSERT_TRUE(autoimpose_test::buildTemplateTicket().Write2File(JDF::WString((dir / "template.jdf").string())));
    valid.push_back(dir / "template.jdf");
    for (const Case& c : kCases) {
        SCOPED_TRACE(c.settings);
        Imposed t(c.shape, c.settings);
        ASSERT_EQ(t.result, LD_OK);
        for (const auto& [query, values] : c.expect) EXPECT_EQ(t.select(query), values) << query;
        // JDF 1.8 knows no FitPolicy in a content object and no MetadataMap in a run list.
        if (!t.select("//FitPolicy|//MetadataMap").empty()) continue;
        valid.push_back(dir / (std::to_string(valid.size()) + ".jdf"));
        fs::copy_file(t.ticket, valid.back());
    }
    if (vorlan::test::corpusDir().empty()) GTEST_SKIP() << "corpus with the JDF schema not found";
    std::string report;
    EXPECT_TRUE(vorlan::test::filesFailingJdfSchema(valid, &report).empty()) << report;
}

TEST(AutoImposeRewrite, VariableDataJobsAreNotRecordedByTheServer) {
    vorlan::test::TempDir store;
    ::setenv("VORLAN_JOB_STORE", store.path().c_str(), 1);
    Imposed t({}, "<JobTypePDL pdl='4' jobnum='31'/><PageDeliveryInfo PageDelivery='ReverseOrderFaceUp'/>");
    ::unsetenv("VORLAN_JOB_STORE");
    EXPECT_EQ(t.result, LD_OK);
    EXPECT_EQ(vorlan::jobstore::JobAttributeStore(store.path()).get(31, "ignore_record_ progress"), "1");
    EXPECT_NE(vorlan::test::readFile(t.ticket).find("xmlns:KAV=\"http://www.vorlan.org/JDF/1.0\""), std::string::npos);
}

TEST(AutoImposeRewrite, FailureLeavesTheTicketByteIdentical) {
    auto without = [](const char* query) {
        JDF::JDFDoc doc = autoimpose_test::buildTemplateTicket();
        pugi::xml_node gone = doc.GetRoot().node().select_node(query).node();
        gone.parent().remove_child(gone);
        return doc.ToString();
    };
    const std::string texts[] = {without("//LayoutLink"), without("/JDF/ResourcePool/Layout/Layout"),
                                 without("/JDF/ResourcePool/RunList"), "<JDF><ResourcePool>",
                                 "<NotJDF ID='x' Type='Imposition' Status='Ready'/>"};
    vorlan::test::TempDir dir;
    autoimpose_test::writeSettings(dir / "s.xml", "<RangeInfo Type='1' TotalCount='4'/>");
    for (const std::string& text : texts) {
        vorlan::test::writeFile(dir / "t.jdf", text);
        EXPECT_EQ(LD_JDF().JDF_AutoImposition((dir / "s.xml").c_str(), (dir / "t.jdf").c_str()), LD_FAILED);
        EXPECT_EQ(vorlan::test::readFile(dir / "t.jdf"), text);
    }
    LD_JDF worker;
    EXPECT_EQ(worker.JDF_AutoImposition((dir / "s.xml").c_str(), ""), LD_FAILED);
    EXPECT_EQ(worker.JDF_AutoImposition(nullptr, (dir / "missing.jdf").c_str()), LD_FAILED);
    EXPECT_EQ(worker.JDF_GetLastErrorCode(), LD_FAILED);
    EXPECT_EQ(std::distance(fs::directory_iterator(dir.path()), {}), 2);  // no temporary file left
}

TEST(AutoImposeCli, PrintsWhatChanged) {
    vorlan::test::TempDir dir;
    ASSERT_TRUE(autoimpose_test::buildTemplateTicket().Write2File(JDF::WString((dir / "t.jdf").string())));
    autoimpose_test::writeSettings(dir / "s.xml", "<Layout><Binding Type='10'/></Layout>");
    const std::string command = std::string(VORLAN_CLI_PATH) + " autoimpose ";
    std::string output;
    EXPECT_EQ(vorlan::test::runCommand(command + "--json " + (dir / "s.xml").string() + " " + (dir / "t.jdf").string(),
                                       &output),
              0);
    for (const char* expected : {"\"rewritten\": true", "\"markObjects\": 4", "\"labelObjects\": 2",
                                 "\"renumberedObjects\": 4", "\"stacks\": 1", "\"name\": \"LD_OK\""})
        EXPECT_NE(output.find(expected), std::string::npos) << expected << "\n" << output;
    // A file that is no ticket: failure, and the file as it was.
    const std::string before = vorlan::test::readFile(dir / "s.xml");
    EXPECT_EQ(vorlan::test::runCommand(command + (dir / "s.xml").string() + " " + (dir / "s.xml").string(), &output),
              1);
    EXPECT_NE(output.find("rewritten: false"), std::string::npos) << output;
    EXPECT_EQ(vorlan::test::readFile(dir / "s.xml"), before);
}
