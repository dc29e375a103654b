// Points, boxes, matrices and clip-path operations: construction, deep copy and release.
#include <cstdlib>

#include "vorlan/LD_Records.h"

LD_Point::~LD_Point() { std::free(text); }

LD_Point::LD_Point(const LD_Point& other) : x(other.x), y(other.y), text(LD_CopyText(other.text)) {}

LD_Point& LD_Point::operator=(const LD_Point& other) {
    if (this != &other) {
        std::free(text);
        x = other.x;
        y = other.y;
        text = LD_CopyText(other.text);
    }
    return *this;
}

LD_Box::~LD_Box() { std::free(text); }

LD_Box::LD_Box(const LD_Box& other)
    : lowerLeft(other.lowerLeft), upperRight(other.upperRight), text(LD_CopyText(other.text)) {}

LD_Box& LD_Box::operator=(const LD_Box& other) {
    if (this != &other) {
        std::free(text);
        lowerLeft = other.lowerLeft;
        upperRight = other.upperRight;
        text = LD_CopyText(other.text);
    }
    return *this;
}

LD_CTM::~LD_CTM() { std::free(text); }

LD_CTM::LD_CTM(const LD_CTM& other)
    : a(other.a), b(other.b), c(other.c), d(other.d), e(other.e), f(other.f), text(LD_CopyText(other.text)) {}

LD_CTM& LD_CTM::operator=(const LD_CTM& other) {
    if (this != &other) {
        std::free(text);
        a = other.a, b = other.b, c = other.c, d = other.d, e = other.e, f = other.f;
        text = LD_CopyText(other.text);
    }
    return *this;
}

LD_ClipPathOperands::~LD_ClipPathOperands() = default;

LD_ClipPathOperations::~LD_ClipPathOperations() { delete operands; }
