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
