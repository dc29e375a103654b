// Page count and first-page size on generated files, and bad input of every kind.
#include <gtest/gtest.h>

#include <qpdf/QPDFObjectHandle.hh>

#include "pdf/page_geometry.h"
#include "pdf/pdf_session.h"
#include "pdf/zipped_jdf_file_system.h"
#include "test_pdf.h"
#include "test_support.h"

using vorlan::test::TempDir;
using vorlan::test::TestPdf;

namespace {

struct Context {
    ZippedJDFFileSystem* fs = createZippedJDFFileSystem("/nowhere/job");
    ~Context() { destroyZippedJDFFileSystem(fs); }
};

std::pair<double, double> firstPageSize(const std::string& path) {
    Context ctx;
    double height = -1, width = -1;
    getFirstPageSize(ctx.fs, path.c_str(), &height, &width);
    return {height, width};
}

std::string onePage(const TempDir& dir, const TestPdf::PageOptions& options) {
    TestPdf pdf;
    pdf.addPage("0 0 m 1 1 l S", "<< >>", options);
    std::string path = (dir / "p.pdf").string();
    pdf.write(path);
    return path;
}

}  // namespace

TEST(PdfInspection, FirstPageSizeFollowsRotationAndBoxes) {
    struct Case {
        int rotate;
        const char *mediaBox, *cropBox, *trimBox;  // empty: the default media box, no crop or trim box
        std::pair<double, double> heightWidth;
    };
    const Case cases[] = {
        {0, "", "", "", {100, 200}},
        {90, "", "", "", {200, 100}},
        {-90, "", "", "", {200, 100}},  // normalised to 270
        {180, "", "", "", {100, 200}},
        {0, "", "[110 60 10 10]", "", {50, 100}},       // corners in any order
        {0, "", "[-20 -20 150 1000]", "", {100, 150}},  // clipped to the media box
        {0, "", "[0 0 0 0]", "", {100, 200}},           // an empty crop box is ignored
        {0, "[5 5 5 5]", "[0 0 0 0]", "[0 0 50 40]", {40, 50}},
        {0, "[0 0 595.27559 841.88976]", "", "", {841.8897, 595.2755}},  // cut to 4 decimals
    };
    TempDir dir;
    for (const Case& c : cases) {
        TestPdf::PageOptions page;
        if (*c.mediaBox) page.mediaBox = c.mediaBox;
        page.cropBox = c.cropBox;
        page.trimBox = c.trimBox;
        page.rotate = c.rotate;
        EXPECT_EQ(firstPageSize(onePage(dir, page)), c.heightWidth) << c.rotate << c.mediaBox << c.cropBox;
    }
    // A rotation inherited from the page tree counts too.
    TestPdf pdf;
    pdf.addPage("", "<< >>");
    pdf.qpdf().getRoot().getKey("/Pages").replaceKey("/Rotate", QPDFObjectHandle::newInteger(450));
    pdf.write((dir / "inherit.pdf").string());
    EXPECT_EQ(firstPageSize((dir / "inherit.pdf").string()), std::make_pair(200.0, 100.0));
}

class PdfBadInput : public ::testing::Test {
protected:
    // Page count, size and ink scan of one bad file: nothing thrown, nothing crashed.
    void expectUnreadable(const std::string& path) {
        Context ctx;
        testing::internal::CaptureStderr();
        EXPECT_EQ(getPDFPageCount(ctx.fs, path.c_str()), 0);
        std::string message = testing::internal::GetCapturedStderr();
        EXPECT_EQ(message, "Unable to open " + path + "\n");
        EXPECT_EQ(firstPageSize(path), std::make_pair(-1.0, -1.0));  // left alone
        std::vector<std::string> inks;
        testing::internal::CaptureStderr();
        scanPDFPageInks(path.c_str(), inks);
        testing::internal::GetCapturedStderr();
        EXPECT_TRUE(inks.empty());
    }
    TempDir dir;
};

TEST_F(PdfBadInput, MissingEmptyAndNotAPdf) {
    expectUnreadable((dir / "missing.pdf").string());
    vorlan::test::writeFile(dir / "empty.pdf", "");
    expectUnreadable((dir / "empty.pdf").string());
    vorlan::test::writeFile(dir / "text.pdf", "hello, this is not a PDF\n");
    expectUnreadable((dir / "text.pdf").string());
    expectUnreadable(dir.path().string());  // a folder
}

TEST_F(PdfBadInput, TruncatedAndCorruptFilesNeverCrash) {
    TestPdf pdf;
    std::string resources = "<< /ColorSpace << /CS0 " + pdf.separation("Gold") + " >> >>";
    for (int i = 0; i < 4; ++i) pdf.addPage("/CS0 cs 1 scn 0 0 10 10 re f", resources);
    std::string good = (dir / "good.pdf").string();
    pdf.write(good);
    std::string bytes = vorlan::test::readFile(good);
    ASSERT_GT(bytes.size(), 400u);
    // Cut short, or stretches overwritten with garbage: repair may or may not succeed, never crash.
    std::vector<std::string> damaged;
    for (size_t cut : {bytes.size() / 4, bytes.size() / 2, bytes.size() - 30}) damaged.push_back(bytes.substr(0, cut));
    for (size_t at = 0; at + 64 < bytes.size(); at += bytes.size() / 7) {
        damaged.push_back(bytes);
        for (size_t i = 0; i < 64; ++i) damaged.back()[at + i] = static_cast<char>((i * 37 + at) & 0xff);
    }
    Context ctx;
    for (size_t i = 0; i < damaged.size(); ++i) {
        std::string path = (dir / ("bad" + std::to_string(i) + ".pdf")).string();
        vorlan::test::writeFile(path, damaged[i]);
        testing::internal::CaptureStderr();
        int count = getPDFPageCount(ctx.fs, path.c_str());
        std::vector<std::string> inks;
        scanPDFPageInks(path.c_str(), inks);
        double h = 0, w = 0;
        getFirstPageSize(ctx.fs, path.c_str(), &h, &w);
        testing::internal::GetCapturedStderr();
        EXPECT_TRUE(count >= 0 && count <= 4) << i;
        EXPECT_LE(inks.size(), 4u);
    }
}

TEST_F(PdfBadInput, EncryptedFiles) {
    if (!vorlan::test::haveProgram("qpdf")) GTEST_SKIP() << "qpdf command not installed";
    TestPdf pdf;
    pdf.addPage("0 0 m 1 1 l S");
    std::string plain = (dir / "plain.pdf").string();
    pdf.write(plain);
    std::string locked = (dir / "locked.pdf").string();
    std::string open = (dir / "open.pdf").string();
    ASSERT_EQ(vorlan::test::runCommand("qpdf --encrypt secret owner 256 -- " + plain + " " + locked), 0);
    ASSERT_EQ(vorlan::test::runCommand("qpdf --encrypt '' owner 256 -- " + plain + " " + open), 0);
    expectUnreadable(locked);
    Context ctx;
    EXPECT_EQ(getPDFPageCount(ctx.fs, open.c_str()), 1);  // no user password: readable
}
