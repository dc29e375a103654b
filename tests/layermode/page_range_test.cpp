// The page-range text turned into positions and selections, and page lists packed into ranges.
#include <climits>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "platform/jdf/jdf.h"
#include "vorlan/LD_JDF.h"

namespace {

std::vector<int32_t> pagesOf(const char* text) {
    LD_JDF w;
    w.pageRange = const_cast<char*>(text);
    std::vector<int32_t> pages;
    w.ConvertPageRangesToPages(pages);
    return pages;
}

std::string packed(std::vector<int32_t> pages) {
    LD_JDF w;
    JDF::JDFIntegerRangeList ranges;
    EXPECT_EQ(w.convertPagesVecToJDFRangeList(pages, ranges), LD_OK);
    return ranges.GetString().getUTF8();
}

// Selection of a layout of n surfaces under a page-range text.
std::vector<bool> layoutSelection(const char* text, int mode, int n) {
    LD_JDF w;
    std::vector<LD_Surface> surfaces(static_cast<size_t>(n));
    for (auto& s : surfaces) w.surfaces.push_back(&s);
    w.pageRange = const_cast<char*>(text);
    w.pageRangeMode = mode;
    w.applyPageRangeForLayout();
    std::vector<bool> selected;
    for (auto& s : surfaces) selected.push_back(s.isSelected);
    w.surfaces.clear();
    return selected;
}

}  // namespace

TEST(PageRanges, TextToPositions) {
    EXPECT_EQ(pagesOf("2-4,7"), (std::vector<int32_t>{1, 2, 3, 6}));
    EXPECT_EQ(pagesOf("1-3, 6"), (std::vector<int32_t>{0, 1, 2, 5}));
    EXPECT_EQ(pagesOf(""), (std::vector<int32_t>{-1}));
    EXPECT_EQ(pagesOf("all"), (std::vector<int32_t>{-1}));
    EXPECT_EQ(pagesOf("0"), (std::vector<int32_t>{-1}));
    EXPECT_EQ(pagesOf("3-1"), (std::vector<int32_t>{2}));
    EXPECT_EQ(pagesOf("4,"), (std::vector<int32_t>{3, -1}));
}

TEST(PageRanges, OverflowingNumbersAreIgnored) {
    EXPECT_EQ(pagesOf("99999999999999999999"), (std::vector<int32_t>{}));
    EXPECT_EQ(pagesOf("3,4294967298,5"), (std::vector<int32_t>{2, 4}));
    EXPECT_EQ(pagesOf("2-99999999999"), (std::vector<int32_t>{1}));  // the open range is dropped
    EXPECT_EQ(pagesOf("2147483647"), (std::vector<int32_t>{2147483646}));
    // A huge but valid range stops at the positions any job can have.
    LD_JDF w;
    w.pageRange = const_cast<char*>("1-2000000000");
    std::vector<int32_t> pages;
    w.ConvertPageRangesToPages(pages, 5);
    EXPECT_EQ(pages, (std::vector<int32_t>{0, 1, 2, 3, 4}));
}

TEST(PageRanges, LayoutSelection) {
    EXPECT_EQ(layoutSelection("Odd", 1, 5), (std::vector<bool>{true, false, true, false, true}));
    EXPECT_EQ(layoutSelection("Even", 2, 5), (std::vector<bool>{false, true, false, true, false}));
    EXPECT_EQ(layoutSelection("all", 3, 3), (std::vector<bool>{false, false, false}));
    EXPECT_EQ(layoutSelection("2,9", 3, 3), (std::vector<bool>{false, true, false}));
    EXPECT_EQ(layoutSelection("All", 0, 2), (std::vector<bool>{true, true}));
}

TEST(PageRanges, PdfSelections) {
    LD_JDF w;
    w.pageRange = const_cast<char*>("9");
    w.pageRangeMode = 3;
    for (int i = 0; i < 4; ++i) w.surfaceVersions.push_back(new XMLSurfaceData);
    w.applyPageRangeForPDFWithoutVersions();
    EXPECT_EQ(w.pageSelection, std::vector<bool>(4, false));

    // With versions each version's surfaces count from 0; a missing record selects nothing.
    LD_JDF v;
    v.pageRange = const_cast<char*>("Odd");
    v.pageRangeMode = 1;
    for (int k : {3, 2}) {
        auto* version = new XMLVersionData;
        for (int i = 0; i < k; ++i) version->surfaces.push_back(new XMLSurfaceData);
        v.versions.push_back(version);
    }
    v.versions.push_back(nullptr);
    v.applyPageRangeForPDF();
    EXPECT_EQ(v.pageSelection, (std::vector<bool>{true, false, true, true, false}));
    v.versions.pop_back();
}

TEST(PageRanges, PagesPackedIntoRanges) {
    EXPECT_EQ(packed({1, 2, 3}), "1 ~ 3");
    EXPECT_EQ(packed({1, 5}), "1 5");
    EXPECT_EQ(packed({4}), "4");
    EXPECT_EQ(packed({5, 6, 2}), "5 ~ 6 2");
    EXPECT_EQ(packed({}), "");
    EXPECT_EQ(packed({INT_MAX - 1, INT_MAX}), std::to_string(INT_MAX - 1) + " ~ " + std::to_string(INT_MAX));
}
