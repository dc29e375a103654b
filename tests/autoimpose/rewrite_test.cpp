// The ticket rewrite on template tickets built through the JDF layer.
#include <cstdlib>

#include <gtest/gtest.h>

#include "platform/jobstore/job_store.h"
#include "template_ticket.h"
#include "test_support.h"

using namespace JDF;
using autoimpose_test::buildTemplateTicket;
using autoimpose_test::Imposed;
using autoimpose_test::TemplateShape;

namespace {

std::vector<WString> attributeOf(const vElement& elements, const wchar_t* name) {
    std::vector<WString> values;
    for (const KElement& e : elements) values.push_back(e.GetAttribute(name));
    return values;
}

vElement children(const KElement& parent, const wchar_t* name) { return parent.GetChildrenByTagName(name); }

// Tickets to validate against the JDF 1.8 schema in one xmllint run, at the end of the test.
class SchemaCheck {
public:
    // A copy of the ticket, taken now.
    void add(const std::filesystem::path& ticket) {
        files_.push_back(dir_ / (std::to_string(files_.size()) + ".jdf"));
        std::filesystem::copy_file(ticket, files_.back());
    }
    void add(const JDFDoc& doc) {
        files_.push_back(dir_ / (std::to_string(files_.size()) + ".jdf"));
        EXPECT_TRUE(doc.Write2File(WString(files_.back().string())));
    }
    ~SchemaCheck() {
        if (vorlan::test::corpusDir().empty()) return;  // the schema lives in the corpus
        std::string report;
        EXPECT_TRUE(vorlan::test::filesFailingJdfSchema(files_, &report).empty()) << report;
    }

private:
    vorlan::test::TempDir dir_;
    std::vector<std::filesystem::path> files_;
};

}  // namespace

