// Separations to optional-content groups, judged by pdftoppm with chosen groups switched on.
#include <gtest/gtest.h>

#include <qpdf/QPDF.hh>

#include <set>

#include "pdf/optional_content.h"
#include "pdf/separation_layers.h"
#include "render.h"
#include "test_pdf.h"
#include "test_support.h"

using namespace vorlan::pdf;
using vorlan::test::TempDir;
using vorlan::test::TestPdf;

namespace {

constexpr int kSlots = 13;
const char* kFont = "/Font << /F1 << /Type /Font /Subtype /Type1 /BaseFont /Helvetica >> >>";

// A square in slot i (slots are 40 points apart on a 40 point high strip).
std::string square(int slot) { return std::to_string(10 + 40 * slot) + " 10 20 20 re f"; }
std::string at(int slot) { return std::to_string(10 + 40 * slot) + " 10"; }

std::set<int> inkedSlots(const vorlan::test::GreyImage& image) {
    std::set<int> slots;
    for (int s = 0; s < kSlots; ++s) {
        long inked = 0;
        for (double x = 12 + 40 * s; x < 28 + 40 * s; x += 1)
            for (double y = 12; y < 28; y += 1) {
                int v = image.at(x, y, 36);
                if (v >= 0 && v < 245) ++inked;
            }
        if (inked > 0) slots.insert(s);
    }
    return slots;
}

struct Fixture {
    TempDir dir;
    std::string input = (dir / "in.pdf").string();
    std::string output = (dir / "out.pdf").string();

    // Page 1: one element per slot (see the expectations below); page 2: uses of a form that
    // inherits its colour, a shared form and an inline image.
    Fixture() {
        TestPdf pdf;
        const std::string gold = pdf.separation("Gold"), silver = pdf.separation("Silver");
        QPDFObjectHandle goldSpace = pdf.object(gold);
        QPDFObjectHandle existing = pdf.object("<< /Type /OCG /Name (Existing) >>");
        QPDFObjectHandle imageGold = pdf.image(TestPdf::ref(goldSpace), 1);
        QPDFObjectHandle imageN = pdf.image(pdf.deviceN({"Gold", "Silver"}), 2);
        QPDFObjectHandle shared = pdf.form("/G cs 1 scn 0 0 20 20 re f",
                                           "<< /ColorSpace << /G " + TestPdf::ref(goldSpace) + " >> >>");
        QPDFObjectHandle inherits = pdf.form("0 0 20 20 re f");
        const std::string resources =
            "<< /ColorSpace << /Gold " + TestPdf::ref(goldSpace) + " /Silver " + silver + " /GN " +
            pdf.deviceN({"Silver", "Gold"}) + " >> /XObject << /ImG " + TestPdf::ref(imageGold) + " /ImN " +
            TestPdf::ref(imageN) + " /Fm " + TestPdf::ref(shared) + " /Fb " + TestPdf::ref(inherits) +
            " >> /Properties << /L0 " + TestPdf::ref(existing) + " >> " + kFont + " >>";
        TestPdf::PageOptions strip;
        strip.mediaBox = "[0 0 540 40]";
        pdf.addPage("q /Gold cs 1 scn " + square(0) + " Q q /Silver cs 1 scn " + square(1) + " Q q 0 g " + square(2) +
                        " Q q /GN cs 1 1 scn " + square(3) + " Q "
                        "BT /F1 30 Tf /Gold cs 1 scn 1 0 0 1 " + at(4) + " Tm (M) Tj 0 g 1 0 0 1 " + at(5) +
                        " Tm (M) Tj ET "
                        "BT /F1 30 Tf 0 g 1 0 0 1 " + at(6) + " Tm (M) Tj /Gold cs 1 scn 1 0 0 1 " + at(7) +
                        " Tm (M) Tj ET "
                        "q 20 0 0 20 " + at(8) + " cm /ImG Do Q q 20 0 0 20 " + at(9) + " cm /ImN Do Q "
                        "/OC /L0 BDC 0 g " + square(10) + " EMC q 1 0 0 1 " + at(11) + " cm /Fm Do Q",
                    resources, strip);
        pdf.addPage("q /Gold cs 1 scn 1 0 0 1 " + at(0) + " cm /Fb Do Q q 0 g 1 0 0 1 " + at(1) +
                        " cm /Fb Do Q q 20 0 0 20 " + at(2) +
                        " cm BI /W 1 /H 1 /BPC 8 /CS /G ID \x40 EI Q q 1 0 0 1 " + at(3) + " cm /Fm Do Q",
                    resources, strip);
        QPDFObjectHandle root = pdf.qpdf().getRoot();
        root.replaceKey("/OCProperties", pdf.object("<< /OCGs [" + TestPdf::ref(existing) + "] /D << /Order [" +
                                                    TestPdf::ref(existing) + "] >> >>"));
        pdf.write(input);
    }

