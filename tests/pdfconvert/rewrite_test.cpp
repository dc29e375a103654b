// Separation rewriting, judged by Ghostscript's tiffsep plates: drop-listed variants blank the
// listed plates and leave the others as they were; keep-listed variants print the listed plates
// alone.
#include <gtest/gtest.h>

#include <qpdf/Buffer.hh>
#include <qpdf/QPDF.hh>

#include "pdf/content_edit.h"
#include "pdf/separation_rewrite.h"
#include "plates.h"
#include "render.h"
#include "test_pdf.h"
#include "test_support.h"

using namespace vorlan::pdf;
using vorlan::test::TempDir;
using vorlan::test::TestPdf;

namespace {

constexpr int kPages = 4;

std::string slot(int i) { return std::to_string(10 + 40 * i) + " 10"; }
std::string square(int i) { return slot(i) + " 20 20 re f"; }

using Plates = std::map<std::string, long>;

using vorlan::test::inkedPlates;

struct RewriteFixture {
    TempDir dir;
    std::string input = (dir / "in.pdf").string();

    // Page 1: paths and text; page 2: images; page 3: shadings and patterns (an uncoloured one
    // over a spot and one over CMYK); page 4: forms, a
    // Type 3 font and an annotation. Nothing overlaps, so knock-outs change no listed plate.
    RewriteFixture() {
        TestPdf pdf;
        const std::string gold = TestPdf::ref(pdf.object(pdf.separation("Gold")));
        const std::string silver = TestPdf::ref(pdf.object(pdf.separation("Silver")));
        const std::string font = "/F1 << /Type /Font /Subtype /Type1 /BaseFont /Helvetica >>";
        TestPdf::PageOptions strip;
        strip.mediaBox = "[0 0 280 40]";

        pdf.addPage("q /Au cs 1 scn " + square(0) + " Q q /Ag cs 1 scn " + square(1) + " Q q 1 0 0 0 k " + square(2) +
                        " Q q /DeviceRGB cs 0 0 1 sc " + square(3) + " Q BT /F1 30 Tf 1 0 0 1 " + slot(4) +
                        " Tm (M) Tj ET q /AuAg cs 1 1 scn " + square(5) + " Q",
                    "<< /ColorSpace << /Au " + gold + " /Ag " + silver + " /AuAg " + pdf.deviceN({"Gold", "Silver"}) +
                        " >> /Font << " + font + " >> >>",
                    strip);

        QPDFObjectHandle deviceN = pdf.image(pdf.deviceN({"Gold", "Silver"}), 2);
        QPDFObjectHandle nChannel = pdf.image(pdf.deviceN({"Gold", "Silver"}, true), 2);
        QPDFObjectHandle cmyk = pdf.image("/DeviceCMYK", 4);
        QPDFObjectHandle silverImage = pdf.image(silver, 1);
        QPDFObjectHandle indexed = pdf.image("[/Indexed " + gold + " 1 <00ff>]", 1);
        auto place = [](int i, const std::string& name) { return "q 20 0 0 20 " + slot(i) + " cm /" + name + " Do Q "; };
        pdf.addPage(place(0, "DN") + place(1, "NC") + place(2, "CM") + place(3, "SI") + place(4, "IX") +
                        "q 20 0 0 20 " + slot(5) + " cm BI /W 1 /H 1 /BPC 8 /CS /G ID \x40 EI Q",
                    "<< /XObject << /DN " + TestPdf::ref(deviceN) + " /NC " + TestPdf::ref(nChannel) + " /CM " +
                        TestPdf::ref(cmyk) + " /SI " + TestPdf::ref(silverImage) + " /IX " + TestPdf::ref(indexed) +
                        " >> >>",
                    strip);

        QPDFObjectHandle tiling = pdf.stream(
            "<< /PatternType 1 /PaintType 1 /TilingType 1 /BBox [0 0 10 10] /XStep 10 /YStep 10 /Resources << "
            "/ColorSpace << /Au " + gold + " >> >> >>",
            "/Au cs 1 scn 0 0 5 10 re f 1 0 0 0 k 5 0 5 10 re f");
        QPDFObjectHandle uncoloured = pdf.stream(
            "<< /PatternType 1 /PaintType 2 /TilingType 1 /BBox [0 0 10 10] /XStep 10 /YStep 10 /Resources << >> >>",
            "0 0 5 10 re f");
        pdf.addPage("q " + slot(0) + " 20 20 re W n /GoldRamp sh Q "
                    "q /Pattern cs /CmykRamp scn " + square(1) + " Q "
                    "q /Pattern cs /Tile scn " + square(2) + " Q "
                    "q /SilverPattern cs 1 /Stripes scn " + square(3) + " Q "
                    "q /CmykPattern cs 0 1 0 0 /Stripes scn " + square(4) + " Q",
                    "<< /ColorSpace << /SilverPattern [/Pattern " + silver + "] /CmykPattern [/Pattern /DeviceCMYK] >> "
                    "/Shading << /GoldRamp << "
                    "/ShadingType 2 /ColorSpace " + gold + " /Coords [10 0 30 0] /Function << /FunctionType 2 "
                    "/Domain [0 1] /C0 [0.2] /C1 [1] /N 1 >> >> >> /Pattern << /CmykRamp << /PatternType 2 "
                    "/Shading << /ShadingType 2 /ColorSpace /DeviceCMYK /Coords [50 0 70 0] /Function << "
                    "/FunctionType 2 /Domain [0 1] /C0 [1 0 0 0] /C1 [0 1 0 0] /N 1 >> >> >> /Tile " +
                        TestPdf::ref(tiling) + " /Stripes " + TestPdf::ref(uncoloured) + " >> >>",
                    strip);

        QPDFObjectHandle shared = pdf.form("/Au cs 1 scn 0 0 10 20 re f 0 0 1 0 k 10 0 10 20 re f",
                                           "<< /ColorSpace << /Au " + gold + " >> >>");
        QPDFObjectHandle inherits = pdf.form("0 0 20 20 re f");
        QPDFObjectHandle glyph = pdf.stream("<< >>", "1000 0 d0 /Au cs 1 scn 0 0 500 1000 re f 0 0 1 0 k 500 0 500 1000 re f");
        const std::string type3 = "/T3 << /Type /Font /Subtype /Type3 /FontBBox [0 0 1000 1000] /FontMatrix [0.001 0 0 "
                                  "0.001 0 0] /CharProcs << /a " + TestPdf::ref(glyph) + " >> /Encoding << /Type "
                                  "/Encoding /Differences [97 /a] >> /FirstChar 97 /LastChar 97 /Widths [1000] "
                                  "/Resources << /ColorSpace << /Au " + gold + " >> >> >>";
        QPDFObjectHandle appearance = pdf.stream(
            "<< /Type /XObject /Subtype /Form /BBox [0 0 20 20] /Resources << /ColorSpace << /Ag " + silver + " >> >> >>",
            "/Ag cs 1 scn 0 0 10 20 re f 0 g 10 0 10 20 re f");
        QPDFObjectHandle page = pdf.addPage(
            "q 1 0 0 1 " + slot(0) + " cm /Shared Do Q q /Ag cs 1 scn 1 0 0 1 " + slot(1) + " cm /Inherits Do Q "
            "q 0 0 0 1 k 1 0 0 1 " + slot(2) + " cm /Inherits Do Q BT /T3 20 Tf 1 0 0 1 " + slot(3) + " Tm (a) Tj ET",
            "<< /ColorSpace << /Ag " + silver + " >> /XObject << /Shared " + TestPdf::ref(shared) + " /Inherits " +
                TestPdf::ref(inherits) + " >> /Font << " + type3 + " >> >>",
            strip);
        page.replaceKey("/Annots", QPDFObjectHandle::parse(&pdf.qpdf(),
                                                           "[<< /Type /Annot /Subtype /Square /F 4 /Rect [170 10 190 30] "
                                                           "/AP << /N " + TestPdf::ref(appearance) + " >> >>]"));
        pdf.write(input);
    }

