// Wide text: UTF-8 conversion, tokens, number formatting.
#include "platform/jdf/wstring.h"

#include <charconv>
#include <cstdio>
#include <cstring>

#include "platform/os/text.h"

namespace JDF {

WString::WString(const char* utf8)
    : std::wstring(utf8 ? vorlan::os::fromUtf8(utf8, std::strlen(utf8)) : std::wstring()) {}
WString::WString(const std::string& utf8) : std::wstring(vorlan::os::fromUtf8(utf8)) {}

std::string WString::getUTF8() const { return vorlan::os::toUtf8(*this); }

vWString WString::Tokenize(const WString& separators) const {
    return vWString(*this, separators);
}

bool WString::HasToken(const WString& token, const WString& separators) const {
    return Tokenize(separators).contains(token);
}

WString WString::valueOf(int value) { return WString(std::to_wstring(value)); }
WString WString::valueOf(unsigned int value) { return WString(std::to_wstring(value)); }
WString WString::valueOf(long long value) { return WString(std::to_wstring(value)); }

WString WString::valueOf(double value) {
    char buf[64];
    auto res = std::to_chars(buf, buf + sizeof buf, value);
    return WString(std::string(buf, res.ptr));
}

vWString::vWString(const WString& text, const WString& separators) {
    for (std::wstring& token : vorlan::os::splitList<wchar_t>(text, separators)) push_back(WString(std::move(token)));
}

bool vWString::contains(const WString& s) const { return index(s) >= 0; }

int vWString::index(const WString& s) const {
    for (size_t i = 0; i < size(); ++i)
        if ((*this)[i] == s) return static_cast<int>(i);
    return -1;
}

WString vWString::GetString(const WString& sep) const {
    WString out;
    for (size_t i = 0; i < size(); ++i) {
        if (i) out += sep;
        out += (*this)[i];
    }
    return out;
}

void vWString::AppendUnique(const WString& s) {
    if (!contains(s)) push_back(s);
}

}  // namespace JDF