    std::set<int> visible(const std::vector<std::string>& groups, int page) {
        const std::string shown = (dir / "shown.pdf").string();
        EXPECT_TRUE(vorlan::test::showOnlyGroups(output, shown, groups));
        return inkedSlots(vorlan::test::renderPage(shown, page));
    }
};

bool haveRenderers() { return vorlan::test::haveProgram("pdftoppm") && vorlan::test::haveProgram("qpdf"); }

}  // namespace

TEST(SeparationLayers, EachSeparationGroupShowsExactlyItsElements) {
    if (!haveRenderers()) GTEST_SKIP() << "pdftoppm or qpdf missing";
    Fixture f;
    const std::string before = vorlan::test::readFile(f.input);
    const char* seps[] = {"Gold"};
    const char* layers[] = {"Existing"};
    ASSERT_EQ(convertPDF(nullptr, f.input.c_str(), f.output.c_str(), seps, layers, 1, 1), 0);
    EXPECT_EQ(vorlan::test::readFile(f.input), before);
    std::string check;
    EXPECT_TRUE(vorlan::test::qpdfCheckPasses(f.output, &check)) << check;

    // Without the groups the file renders as before.
    EXPECT_EQ(inkedSlots(vorlan::test::renderPage(f.input, 1)).size(), 12u);
    // The new groups start OFF; the existing layer keeps its own initial state (ON).
    EXPECT_EQ(inkedSlots(vorlan::test::renderPage(f.output, 1)), (std::set<int>{10}));
    EXPECT_EQ(f.visible({}, 1), (std::set<int>{}));
    EXPECT_EQ(vorlan::test::renderPage(f.output, 2).inked(), 0);

    EXPECT_EQ(f.visible({"Gold"}, 1), (std::set<int>{0, 3, 6, 7, 8, 11}));
    EXPECT_EQ(f.visible({kSpecialOCGName}, 1), (std::set<int>{1, 2, 4, 5, 9}));
    EXPECT_EQ(f.visible({"Existing"}, 1), (std::set<int>{10}));
    EXPECT_EQ(f.visible({"Gold", kSpecialOCGName, "Existing"}, 1).size(), 12u);
    // A form that inherits Gold at one use and black at another is copied for the second use.
    EXPECT_EQ(f.visible({"Gold"}, 2), (std::set<int>{0, 3}));
    EXPECT_EQ(f.visible({kSpecialOCGName}, 2), (std::set<int>{1, 2}));

    EXPECT_EQ(vorlan::test::groupOrder(f.output),
              (std::vector<std::string>{"Existing", "Gold", kSpecialOCGName}));
}

TEST(SeparationLayers, AllSeparationsCaseEmptiesOrderAndWrapsLayeredContentToo) {
    if (!haveRenderers()) GTEST_SKIP() << "pdftoppm or qpdf missing";
    Fixture f;
    const char* seps[] = {"Gold", "Silver"};
    ASSERT_EQ(convertPDF(nullptr, f.input.c_str(), f.output.c_str(), seps, nullptr, 2, 0), 0);
    EXPECT_TRUE(vorlan::test::qpdfCheckPasses(f.output));
    EXPECT_EQ(vorlan::test::groupOrder(f.output), (std::vector<std::string>{"Gold", "Silver", kSpecialOCGName}));
    EXPECT_EQ(f.visible({"Silver"}, 1), (std::set<int>{1}));
    EXPECT_EQ(f.visible({"Existing"}, 1), (std::set<int>{})) << "the layer's content is wrapped again";
    EXPECT_EQ(f.visible({"Existing", kSpecialOCGName}, 1), (std::set<int>{2, 4, 5, 9, 10}));
    // DeviceN [Silver Gold]: the last listed colorant found decides.
    EXPECT_EQ(f.visible({"Gold"}, 1), (std::set<int>{0, 3, 6, 7, 8, 11}));
}