TEST(AutoImposeRewrite, TemplatePagesBecomeMarksAndLabelsAndJobPagesAreRenumbered) {
    SchemaCheck schema;
    schema.add(buildTemplateTicket());
    Imposed t(buildTemplateTicket(),
              "<Layout><SheetLabels JobNamePrint='1' SurfaceNumberPrint='1' JobNameString='J'/></Layout>");
    ASSERT_EQ(t.result, LD_OK);
    JDFRenderingParams rendering = t.root.GetMatchingResource(L"RenderingParams", 3);
    EXPECT_TRUE(rendering.GetInterleaved());
    EXPECT_EQ(rendering.GetAttribute(L"Status"), L"Available");

    // The template's runs leave the document run list; the marks get a run list of their own.
    JDFRunList document = t.root.GetMatchingResource(L"RunList", 10);
    vElement runs = children(document, L"RunList");
    ASSERT_EQ(runs.size(), 1u);
    EXPECT_EQ(JDFRunList(runs[0]).GetFileURL(), L"file:///tmp/template/job.pdf");
    EXPECT_EQ(runs[0].GetAttribute(L"Pages"), L"0 ~ -1");
    EXPECT_EQ(runs[0].GetAttribute(L"RunTag"), L"PDF_Job");
    EXPECT_FALSE(runs[0].HasChildElement(L"MetadataMap", L""));
    EXPECT_FALSE(document.HasChildElement(L"KAV:OrvelDeliveryOptions", L""));
    JDFRunList marks = t.root.GetMatchingResource(L"RunList", 9);
    ASSERT_FALSE(marks.isNull());
    EXPECT_EQ(marks.GetAttribute(L"RunTag"), L"PDF_Job");
    EXPECT_EQ(marks.GetAttribute(L"Status"), L"Available");
    JDFRunList markRun = marks.GetElement(L"RunList");
    EXPECT_EQ(markRun.GetFileURL(), L"file:///tmp/template/Mark.tmp");
    EXPECT_EQ(markRun.GetAttribute(L"Pages"), L"0 ~ -1");

    JDFLayout layout = t.layout();
    EXPECT_TRUE(layout.GetAutomated());
    EXPECT_FALSE(layout.HasAttribute(L"BaseOrdReset", L"", false));
    EXPECT_EQ(layout.GetAttribute(L"PartIDKeys"), L"RunTags SheetName Side");
    KElement signature = layout.GetElement(L"Layout");
    EXPECT_EQ(signature.GetAttribute(L"RunTags"), L"PDF_Job");
    EXPECT_FALSE(signature.HasAttribute(L"SignatureName"));
    EXPECT_TRUE(layout.GetLogicalStackParams().isNull());

    for (int s = 0; s < 2; ++s) {
        JDFLayout side = t.side(s);
        EXPECT_EQ(side.GetAttribute(L"Side"), s ? L"Back" : L"Front");  // forward delivery keeps the sides
        vElement objects = children(side, L"ContentObject");
        EXPECT_EQ(attributeOf(objects, L"Ord"), (std::vector<WString>{L"0", L"1"}));
        EXPECT_EQ(JDFContentObject(objects[0]).GetCTM(), JDFMatrix(1, 0, 0, 1, 30, s));
        EXPECT_FALSE(objects[0].HasAttribute(L"TrimSize") || objects[0].HasChildElement(L"FitPolicy", L""));
        vElement markObjects = children(side, L"MarkObject");
        ASSERT_EQ(markObjects.size(), 3u);
        EXPECT_EQ(attributeOf(markObjects, L"Ord"), (std::vector<WString>{L"0", L"1", L""}));
        EXPECT_EQ(JDFMarkObject(markObjects[1]).GetCTM(), JDFMatrix(1, 0, 0, 1, 10, s));
        EXPECT_EQ(JDFMarkObject(markObjects[2]).GetClipBox(), JDFRectangle(0, 0, 102, 50));
        KElement field = markObjects[2].GetElement(L"JobField");
        EXPECT_EQ(field.GetAttribute(L"JobFormat"), L"J Sheet %d/%s");
        EXPECT_EQ(field.GetAttribute(L"JobTemplate"), L"SheetCount, Side");
        KElement device = markObjects[2].GetElement(L"DeviceMark");
        EXPECT_EQ(device.GetAttribute(L"Font"), L"Times-Roman");
        EXPECT_EQ(device.GetAttribute(L"FontSize"), L"9");
        EXPECT_TRUE(markObjects[0].GetElement(L"JobField").isNull());
    }
    schema.add(t.ticket);
}

TEST(AutoImposeRewrite, LabelsWithoutATemplateGetAnEmptyJobField) {
    // Only the job name: no template text, so the job field stays bare.
    Imposed t(buildTemplateTicket({0, 1, 1, 1, false}), "<Layout><SheetLabels JobNamePrint='1' JobNameString='J'/></Layout>");
    ASSERT_EQ(t.result, LD_OK);
    EXPECT_TRUE(t.root.GetMatchingResource(L"RunList", 9).isNull());  // labels get no run list
    EXPECT_FALSE(t.root.GetMatchingResource(L"RenderingParams", 3).isNull());  // added
    KElement field = t.side(0).GetMarkObject(0).GetElement(L"JobField");
    ASSERT_FALSE(field.isNull());
    EXPECT_EQ(field.NumAttributes(), 0);
    EXPECT_EQ(t.side(0).GetContentObject(0).GetOrd(), 0);
}

