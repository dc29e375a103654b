// Comma lists, page ranges, blank trimming and %20 used by the description reader.
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
    LD_JDF worker;
    std::vector<wchar_t*> list{LD_CopyText(L"old")};
    wchar_t* old = list[0];
    worker.parseStringAttributeToStringVector(nullptr, list);  // an empty value empties the list
    EXPECT_TRUE(list.empty());
    std::free(old);
    wchar_t text[] = L"  a b  ";
    EXPECT_EQ(std::wstring(worker.trimExtraSpaces(text)), L"a b");
    wchar_t blanks[] = L"    ";
    EXPECT_EQ(std::wstring(worker.trimExtraSpaces(blanks)), L"");
}

TEST(RangeLists, RangesAndNumbersWithAHugeRangeBounded) {
    EXPECT_EQ(range(L"1~3, 7"), (std::vector<long>{1, 2, 3, 7}));
    EXPECT_EQ(range(L"5~2"), (std::vector<long>{}));
    EXPECT_EQ(range(L"x,4abc, -2"), (std::vector<long>{0, 4, -2}));
    EXPECT_EQ(range(L""), (std::vector<long>{}));
    std::vector<long> values = range(L"0~2000000000");  // bounded, not exhausting memory
    EXPECT_GT(values.size(), 1000u);
    EXPECT_LE(values.size(), 1u << 20);
    LD_JDF worker;
    long first = -9, last = -9;
    wchar_t token[] = L"2~5~9";  // split at the first tilde
    EXPECT_TRUE(worker.isRange(token, first, last));
    EXPECT_EQ(std::make_pair(first, last), std::make_pair(2L, 5L));
    wchar_t plain[] = L"12";
    EXPECT_FALSE(worker.isRange(plain, first, last));
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
