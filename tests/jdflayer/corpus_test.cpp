// Every corpus ticket parses and survives parse → write → parse unchanged; broken files fail
// cleanly.
#include <filesystem>
#include <set>

#include <gtest/gtest.h>

#include "platform/jdf/jdf.h"
#include "test_support.h"
#include "tree_compare.h"

namespace fs = std::filesystem;
using namespace JDF;

namespace {

const std::set<std::string> kMalformed = {"libj_corrupt.jdf", "sch_invalid_INVALID-MISPrepress-ICS-Complex.jdf"};

std::vector<fs::path> corpusTickets() {
    if (vorlan::test::corpusDir().empty()) return {};
    std::vector<fs::path> out;
    for (const auto& e : fs::directory_iterator(vorlan::test::corpusDir() / "jdf")) {
        std::string ext = e.path().extension().string();
        if (ext == ".jdf" || ext == ".JDF") out.push_back(e.path());
    }
    std::sort(out.begin(), out.end());
    return out;
}

}  // namespace

TEST(JdfCorpus, EveryTicketRoundTripsAndBrokenOnesFailCleanly) {
    VORLAN_REQUIRE_CORPUS();
    vorlan::test::TempDir tmp;
    std::vector<fs::path> files = corpusTickets();
    ASSERT_GE(files.size(), 50u);
    int failed = 0;
    for (const fs::path& file : files) {
        SCOPED_TRACE(file.filename().string());
        JDFParser parser;
        bool ok = parser.Parse(WString(file.string()), true, true, true, nullptr, WString(), 0, 42);
        if (kMalformed.count(file.filename().string())) {
            EXPECT_FALSE(ok);
            EXPECT_TRUE(parser.GetDocument().isNull());
            EXPECT_FALSE(parser.GetError().empty());
            ++failed;
            continue;
        }
        ASSERT_TRUE(ok) << parser.GetError();
        XMLDoc doc = parser.GetDocument();
        fs::path out = tmp / (file.filename().string() + ".out");
        ASSERT_TRUE(doc.Write2File(WString(out.string())));
        JDFParser again;
        ASSERT_TRUE(again.Parse(WString(out.string())));
        EXPECT_EQ(jdflayer_test::diffTrees(doc.document()->doc, again.GetDocument().document()->doc), "");
        // Writing is deterministic: the re-parsed document writes the same bytes.
        EXPECT_EQ(doc.ToString(), again.GetDocument().ToString());
    }
    EXPECT_EQ(failed, 2);
}

// Every read call the ticket reader makes, on every element kind it meets; nothing may throw.
static void walkForReading(const JDFNode& root, int& runs, int& media, int& placed) {
    for (const char* type : {"Imposition", "Combined"})
        for (const KElement& n : root.GetvJDFNode(WString(type), 6, false)) {
            JDFNode node(n);
            (void)node.GetTypes().contains(L"Imposition");
            (void)node.GetActivation(true);
            JDFResourcePool pool = node.GetResourcePool();
            for (const KElement& e : pool.GetPoolChildren(L"*", JDFAttributeMap(), L"*")) {
                JDFResource r(e);
                if (!r.IsResource(true)) continue;
                (void)JDFElement(r).GetStatus();
                (void)r.GetStatus();
                for (const KElement& l : r.GetLinks(L"*")) (void)JDFResourceLink(l).GetProcessUsage();
                if (r.GetLocalName() == L"RunList") {
                    for (const KElement& p : r.GetChildElementVector(L"RunList", L"*", JDFAttributeMap(), true, 0, false)) {
                        JDFRunList part(p);
                        (void)part.GetPages().ToVInt(1000);
                        (void)part.GetNPage();
                        (void)part.GetLayoutElement().IsBlank();
                        (void)part.GetFileURL();
                        ++runs;
                    }
                }
            }
            for (const char* kind : {"Layout", "InterpretingParams", "RenderingParams", "DigitalPrintingParams", "RunList"})
                (void)node.GetMatchingResource(WString(kind), 3);
        }
    for (const KElement& e : root.GetChildrenByTagName(L"Media", L"", JDFAttributeMap(), false)) {
        JDFMedia m(e);
        (void)m.GetMediaType();
        (void)m.GetDimension().GetX();
        (void)m.GetMediaUnit();
        (void)m.GetGrainDirection();
        (void)(m.GetThickness() + m.GetWeight());
        ++media;
    }
    for (const KElement& l : root.GetChildrenByTagName(L"Layout", L"*", JDFAttributeMap(), false))
        for (const KElement& c : JDFElement(l).GetChildElementVector(L"*", L"*"))
            for (const KElement& o : c.GetChildrenByTagName(L"*", L"*", JDFAttributeMap(), false)) {
                JDFContentObject co(o);
                (void)co.GetCTM();
                (void)co.GetClipBox();
                (void)co.GetOrd();
                ++placed;
            }
}

