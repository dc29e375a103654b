// The content-element tree and its edits, proven by re-parsing and by rendering plates. Wrapping
// in optional content, forms painted per use and colorants set to None in nested spaces are
// proven by rendering in tests/pdfconvert.
#include <gtest/gtest.h>

#include <qpdf/QPDFWriter.hh>

#include "pdf/content_edit.h"
#include "pdf/content_tree.h"
#include "pdf/pdf_document.h"
#include "plates.h"
#include "test_pdf.h"
#include "test_support.h"

using namespace vorlan::pdf;
using vorlan::test::TempDir;
using vorlan::test::TestPdf;

namespace {

const char* kFont = "/Font << /F1 << /Type /Font /Subtype /Type1 /BaseFont /Helvetica >> >>";

std::string kinds(const std::vector<ContentElement>& elements) {
    std::string out;
    for (const ContentElement& e : elements) {
        static const char* names[] = {"Path", "Text", "Run", "Image", "Inline", "Form", "Shading",
                                      "Group", "Marked", "State", "Barrier"};
        out += names[static_cast<int>(e.kind)];
        if (!e.children.empty()) out += "(" + kinds(e.children) + ")";
        out += " ";
    }
    return out;
}

std::string firstInk(const ContentElement& e) {
    auto spaces = e.colourSpaces();
    return spaces.empty() || spaces.front()->inks.empty() ? "" : spaces.front()->inks.front();
}

}  // namespace

TEST(ContentTree, ContainersLeavesAndStates) {
    TestPdf pdf;
    QPDFObjectHandle image = pdf.image("/DeviceCMYK", 4);
    std::string resources = "<< /ColorSpace << /CS0 " + pdf.separation("Gold") + " /CS1 " + pdf.separation("Silver") +
                            " >> /XObject << /Im " + TestPdf::ref(image) + " >> " + kFont + " >>";
    QPDFObjectHandle page = pdf.addPage(
        "q /CS0 cs 1 scn 0 0 1 1 re 2 2 m 3 3 l f Q "
        "BT /F1 12 Tf (a) Tj /CS1 cs 2 Tr (b) Tj ET "
        "/OC /oc1 BDC 0 0 1 1 re S EMC "
        "q BI /W 1 /H 1 /BPC 8 /CS /G ID \x80 EI /Im Do Q Q EMC",
        resources);
    ColourSpaceResolver::SharedCache cache;
    auto content = parsePageContent(page, &cache);
    ASSERT_TRUE(content->complete);
    EXPECT_EQ(kinds(content->elements),
              "Group(State State Path ) Text(State Run State State Run ) Marked(Path ) Group(Inline Image ) Barrier Barrier ");
    const ContentElement& path = content->elements[0].children[2];
    EXPECT_EQ(firstInk(path), "Gold");
    EXPECT_TRUE(path.fills);
    EXPECT_EQ(content->bytes.substr(path.begin, path.end - path.begin), "0 0 1 1 re 2 2 m 3 3 l f");
    const ContentElement& runB = content->elements[1].children[4];
    EXPECT_EQ(firstInk(runB), "Silver");
    EXPECT_TRUE(runB.fills && runB.strokes);
    EXPECT_EQ(runB.state.textRender, 2);
    EXPECT_EQ(firstInk(content->elements[1].children[1]), "Black");  // before any colour: DeviceGray
    EXPECT_TRUE(content->elements[2].optionalContent);
    EXPECT_EQ(firstInk(content->elements[2].children[0]), "Black");  // after Q: Gold is gone
    const ContentElement& inlineImage = content->elements[3].children[0];
    EXPECT_EQ(content->bytes.substr(inlineImage.begin, 2), "BI");
    EXPECT_EQ(content->bytes.substr(inlineImage.end - 2, 2), "EI");
    EXPECT_EQ(inlineImage.ownSpace->family, ColourFamily::DeviceGray);
}

// Removing the Gold group and a text run: the plates lose exactly that ink, and the removed
// elements leave their graphics-state effects behind (a path becomes "n", a run invisible).
TEST(ContentEdit, RemovedElementsKeepTheirStateEffects) {
    if (!vorlan::test::haveProgram("gs")) GTEST_SKIP() << "ghostscript not installed";
    TempDir dir;
    TestPdf gen;
    std::string resources = "<< /ColorSpace << /CS0 " + gen.separation("Gold") + " /CS1 " +
                            gen.separation("Silver") + " >> " + kFont + " >>";
    gen.addPage("q /CS0 cs 1 scn 10 10 60 80 re f Q /CS1 cs 1 scn 120 10 60 80 re f "
                "BT /F1 40 Tf /CS1 cs 1 scn 20 40 Td (XX) Tj ET", resources);
    std::string in = (dir / "in.pdf").string(), out = (dir / "removed.pdf").string();
    gen.write(in);
    auto pdf = openDocument(in.c_str(), true);
    ColourSpaceResolver::SharedCache cache;
    auto content = parsePageContent(documentPages(*pdf)[0], &cache);
    ContentEditor editor(*content);
    editor.remove(content->elements[0]);              // the Gold group
    editor.remove(content->elements[4].children[4]);  // the text run
    StreamCompressor compressor;
    editor.apply(*pdf, compressor);
    QPDFWriter writer(*pdf, out.c_str());
    writer.write();
    EXPECT_EQ(vorlan::test::runCommand("qpdf --check '" + out + "' >/dev/null 2>&1"), 0);
    auto before = vorlan::test::platePixels(in, 1);
    auto after = vorlan::test::platePixels(out, 1);
    EXPECT_LE(after["Gold"], 0);
    EXPECT_GT(after["Silver"], 0);
    EXPECT_LT(after["Silver"], before["Silver"]);
    auto reparsed = parsePageContent(documentPages(*pdf)[0], &cache);
    EXPECT_EQ(reparsed->elements[0].children[2].op, "n");
    ASSERT_EQ(reparsed->elements[4].children[5].kind, ElementKind::TextRun);
    EXPECT_EQ(reparsed->elements[4].children[5].state.textRender, 3);
}
