// Comma lists, page ranges and blank trimming used by the description reader.
#include <cstdlib>

#include <gtest/gtest.h>

#include "vorlan/LD_JDF.h"

namespace {

std::vector<std::wstring> split(const wchar_t* value) {
    LD_JDF worker;
    std::wstring text = value;
    std::vector<wchar_t*> list;
    worker.parseStringAttributeToStringVector(text.data(), list);
    std::vector<std::wstring> items(list.begin(), list.end());
    LD_FreeTextList(list);  // every entry is its own block
    return items;
}

std::vector<long> range(const wchar_t* value) {
    LD_JDF worker;
    std::wstring text = value;
    std::vector<long> list;
    worker.parseRangeAttributeToIntVector(text.data(), list);
    return list;
}

}  // namespace

TEST(StringLists, ItemsAreTrimmedAndEmptyItemsVanish) {
    EXPECT_EQ(split(L" Cyan , Magenta,,Black "), (std::vector<std::wstring>{L"Cyan", L"Magenta", L"Black"}));
    EXPECT_EQ(split(L"   "), (std::vector<std::wstring>{L""}));
    EXPECT_EQ(split(L",,,"), (std::vector<std::wstring>{}));
    EXPECT_EQ(split(L"\tTab "), (std::vector<std::wstring>{L"\tTab"}));  // only U+0020 is a blank
}

TEST(StringLists, EmptyValueEmptiesTheList) {
    LD_JDF worker;
    std::vector<wchar_t*> list{LD_CopyText(L"old")};
    wchar_t* old = list[0];
    worker.parseStringAttributeToStringVector(nullptr, list);
    EXPECT_TRUE(list.empty());
    std::free(old);
}

TEST(RangeLists, RangesAndNumbers) {
    EXPECT_EQ(range(L"1~3, 7"), (std::vector<long>{1, 2, 3, 7}));
    EXPECT_EQ(range(L"5~2"), (std::vector<long>{}));
    EXPECT_EQ(range(L"x,4abc, -2"), (std::vector<long>{0, 4, -2}));
    EXPECT_EQ(range(L""), (std::vector<long>{}));
}

TEST(RangeLists, HugeRangeIsBoundedNotExhaustingMemory) {
    std::vector<long> values = range(L"0~2000000000");
    EXPECT_GT(values.size(), 1000u);
    EXPECT_LE(values.size(), 1u << 20);
    EXPECT_EQ(values.front(), 0);
}

TEST(RangeLists, IsRangeSplitsAtTheFirstTilde) {
    LD_JDF worker;
    long first = -9, last = -9;
    wchar_t token[] = L"2~5~9";
    EXPECT_TRUE(worker.isRange(token, first, last));
    EXPECT_EQ(first, 2);
    EXPECT_EQ(last, 5);
    wchar_t plain[] = L"12";
    EXPECT_FALSE(worker.isRange(plain, first, last));
}

TEST(Trim, OnlyBlanksAroundTheText) {
    LD_JDF worker;
    wchar_t text[] = L"  a b  ";
    EXPECT_EQ(std::wstring(worker.trimExtraSpaces(text)), L"a b");
    wchar_t blanks[] = L"    ";
    EXPECT_EQ(std::wstring(worker.trimExtraSpaces(blanks)), L"");
}

TEST(PercentTwenty, OnlyCompleteSequencesBecomeBlanks) {
    LD_JDF worker;
    wchar_t text[] = L"a%20b%2%21%";
    worker.removePercentTwenty(text);
    EXPECT_EQ(std::wstring(text), L"a b%2%21%");
    wchar_t edge[] = L"%20%20";
    worker.removePercentTwenty(edge);
    EXPECT_EQ(std::wstring(edge), L"  ");
}