TEST(SeparationLayers, ExistingGroupIsReusedAndSetOff) {
    if (!haveRenderers()) GTEST_SKIP() << "pdftoppm or qpdf missing";
    Fixture f;
    const char* seps[] = {"Existing"};
    const char* layers[] = {"Other"};
    ASSERT_EQ(convertPDF(nullptr, f.input.c_str(), f.output.c_str(), seps, layers, 1, 1), 0);
    QPDF pdf;
    pdf.processFile(f.output.c_str());
    std::vector<QPDFObjectHandle> groups = documentOCGs(pdf);
    ASSERT_EQ(groups.size(), 2u);
    EXPECT_EQ(ocgName(groups[0]), "Existing");
    EXPECT_EQ(groups[0].getKey("/Intent").unparse(), "[ /View /Print ]");
    // A group that existed is listed in the order once more.
    EXPECT_EQ(vorlan::test::groupOrder(f.output), (std::vector<std::string>{"Existing", "Existing", kSpecialOCGName}));
    // A converted file converted again keeps one group per name.
    const std::string twice = (f.dir / "twice.pdf").string();
    ASSERT_EQ(convertPDF(nullptr, f.output.c_str(), twice.c_str(), seps, layers, 1, 1), 0);
    QPDF again;
    again.processFile(twice.c_str());
    EXPECT_EQ(documentOCGs(again).size(), 2u);
    EXPECT_EQ(vorlan::test::renderPage(twice, 1).inked(), 0);
}

TEST(SeparationLayers, BadNamesAndPathsFailCleanly) {
    Fixture f;
    const std::string longName(1024, 'G');
    const char* seps[] = {longName.c_str()};
    EXPECT_EQ(convertPDF(nullptr, f.input.c_str(), f.output.c_str(), seps, nullptr, 1, 0), 1);
    const std::string fits(1023, 'G');
    seps[0] = fits.c_str();
    EXPECT_EQ(convertPDF(nullptr, f.input.c_str(), f.output.c_str(), seps, nullptr, 1, 0), 0);
    seps[0] = "Gold";
    vorlan::test::writeFile(f.dir / "file", "x");
    EXPECT_EQ(convertPDF(nullptr, f.input.c_str(), (f.dir / "file" / "out.pdf").c_str(), seps, nullptr, 1, 0), 1);
    EXPECT_EQ(convertPDF(nullptr, f.input.c_str(), f.dir.path().c_str(), seps, nullptr, 1, 0), 1);
    EXPECT_EQ(convertPDF(nullptr, (f.dir / "missing.pdf").c_str(), f.output.c_str(), seps, nullptr, 1, 0), 1);
    EXPECT_EQ(convertPDF(nullptr, f.input.c_str(), "", seps, nullptr, 1, 0), 1);
    // Folders are created; saving over the input replaces it only when complete.
    const std::string nested = (f.dir / "a" / "b" / "out.pdf").string();
    EXPECT_EQ(convertPDF(nullptr, f.input.c_str(), nested.c_str(), seps, nullptr, 1, 0), 0);
    EXPECT_EQ(convertPDF(nullptr, nested.c_str(), nested.c_str(), seps, nullptr, 1, 0), 0);
    EXPECT_TRUE(vorlan::test::qpdfCheckPasses(nested));
}

TEST(SeparationLayers, NamesWithNumberSignsSurviveTheSave) {
    if (!haveRenderers()) GTEST_SKIP() << "pdftoppm or qpdf missing";
    TempDir dir;
    // Written by hand: qpdf itself would write the name unescaped.
    const std::string name = "PANTONE #123 C";
    const std::string in = (dir / "in.pdf").string(), out = (dir / "out.pdf").string();
    vorlan::test::writeFile(in, vorlan::test::handWrittenPdf(
        {"<< /Type /Catalog /Pages 2 0 R >>", "<< /Type /Pages /Kids [3 0 R] /Count 1 >>",
         "<< /Type /Page /Parent 2 0 R /MediaBox [0 0 40 40] /Contents 4 0 R /Resources << /ColorSpace << /S "
         "[/Separation /PANTONE#20#23123#20C /DeviceCMYK << /FunctionType 2 /Domain [0 1] /C0 [0 0 0 0] "
         "/C1 [0 0 1 0] /N 1 >>] >> >> >>",
         "<< /Length 30 >>\nstream\n/S cs 1 scn 10 10 20 20 re f\nendstream"}));
    const char* seps[] = {name.c_str()};
    ASSERT_EQ(convertPDF(nullptr, in.c_str(), out.c_str(), seps, nullptr, 1, 0), 0);
    std::string check;
    EXPECT_TRUE(vorlan::test::qpdfCheckPasses(out, &check)) << check;
    QPDF result;
    result.processFile(out.c_str());
    QPDFObjectHandle page = result.getAllPages()[0];
    QPDFObjectHandle space = page.getKey("/Resources").getKey("/ColorSpace").getKey("/S");
    EXPECT_EQ(space.getArrayItem(1).getName(), "/" + name);
    const std::string shown = (dir / "shown.pdf").string();
    ASSERT_TRUE(vorlan::test::showOnlyGroups(out, shown, {name}));
    EXPECT_GT(vorlan::test::renderPage(shown, 1).inked(), 0);
}

