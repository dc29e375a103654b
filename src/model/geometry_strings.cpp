// Geometry attribute text (boxes, matrices, points, clip paths) read into the geometry records.
#include "model/geometry_strings.h"

#include <cctype>
#include <charconv>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>
#include <string_view>

#include "platform/jdf/wstring.h"
#include "platform/os/text.h"
#include "vorlan/LD_JDF.h"

namespace {

bool isDigit(char c) { return c >= '0' && c <= '9'; }

// Plain decimals ("841.89", "30") with few digits, the usual geometry text, read exactly without
// the general parser: an integer mantissa below 2^53 divided by a power of ten up to 10^22 is
// one correctly rounded operation, the value the general parser gives. False for anything else
// (exponents, long numbers, no digits), which is left to the general parser.
bool readPlainDecimal(const char* p, const char* end, double& value) {
    static constexpr double kPowers[] = {1e0,  1e1,  1e2,  1e3,  1e4,  1e5,  1e6,  1e7,  1e8,  1e9,  1e10, 1e11,
                                         1e12, 1e13, 1e14, 1e15, 1e16, 1e17, 1e18, 1e19, 1e20, 1e21, 1e22};
    uint64_t mantissa = 0;
    int digits = 0, fraction = 0;
    for (; p < end && isDigit(*p); ++p, ++digits) mantissa = mantissa * 10 + static_cast<uint64_t>(*p - '0');
    if (p < end && *p == '.') {
        for (++p; p < end && isDigit(*p); ++p, ++digits, ++fraction)
            mantissa = mantissa * 10 + static_cast<uint64_t>(*p - '0');
    }
    if (digits == 0 || digits > 15 || fraction > 22) return false;
    if (p < end && (*p == 'e' || *p == 'E')) return false;
    value = static_cast<double>(mantissa);
    if (fraction > 0) value /= kPowers[fraction];
    return true;
}

// Reads a number the way atof does (leading blanks, optional sign, as many characters as form a
// number, 0 when none), but always with '.' as the decimal point whatever the locale.
double readNumber(std::string_view token) {
    size_t i = 0;
    auto plain = [](char c) { return isDigit(c) || c == '+' || c == '-' || c == '.'; };
    while (i < token.size() && !plain(token[i]) && std::isspace(static_cast<unsigned char>(token[i]))) ++i;
    bool negative = false;
    if (i < token.size() && (token[i] == '+' || token[i] == '-')) negative = token[i++] == '-';
    double value = 0;
    // A second sign ("+-1") is not a number for atof either.
    if (i < token.size() && token[i] != '+' && token[i] != '-' &&
        !readPlainDecimal(token.data() + i, token.data() + token.size(), value))
        std::from_chars(token.data() + i, token.data() + token.size(), value);
    return negative ? -value : value;
}

// A token that is a plain decimal with an optional sign ("-12.5"), read in one pass up to its
// end (a space or the end of the text): the value readNumber gives, by the same exact rule as
// readPlainDecimal. False, with nothing read, for any other token.
[[gnu::always_inline]] inline bool readPlainToken(const char*& p, const char* end, double& value) {
    static constexpr double kPowers[] = {1e0, 1e1, 1e2, 1e3, 1e4, 1e5, 1e6, 1e7, 1e8, 1e9, 1e10, 1e11, 1e12, 1e13, 1e14, 1e15};
    const char* q = p;
    bool negative = false;
    if (q < end && (*q == '+' || *q == '-')) negative = *q++ == '-';
    uint64_t mantissa = 0;  // wraps harmlessly for long numbers, which are refused below
    const char* first = q;
    for (; q < end && isDigit(*q); ++q) mantissa = mantissa * 10 + static_cast<uint64_t>(*q - '0');
    std::ptrdiff_t digits = q - first, fraction = 0;
    if (q < end && *q == '.') {
        const char* point = ++q;
        for (; q < end && isDigit(*q); ++q) mantissa = mantissa * 10 + static_cast<uint64_t>(*q - '0');
        fraction = q - point;
        digits += fraction;
    }
    if ((q < end && *q != ' ') || digits == 0 || digits > 15) return false;
    value = static_cast<double>(mantissa);
    if (fraction > 0) value /= kPowers[fraction];
    if (negative) value = -value;
    p = q;
    return true;
}

// Calls fn(number) for the number of each token of the text (tokens split at single space
// characters only, as forEachToken has them, each read by readNumber) while fn returns true.
template <typename Fn>
void forEachNumber(std::string_view text, Fn fn) {
    const char* p = text.data();
    const char* end = p + text.size();
    while (p < end) {
        if (*p == ' ') {
            ++p;
            continue;
        }
        double value = 0;
        if (!readPlainToken(p, end, value)) {
            auto* space = static_cast<const char*>(std::memchr(p, ' ', static_cast<size_t>(end - p)));
            const char* tokenEnd = space ? space : end;
            value = readNumber(std::string_view(p, static_cast<size_t>(tokenEnd - p)));
            p = tokenEnd;
        }
        if (!fn(value)) return;
    }
}

// Calls fn for each token of the narrowed text, split at single space characters only.
template <typename Fn>
void forEachToken(std::string_view rest, Fn fn) {
    while (!rest.empty()) {
        size_t space = rest.find(' ');
        std::string_view token = rest.substr(0, space);
        if (!token.empty()) fn(token);
        if (space == std::string_view::npos) break;
        rest.remove_prefix(space + 1);
    }
}

// Operator code of a clip-path token, or -1 for a number. Only the leading characters count.
int clipOperatorOf(std::string_view token) {
    switch (token[0]) {
        case 'm': return CLIP_MOVETO;
        case 'l': return CLIP_LINETO;
        case 'c': return CLIP_CURVETO;
        case 'v': return CLIP_CURVETO_V;
        case 'y': return CLIP_CURVETO_Y;
        case 'h': return CLIP_CLOSEPATH;
        default: return token.size() >= 2 && token[0] == 'r' && token[1] == 'e' ? CLIP_RECTANGLE : -1;
    }
}

size_t operandCountOf(int op) {
    switch (op) {
        case CLIP_MOVETO:
        case CLIP_LINETO: return 2;
        case CLIP_CURVETO: return 6;
        case CLIP_CURVETO_V:
        case CLIP_CURVETO_Y:
        case CLIP_RECTANGLE: return 4;
        default: return 0;
    }
}

void setPoint(LD_Point& point, const std::vector<double>& numbers, size_t first) {
    point.x = numbers[first];
    point.y = numbers[first + 1];
}

// The operands object of an operator whose numbers have the right count.
LD_ClipPathOperands* makeOperands(int op, const std::vector<double>& n) {
    switch (op) {
        case CLIP_MOVETO:
        case CLIP_LINETO: {
            auto* o = new LD_ClipPathOperandsOnePoint;
            setPoint(o->point1, n, 0);
            return o;
        }
        case CLIP_CURVETO: {
            auto* o = new LD_ClipPathOperandsThreePoints;
            setPoint(o->point1, n, 0);
            setPoint(o->point2, n, 2);
            setPoint(o->point3, n, 4);
            return o;
        }
        case CLIP_CURVETO_V:
        case CLIP_CURVETO_Y: {
            auto* o = new LD_ClipPathOperandsTwoPoints;
            setPoint(o->point1, n, 0);
            setPoint(o->point2, n, 2);
            return o;
        }
        case CLIP_RECTANGLE: {
            auto* o = new LD_ClipPathOperandsOnePointWidthHeight;
            setPoint(o->point1, n, 0);
            o->width = n[2];
            o->height = n[3];
            return o;
        }
        default: return nullptr;  // closepath
    }
}

}  // namespace

