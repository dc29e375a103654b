// The Esko XMP ink list and the two descriptions the scan writes.
#include <gtest/gtest.h>

#include <expat.h>

#include <cstdlib>
#include <tuple>

#include "pdf/pdf_session.h"
#include "pdf/xmp_inks.h"
#include "pdf/xmp_scan.h"
#include "test_pdf.h"
#include "test_support.h"

using vorlan::test::DieLibraryHome;
using vorlan::test::TempDir;
using vorlan::test::TestInk;
using vorlan::test::TestPdf;

namespace {

std::vector<XMPInk> read(const std::string& packet, bool expected = true) {
    std::vector<XMPInk> inks;
    EXPECT_EQ(readXMPInks(packet.c_str(), inks), expected);
    return inks;
}

// A PDF whose pages paint the given inks, with an optional XMP packet.
std::string makePdf(const TempDir& dir, const std::vector<std::vector<std::string>>& pageInks, const std::string& xmp,
                    const char* name = "in.pdf") {
    const std::string path = (dir / name).string();
    vorlan::test::writeSpotPdf(path, pageInks, xmp);
    return path;
}

// Attribute values of every element named `element`, read back by a conforming XML parser.
std::vector<std::string> attributeValues(const std::string& xml, const std::string& element,
                                         const std::string& attribute) {
    struct State {
        std::string element, attribute;
        std::vector<std::string> values;
    } state{element, attribute, {}};
    XML_Parser parser = XML_ParserCreate(nullptr);
    XML_SetUserData(parser, &state);
    XML_SetStartElementHandler(parser, [](void* user, const XML_Char* name, const XML_Char** atts) {
        auto* s = static_cast<State*>(user);
        if (s->element != name) return;
        for (; atts[0]; atts += 2)
            if (s->attribute == atts[0]) s->values.emplace_back(atts[1]);
    });
    bool ok = XML_Parse(parser, xml.data(), static_cast<int>(xml.size()), XML_TRUE) != XML_STATUS_ERROR;
    XML_ParserFree(parser);
    EXPECT_TRUE(ok) << "not well-formed:\n" << xml;
    return state.values;
}

const char* kLibrary =
    "<?xml version=\"1.0\"?>\n<AutoDieLibrary><Layers><Layer Name=\"LayerDie\"/></Layers>"
    "<Separations><Separation Name=\"Die\" Locked=\"TRUE\"/><Separation Name=\"Crease\" Printable=\"FALSE\"/>"
    "<Separation/></Separations></AutoDieLibrary>";

}  // namespace

TEST(XmpInks, ReadsTypesAndAttributesAndDropsNamelessItems) {
    std::vector<XMPInk> inks = read(vorlan::test::eskoXmp({{"cyan", "process", "normal"},
                                                          {"PANTONE 871 C", "Pantone", "OPAQUE"},
                                                          {"Gloss", "designer", "varnish"},
                                                          {"CutLine", "other", "technical"},
                                                          {"", "process", "technical"},
                                                          {"Odd", "", ""},
                                                          {"Strange", "spot", "metallic"}}));
    ASSERT_EQ(inks.size(), 6u);
    const std::pair<int, int> typeAndAttribute[] = {{0, 0}, {1, 1}, {2, 2}, {3, 3}, {3, 4}, {3, 4}};
    for (size_t i = 0; i < inks.size(); ++i)
        EXPECT_EQ(std::make_pair(inks[i].type, inks[i].attribute), typeAndAttribute[i]) << inks[i].name;
    EXPECT_EQ(inks[4].name, "Odd");  // the nameless item is dropped; no type or attribute: the defaults
    EXPECT_TRUE(isTechnicalVersionInk(inks[2]) && isTechnicalVersionInk(inks[3]) && !isTechnicalVersionInk(inks[1]));
    EXPECT_TRUE(isDieInk(inks[3]) && !isDieInk(inks[2]));
}

// The packet's result and the names read from it: names compare ignoring case, entities decode,
// only the first list counts, and a list whose first child is not an item fails.
TEST(XmpInks, ShapeOfTheList) {
    auto list = [](const std::string& seq) { return "<x><egGr:inks>" + seq + "</egGr:inks></x>"; };
    const std::string a = "<rdf:li><egInk:name>A</egInk:name></rdf:li>";
    const std::tuple<std::string, bool, std::vector<std::string>> cases[] = {
        {"<x><EGGR:INKS><RDF:SEQ><rdf:LI><egInk:Name>A &amp; B</egInk:Name></rdf:LI></RDF:SEQ></EGGR:INKS></x>", true, {"A & B"}},
        {list("<rdf:Seq>" + a + "</rdf:Seq><rdf:Seq><rdf:li><egInk:name>B</egInk:name></rdf:li></rdf:Seq>"), true, {"A"}},
        {list("<rdf:Seq><rdf:li><d><egInk:name>A</egInk:name></d></rdf:li></rdf:Seq>"), true, {}},  // walked, adds nothing
        {list("<rdf:Seq><rdf:Bag/>" + a + "</rdf:Seq>"), false, {}},
        {list(""), false, {}},
        {"<x><rdf:Seq>" + a + "</rdf:Seq></x>", false, {}},
        {"<x><egGr:inks><rdf:Seq></egGr:inks>", false, {}},  // not well-formed
    };
    for (const auto& [packet, ok, expected] : cases) {
        std::vector<std::string> names;
        for (const XMPInk& ink : read(packet, ok)) names.push_back(ink.name);
        EXPECT_EQ(names, expected) << packet;
    }
    std::vector<XMPInk> none;
    EXPECT_FALSE(readXMPInks(nullptr, none));
}

