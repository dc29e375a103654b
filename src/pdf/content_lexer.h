// A tokenizer for decoded content streams that reports byte ranges instead of building objects:
// content is mostly numbers and operators, and allocating an object per token would dominate
// the cost of walking it.
#pragma once

#include <cstddef>
#include <string>

namespace vorlan::pdf {

struct ContentToken {
    enum Kind { Number, Name, String, Open, Close, Keyword, End, Damaged } kind = End;
    size_t begin = 0;
    size_t end = 0;
};

class ContentLexer {
public:
    explicit ContentLexer(const std::string& bytes) : s_(bytes) {}

    // The next token; End at the end of the content; Damaged for an unterminated string.
    ContentToken next();
    // After an ID operator: skips the inline image's data up to its EI, leaving the lexer before
    // the EI. False when no EI follows.
    bool skipInlineImageData(size_t idEnd);

    size_t position() const { return pos_; }

private:
    const std::string& s_;
    size_t pos_ = 0;
};

bool isContentWhitespace(char c);
bool isContentDelimiter(char c);
// The decoded text of a name token (with its slash, #xx escapes resolved), as qpdf spells names.
std::string decodeName(const std::string& bytes, size_t begin, size_t end);

}  // namespace vorlan::pdf
