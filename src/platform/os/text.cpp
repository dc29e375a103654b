#include "platform/os/text.h"

#include <cctype>
#include <cerrno>
#include <charconv>
#include <cmath>
#include <climits>
#include <clocale>
#include <cstdlib>
#include <cstring>
#include <cwctype>
#include <langinfo.h>

namespace vorlan::os {

char* narrowCopy(const wchar_t* text) {
    if (!text) return nullptr;
    std::mbstate_t state{};
    const wchar_t* probe = text;
    size_t needed = std::wcsrtombs(nullptr, &probe, 0, &state);
    if (needed == static_cast<size_t>(-1)) return nullptr;
    char* out = static_cast<char*>(std::malloc(needed + 1));
    if (!out) return nullptr;
    state = std::mbstate_t{};
    probe = text;
    std::wcsrtombs(out, &probe, needed + 1, &state);
    out[needed] = '\0';
    return out;
}

wchar_t* wideCopy(const char* text) {
    if (!text) return nullptr;
    std::mbstate_t state{};
    const char* probe = text;
    size_t needed = std::mbsrtowcs(nullptr, &probe, 0, &state);
    if (needed == static_cast<size_t>(-1)) return nullptr;
    auto* out = static_cast<wchar_t*>(std::malloc((needed + 1) * sizeof(wchar_t)));
    if (!out) return nullptr;
    state = std::mbstate_t{};
    probe = text;
    std::mbsrtowcs(out, &probe, needed + 1, &state);
    out[needed] = L'\0';
    return out;
}

std::string narrow(const wchar_t* text) {
    char* copy = narrowCopy(text);
    if (!copy) return toUtf8(text ? std::wstring(text) : std::wstring());
    std::string result(copy);
    std::free(copy);
    return result;
}

std::wstring widen(const char* text) {
    wchar_t* copy = wideCopy(text);
    if (!copy) return text ? fromUtf8(text) : std::wstring();
    std::wstring result(copy);
    std::free(copy);
    return result;
}

size_t encodeUtf8(wchar_t wc, char* out) {
    auto cp = static_cast<uint32_t>(wc);
    if (cp > 0x10FFFF || (cp >= 0xD800 && cp <= 0xDFFF)) cp = 0xFFFD;
    if (cp < 0x80) {
        out[0] = static_cast<char>(cp);
        return 1;
    }
    if (cp < 0x800) {
        out[0] = static_cast<char>(0xC0 | (cp >> 6));
        out[1] = static_cast<char>(0x80 | (cp & 0x3F));
        return 2;
    }
    if (cp < 0x10000) {
        out[0] = static_cast<char>(0xE0 | (cp >> 12));
        out[1] = static_cast<char>(0x80 | ((cp >> 6) & 0x3F));
        out[2] = static_cast<char>(0x80 | (cp & 0x3F));
        return 3;
    }
    out[0] = static_cast<char>(0xF0 | (cp >> 18));
    out[1] = static_cast<char>(0x80 | ((cp >> 12) & 0x3F));
    out[2] = static_cast<char>(0x80 | ((cp >> 6) & 0x3F));
    out[3] = static_cast<char>(0x80 | (cp & 0x3F));
    return 4;
}

std::string toUtf8(const wchar_t* text) { return text ? toUtf8(text, std::wcslen(text)) : std::string(); }
std::string toUtf8(const std::wstring& text) { return toUtf8(text.data(), text.size()); }

std::string toUtf8(const wchar_t* text, size_t length) {
    std::string out;
    out.reserve(length);
    char bytes[4];
    for (size_t i = 0; i < length; ++i) out.append(bytes, encodeUtf8(text[i], bytes));
    return out;
}

Utf8Text::Utf8Text(const wchar_t* text, size_t length) {
    size_t used = 0;
    for (size_t i = 0; i < length; ++i) {
        if (used + 4 >= sizeof small_) {  // too long for the stack: convert it all on the heap
            large_ = toUtf8(text, length);
            text_ = large_.c_str();
            size_ = large_.size();
            return;
        }
        used += encodeUtf8(text[i], small_ + used);
    }
    small_[used] = '\0';
    size_ = used;
}

// Well-formed UTF-8 only: a lead byte with the right number of continuation bytes, the shortest
// form of its code point, no surrogate and nothing above U+10FFFF; each ill-formed sequence
// becomes one U+FFFD and reading goes on at the next byte.
std::wstring fromUtf8(const char* bytes, size_t size) {
    std::wstring out;
    out.reserve(size);
    static constexpr uint32_t kSmallest[] = {0, 0x80, 0x800, 0x10000};
    size_t i = 0;
    while (i < size) {
        auto lead = static_cast<unsigned char>(bytes[i]);
        int extra = lead < 0x80 ? 0 : (lead >> 5) == 0x6 ? 1 : (lead >> 4) == 0xE ? 2 : (lead >> 3) == 0x1E ? 3 : -1;
        if (extra < 0 || static_cast<size_t>(extra) >= size - i) {
            out += L'\uFFFD';
            ++i;
            continue;
        }
        uint32_t cp = extra == 0 ? lead : lead & (0x3F >> extra);
        bool ok = true;
        for (int k = 1; k <= extra && ok; ++k) {
            auto cont = static_cast<unsigned char>(bytes[i + static_cast<size_t>(k)]);
            ok = (cont & 0xC0) == 0x80;
            cp = (cp << 6) | (cont & 0x3F);
        }
        ok = ok && cp >= kSmallest[extra] && cp <= 0x10FFFF && !(cp >= 0xD800 && cp <= 0xDFFF);
        if (!ok) {
            out += L'\uFFFD';
            ++i;
            continue;
        }
        out += static_cast<wchar_t>(cp);
        i += static_cast<size_t>(extra) + 1;
    }
    return out;
}

std::wstring fromUtf8(const std::string& bytes) { return fromUtf8(bytes.data(), bytes.size()); }

namespace {

bool isBlank(wchar_t c) { return std::iswspace(static_cast<wint_t>(c)) != 0; }
bool isBlank(char c) { return std::isspace(static_cast<unsigned char>(c)) != 0; }

// Reads leading white space, an optional sign and decimal digits, saturating at the int limits.
// *found tells whether any digit was read.
template <typename Char>
int leadingInteger(const Char* text, bool* found) {
    *found = false;
    if (!text) return 0;
    while (isBlank(*text)) ++text;
    bool negative = false;
    if (*text == '+' || *text == '-') negative = (*text++ == '-');
    long long value = 0;
    while (*text >= '0' && *text <= '9') {
        if (value <= static_cast<long long>(INT_MAX) + 1) value = value * 10 + (*text - '0');
        ++text;
        *found = true;
    }
    if (negative) value = -value;
    if (value > INT_MAX) return INT_MAX;
    if (value < INT_MIN) return INT_MIN;
    return static_cast<int>(value);
}

}  // namespace

int wtoi(const wchar_t* text) {
    bool found = false;
    return leadingInteger(text, &found);
}

bool readLeadingInteger(const char* text, int32_t& value) {
    bool found = false;
    int read = leadingInteger(text, &found);
    if (found) value = read;
    return found;
}

bool readDecimal(const char* text, double& value) {
    if (!text) return false;
    while (isBlank(*text)) ++text;
    if (*text == '+' && text[1] != '-') ++text;  // from_chars takes no plus sign
    const char* end = text + std::strlen(text);
    double read = 0;
    auto [rest, error] = std::from_chars(text, end, read);
    if (error != std::errc() || rest == text || !std::isfinite(read)) return false;
    value = read;
    return true;
}

bool equalsIgnoreCase(const wchar_t* a, const wchar_t* b) {
    if (!a || !b) return a == b;
    for (; *a && *b; ++a, ++b)
        if (std::towlower(static_cast<wint_t>(*a)) != std::towlower(static_cast<wint_t>(*b))) return false;
    return *a == *b;
}

bool equalsIgnoreCaseAscii(const char* a, const char* b) {
    if (!a || !b) return a == b;
    auto lower = [](unsigned char c) { return (c >= 'A' && c <= 'Z') ? c + 32 : c; };
    for (; *a && *b; ++a, ++b)
        if (lower(static_cast<unsigned char>(*a)) != lower(static_cast<unsigned char>(*b))) return false;
    return *a == *b;
}

void ensureUtf8Locale() {
    if (std::setlocale(LC_ALL, "") && std::strcmp(nl_langinfo(CODESET), "UTF-8") == 0) return;
    if (!std::setlocale(LC_ALL, "C.UTF-8")) std::setlocale(LC_ALL, "C");
}

}  // namespace vorlan::os