TEST(XmpScan, EskoModeWritesTechnicalVersionAndDieCut) {
    TempDir dir;
    std::string pdf = makePdf(dir, vorlan::test::samePages({"Gold"}, 3),
                              vorlan::test::eskoXmp({{"cyan", "process", "normal"},
                                                     {"Gloss", "designer", "varnish"},
                                                     {"Cut & \"Crease\"", "designer", "technical"}}));
    std::string out = (dir / "job1.impinfo").string();
    EXPECT_EQ(scanPdfInksToDescription(pdf.c_str(), out.data(), false), 1);
    std::string text = vorlan::test::readFile(out);
    EXPECT_EQ(attributeValues(text, "OptionalLayer", "OCGName"),
              (std::vector<std::string>{"Gloss", "Cut & \"Crease\""}));
    EXPECT_EQ(attributeValues(text, "Surface", "index"), (std::vector<std::string>{" 0 ", " 1 ", " 2 ", "0"}));
    EXPECT_EQ(attributeValues(text, "Surface", "dieSepInternalNames"), (std::vector<std::string>{"Cut & \"Crease\""}));
    EXPECT_EQ(attributeValues(text, "Version", "name"), (std::vector<std::string>{"EskoTechnicalVersion"}));
}

TEST(XmpScan, EskoModeEdgeCases) {
    TempDir dir;
    std::string out = (dir / "out.impinfo").string();
    // Only varnish: no die cut.
    std::string varnish = makePdf(dir, {{"A"}}, vorlan::test::eskoXmp({{"Gloss", "designer", "varnish"}}), "v.pdf");
    EXPECT_EQ(scanPdfInksToDescription(varnish.c_str(), out.data(), false), 1);
    std::string text = vorlan::test::readFile(out);
    EXPECT_NE(text.find("SepNameOff=\"Gloss\""), std::string::npos);
    EXPECT_EQ(text.find("DieCut"), std::string::npos);
    std::filesystem::remove(out);
    // Normal and opaque inks only, no XMP, a missing or damaged file: nothing written, result 1.
    std::string normal = makePdf(dir, {{"A"}}, vorlan::test::eskoXmp({{"A", "pantone", "normal"}, {"W", "designer", "opaque"}}), "n.pdf");
    std::string bare = makePdf(dir, {{"A"}}, "", "bare.pdf");
    vorlan::test::writeFile(dir / "junk.pdf", "%PDF-1.4\njunk");
    for (std::string in : {normal, bare, (dir / "missing.pdf").string(), (dir / "junk.pdf").string()}) {
        EXPECT_EQ(scanPdfInksToDescription(in.c_str(), out.data(), false), 1);
        EXPECT_FALSE(std::filesystem::exists(out)) << in;
    }
    // An output that cannot be created: nothing written, no error.
    std::string blocked = (dir / "no" / "such" / "folder" / "x.impinfo").string();
    EXPECT_EQ(scanPdfInksToDescription(varnish.c_str(), blocked.data(), false), 1);
    EXPECT_EQ(scanPdfInksToDescription(varnish.c_str(), nullptr, false), 1);
}

TEST(XmpScan, DieLibraryModeMatchesPageInksAgainstSeparations) {
    TempDir dir;
    DieLibraryHome home(kLibrary);
    std::string pdf = makePdf(dir, {{"Die"}, {"Gold"}, {"Die"}, {"LayerDie"}, {"Crease"}}, "");
    std::string out = (dir / "die.impinfo").string();
    EXPECT_EQ(scanPdfInksToDescription(pdf.c_str(), out.data(), true), 2);
    std::string text = vorlan::test::readFile(out);
    // Page order, repeats kept; a library Layer of the same name is no die ink.
    EXPECT_EQ(attributeValues(text, "OptionalLayer", "OCGName"), (std::vector<std::string>{"Die", "Die", "Crease"}));
    EXPECT_EQ(attributeValues(text, "ContentObject", "SepNameOff")[0], "Die,Die,Crease");
    EXPECT_EQ(attributeValues(text, "Surface", "dieSepInternalNames")[0], "Die,Die,Crease");
    EXPECT_NE(text.find("name=\"KAVDieLibrary\""), std::string::npos);
    EXPECT_EQ(attributeValues(text, "Surface", "index").size(), 6u);  // five pages and the die cut

    std::filesystem::remove(out);
    std::string none = makePdf(dir, {{"Gold"}}, "", "none.pdf");
    EXPECT_EQ(scanPdfInksToDescription(none.c_str(), out.data(), true), 2);
    EXPECT_FALSE(std::filesystem::exists(out));
}

