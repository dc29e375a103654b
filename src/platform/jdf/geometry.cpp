// Parsing and writing of number lists.
#include "platform/jdf/geometry.h"

#include <cmath>
#include <cstdlib>

#include "platform/jdf/exception.h"

namespace JDF {

JDFNumberList::JDFNumberList(const WString& text, size_t expected) {
    for (const WString& token : vWString(text)) {
        std::string s = token.getUTF8();
        char* end = nullptr;
        double v = std::strtod(s.c_str(), &end);
        if (end == s.c_str() || *end != '\0' || !std::isfinite(v))
            throw JDFException("not a number: \"" + s + "\"");
        values_.push_back(v);
    }
    if (expected && values_.size() != expected)
        throw JDFException("expected " + std::to_string(expected) + " numbers in \"" + text.getUTF8() + "\"");
}

WString JDFNumberList::GetString() const {
    WString out;
    for (size_t i = 0; i < values_.size(); ++i) {
        if (i) out += L' ';
        out += WString::valueOf(values_[i]);
    }
    return out;
}

}  // namespace JDF