    std::string rewrite(const std::vector<std::string>& list, bool keep, const std::string& name) {
        const std::string out = (dir / name).string();
        EXPECT_EQ(rewriteSeparations(nullptr, input.c_str(), out.c_str(), list, keep), 0);
        std::string check;
        EXPECT_TRUE(vorlan::test::qpdfCheckPasses(out, &check)) << check;
        return out;
    }
};

bool haveTools() { return vorlan::test::haveProgram("gs") && vorlan::test::haveProgram("qpdf"); }

}  // namespace

TEST(SeparationRewrite, DropListedBlanksTheListedPlatesOnly) {
    if (!haveTools()) GTEST_SKIP() << "gs or qpdf missing";
    RewriteFixture f;
    const std::string before = vorlan::test::readFile(f.input);
    const std::string out = f.rewrite({"Gold"}, false, "drop.pdf");
    EXPECT_EQ(vorlan::test::readFile(f.input), before);
    for (int page = 1; page <= kPages; ++page) {
        Plates original = inkedPlates(f.input, page);
        Plates variant = inkedPlates(out, page);
        ASSERT_GT(original["Gold"], 0) << "page " << page;
        original.erase("Gold");
        EXPECT_EQ(variant, original) << "page " << page;
    }
}

TEST(SeparationRewrite, KeepListedPrintsTheListedPlatesAlone) {
    if (!haveTools()) GTEST_SKIP() << "gs or qpdf missing";
    RewriteFixture f;
    const std::string out = f.rewrite({"Gold"}, true, "keep.pdf");
    for (int page = 1; page <= kPages; ++page) {
        Plates original = inkedPlates(f.input, page);
        Plates variant = inkedPlates(out, page);
        EXPECT_EQ(variant, (Plates{{"Gold", original["Gold"]}})) << "page " << page;
    }
    // The DeviceN and NChannel images stay, their other colorant named None; the CMYK image goes.
    QPDF pdf;
    pdf.processFile(out.c_str());
    QPDFObjectHandle page = pdf.getAllPages()[1];
    QPDFObjectHandle xobjects = page.getKey("/Resources").getKey("/XObject");
    EXPECT_EQ(xobjects.getKey("/DN").getDict().getKey("/ColorSpace").getArrayItem(1).unparse(), "[ /Gold /None ]");
    QPDFObjectHandle nChannel = xobjects.getKey("/NC").getDict().getKey("/ColorSpace");
    EXPECT_EQ(nChannel.getArrayItem(1).unparse(), "[ /Gold /None ]");
    EXPECT_TRUE(nChannel.getArrayItem(4).getKey("/Colorants").hasKey("/None"));
    EXPECT_TRUE(nChannel.getArrayItem(4).getKey("/Colorants").hasKey("/Gold"));
    std::shared_ptr<Buffer> data = page.getKey("/Contents").getStreamData();
    const std::string content(reinterpret_cast<const char*>(data->getBuffer()), data->getSize());
    EXPECT_EQ(content.find("/CM Do"), std::string::npos);
    EXPECT_NE(content.find("/DN Do"), std::string::npos);
}