namespace vorlan::geometry {

void parsePoints(std::string_view text, std::vector<LD_Point*>& points) {
    double x = 0;
    bool haveX = false;
    forEachNumber(text, [&](double value) {
        if (!haveX) {
            x = value;
            haveX = true;
            return true;
        }
        auto* point = new LD_Point;
        point->x = x;
        point->y = value;
        points.push_back(point);
        haveX = false;
        return true;
    });
}

bool parseFirstPoint(std::string_view text, LD_Point& point) {
    double numbers[2] = {};
    size_t count = 0;
    forEachNumber(text, [&](double value) {
        numbers[count++] = value;
        return count < 2;  // later tokens do not count
    });
    if (count < 2) return false;
    point.x = numbers[0];
    point.y = numbers[1];
    return true;
}

void parseBox(std::string_view text, LD_Box* box) {
    // Numbers after the fourth cycle through the fields again: the last one of each cycle stays.
    double fields[4] = {};
    size_t count = 0;
    forEachNumber(text, [&](double value) {
        fields[count++ % 4] = value;
        return true;
    });
    if (!box || count < 4) return;
    box->lowerLeft.x = fields[0];
    box->lowerLeft.y = fields[1];
    box->upperRight.x = fields[2];
    box->upperRight.y = fields[3];
}

void parseCTM(std::string_view text, LD_CTM* ctm) {
    double n[6] = {};
    size_t count = 0;
    forEachNumber(text, [&](double value) {
        n[count++] = value;
        return count < 6;  // six numbers make the matrix; more are not read
    });
    if (!ctm || count < 6) return;
    ctm->a = n[0], ctm->b = n[1], ctm->c = n[2], ctm->d = n[3], ctm->e = n[4], ctm->f = n[5];
}

bool parseClipPath(std::string_view text, std::vector<LD_ClipPathOperations*>& ops) {
    bool wellFormed = true;
    std::vector<double> pending;
    forEachToken(text, [&](std::string_view token) {
        int op = clipOperatorOf(token);
        if (op < 0) {
            pending.push_back(readNumber(token));
            return;
        }
        // An operator with the wrong count of numbers is left out: it never reads numbers that
        // are not there, and never takes numbers meant for something else.
        if (pending.size() == operandCountOf(op)) {
            auto* operation = new LD_ClipPathOperations;
            operation->operation = op;
            operation->operands = makeOperands(op, pending);
            ops.push_back(operation);
        } else {
            wellFormed = false;
        }
        pending.clear();
    });
    return wellFormed;
}

}  // namespace vorlan::geometry