TEST(AutoImposeRewrite, ReverseDeliveryOfAVariableDataJob) {
    vorlan::test::TempDir store;
    ::setenv("VORLAN_JOB_STORE", store.path().c_str(), 1);
    for (const auto& [duplex, twoSided] : {std::pair{"1", L"false"}, {"2", L"true"}, {"-1", L"true"}}) {
        Imposed t(buildTemplateTicket(), std::string("<Layout isDuplex='") + duplex +
                                             "'/><JobTypePDL pdl='4' jobnum='31'/>"
                                             "<PageDeliveryInfo PageDelivery='ReverseOrderFaceUp'/>");
        ASSERT_EQ(t.result, LD_OK);
        EXPECT_EQ(t.root.GetAttribute(L"xmlns:KAV"), L"http://www.vorlan.org/JDF/1.0");
        KElement delivery = t.root.GetMatchingResource(L"RunList", 10).GetElement(L"KAV:OrvelDeliveryOptions");
        EXPECT_EQ(delivery.GetNamespaceURI(), L"http://www.vorlan.org/JDF/delivery/1.0");
        EXPECT_EQ(delivery.GetAttribute(L"OutputDelivery"), L"reverse");
        EXPECT_EQ(delivery.GetAttribute(L"TwoSided"), twoSided) << duplex;
    }
    vorlan::jobstore::JobAttributeStore jobs(store.path());
    EXPECT_EQ(jobs.get(31, "ignore_record_ progress"), "1");

    Imposed t(buildTemplateTicket(), "<JobTypePDL pdl='4'/><PageDeliveryInfo PageDelivery='ReverseOrderFaceUp'/>");
    ::unsetenv("VORLAN_JOB_STORE");
    EXPECT_EQ(t.side(0).GetAttribute(L"Side"), L"Back");
    EXPECT_EQ(t.side(1).GetAttribute(L"Side"), L"Front");
    EXPECT_EQ(t.layout().GetAttribute(L"BaseOrdReset"), L"PagePoolList");
    EXPECT_EQ(t.layout().GetElement(L"Layout").GetAttribute(L"RunTags"), L"PDFVT_Job");
    EXPECT_EQ(t.root.GetMatchingResource(L"RunList", 9).GetAttribute(L"RunTag"), L"PDFVT_Job");
    KElement run = t.root.GetMatchingResource(L"RunList", 10).GetElement(L"RunList");
    EXPECT_EQ(run.GetAttribute(L"RunTag"), L"PDFVT_Job");
    KElement map = run.GetElement(L"MetadataMap");
    using Attributes = std::map<WString, WString>;
    EXPECT_EQ(Attributes(map.GetAttributeMap()), (Attributes{{L"DataType", L"PartIDKeys"}, {L"Name", L"RunTags"},
                                                             {L"ValueFormat", L"%s"}, {L"ValueTemplate", L"doctype"},
                                                             {L"Context", L"Document"}}));
    EXPECT_EQ(Attributes(map.GetElement(L"Expr").GetAttributeMap()),
              (Attributes{{L"Name", L"doctype"}, {L"Value", L"PDFVT_Job"}}));
}

TEST(AutoImposeRewrite, StackingByBinding) {
    struct Case {
        const char* settings;
        bool stacked;
        const wchar_t* depth;
        std::vector<WString> backStacks;
    };
    const Case cases[] = {
        {"<Layout><Binding Type='10' row='2' col='1' MaxStackDepth='-3'/></Layout>", true, L"3", {L"1", L"0"}},
        {"<Layout><Binding Type='12' row='1' col='2'/></Layout>", true, L"", {L"0", L"1"}},
        {"<Layout><Binding Type='17' row='2' MaxStackDepth='-5'/></Layout><JobTypePDL pdl='4'/>", true, L"1",
         {L"0", L"1"}},
        {"<Layout><Binding Type='17' row='2'/></Layout>", false, L"", {L"", L""}},
    };
    SchemaCheck schema;
    for (const Case& c : cases) {
        SCOPED_TRACE(c.settings);
        Imposed t(buildTemplateTicket({0, 0, 3, 2, true}), c.settings);
        ASSERT_EQ(t.result, LD_OK);
        JDFLogicalStackParams params = t.layout().GetLogicalStackParams();
        ASSERT_EQ(params.isNull(), !c.stacked);
        if (!c.stacked) continue;
        EXPECT_EQ(params.GetAttribute(L"Restrictions"), L"None");
        EXPECT_EQ(params.GetAttribute(L"MaxStackDepth"), c.depth);
        vElement stacks = children(params, L"Stack");
        EXPECT_EQ(attributeOf(stacks, L"LogicalStackOrd"), (std::vector<WString>{L"0", L"1"}));
        EXPECT_EQ(attributeOf(stacks, L"LogicalStackSequence"), (std::vector<WString>{L"SheetIndex", L"SheetIndex"}));
        vElement front = children(t.side(0), L"ContentObject"), back = children(t.side(1), L"ContentObject");
        EXPECT_EQ(attributeOf(front, L"Ord"), (std::vector<WString>{L"0", L"0", L"2"}));
        EXPECT_EQ(attributeOf(front, L"LogicalStackOrd"), (std::vector<WString>{L"0", L"1", L""}));
        EXPECT_EQ(attributeOf(back, L"Ord"), (std::vector<WString>{L"1", L"1", L"2"}));
        EXPECT_EQ(attributeOf(back, L"LogicalStackOrd"), (std::vector<WString>{c.backStacks[0], c.backStacks[1], L""}));
        // A variable-data job's run lists carry metadata maps, which the JDF 1.8 schema does not know.
        if (!t.root.GetMatchingResource(L"RunList", 10).GetElement(L"RunList").HasChildElement(L"MetadataMap", L""))
            schema.add(t.ticket);
    }
}