TEST(SeparationRewrite, EmptyDropListKeepsEveryPlateAndNamesMatchExactly) {
    if (!haveTools()) GTEST_SKIP() << "gs or qpdf missing";
    RewriteFixture f;
    const std::string same = f.rewrite({}, false, "same.pdf");
    const std::string wrongCase = f.rewrite({"gold"}, false, "case.pdf");
    for (int page = 1; page <= kPages; ++page) {
        Plates original = inkedPlates(f.input, page);
        ASSERT_GT(original["Gold"], 0) << "page " << page;
        EXPECT_EQ(inkedPlates(same, page), original) << "page " << page;
        EXPECT_EQ(inkedPlates(wrongCase, page), original) << "page " << page;
    }
}

TEST(SeparationRewrite, AllIsKeptUnlessListedAndFailuresAreClean) {
    TempDir dir;
    TestPdf pdf;
    pdf.addPage("/A cs 1 scn 0 0 10 10 re f", "<< /ColorSpace << /A " + pdf.separation("All") + " >> >>");
    const std::string in = (dir / "in.pdf").string();
    pdf.write(in);
    auto colorant = [](const std::string& file) {
        QPDF q;
        q.processFile(file.c_str());
        QPDFObjectHandle page = q.getAllPages()[0];
        QPDFObjectHandle spaces = page.getKey("/Resources").getKey("/ColorSpace");
        std::string names;
        for (auto& [key, space] : spaces.ditems()) names += space.getArrayItem(1).getName();
        return names;
    };
    const std::string keep = (dir / "keep.pdf").string(), drop = (dir / "drop.pdf").string();
    ASSERT_EQ(rewriteSeparations(nullptr, in.c_str(), keep.c_str(), {"Gold"}, true), 0);
    EXPECT_EQ(colorant(keep), "/All");
    ASSERT_EQ(rewriteSeparations(nullptr, in.c_str(), drop.c_str(), {"All"}, false), 0);
    EXPECT_NE(colorant(drop).find("/None"), std::string::npos);

    vorlan::test::writeFile(dir / "file", "x");
    EXPECT_EQ(rewriteSeparations(nullptr, in.c_str(), (dir / "file" / "x.pdf").c_str(), {"Gold"}, true), 1);
    EXPECT_EQ(rewriteSeparations(nullptr, (dir / "none.pdf").c_str(), keep.c_str(), {"Gold"}, true), 1);
    vorlan::test::writeFile(dir / "bad.pdf", "not a pdf");
    EXPECT_EQ(rewriteSeparations(nullptr, (dir / "bad.pdf").c_str(), keep.c_str(), {"Gold"}, true), 1);
    EXPECT_EQ(rewriteSeparations(nullptr, in.c_str(), nullptr, {"Gold"}, true), 1);
}

