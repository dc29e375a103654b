// Attribute value types: integer range lists, number lists and wide text.
#include <gtest/gtest.h>

#include "platform/jdf/jdf.h"
#include "platform/os/text.h"

using namespace JDF;

TEST(JdfValues, IntegerRangeListsParseExpandAndWrite) {
    EXPECT_EQ(JDFIntegerRangeList(L"0 ~ -1").ToVInt(4), (std::vector<int>{0, 1, 2, 3}));
    EXPECT_EQ(JDFIntegerRangeList(L"0~-1").ToVInt(1000).size(), 1000u);
    EXPECT_EQ(JDFIntegerRangeList(L"1 3 ~ 5 -2").ToVInt(10), (std::vector<int>{1, 3, 4, 5, 8}));
    EXPECT_EQ(JDFIntegerRangeList(L"5 ~ 2").ToVInt(0), (std::vector<int>{5, 4, 3, 2}));
    EXPECT_EQ(JDFIntegerRangeList(L"-3 ~ -1").ToVInt(5), (std::vector<int>{2, 3, 4}));
    // Open ranges that stay negative (no length known) give nothing.
    EXPECT_EQ(JDFIntegerRangeList(L"0 ~ -1").NElements(), 0);
    EXPECT_EQ(JDFIntegerRangeList(L"2 4 ~ 6").NElements(), 4);
    EXPECT_TRUE(JDFIntegerRangeList(L"").empty());
    for (const wchar_t* bad : {L"1 ~", L"~ 2", L"a", L"1.5", L"1 ~ ~ 2", L"99999999999"})
        EXPECT_THROW(JDFIntegerRangeList{bad}, JDFException) << WString(bad).getUTF8();
    EXPECT_THROW(JDFIntegerRangeList(L"0 ~ 2000000000").ToVInt(0), JDFException);
    JDFIntegerRangeList built;
    built.Append(5, 6);
    built.Append(2);
    built.Append(0, -1);
    EXPECT_EQ(built.GetString(), L"5 ~ 6 2 0 ~ -1");
    EXPECT_EQ(JDFIntegerRangeList(built.GetString()).GetString(), built.GetString());
}

// The one UTF-8 decoder: each ill-formed sequence becomes one U+FFFD and reading goes on.
TEST(JdfValues, Utf8DecodingRejectsIllFormedSequences) {
    const struct {
        const char* bytes;
        const wchar_t* text;
    } cases[] = {
        {"a\xF0\x9F\x98\x80", L"a\U0001F600"},      // four bytes, well formed
        {"\xC0\xAF", L"\uFFFD\uFFFD"},                // overlong '/'
        {"\xE0\x80\xAF", L"\uFFFD\uFFFD\uFFFD"},     // overlong, three bytes
        {"\xED\xA0\x80x", L"\uFFFD\uFFFD\uFFFDx"},   // a surrogate
        {"\xF4\x90\x80\x80", L"\uFFFD\uFFFD\uFFFD\uFFFD"},  // beyond U+10FFFF
        {"\xE2\x82", L"\uFFFD\uFFFD"},                // cut short
    };
    for (const auto& c : cases) EXPECT_EQ(WString(c.bytes), c.text) << c.bytes;
    // Encoding: a long text leaves the stack buffer and converts whole.
    std::wstring longText(1000, L'\u20ac');
    EXPECT_EQ(vorlan::os::Utf8Text(longText).size(), 3000u);
    EXPECT_EQ(vorlan::os::toUtf8(std::wstring(1, static_cast<wchar_t>(0xD800))), "\xEF\xBF\xBD");
}

TEST(JdfValues, PairsRectanglesAndMatrices) {
    JDFXYPair p(L" 612  792.5 ");
    EXPECT_DOUBLE_EQ(p.GetX(), 612);
    EXPECT_DOUBLE_EQ(p.GetY(), 792.5);
    EXPECT_EQ(p.GetString(), L"612 792.5");
    EXPECT_EQ(JDFRectangle(0, 0, 595.276, 841.89).GetString(), L"0 0 595.276 841.89");
    EXPECT_THROW(JDFXYPair(L"1"), JDFException);
    EXPECT_THROW(JDFRectangle(L"1 2 3"), JDFException);
    EXPECT_THROW(JDFMatrix(L"1 0 0 1 0 x"), JDFException);
    EXPECT_THROW(JDFXYPair(L"1 nan"), JDFException);
    EXPECT_EQ(WString::valueOf(1e-7), L"1e-07");
    EXPECT_EQ(WString::valueOf(0.1 + 0.2), L"0.30000000000000004");
}

TEST(JdfValues, WideTextAndTokenLists) {
    WString s("Gr\xC3\xBC\xC3\x9F" "e \xE2\x82\xAC");
    EXPECT_EQ(s, L"Gr\u00fc\u00dfe \u20ac");
    EXPECT_EQ(s.getUTF8(), "Gr\xC3\xBC\xC3\x9F" "e \xE2\x82\xAC");
    EXPECT_EQ(WString(static_cast<const char*>(nullptr)), L"");
    EXPECT_EQ(vWString(L"  a b\t c  "), (vWString{L"a", L"b", L"c"}));
    EXPECT_FALSE(WString(L"Imposition Rendering").HasToken(L"Render"));
    // Non-ASCII text survives a document round trip.
    JDFDoc doc(0);
    doc.GetRoot().SetAttribute(L"DescriptiveName", s);
    JDFParser p;
    ASSERT_TRUE(p.ParseString(doc.ToString()));
    EXPECT_EQ(JDFElement(p.GetRoot()).GetDescriptiveName(), s);
}

// A number outside a table is refused; Unknown is written only where allowed.
TEST(JdfValues, TokensOutsideTheTableAreRefused) {
    EXPECT_THROW(Tables::Token(Tables::Side, 3), JDFException);
    EXPECT_THROW(Tables::Token(Tables::Side, -1), JDFException);
    EXPECT_THROW(Tables::Token(Tables::SizePolicy, 0), JDFException);
    EXPECT_EQ(Tables::Token(Tables::MediaType, 0, true), L"Unknown");
}