TEST(AutoImposeRewrite, TrimSizesAndFitPolicies) {
    struct Case {
        const char* settings;
        const wchar_t* trim;
        const wchar_t* size;    // FitPolicy SizePolicy; null: no FitPolicy
        const wchar_t* rotate;
    };
    const Case cases[] = {
        {"<Layout SizePolicy='7'><BleedSize x='5' y='6.5'/><FinishSize ord='0' x='1' y='2'/></Layout>", L"5 6.5",
         L"FitToPage", L"NoRotate"},
        {"<Layout SizePolicy='6' RotationPolicy='2'><FinishSize ord='0' x='210' y='297'/></Layout>", L"210 297",
         L"ClipToMaxPage", L"RotateCounterClockwise"},
        {"<Layout SizePolicy='0' RotationPolicy='1'><FinishSize ord='1' x='210' y='297'/></Layout>", L"0 0", L"",
         L"RotateClockwise"},
        {"<Layout SizePolicy='5' ImpositionMode='1'/>", L"0 0", nullptr, nullptr},
        {"<Layout SizePolicy='2' RotationPolicy='0'/>", L"", nullptr, nullptr},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.settings);
        Imposed t(buildTemplateTicket({1, 0, 2, 2, true}), c.settings);
        ASSERT_EQ(t.result, LD_OK);
        for (int s = 0; s < 2; ++s) {
            vElement objects = children(t.side(s), L"ContentObject");
            ASSERT_EQ(objects.size(), 2u);
            for (const KElement& object : objects) {
                EXPECT_EQ(object.GetAttribute(L"TrimSize"), c.trim);
                KElement policy = object.GetElement(L"FitPolicy");
                ASSERT_EQ(policy.isNull(), c.size == nullptr);
                if (!c.size) continue;
                EXPECT_EQ(policy.GetAttribute(L"SizePolicy"), c.size);
                EXPECT_EQ(policy.GetAttribute(L"RotatePolicy"), c.rotate);
            }
        }
    }
}

