// The XML document tree: shape, attributes, byte units, feeding in pieces, and hostile input.
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "test_support.h"
#include "versions/xml_tree.h"

namespace {

struct Parsed {
    KvXmlDocumentPtr document;
    bool ok = false;
    _kvXmlNode* root() const { return kvXmlRoot(document.get()); }
};

Parsed parse(const std::string& bytes) {
    Parsed parsed{KvXmlDocumentPtr(kvXmlCreateDocument())};
    parsed.ok = kvXmlFeedBuffer(parsed.document.get(), bytes.data(), bytes.size());
    return parsed;
}

std::string nameOf(const _kvXmlNode* node) { return kvXmlBytes(kvXmlName(node)); }

// "name(child child ...)" for a whole subtree, following firstChild / nextSibling only.
std::string shape(const _kvXmlNode* node) {
    std::string out = nameOf(node);
    if (const _kvXmlNode* child = kvXmlFirstChild(node)) {
        out += '(';
        for (; child; child = kvXmlNextSibling(child)) {
            out += shape(child);
            if (kvXmlNextSibling(child)) out += ' ';
        }
        out += ')';
    }
    return out;
}

// A document of exactly `length` bytes, shaped a(b c(d)); the padding goes into a's attribute.
constexpr size_t kFixedBytes = 33;
std::string documentOfLength(size_t length) {
    return "<a p='" + std::string(length - kFixedBytes, 'v') + "'><b x='1'/><c><d/></c></a>";
}

}  // namespace

TEST(XmlTreeShape, SiblingChainsOfCousinsStaySeparate) {
    Parsed p = parse("<A><B><C/></B><D><E/><F/></D></A>");
    ASSERT_TRUE(p.ok);
    EXPECT_EQ(shape(p.root()), "A(B(C) D(E F))");
    _kvXmlNode* b = kvXmlFirstChild(p.root());
    _kvXmlNode* c = kvXmlFirstChild(b);
    EXPECT_EQ(kvXmlNextSibling(c), nullptr);
    EXPECT_EQ(nameOf(kvXmlFirstChild(kvXmlNextSibling(b))), "E");
    EXPECT_EQ(c->document, p.document.get());
}

TEST(XmlTreeShape, DeeperLevelsAndReturnsToShallowerOnes) {
    Parsed p = parse("<r><a><b><c/><c2/></b></a><a2/><a3><b3><c3/></b3><b4/></a3></r>");
    ASSERT_TRUE(p.ok);
    EXPECT_EQ(shape(p.root()), "r(a(b(c c2)) a2 a3(b3(c3) b4))");
}

TEST(XmlTreeShape, TextCommentsAndInstructionsAreDropped) {
    Parsed p = parse("<?xml version='1.0'?><!-- c --><r>text<?pi x?><a/>more<!-- c --><b/></r>");
    ASSERT_TRUE(p.ok);
    EXPECT_EQ(shape(p.root()), "r(a b)");
}

TEST(XmlTreeShape, EmptyBufferHasNoRoot) {
    Parsed p = parse("");
    EXPECT_TRUE(p.ok);
    EXPECT_EQ(p.root(), nullptr);
}

TEST(XmlTreeShape, NamesKeepTheirPrefix) {
    Parsed p = parse("<x:r xmlns:x='urn:a'><x:c/></x:r>");
    ASSERT_TRUE(p.ok);
    EXPECT_EQ(shape(p.root()), "x:r(x:c)");
}

TEST(XmlTreeAttributes, KeepDocumentOrderAndValues) {
    Parsed p = parse("<r z='1' a='two' m=\"&amp;&#65;\"/>");
    ASSERT_TRUE(p.ok);
    std::vector<std::string> seen;
    for (_kvXmlAttribute* a = kvXmlFirstAttribute(p.root()); a; a = kvXmlAttributeNext(a))
        seen.push_back(kvXmlBytes(kvXmlAttributeName(a)) + "=" + kvXmlBytes(kvXmlAttributeValue(a)));
    EXPECT_EQ(seen, (std::vector<std::string>{"z=1", "a=two", "m=&A"}));
    EXPECT_EQ(p.root()->lastAttribute, p.root()->firstAttribute->next->next);
}

TEST(XmlTreeAttributes, LookupIgnoresAsciiCaseAndTakesTheFirst) {
    Parsed p = parse("<r Name='first' NAME='second'/>");
    ASSERT_TRUE(p.ok);
    _kvXmlAttribute* a = kvXmlFindAttribute(p.root(), "name");
    ASSERT_NE(a, nullptr);
    EXPECT_EQ(kvXmlBytes(a->value), "first");
    EXPECT_EQ(kvXmlFindAttribute(p.root(), "nam"), nullptr);
}

