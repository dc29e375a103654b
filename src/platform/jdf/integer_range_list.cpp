// Parsing, expansion and writing of integer range lists.
#include "platform/jdf/integer_range_list.h"

#include <cerrno>
#include <climits>
#include <cstdlib>

#include "platform/jdf/exception.h"

namespace JDF {
namespace {

int parseInt(const WString& token) {
    std::string s = token.getUTF8();
    char* end = nullptr;
    errno = 0;
    long v = std::strtol(s.c_str(), &end, 10);
    if (s.empty() || *end != '\0' || errno == ERANGE || v > INT_MAX || v < INT_MIN)
        throw JDFException("not an integer range list value: \"" + s + "\"");
    return static_cast<int>(v);
}

// Upper bound on expanded values, so that "0 ~ 2000000000" cannot exhaust memory.
constexpr size_t kMaxValues = 10'000'000;

}  // namespace

std::vector<int> JDFIntegerRange::ToVInt(int xDef) const {
    long long from = from_ < 0 ? static_cast<long long>(xDef) + from_ : from_;
    long long to = to_ < 0 ? static_cast<long long>(xDef) + to_ : to_;
    std::vector<int> out;
    if (from < 0 || to < 0) return out;
    long long step = from <= to ? 1 : -1;
    for (long long v = from;; v += step) {
        if (out.size() >= kMaxValues) throw JDFException("integer range too large");
        out.push_back(static_cast<int>(v));
        if (v == to) break;
    }
    return out;
}

WString JDFIntegerRange::GetString() const {
    if (from_ == to_) return WString::valueOf(from_);
    return WString(WString::valueOf(from_) + L" ~ " + WString::valueOf(to_));
}

JDFIntegerRangeList::JDFIntegerRangeList(const WString& text) {
    WString spaced;
    for (wchar_t c : text) {
        if (c == L'~') spaced += L" ~ ";
        else spaced += c;
    }
    vWString tokens(spaced);
    for (size_t i = 0; i < tokens.size(); ++i) {
        if (tokens[i] == L"~") throw JDFException("range without start in \"" + text.getUTF8() + "\"");
        int from = parseInt(tokens[i]);
        if (i + 2 < tokens.size() && tokens[i + 1] == L"~") {
            ranges_.emplace_back(from, parseInt(tokens[i + 2]));
            i += 2;
        } else if (i + 1 < tokens.size() && tokens[i + 1] == L"~") {
            throw JDFException("range without end in \"" + text.getUTF8() + "\"");
        } else {
            ranges_.emplace_back(from, from);
        }
    }
}

std::vector<int> JDFIntegerRangeList::ToVInt(int xDef) const {
    std::vector<int> out;
    for (const JDFIntegerRange& r : ranges_) {
        std::vector<int> part = r.ToVInt(xDef);
        if (out.size() + part.size() > kMaxValues) throw JDFException("integer range list too large");
        out.insert(out.end(), part.begin(), part.end());
    }
    return out;
}

bool JDFIntegerRangeList::CountsFromEnd() const {
    for (const JDFIntegerRange& r : ranges_)
        if (r.GetLeft() < 0 || r.GetRight() < 0) return true;
    return false;
}

WString JDFIntegerRangeList::GetString() const {
    WString out;
    for (size_t i = 0; i < ranges_.size(); ++i) {
        if (i) out += L' ';
        out += ranges_[i].GetString();
    }
    return out;
}

}  // namespace JDF