TEST(AutoImposeRewrite, SheetRangesByRangeType) {
    struct Case {
        const char* settings;
        const wchar_t* partKey;  // on the output run list's link; SetIndex: on the document link
        std::vector<WString> parts;
        const wchar_t* firstRunPages;
    };
    const std::string ranges = "Count='2'><Range StartIndex='1' EndIndex='2'/><Range StartIndex='5' EndIndex='5'/>";
    const Case cases[] = {
        {"<RangeInfo Type='1' TotalCount='6'/>", L"SheetIndex", {L"1", L"3", L"5"}, L"0 ~ -1"},
        {"<RangeInfo Type='2' TotalCount='5'/>", L"SheetIndex", {L"0", L"2", L"4"}, L"0 ~ -1"},
        {"<RangeInfo Type='3' ", nullptr, {}, L"0 ~ 1 4"},
        {"<RangeInfo Type='4' ", L"SheetIndex", {L"0 ~ 1", L"4"}, L"0 ~ -1"},
        {"<RangeInfo Type='5' ", L"SetIndex", {L"0 ~ 1", L"4"}, L"0 ~ -1"},
        {"<RangeInfo Type='9' TotalCount='4'/>", L"SheetIndex", {}, L"0 ~ -1"},
    };
    SchemaCheck schema;
    for (const Case& c : cases) {
        std::string settings = c.settings;
        if (settings.back() == ' ') settings += ranges + "</RangeInfo>";
        SCOPED_TRACE(settings);
        Imposed t(buildTemplateTicket(), settings);
        ASSERT_EQ(t.result, LD_OK);
        EXPECT_EQ(t.root.GetMatchingResource(L"RunList", 10).GetElement(L"RunList").GetAttribute(L"Pages"),
                  c.firstRunPages);
        JDFResourceLink output = t.root.GetMatchingLink(L"RunList", 2);
        const bool onOutput = c.partKey && WString(c.partKey) == L"SheetIndex";
        ASSERT_EQ(output.isNull(), !onOutput);
        if (onOutput) {
            EXPECT_EQ(output.GetTarget().GetAttribute(L"PartIDKeys"), L"SheetIndex");
            EXPECT_EQ(output.GetTarget().GetAttribute(L"Status"), L"Available");
        }
        KElement link = onOutput ? KElement(output) : KElement(t.root.GetMatchingLink(L"RunList", 10));
        if (c.partKey) {
            EXPECT_EQ(attributeOf(children(link, L"Part"), c.partKey), c.parts);
        }
        schema.add(t.ticket);
    }
}

TEST(AutoImposeRewrite, FailureLeavesTheTicketByteIdentical) {
    JDFDoc noLayout = buildTemplateTicket();
    noLayout.GetJDFRoot().GetMatchingLink(L"Layout", 3).DeleteNode();
    JDFDoc noSignature = buildTemplateTicket();
    KElement signature = noSignature.GetJDFRoot().GetMatchingResource(L"Layout", 3).GetElement(L"Layout");
    signature.DeleteNode();
    JDFDoc danglingLink = buildTemplateTicket();
    danglingLink.GetJDFRoot().GetMatchingLink(L"RunList", 10).SetAttribute(L"rRef", L"nowhere");
    const std::string texts[] = {noLayout.ToString(), noSignature.ToString(), danglingLink.ToString(),
                                 "<JDF><ResourcePool>", "<NotJDF ID='x' Type='Imposition' Status='Ready'/>"};
    vorlan::test::TempDir dir;
    autoimpose_test::writeSettings(dir / "s.xml", "<RangeInfo Type='1' TotalCount='4'/>");
    for (const std::string& text : texts) {
        vorlan::test::writeFile(dir / "t.jdf", text);
        LD_JDF worker;
        EXPECT_EQ(worker.JDF_AutoImposition((dir / "s.xml").c_str(), (dir / "t.jdf").c_str()), LD_FAILED);
        EXPECT_EQ(vorlan::test::readFile(dir / "t.jdf"), text);
    }
    LD_JDF worker;
    EXPECT_EQ(worker.JDF_AutoImposition((dir / "s.xml").c_str(), ""), LD_FAILED);
    EXPECT_EQ(worker.JDF_AutoImposition(nullptr, (dir / "missing.jdf").c_str()), LD_FAILED);
    EXPECT_EQ(worker.JDF_GetLastErrorCode(), LD_FAILED);
    EXPECT_EQ(std::distance(std::filesystem::directory_iterator(dir.path()), {}), 2);  // no temporary left
}

TEST(AutoImposeCli, PrintsWhatChanged) {
    vorlan::test::TempDir dir;
    ASSERT_TRUE(buildTemplateTicket().Write2File(WString((dir / "t.jdf").string())));
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