TEST(XmlTreeAttributes, RepeatedAttributeIsAParseError) {
    Parsed p = parse("<r a='1' a='2'/>");
    EXPECT_FALSE(p.ok);
}

TEST(XmlTreeText, OneUnitPerUtf8Byte) {
    Parsed p = parse("<r v='\xC3\x84\xE2\x82\xAC'/>");  // A-umlaut, euro sign
    ASSERT_TRUE(p.ok);
    _kvXmlText* value = p.root()->firstAttribute->value;
    ASSERT_EQ(value->length, 5);
    EXPECT_EQ(value->text[0], 0xC3);
    EXPECT_EQ(value->text[4], 0xAC);
    EXPECT_EQ(value->text[5], 0);
    // The UTF-8 copy gives the original bytes back.
    char* copy = kvXmlUtf8Copy(value);
    EXPECT_STREQ(copy, "\xC3\x84\xE2\x82\xAC");
    kvXmlFreeUtf8Copy(copy);
}

TEST(XmlTreeText, EmptyTextCopiesToTheSharedEmptyString) {
    Parsed p = parse("<r v=''/>");
    ASSERT_TRUE(p.ok);
    char* copy = kvXmlUtf8Copy(p.root()->firstAttribute->value);
    EXPECT_EQ(copy, kvXmlEmptyText);
    kvXmlFreeUtf8Copy(copy);  // must not free the shared string
    EXPECT_EQ(kvXmlUtf8Copy(nullptr), kvXmlEmptyText);
}

TEST(XmlTreeText, DeclaredLatin1ArrivesAsUtf8Bytes) {
    Parsed p = parse("<?xml version='1.0' encoding='ISO-8859-1'?><r v='\xC4'/>");
    ASSERT_TRUE(p.ok);
    EXPECT_EQ(kvXmlBytes(p.root()->firstAttribute->value), "\xC3\x84");
}

TEST(XmlTreeText, NameComparisonFoldsOnlyAscii) {
    Parsed p = parse("<OptionalContentGroupData/>");
    ASSERT_TRUE(p.ok);
    EXPECT_TRUE(kvXmlTextEquals(p.root()->name, "optionalcontentgroupdata"));
    EXPECT_FALSE(kvXmlTextEquals(p.root()->name, "OptionalContentGroupDat"));
    Parsed q = parse("<r v='\xC3\xA4'/>");  // a-umlaut must not match A-umlaut
    EXPECT_FALSE(kvXmlTextEquals(q.root()->firstAttribute->value, "\xC3\x84"));
}

// Pieces of 512 bytes: whatever the boundaries cut (names, attribute values, tags), the tree is
// the same; an exact multiple of 512 is fed without a short final piece and must still finish.
TEST(XmlTreeChunking, BoundariesDoNotChangeTheTree) {
    for (size_t length : {511u, 512u, 513u, 1023u, 1024u, 1025u, 1536u, 2000u}) {
        Parsed p = parse(documentOfLength(length));
        ASSERT_TRUE(p.ok) << length;
        EXPECT_EQ(shape(p.root()), "a(b c(d))") << length;
        EXPECT_EQ(p.root()->firstAttribute->value->length, static_cast<int32_t>(length - kFixedBytes)) << length;
    }
}

TEST(XmlTreeChunking, ElementNameAcrossABoundary) {
    std::string doc = "<r>" + std::string(505, ' ') + "<LongElementName/></r>";  // name spans 512
    Parsed p = parse(doc);
    ASSERT_TRUE(p.ok);
    EXPECT_EQ(shape(p.root()), "r(LongElementName)");
}

TEST(XmlTreeChunking, TruncatedDocumentOfExactMultipleLengthIsAnError) {
    std::string doc = "<r p='" + std::string(1024 - 12, 'v') + "'><a/>";  // root never closed
    ASSERT_EQ(doc.size(), 1024u);
    EXPECT_FALSE(parse(doc).ok);
    std::string shorter = doc.substr(0, 1000);
    EXPECT_FALSE(parse(shorter + "'>").ok);
}

TEST(XmlTreeChunking, PieceByPieceWithFinalFlag) {
    KvXmlDocumentPtr document(kvXmlCreateDocument());
    EXPECT_TRUE(kvXmlFeedPiece(document.get(), "<r><a", 5, false));
    EXPECT_TRUE(kvXmlFeedPiece(document.get(), "/></r>", 6, true));
    EXPECT_EQ(shape(kvXmlRoot(document.get())), "r(a)");
}

