// Text conversion and number reading shared by every layer (what the Win32 text calls did).
#pragma once

#include <cstdint>
#include <cwchar>
#include <string>
#include <string_view>
#include <vector>

namespace vorlan::os {

// Narrow (current-locale multibyte) copy of a wide string, allocated with malloc; null for null
// or when the text cannot be converted.
char* narrowCopy(const wchar_t* text);
// Wide copy of a narrow (current-locale) string, allocated with malloc; null for null or failure.
wchar_t* wideCopy(const char* text);

std::string narrow(const wchar_t* text);    // empty for null
std::wstring widen(const char* text);        // empty for null

// The one UTF-8 conversion of the library, whatever the locale. Encoding: surrogates and values
// above U+10FFFF become U+FFFD. Decoding: every ill-formed sequence (bad lead or continuation
// byte, overlong form, surrogate, beyond U+10FFFF, cut short) becomes one U+FFFD.
size_t encodeUtf8(wchar_t character, char* out);  // writes 1 to 4 bytes; returns how many
std::string toUtf8(const wchar_t* text);          // empty for null
std::string toUtf8(const std::wstring& text);
std::string toUtf8(const wchar_t* text, size_t length);
std::wstring fromUtf8(const char* bytes, size_t size);
std::wstring fromUtf8(const std::string& bytes);

// UTF-8 of a wide text, held on the stack when short: the conversion for the many short names
// and values written into documents, without a heap block each.
class Utf8Text {
public:
    Utf8Text(const wchar_t* text, size_t length);
    explicit Utf8Text(const std::wstring& text) : Utf8Text(text.data(), text.size()) {}
    Utf8Text(const Utf8Text&) = delete;
    Utf8Text& operator=(const Utf8Text&) = delete;
    const char* c_str() const { return text_; }
    size_t size() const { return size_; }

private:
    char small_[256];
    std::string large_;
    const char* text_ = small_;
    size_t size_ = 0;
};

// The one list splitter: the items of text between any of the separator characters, each without
// the spaces around it. Runs of separators give no item; an item of spaces alone gives an empty one.
// forEachListItem hands each item to visit as a view into text, until visit returns false.
template <typename Char, typename Visit>
void forEachListItem(std::basic_string_view<Char> text, std::basic_string_view<Char> separators, Visit visit) {
    size_t start = 0;
    while (start < text.size()) {
        size_t end = text.find_first_of(separators, start);
        if (end == std::basic_string_view<Char>::npos) end = text.size();
        if (end > start) {
            std::basic_string_view<Char> item = text.substr(start, end - start);
            while (!item.empty() && item.front() == Char(' ')) item.remove_prefix(1);
            while (!item.empty() && item.back() == Char(' ')) item.remove_suffix(1);
            if (!visit(item)) return;
        }
        start = end + 1;
    }
}

template <typename Char>
std::vector<std::basic_string<Char>> splitList(std::basic_string_view<Char> text,
                                               std::basic_string_view<Char> separators) {
    std::vector<std::basic_string<Char>> items;
    forEachListItem(text, separators, [&](std::basic_string_view<Char> item) {
        items.emplace_back(item);
        return true;
    });
    return items;
}

// Reads a number like the C runtime's _wtoi: leading white space, optional sign, decimal digits up
// to the first other character; 0 when there are none. Saturates instead of overflowing.
int wtoi(const wchar_t* text);
// Reads a leading integer as _wtoi does (saturating) into value; false, value unchanged, when the
// text does not start (after white space) with an optionally signed digit.
bool readLeadingInteger(const char* text, int32_t& value);
// Reads a leading decimal number ("12.5", "-3e2", "7mm" reads 7) into value, whatever the
// locale; false, value unchanged, when there is none or it is out of range or not finite.
bool readDecimal(const char* text, double& value);

// Case-insensitive comparison of wide strings (null equals only null).
bool equalsIgnoreCase(const wchar_t* a, const wchar_t* b);
// ASCII case-insensitive comparison of narrow strings, locale-independent.
bool equalsIgnoreCaseAscii(const char* a, const char* b);

// Makes sure the process has a UTF-8 capable locale for the wide/narrow conversions:
// the environment's when it is UTF-8, else C.UTF-8.
void ensureUtf8Locale();

}  // namespace vorlan::os