TEST(SeparationRewrite, NamesWithNumberSignsAndSpacesStayIntact) {
    TempDir dir;
    // Written by hand: qpdf itself would write the '#' unescaped. The resource key has one too.
    const std::string in = (dir / "in.pdf").string(), keep = (dir / "keep.pdf").string();
    vorlan::test::writeFile(in, vorlan::test::handWrittenPdf(
        {"<< /Type /Catalog /Pages 2 0 R >>", "<< /Type /Pages /Kids [3 0 R] /Count 1 >>",
         "<< /Type /Page /Parent 2 0 R /MediaBox [0 0 40 40] /Contents 4 0 R /Resources << /ColorSpace << "
         "/S#231 [/Separation /Gold#231 /DeviceCMYK << /FunctionType 2 /Domain [0 1] /C0 [0 0 0 0] /C1 [0 0 1 0] "
         "/N 1 >>] /T [/Separation /Tin /DeviceGray << /FunctionType 2 /Domain [0 1] /C0 [0] /C1 [1] /N 1 >>] >> >> >>",
         "<< /Length 53 >>\nstream\n/S#231 cs 1 scn 0 0 9 9 re f /T cs 1 scn 9 9 9 9 re f\nendstream"}));
    // Alone, and as the second of two variants written from one reading (the document is saved
    // twice, so its names must read as before after the first save).
    const std::string drop = (dir / "drop.pdf").string(), keep2 = (dir / "keep2.pdf").string();
    ASSERT_EQ(rewriteSeparations(nullptr, in.c_str(), keep.c_str(), {"Gold#1"}, true), 0);
    ASSERT_EQ(rewriteSeparationVariants(nullptr, in.c_str(), {{drop, {"Tin"}, false}, {keep2, {"Gold#1"}, true}}),
              (std::vector<int>{0, 0}));
    for (const std::string& file : {keep, keep2}) {
        std::string check;
        EXPECT_TRUE(vorlan::test::qpdfCheckPasses(file, &check)) << check;
        QPDF pdf;
        pdf.processFile(file.c_str());
        QPDFObjectHandle page = pdf.getAllPages()[0];
        QPDFObjectHandle spaces = page.getKey("/Resources").getKey("/ColorSpace");
        ASSERT_TRUE(spaces.hasKey("/S#1")) << file;
        EXPECT_EQ(spaces.getKey("/S#1").getArrayItem(1).getName(), "/Gold#1");
        if (vorlan::test::haveProgram("gs")) {
            auto plates = inkedPlates(file, 1);
            EXPECT_EQ(plates.size(), 1u);
            EXPECT_GT(plates["Gold#1"], 0);
        }
    }
    EXPECT_EQ(nameToken("/A B#(x)"), "/A#20B#23#28x#29");
}
