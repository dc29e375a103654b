// Content tokenizer: byte ranges of numbers, names, strings, brackets and operators.
#include "pdf/content_lexer.h"


namespace vorlan::pdf {

namespace {

// Character classes: 1 white space, 2 delimiter.
struct CharClasses {
    unsigned char table[256] = {};
    CharClasses() {
        for (unsigned char c : {' ', '\n', '\r', '\t', '\f', '\0'}) table[c] = 1;
        for (const char* d = "()<>[]{}/%"; *d; ++d) table[static_cast<unsigned char>(*d)] = 2;
    }
};
const CharClasses kClasses;

inline unsigned char charClass(char c) { return kClasses.table[static_cast<unsigned char>(c)]; }

int hexValue(char c) {
    if (c >= '0' && c <= '9') return c - '0';
    if (c >= 'a' && c <= 'f') return c - 'a' + 10;
    if (c >= 'A' && c <= 'F') return c - 'A' + 10;
    return -1;
}

}  // namespace

bool isContentWhitespace(char c) { return charClass(c) == 1; }

bool isContentDelimiter(char c) { return charClass(c) == 2; }

std::string decodeName(const std::string& bytes, size_t begin, size_t end) {
    std::string name = "/";
    name.reserve(end - begin);
    for (size_t i = begin + 1; i < end; ++i) {
        if (bytes[i] == '#' && i + 2 < end) {
            const int hi = hexValue(bytes[i + 1]), lo = hexValue(bytes[i + 2]);
            if (hi >= 0 && lo >= 0) {
                name += static_cast<char>(hi * 16 + lo);
                i += 2;
                continue;
            }
        }
        name += bytes[i];
    }
    return name;
}

ContentToken ContentLexer::next() {
    const size_t n = s_.size();
    for (;;) {
        while (pos_ < n && charClass(s_[pos_]) == 1) ++pos_;
        if (pos_ < n && s_[pos_] == '%') {
            while (pos_ < n && s_[pos_] != '\n' && s_[pos_] != '\r') ++pos_;
            continue;
        }
        break;
    }
    ContentToken t;
    t.begin = pos_;
    if (pos_ >= n) {
        t.kind = ContentToken::End;
        t.end = pos_;
        return t;
    }
    const char c = s_[pos_];
    auto regular = [&] {
        while (pos_ < n && charClass(s_[pos_]) == 0) ++pos_;
    };
    switch (c) {
        case '/':
            ++pos_;
            regular();
            t.kind = ContentToken::Name;
            break;
        case '(': {
            int depth = 0;
            t.kind = ContentToken::Damaged;
            for (; pos_ < n; ++pos_) {
                const char d = s_[pos_];
                if (d == '\\') {
                    ++pos_;
                } else if (d == '(') {
                    ++depth;
                } else if (d == ')' && --depth == 0) {
                    ++pos_;
                    t.kind = ContentToken::String;
                    break;
                }
            }
            break;
        }
        case '<':
            if (pos_ + 1 < n && s_[pos_ + 1] == '<') {
                pos_ += 2;
                t.kind = ContentToken::Open;
            } else {
                const size_t close = s_.find('>', pos_);
                t.kind = close == std::string::npos ? ContentToken::Damaged : ContentToken::String;
                pos_ = close == std::string::npos ? n : close + 1;
            }
            break;
        case '>':
            pos_ += pos_ + 1 < n && s_[pos_ + 1] == '>' ? 2 : 1;
            t.kind = ContentToken::Close;
            break;
        case '[':
        case '{':
            ++pos_;
            t.kind = ContentToken::Open;
            break;
        case ']':
        case '}':
            ++pos_;
            t.kind = ContentToken::Close;
            break;
        case ')':  // stray: an operator nobody knows
            ++pos_;
            t.kind = ContentToken::Keyword;
            break;
        default:
            regular();
            t.kind = (c >= '0' && c <= '9') || c == '+' || c == '-' || c == '.' ? ContentToken::Number
                                                                                : ContentToken::Keyword;
            break;
    }
    t.end = pos_;
    return t;
}

bool ContentLexer::skipInlineImageData(size_t idEnd) {
    // One white-space character follows ID; the data ends at an EI that stands alone.
    const size_t n = s_.size();
    size_t at = idEnd < n ? idEnd + 1 : n;
    while (at + 1 < n) {
        const size_t found = s_.find("EI", at);
        if (found == std::string::npos) break;
        const bool before = found == 0 || isContentWhitespace(s_[found - 1]);
        const bool after = found + 2 >= n || isContentWhitespace(s_[found + 2]) || isContentDelimiter(s_[found + 2]);
        if (before && after) {
            pos_ = found;
            return true;
        }
        at = found + 1;
    }
    pos_ = n;
    return false;
}

}  // namespace vorlan::pdf
