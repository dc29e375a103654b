// Page inks of generated files: every way content can paint with a spot colour.
#include <gtest/gtest.h>

#include "pdf/page_geometry.h"
#include "test_pdf.h"
#include "test_support.h"

using vorlan::test::TempDir;
using vorlan::test::TestPdf;
using Inks = std::vector<std::string>;

namespace {

const char* kFont = "/Font << /F1 << /Type /Font /Subtype /Type1 /BaseFont /Helvetica >> >>";

Inks scan(TestPdf& pdf, const TempDir& dir) {
    std::string path = (dir / "inks.pdf").string();
    pdf.write(path);
    Inks inks;
    scanPDFPageInks(path.c_str(), inks);
    return inks;
}

}  // namespace

TEST(PageInks, EveryPaintingOperatorInFirstUseOrder) {
    TempDir dir;
    TestPdf pdf;
    QPDFObjectHandle image = pdf.image(pdf.separation("ImageInk"), 1);
    QPDFObjectHandle mask = pdf.image("/DeviceGray", 1, "/ImageMask true");
    mask.getDict().removeKey("/ColorSpace");
    mask.getDict().replaceKey("/BitsPerComponent", QPDFObjectHandle::newInteger(1));
    QPDFObjectHandle form = pdf.form("/CS0 cs 1 scn 0 0 5 5 re f",
                                     "<< /ColorSpace << /CS0 " + pdf.separation("FormInk") + " >> >>");
    QPDFObjectHandle shading = pdf.object("<< /ShadingType 2 /ColorSpace " + pdf.separation("ShadeInk") +
                                          " /Coords [0 0 1 0] /Function << /FunctionType 2 /Domain [0 1] /C0 [0] /C1 [1] /N 1 >> >>");
    QPDFObjectHandle patternShading = pdf.object("<< /ShadingType 2 /ColorSpace " + pdf.separation("PatInk") +
                                          " /Coords [0 0 1 0] /Function << /FunctionType 2 /Domain [0 1] /C0 [0] /C1 [1] /N 1 >> >>");
    QPDFObjectHandle pattern = pdf.object("<< /PatternType 2 /Shading " + TestPdf::ref(patternShading) + " >>");
    std::string resources =
        "<< /ColorSpace << /CS0 " + pdf.separation("Gold") + " /CS1 " + pdf.separation("Silver") +
        " /CS2 " + pdf.separation("TextInk") + " /CS3 " + pdf.separation("Invisible") +
        " /CS4 " + pdf.separation("InlineInk") + " /CS5 " + pdf.deviceN({"DevA", "DevB"}) +
        " /CS6 " + pdf.deviceN({"NchA", "Cyan"}, true) + " /CS7 " + pdf.separation("None") +
        " /CS8 " + pdf.separation("All") + " /CS9 " + pdf.separation("ClipOnly") +
        " /CS10 [/Pattern] /CS11 " + pdf.separation("MaskInk") + " /CS12 " + pdf.separation("Unused") +
        " >> /XObject << /Im1 " + TestPdf::ref(image) + " /Mask1 " + TestPdf::ref(mask) +
        " /Fm1 " + TestPdf::ref(form) + " >> /Shading << /Sh1 " + TestPdf::ref(shading) +
        " >> /Pattern << /P1 " + TestPdf::ref(pattern) + " >> " + kFont + " >>";
    std::string content =
        "0 0 0 1 k 0 0 1 1 re f\n"                          // process only
        "/CS0 cs 1 scn 0 0 10 10 re f\n"                     // fill
        "/CS1 CS 1 SCN 0 0 m 10 10 l S\n"                    // stroke
        "BT /F1 12 Tf /CS2 cs 1 scn 0 Tr 10 10 Td (x) Tj ET\n"
        "BT /F1 12 Tf /CS3 cs 1 scn 3 Tr (hidden) Tj ET\n"   // invisible text marks nothing
        "q 10 0 0 10 0 0 cm /Im1 Do Q\n"
        "q /CS11 cs 1 scn 10 0 0 10 0 0 cm /Mask1 Do Q\n"   // stencil mask: fill colour
        "/Fm1 Do\n"
        "q BI /W 2 /H 2 /BPC 8 /CS /CS4 ID \x80\x80\x80\x80 EI Q\n"
        "/Sh1 sh\n"
        "/CS5 cs 0.5 0.5 scn 0 0 1 1 re f\n"
        "/CS6 cs 0.5 0.5 scn 0 0 1 1 re f\n"
        "/CS7 cs 1 scn 0 0 1 1 re f /CS8 cs 1 scn 0 0 1 1 re f\n"
        "/CS9 cs 1 scn 0 0 1 1 re W n\n"                    // clip only
        "/CS10 cs /P1 scn 0 0 1 1 re f\n"
        "q /CS12 cs Q 0 0 1 1 re f\n";                       // set, restored, never painted
    pdf.addPage(content, resources);
    EXPECT_EQ(scan(pdf, dir), (Inks{"Gold", "Silver", "TextInk", "ImageInk", "MaskInk", "FormInk",
                                    "InlineInk", "ShadeInk", "DevA", "DevB", "NchA", "PatInk"}));
}

