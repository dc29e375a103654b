// Wide text of the JDF layer.
// WString is a std::wstring that also converts from and to UTF-8 (the document's own encoding);
// vWString is a list of WStrings, typically the blank-separated tokens of an NMTOKENS attribute.
#pragma once

#include <string>
#include <vector>

namespace JDF {

class vWString;

class WString : public std::wstring {
public:
    WString() = default;
    WString(const wchar_t* text) : std::wstring(text ? text : L"") {}
    WString(std::wstring text) : std::wstring(std::move(text)) {}
    // From UTF-8 text; a null pointer gives the empty text.
    WString(const char* utf8);
    WString(const std::string& utf8);

    // The text as UTF-8.
    std::string getUTF8() const;
    // Splits at any of the separator characters; runs of separators give no empty tokens.
    vWString Tokenize(const WString& separators = L" \t\r\n") const;
    // True when the blank-separated token list contains token exactly.
    bool HasToken(const WString& token, const WString& separators = L" \t\r\n") const;
    // Decimal text of a number.
    static WString valueOf(int value);
    static WString valueOf(unsigned int value);
    static WString valueOf(long long value);
    // Shortest text that reads back as the same double ("612", "0.5", "1e-07").
    static WString valueOf(double value);
};

class vWString : public std::vector<WString> {
public:
    vWString() = default;
    vWString(std::initializer_list<WString> items) : std::vector<WString>(items) {}
    // The tokens of text split at the separator characters (spaces around each are dropped).
    explicit vWString(const WString& text, const WString& separators = L" \t\r\n");

    // True when one entry equals s exactly.
    bool contains(const WString& s) const;
    // Position of the first entry equal to s, or -1.
    int index(const WString& s) const;
    // Entries joined by sep.
    WString GetString(const WString& sep = L" ") const;
    // Appends s unless it is already present.
    void AppendUnique(const WString& s);
};

}  // namespace JDF