TEST(XmlTreeBadInput, MalformedAndFollowingFeedsFail) {
    KvXmlDocumentPtr document(kvXmlCreateDocument());
    EXPECT_FALSE(kvXmlFeedPiece(document.get(), "<r><a></r>", 10, true));
    EXPECT_STRNE(kvXmlErrorText(document.get()), "");
    EXPECT_FALSE(kvXmlFeedPiece(document.get(), "<r/>", 4, true));
}

TEST(XmlTreeBadInput, InvalidUtf8IsRejected) {
    EXPECT_FALSE(parse("<r v='\xFF\xFE'/>").ok);
    EXPECT_FALSE(parse("<r\xC3/>").ok);
    EXPECT_FALSE(parse(std::string("<r>\0</r>", 8)).ok);
}

TEST(XmlTreeBadInput, SecondRootIsRejected) { EXPECT_FALSE(parse("<a/><b/>").ok); }

TEST(XmlTreeBadInput, EntityExpansionBombIsStoppedQuickly) {
    std::string bomb = "<?xml version='1.0'?><!DOCTYPE r [<!ENTITY l0 'haha'>";
    for (int i = 1; i <= 12; ++i)
        bomb += "<!ENTITY l" + std::to_string(i) + " '" + [&] {
            std::string refs;
            for (int k = 0; k < 10; ++k) refs += "&l" + std::to_string(i - 1) + ";";
            return refs;
        }() + "'>";
    bomb += "]><r v='&l12;'/>";
    EXPECT_FALSE(parse(bomb).ok);  // expat's amplification limit, not memory exhaustion
}

TEST(XmlTreeBadInput, ExternalEntitiesAreNotLoaded) {
    vorlan::test::TempDir dir;
    vorlan::test::writeFile(dir / "secret.txt", "secret");
    std::string doc = "<!DOCTYPE r [<!ENTITY e SYSTEM '" + (dir / "secret.txt").string() + "'>]><r>&e;<a v='x'/></r>";
    Parsed p = parse(doc);
    // Either way the external file's content never reaches the tree.
    if (p.ok) {
        EXPECT_EQ(shape(p.root()), "r(a)");
    }
}

TEST(XmlTreeBadInput, DeepNestingBuildsAndReleases) {
    const int depth = 200000;
    std::string doc;
    for (int i = 0; i < depth; ++i) doc += "<e>";
    for (int i = 0; i < depth; ++i) doc += "</e>";
    Parsed p = parse(doc);
    ASSERT_TRUE(p.ok);
    int levels = 0;
    for (const _kvXmlNode* n = p.root(); n; n = kvXmlFirstChild(n)) ++levels;
    EXPECT_EQ(levels, depth);
}

TEST(XmlTreeBadInput, HugeAttributeValue) {
    std::string value(8 * 1024 * 1024, 'x');
    Parsed p = parse("<r v='" + value + "'/>");
    ASSERT_TRUE(p.ok);
    EXPECT_EQ(p.root()->firstAttribute->value->length, static_cast<int32_t>(value.size()));
}

TEST(XmlTreeFile, ReadsIn512BytePiecesAndFinishes) {
    vorlan::test::TempDir dir;
    for (size_t length : {100u, 512u, 1024u, 1500u}) {
        std::string doc = documentOfLength(length);
        vorlan::test::writeFile(dir / "ok.xml", doc);
        KvXmlDocumentPtr document(kvXmlCreateDocument());
        ASSERT_TRUE(kvXmlFeedFile(document.get(), (dir / "ok.xml").c_str())) << length;
        EXPECT_EQ(shape(kvXmlRoot(document.get())), "a(b c(d))");
        // The same bytes without the closing tag, padded back to the same length.
        std::string truncated = doc.substr(0, doc.size() - 4) + "    ";
        vorlan::test::writeFile(dir / "cut.xml", truncated);
        KvXmlDocumentPtr cut(kvXmlCreateDocument());
        EXPECT_FALSE(kvXmlFeedFile(cut.get(), (dir / "cut.xml").c_str())) << length;
    }
}

TEST(XmlTreeFile, MissingFileAndFolderFail) {
    vorlan::test::TempDir dir;
    KvXmlDocumentPtr a(kvXmlCreateDocument());
    EXPECT_FALSE(kvXmlFeedFile(a.get(), (dir / "absent.xml").c_str()));
    KvXmlDocumentPtr b(kvXmlCreateDocument());
    EXPECT_FALSE(kvXmlFeedFile(b.get(), dir.path().c_str()));
    KvXmlDocumentPtr c(kvXmlCreateDocument());
    EXPECT_FALSE(kvXmlFeedFile(c.get(), nullptr));
}