// The wide forms narrow the text with the current locale first; geometry text is ASCII.
std::vector<double>* LD_JDF::splitIntoFloatTokensBySpace(const JDF::WString& text) {
    auto* numbers = new std::vector<double>;
    forEachToken(vorlan::os::narrow(text.c_str()), [&](std::string_view token) { numbers->push_back(readNumber(token)); });
    return numbers;
}

void LD_JDF::parseStringAsPoints(const JDF::WString& text, std::vector<LD_Point*>& points) {
    vorlan::geometry::parsePoints(vorlan::os::narrow(text.c_str()), points);
}

void LD_JDF::parseStringAsBox(const JDF::WString& text, LD_Box* box) {
    vorlan::geometry::parseBox(vorlan::os::narrow(text.c_str()), box);
}

void LD_JDF::parseStringAsCTM(const JDF::WString& text, LD_CTM* ctm) {
    vorlan::geometry::parseCTM(vorlan::os::narrow(text.c_str()), ctm);
}

bool LD_JDF::parseStringAsClipPathOperations(const JDF::WString& text, std::vector<LD_ClipPathOperations*>& ops) {
    return vorlan::geometry::parseClipPath(vorlan::os::narrow(text.c_str()), ops);
}

bool LD_JDF::isMarkPresent(const wchar_t* text) {
    if (!text) return false;
    static const wchar_t kWord[] = L"mark";
    size_t length = std::wcslen(text);
    for (size_t start = 0; start + 4 <= length; ++start) {
        size_t k = 0;
        while (k < 4) {
            wchar_t c = text[start + k];
            if (c >= L'A' && c <= L'Z') c = static_cast<wchar_t>(c - L'A' + L'a');
            if (c != kWord[k]) break;
            ++k;
        }
        if (k == 4) return true;
    }
    return false;
}
