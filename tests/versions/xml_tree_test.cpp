// The XML document tree: shape, attributes, byte units, feeding in pieces, and hostile input.
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "test_support.h"  // file feeding is checked through ValidDescription
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

// "name(child child ...)" for a whole subtree, following firstChild / nextSibling only.
std::string shape(const _kvXmlNode* node) {
    std::string out = kvXmlBytes(kvXmlName(node));
    if (const _kvXmlNode* child = kvXmlFirstChild(node)) {
        out += '(';
        for (; child; child = kvXmlNextSibling(child)) out += shape(child) + (kvXmlNextSibling(child) ? " " : "");
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

TEST(XmlTree, ShapeKeepsOnlyElementsInDocumentOrder) {
    const std::pair<const char*, const char*> cases[] = {
        {"<A><B><C/></B><D><E/><F/></D></A>", "A(B(C) D(E F))"},  // cousins' sibling chains stay apart
        {"<r><a><b><c/><c2/></b></a><a2/><a3><b3><c3/></b3><b4/></a3></r>", "r(a(b(c c2)) a2 a3(b3(c3) b4))"},
        {"<?xml version='1.0'?><!-- c --><r>text<?pi x?><a/>more<!-- c --><b/></r>", "r(a b)"},
        {"<x:r xmlns:x='urn:a'><x:c/></x:r>", "x:r(x:c)"},  // prefixes stay
    };
    for (auto [xml, expected] : cases) {
        Parsed p = parse(xml);
        ASSERT_TRUE(p.ok) << xml;
        EXPECT_EQ(shape(p.root()), expected);
    }
    Parsed empty = parse("");
    EXPECT_TRUE(empty.ok);
    EXPECT_EQ(empty.root(), nullptr);
}

TEST(XmlTree, AttributesKeepOrderAndLookupIgnoresAsciiCase) {
    Parsed p = parse("<r z='1' Name='two' m=\"&amp;&#65;\" NAME='second'/>");
    ASSERT_TRUE(p.ok);
    std::vector<std::string> seen;
    for (_kvXmlAttribute* a = kvXmlFirstAttribute(p.root()); a; a = kvXmlAttributeNext(a))
        seen.push_back(kvXmlBytes(kvXmlAttributeName(a)) + "=" + kvXmlBytes(kvXmlAttributeValue(a)));
    EXPECT_EQ(seen, (std::vector<std::string>{"z=1", "Name=two", "m=&A", "NAME=second"}));
    EXPECT_EQ(p.root()->lastAttribute->next, nullptr);
    EXPECT_EQ(kvXmlBytes(p.root()->lastAttribute->value), "second");
    _kvXmlAttribute* found = kvXmlFindAttribute(p.root(), "name");
    ASSERT_NE(found, nullptr);
    EXPECT_EQ(kvXmlBytes(found->value), "two");  // the first of two spellings
    EXPECT_EQ(kvXmlFindAttribute(p.root(), "nam"), nullptr);
}

TEST(XmlTree, TextIsOneUnitPerUtf8Byte) {
    Parsed p = parse("<r v='\xC3\x84\xE2\x82\xAC' e=''/>");  // A-umlaut, euro sign
    ASSERT_TRUE(p.ok);
    _kvXmlText* value = p.root()->firstAttribute->value;
    ASSERT_EQ(value->length, 5);
    EXPECT_EQ(value->text[5], 0);
    const char* copy = kvXmlUtf8Copy(value);
    EXPECT_STREQ(copy, "\xC3\x84\xE2\x82\xAC");
    kvXmlFreeUtf8Copy(copy);
    const char* empty = kvXmlUtf8Copy(p.root()->lastAttribute->value);
    EXPECT_EQ(empty, kvXmlEmptyText);
    kvXmlFreeUtf8Copy(empty);  // must not free the shared string
    EXPECT_EQ(kvXmlUtf8Copy(nullptr), kvXmlEmptyText);
    // A declared Latin-1 document arrives as UTF-8 bytes.
    Parsed latin = parse("<?xml version='1.0' encoding='ISO-8859-1'?><r v='\xC4'/>");
    ASSERT_TRUE(latin.ok);
    EXPECT_EQ(kvXmlBytes(latin.root()->firstAttribute->value), "\xC3\x84");
    // Name comparison folds only ASCII: a-umlaut does not match A-umlaut.
    EXPECT_FALSE(kvXmlTextEquals(p.root()->firstAttribute->value, "\xC3\xA4\xE2\x82\xAC"));
    Parsed named = parse("<OptionalContentGroupData/>");
    EXPECT_TRUE(kvXmlTextEquals(named.root()->name, "optionalcontentgroupdata"));
    EXPECT_FALSE(kvXmlTextEquals(named.root()->name, "OptionalContentGroupDat"));
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
    Parsed p = parse("<r>" + std::string(505, ' ') + "<LongElementName/></r>");  // name spans 512
    EXPECT_EQ(shape(p.root()), "r(LongElementName)");
    std::string unclosed = "<r p='" + std::string(1024 - 12, 'v') + "'><a/>";
    ASSERT_EQ(unclosed.size(), 1024u);
    EXPECT_FALSE(parse(unclosed).ok);
}

TEST(XmlTreeChunking, PiecesWithFinalFlagAndFeedsAfterAnError) {
    KvXmlDocumentPtr document(kvXmlCreateDocument());
    EXPECT_TRUE(kvXmlFeedPiece(document.get(), "<r><a", 5, false));
    EXPECT_TRUE(kvXmlFeedPiece(document.get(), "/></r>", 6, true));
    EXPECT_EQ(shape(kvXmlRoot(document.get())), "r(a)");
    KvXmlDocumentPtr bad(kvXmlCreateDocument());
    EXPECT_FALSE(kvXmlFeedPiece(bad.get(), "<r><a></r>", 10, true));
    EXPECT_STRNE(kvXmlErrorText(bad.get()), "");
    EXPECT_FALSE(kvXmlFeedPiece(bad.get(), "<r/>", 4, true));
}

TEST(XmlTreeBadInput, MalformedDocumentsAreRejected) {
    for (const std::string& xml : {std::string("<r a='1' a='2'/>"), std::string("<a/><b/>"),
                                   std::string("<r v='\xFF\xFE'/>"), std::string("<r\xC3/>"), std::string("<r>\0</r>", 8)})
        EXPECT_FALSE(parse(xml).ok) << xml;
}

TEST(XmlTreeBadInput, EntityExpansionBombIsStoppedQuickly) {
    std::string bomb = "<?xml version='1.0'?><!DOCTYPE r [<!ENTITY l0 'haha'>";
    for (int i = 1; i <= 12; ++i) {
        bomb += "<!ENTITY l" + std::to_string(i) + " '";
        for (int k = 0; k < 10; ++k) bomb += "&l" + std::to_string(i - 1) + ";";
        bomb += "'>";
    }
    EXPECT_FALSE(parse(bomb + "]><r v='&l12;'/>").ok);  // expat's amplification limit, not memory exhaustion
}

TEST(XmlTreeBadInput, ExternalEntitiesAreNotLoaded) {
    vorlan::test::TempDir dir;
    vorlan::test::writeFile(dir / "secret.txt", "secret");
    Parsed p = parse("<!DOCTYPE r [<!ENTITY e SYSTEM '" + (dir / "secret.txt").string() + "'>]><r>&e;<a v='x'/></r>");
    if (p.ok) {
        EXPECT_EQ(shape(p.root()), "r(a)");  // either way the file's content never arrives
    }
}

TEST(XmlTreeBadInput, DeepNestingAndHugeValues) {
    const int depth = 200000;
    std::string doc;
    for (int i = 0; i < depth; ++i) doc += "<e>";
    for (int i = 0; i < depth; ++i) doc += "</e>";
    Parsed deep = parse(doc);
    ASSERT_TRUE(deep.ok);
    int levels = 0;
    for (const _kvXmlNode* n = deep.root(); n; n = kvXmlFirstChild(n)) ++levels;
    EXPECT_EQ(levels, depth);
    Parsed huge = parse("<r v='" + std::string(8 << 20, 'x') + "'/>");
    ASSERT_TRUE(huge.ok);
    EXPECT_EQ(huge.root()->firstAttribute->value->length, 8 << 20);
}
