// Geometry attribute text (boxes, matrices, points, clip paths) read into the geometry records.
#include "model/geometry_strings.h"

#include <charconv>
#include <cstring>
#include <string>
#include <string_view>

#include "platform/jdf/wstring.h"
#include "platform/os/text.h"
#include "vorlan/LD_JDF.h"

namespace {

// Reads a number the way atof does (leading blanks, optional sign, as many characters as form a
// number, 0 when none), but always with '.' as the decimal point whatever the locale.
double readNumber(std::string_view token) {
    size_t i = 0;
    while (i < token.size() && std::isspace(static_cast<unsigned char>(token[i]))) ++i;
    bool negative = false;
    if (i < token.size() && (token[i] == '+' || token[i] == '-')) negative = token[i++] == '-';
    double value = 0;
    // A second sign ("+-1") is not a number for atof either.
    if (i < token.size() && token[i] != '+' && token[i] != '-')
        std::from_chars(token.data() + i, token.data() + token.size(), value);
    return negative ? -value : value;
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
    forEachToken(text, [&](std::string_view token) {
        double value = readNumber(token);
        if (!haveX) {
            x = value;
            haveX = true;
            return;
        }
        auto* point = new LD_Point;
        point->x = x;
        point->y = value;
        points.push_back(point);
        haveX = false;
    });
}

void parseBox(std::string_view text, LD_Box* box) {
    // Numbers after the fourth cycle through the fields again: the last one of each cycle stays.
    double fields[4] = {};
    size_t count = 0;
    forEachToken(text, [&](std::string_view token) { fields[count++ % 4] = readNumber(token); });
    if (!box || count < 4) return;
    box->lowerLeft.x = fields[0];
    box->lowerLeft.y = fields[1];
    box->upperRight.x = fields[2];
    box->upperRight.y = fields[3];
}

void parseCTM(std::string_view text, LD_CTM* ctm) {
    double n[6] = {};
    size_t count = 0;
    forEachToken(text, [&](std::string_view token) {
        if (count < 6) n[count] = readNumber(token);
        ++count;
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