TEST(SeparationLayers, AnnotationsJoinTheCatchAllGroup) {
    if (!haveRenderers()) GTEST_SKIP() << "pdftoppm or qpdf missing";
    TempDir dir;
    TestPdf pdf;
    QPDFObjectHandle appearance = pdf.stream("<< /Type /XObject /Subtype /Form /BBox [0 0 20 20] >>", "0 g 0 0 20 20 re f");
    QPDFObjectHandle own = pdf.object("<< /Type /OCG /Name (Own) >>");
    QPDFObjectHandle page = pdf.addPage("");
    // The second annotation has optional content of its own (a group that starts OFF): it stays.
    page.replaceKey("/Annots", QPDFObjectHandle::parse(&pdf.qpdf(), "[<< /Type /Annot /Subtype /Square /F 4 /Rect [10 10 30 30] "
                                                                     "/AP << /N " + TestPdf::ref(appearance) + " >> >> "
                                                                     "<< /Type /Annot /Subtype /Square /F 4 /Rect [40 40 60 60] "
                                                                     "/AP << /N " + TestPdf::ref(appearance) + " >> /OC " +
                                                                     TestPdf::ref(own) + " >>]"));
    pdf.qpdf().getRoot().replaceKey("/OCProperties", pdf.object("<< /OCGs [" + TestPdf::ref(own) + "] /D << /OFF [" +
                                                                TestPdf::ref(own) + "] >> >>"));
    const std::string in = (dir / "in.pdf").string(), out = (dir / "out.pdf").string();
    pdf.write(in);
    ASSERT_GT(vorlan::test::renderPage(in, 1).inked(), 0);
    const char* seps[] = {"Gold"};
    ASSERT_EQ(convertPDF(nullptr, in.c_str(), out.c_str(), seps, nullptr, 1, 0), 0);
    EXPECT_EQ(vorlan::test::renderPage(out, 1).inked(), 0);
    QPDF converted;
    converted.processFile(out.c_str());
    QPDFObjectHandle first = converted.getAllPages()[0];
    QPDFObjectHandle annots = first.getKey("/Annots");
    EXPECT_EQ(ocgName(annots.getArrayItem(0).getKey("/OC")), kSpecialOCGName);
    EXPECT_EQ(ocgName(annots.getArrayItem(1).getKey("/OC")), "Own");
    const std::string shown = (dir / "shown.pdf").string();
    ASSERT_TRUE(vorlan::test::showOnlyGroups(out, shown, {kSpecialOCGName}));
    EXPECT_GT(vorlan::test::renderPage(shown, 1).inked(), 0);
}

TEST(SeparationLayers, NullEntriesOfADamagedLayerListAreDroppedSoReadersFindTheNewGroups) {
    if (!haveRenderers()) GTEST_SKIP() << "pdftoppm or qpdf missing";
    TempDir dir;
    // /OCGs and /Order start with a reference to an object that does not exist (9 0 R).
    const std::string in = (dir / "in.pdf").string();
    vorlan::test::writeFile(in, vorlan::test::handWrittenPdf(
        {"<< /Type /Catalog /Pages 2 0 R /OCProperties << /OCGs [9 0 R 5 0 R] /D << /Order [9 0 R 5 0 R] >> >> >>",
         "<< /Type /Pages /Kids [3 0 R] /Count 1 >>",
         "<< /Type /Page /Parent 2 0 R /MediaBox [0 0 40 40] /Contents 4 0 R /Resources << >> >>",
         "<< /Length 19 >>\nstream\n0 g 5 5 30 30 re f\nendstream", "<< /Type /OCG /Name (Existing) >>"}));
    ASSERT_GT(vorlan::test::renderPage(in, 1).inked(), 0);
    const char* seps[] = {"Gold"};
    const char* layers[] = {"Existing"};
    for (int layerCount : {1, 0}) {  // the layer order kept, or emptied (separations only)
        SCOPED_TRACE(layerCount);
        const std::string out = (dir / "out.pdf").string();
        ASSERT_EQ(convertPDF(nullptr, in.c_str(), out.c_str(), seps, layers, 1, layerCount), 0);
        const vorlan::test::GreyImage image = vorlan::test::renderPage(out, 1);
        EXPECT_EQ(image.inked(), 0) << "the new groups start OFF";
        EXPECT_EQ(vorlan::test::allGroups(out), (std::vector<std::string>{"Existing", "Gold", kSpecialOCGName}));
    }
}
