// Real files made by others: page counts and first-page sizes against qpdf and poppler, page inks
// against the plates Ghostscript prints, XMP reading and the scan never failing on them.
#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <filesystem>
#include <sstream>

#include "pdf/page_inks.h"
#include "pdf/pdf_document.h"
#include "pdf/page_geometry.h"
#include "pdf/zipped_jdf_file_system.h"
#include "plates.h"
#include "test_support.h"

namespace fs = std::filesystem;

namespace {

std::vector<std::string> corpusPdfs() {
    std::vector<std::string> files;
    fs::path dir = vorlan::test::corpusDir() / "pdf";
    std::error_code ec;
    for (const auto& e : fs::directory_iterator(dir, ec))
        if (e.path().extension() == ".pdf") files.push_back(e.path().string());
    std::sort(files.begin(), files.end());
    return files;
}

std::string quoted(const std::string& path) { return "'" + path + "'"; }

struct Context {
    ZippedJDFFileSystem* fs = createZippedJDFFileSystem("corpus");
    ~Context() { destroyZippedJDFFileSystem(fs); }
};

}  // namespace

TEST(PdfCorpus, PageCountsMatchQpdf) {
    VORLAN_REQUIRE_CORPUS();
    if (!vorlan::test::haveProgram("qpdf")) GTEST_SKIP() << "qpdf command not installed";
    Context ctx;
    int compared = 0;
    for (const std::string& file : corpusPdfs()) {
        // Compared with the pages the tree really holds (what --show-pages lists), which differs
        // from qpdf's --show-npages (the page tree's /Count) for files whose /Count is broken.
        std::string pages;
        vorlan::test::runCommand("qpdf --show-pages " + quoted(file) + " 2>/dev/null | grep -c '^page '", &pages);
        testing::internal::CaptureStderr();
        const int ours = getPDFPageCount(ctx.fs, file.c_str());
        testing::internal::GetCapturedStderr();
        const int listed = std::atoi(pages.c_str());
        EXPECT_EQ(ours, listed) << file;
        ++compared;
    }
    EXPECT_GE(compared, 40);
}

TEST(PdfCorpus, FirstPageSizesMatchPoppler) {
    VORLAN_REQUIRE_CORPUS();
    if (!vorlan::test::haveProgram("pdfinfo")) GTEST_SKIP() << "pdfinfo (poppler-utils) not installed";
    Context ctx;
    int compared = 0;
    for (const std::string& file : corpusPdfs()) {
        std::string info;
        if (vorlan::test::runCommand("pdfinfo -box -f 1 -l 1 " + quoted(file) + " 2>/dev/null", &info) != 0) continue;
        double x0 = 0, y0 = 0, x1 = 0, y1 = 0;
        int rot = 0;
        bool haveBox = false, haveRot = false;
        std::istringstream lines(info);
        for (std::string line; std::getline(lines, line);) {
            if (line.rfind("Page    1 CropBox:", 0) == 0)
                haveBox = std::sscanf(line.c_str() + 18, "%lf %lf %lf %lf", &x0, &y0, &x1, &y1) == 4;
            if (line.rfind("Page    1 rot:", 0) == 0) haveRot = std::sscanf(line.c_str() + 14, "%d", &rot) == 1;
        }
        if (!haveBox || !haveRot) continue;
        double w = std::fabs(x1 - x0), h = std::fabs(y1 - y0);
        if (rot % 180 != 0) std::swap(w, h);
        double height = -1, width = -1;
        getFirstPageSize(ctx.fs, file.c_str(), &height, &width);
        EXPECT_NEAR(width, w, 0.011) << file;  // pdfinfo prints two decimals
        EXPECT_NEAR(height, h, 0.011) << file;
        ++compared;
    }
    EXPECT_GE(compared, 40);
}

// Every spot plate Ghostscript inks on page 1 is one of the page's inks, and every ink we report
// is a colorant Ghostscript knows for that page (it makes a plate for it, blank or not).
TEST(PdfCorpus, FirstPageInksMatchGhostscriptPlates) {
    VORLAN_REQUIRE_CORPUS();
    if (!vorlan::test::haveProgram("gs")) GTEST_SKIP() << "ghostscript not installed";
    int compared = 0;
    for (const std::string& file : corpusPdfs()) {
        auto pdf = vorlan::pdf::openDocument(file.c_str(), true);
        if (!pdf) continue;
        auto pages = vorlan::pdf::documentPages(*pdf);
        if (pages.empty()) continue;
        vorlan::pdf::ColourSpaceResolver::SharedCache cache;
        std::vector<std::string> inks = vorlan::pdf::pageInks(pages.front(), &cache);
        std::map<std::string, long> plates = vorlan::test::platePixels(file, 1);
        if (plates.empty()) continue;
        for (const auto& [plate, pixels] : plates) {
            if (pixels > 0) {
                EXPECT_NE(std::find(inks.begin(), inks.end(), plate), inks.end())
                    << file << ": plate " << plate << " is inked but not reported";
            }
        }
        const std::string name = fs::path(file).filename().string();
        // An invalid file: its DeviceN names SpotColour1..3 while its NChannel /Colorants
        // dictionary defines Blue, Green and Red; gs makes plates for the dictionary's names.
        if (name == "vera_A-2b_6-2-4-4-t02-fail-a.pdf") continue;
        for (const std::string& ink : inks)
            EXPECT_TRUE(plates.count(ink)) << file << ": reported ink " << ink << " has no plate";
        ++compared;
    }
    EXPECT_GE(compared, 40);
}

TEST(PdfCorpus, WholeDocumentScansNeverFail) {
    VORLAN_REQUIRE_CORPUS();
    for (const std::string& file : corpusPdfs()) {
        std::vector<std::string> inks;
        testing::internal::CaptureStderr();
        scanPDFPageInks(file.c_str(), inks);
        testing::internal::GetCapturedStderr();
        for (const std::string& ink : inks) {
            EXPECT_NE(ink, "Cyan");
            EXPECT_NE(ink, "None");
        }
        auto pdf = vorlan::pdf::openDocument(file.c_str(), true);
        if (pdf) vorlan::pdf::documentXmp(*pdf);
    }
}
