// Removing nested names: the counted removal must equal removing, for each nested name in turn,
// the first remaining entry equal to it ignoring case.
#include <algorithm>
#include <cwctype>
#include <random>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "description_fixture.h"
#include "platform/os/text.h"
#include "versions/name_lists.h"

using vorlan::test::Names;
using vorlan::test::names;

namespace {

std::vector<wchar_t*> copies(const Names& list) {
    std::vector<wchar_t*> out;
    for (const std::wstring& name : list) out.push_back(LD_CopyText(name.c_str()));
    return out;
}

bool sameIgnoringCase(const std::wstring& a, const std::wstring& b) {
    return a.size() == b.size() && std::equal(a.begin(), a.end(), b.begin(), [](wchar_t x, wchar_t y) {
               return std::towlower(static_cast<wint_t>(x)) == std::towlower(static_cast<wint_t>(y));
           });
}

// The removal as the format defines it, one nested name at a time.
Names removeOneByOne(Names list, const Names& nested) {
    for (const std::wstring& name : nested) {
        auto found = std::find_if(list.begin(), list.end(), [&](const std::wstring& e) { return sameIgnoringCase(e, name); });
        if (found != list.end()) list.erase(found);
    }
    return list;
}

}  // namespace

TEST(NameLists, CountedRemovalEqualsOneByOneRemoval) {
    std::mt19937 random(7);
    const Names alphabet{L"a", L"A", L"b", L"B", L"\u00C4", L"\u00E4", L"ab", L"Ab", L""};
    for (int round = 0; round < 2000; ++round) {
        Names list, nested;
        for (int i = random() % 8; i > 0; --i) list.push_back(alphabet[random() % alphabet.size()]);
        for (int i = random() % 6; i > 0; --i) nested.push_back(alphabet[random() % alphabet.size()]);
        std::vector<wchar_t*> actual = copies(list), nestedCopies = copies(nested);
        LD_JDF worker;
        worker.removeNestedComponentsFromList(actual, nestedCopies);
        EXPECT_EQ(names(actual), removeOneByOne(list, nested)) << round;
        LD_FreeTextList(actual);
        LD_FreeTextList(nestedCopies);
    }
}

TEST(NameLists, ContainsIgnoresCase) {
    vorlan::os::ensureUtf8Locale();  // as the host does: case folding beyond ASCII needs it
    std::vector<wchar_t*> list = copies({L"CutContour", L"\u00DCberdruck"});
    vorlan::versions::NameCounts counts(list);
    EXPECT_TRUE(counts.contains(L"cutcontour"));
    EXPECT_TRUE(counts.contains(L"\u00FCberdruck"));
    EXPECT_FALSE(counts.contains(L"Cut"));
    EXPECT_FALSE(counts.contains(nullptr));
    LD_FreeTextList(list);
}