TEST(JdfCorpus, ReadingCallsWorkOnEveryTicket) {
    VORLAN_REQUIRE_CORPUS();
    int runs = 0, media = 0, placed = 0, roots = 0;
    for (const fs::path& file : corpusTickets()) {
        if (kMalformed.count(file.filename().string())) continue;
        SCOPED_TRACE(file.filename().string());
        JDFParser parser;
        ASSERT_TRUE(parser.Parse(WString(file.string())));
        JDFNode root = JDFDoc(parser.GetDocument()).GetJDFRoot();
        if (root.isNull()) continue;
        ++roots;
        EXPECT_NO_THROW(walkForReading(root, runs, media, placed));
    }
    // The corpus is varied enough that every path above is taken.
    EXPECT_GT(roots, 50);
    EXPECT_GT(runs, 20);
    EXPECT_GT(media, 20);
    EXPECT_GT(placed, 100);
}

TEST(JdfCorpus, DocumentOutlivesParserAndJdfRootIsFound) {
    VORLAN_REQUIRE_CORPUS();
    JDFNode root;
    {
        auto parser = std::make_unique<JDFParser>();
        ASSERT_TRUE(parser->Parse(WString((vorlan::test::corpusDir() / "jdf" / "libc_newLayout.jdf").string())));
        root = JDFDoc(parser->GetDocument()).GetJDFRoot();
    }
    ASSERT_FALSE(root.isNull());
    EXPECT_EQ(root.GetNodeName(), L"JDF");
    EXPECT_FALSE(root.GetChildByTagName(L"Layout", L"*", 0, JDFAttributeMap(), false, true).isNull());
}

TEST(JdfParser, MissingFileAndNonXmlFailWithoutThrowing) {
    vorlan::test::TempDir tmp;
    JDFParser parser;
    EXPECT_FALSE(parser.Parse(WString((tmp / "absent.jdf").string())));
    EXPECT_FALSE(parser.Parse(WString()));
    vorlan::test::writeFile(tmp / "empty.jdf", "");
    EXPECT_FALSE(parser.Parse(WString((tmp / "empty.jdf").string())));
    vorlan::test::writeFile(tmp / "cut.jdf", "<JDF xmlns=\"http://www.CIP4.org/JDFSchema_1_1\"><ResourcePool>");
    EXPECT_FALSE(parser.Parse(WString((tmp / "cut.jdf").string())));
    EXPECT_TRUE(parser.GetDocument().isNull());
    // Well-formed but not JDF: parses, yet has no JDF root.
    ASSERT_TRUE(parser.ParseString("<JMF/>"));
    EXPECT_TRUE(JDFDoc(parser.GetDocument()).GetJDFRoot().isNull());
}

TEST(JdfParser, DeeplyNestedInputIsHandledWithoutRecursion) {
    const int depth = 200000;
    std::string xml = "<JDF xmlns='http://www.CIP4.org/JDFSchema_1_1' xmlns:eg='urn:eg'><ResourcePool>"
                      "<RunList ID='deep' Status='Available' eg:x='1'>";
    for (int i = 0; i < depth; ++i) xml += "<RunList>";
    xml += "<eg:Leaf/>";
    for (int i = 0; i < depth; ++i) xml += "</RunList>";
    xml += "</RunList></ResourcePool></JDF>";
    JDFParser parser;
    ASSERT_TRUE(parser.ParseString(xml));
    JDFNode root = JDFDoc(parser.GetDocument()).GetJDFRoot();
    KElement leaf = root.GetChildByTagName(L"Leaf", L"urn:eg", 0, JDFAttributeMap(), false);
    ASSERT_FALSE(leaf.isNull());
    JDFRunList deepest = leaf.GetParentNode();
    EXPECT_TRUE(deepest.IsResource(true));
    EXPECT_EQ(deepest.GetStatus(), 7);
    EXPECT_EQ(deepest.GetResourceRoot().GetID(), L"deep");
    deepest.SetAttribute(L"Run", L"7");
    EXPECT_EQ(deepest.GetResourceRoot().GetPartition(JDFAttributeMap(L"Run", L"7")), KElement(deepest));
    EXPECT_TRUE(deepest.GetResourceRoot().GetPartition(JDFAttributeMap(L"Run", L"8")).isNull());
    JDFDoc other(0);
    KElement copy = other.GetJDFRoot().GetResourcePool().CopyElement(root.GetResourcePool().GetElement(L"RunList"));
    EXPECT_EQ(copy.GetNamespaceURIFromPrefix(L"eg"), L"urn:eg");
    // Written without indentation: the output stays proportional to the input.
    vorlan::test::TempDir tmp;
    ASSERT_TRUE(other.Write2File(WString((tmp / "deep.jdf").string())));
    EXPECT_LT(fs::file_size(tmp / "deep.jdf"), 2 * xml.size());
    EXPECT_EQ(other.ToString().size(), fs::file_size(tmp / "deep.jdf"));
}