// Per page: a shared form counts once, a form painting with the current colour takes its use's,
// and a form drawing itself terminates.
TEST(PageInks, FormsCountOncePerPageInheritTheirUseAndTerminate) {
    TempDir dir;
    TestPdf pdf;
    QPDFObjectHandle shared = pdf.form("/CS0 cs 1 scn 0 0 5 5 re f /CS0 CS 1 SCN 0 0 m 1 1 l S",
                                       "<< /ColorSpace << /CS0 " + pdf.separation("Shared") + " >> >>");
    QPDFObjectHandle plain = pdf.form("0 0 5 5 re f");
    QPDFObjectHandle loop = pdf.form("/CS0 cs 1 scn 0 0 1 1 re f /Fm3 Do");
    loop.getDict().replaceKey("/Resources", QPDFObjectHandle::parse(&pdf.qpdf(),
        "<< /ColorSpace << /CS0 " + pdf.separation("Loop") + " >> /XObject << /Fm3 " + TestPdf::ref(loop) + " >> >>"));
    std::string resources = "<< /ColorSpace << /CS0 " + pdf.separation("Outer") + " >> /XObject << /Fm1 " +
                            TestPdf::ref(shared) + " /Fm2 " + TestPdf::ref(plain) + " /Fm3 " + TestPdf::ref(loop) + " >> >>";
    pdf.addPage("/Fm1 Do /Fm1 Do", resources);
    pdf.addPage("0 0 1 1 re f", "<< >>");
    pdf.addPage("q /Fm1 Do Q", resources);
    pdf.addPage("/CS0 cs 1 scn /Fm2 Do", resources);
    pdf.addPage("/Fm3 Do", resources);
    EXPECT_EQ(scan(pdf, dir), (Inks{"Shared", "Shared", "Outer", "Loop"}));
}

// Indexed and ICC spaces, names needing escapes, content in an OFF layer and a rotated page.
TEST(PageInks, SpaceKindsEscapedNamesLayersAndRotation) {
    TempDir dir;
    TestPdf pdf;
    QPDFObjectHandle icc = pdf.stream("<< /N 4 >>", "not a real profile");
    QPDFObjectHandle ocg = pdf.object("<< /Type /OCG /Name (Layer) >>");
    pdf.qpdf().getRoot().replaceKey("/OCProperties", QPDFObjectHandle::parse(&pdf.qpdf(),
        "<< /OCGs [" + TestPdf::ref(ocg) + "] /D << /OFF [" + TestPdf::ref(ocg) + "] >> >>"));
    std::string resources = "<< /ColorSpace << /I0 [/Indexed " + pdf.separation("Base Spot") +
                            " 1 <00FF>] /ICC [/ICCBased " + TestPdf::ref(icc) + "] /Odd " +
                            pdf.separation("PANTONE 871 C/\xC3\xA9") + " /CS0 " + pdf.separation("Layered") +
                            " >> /Properties << /oc1 " + TestPdf::ref(ocg) + " >> >>";
    pdf.addPage("/I0 cs 1 sc 0 0 1 1 re f /ICC cs 0 0 0 1 sc 0 0 1 1 re f /Odd cs 1 sc 0 0 1 1 re f", resources);
    TestPdf::PageOptions turned;
    turned.rotate = 90;
    turned.cropBox = "[10 10 50 50]";
    pdf.addPage("/OC /oc1 BDC /CS0 cs 1 scn 0 0 1 1 re f EMC", resources, turned);
    EXPECT_EQ(scan(pdf, dir), (Inks{"Base Spot", "PANTONE 871 C/\xC3\xA9", "Layered"}));
}

TEST(PageInks, DamagedContentKeepsWhatCameBefore) {
    TempDir dir;
    TestPdf pdf;
    std::string resources = "<< /ColorSpace << /CS0 " + pdf.separation("Before") + " /CS1 [/Indexed /CS1 1 <00>] >> >>";
    // An unbalanced Q, a self-referencing colour space, an unknown resource and a broken tail.
    pdf.addPage("Q Q /CS1 cs /Nope cs 0 0 1 1 re f /CS0 cs 1 scn 0 0 1 1 re f BI /W 1 ID", resources);
    EXPECT_EQ(scan(pdf, dir), (Inks{"Before"}));
}
