// Operands of clip-path operations: one class per operand shape.
//
// A clip path is written in PDF path syntax; each operator becomes an LD_ClipPathOperations whose
// operands object is one of these (null for closepath). Objects are owned by their operation and
// deleted through the base class; clone() copies the numbers and each point's text anew.
#pragma once

#include <string_view>
#include <vector>

#include "vorlan/LD_Records.h"

// moveto, lineto: one point.
class LD_ClipPathOperandsOnePoint : public LD_ClipPathOperands {
public:
    LD_Point point1;
    ~LD_ClipPathOperandsOnePoint() override = default;
    LD_ClipPathOperands* clone() const override { return new LD_ClipPathOperandsOnePoint(*this); }
};

// v, y: two points.
class LD_ClipPathOperandsTwoPoints : public LD_ClipPathOperandsOnePoint {
public:
    LD_Point point2;
    LD_ClipPathOperands* clone() const override { return new LD_ClipPathOperandsTwoPoints(*this); }
};

// curveto: three points.
class LD_ClipPathOperandsThreePoints : public LD_ClipPathOperandsTwoPoints {
public:
    LD_Point point3;
    LD_ClipPathOperands* clone() const override { return new LD_ClipPathOperandsThreePoints(*this); }
};

// re: a corner point with width and height.
class LD_ClipPathOperandsOnePointWidthHeight : public LD_ClipPathOperandsOnePoint {
public:
    double width = 0;
    double height = 0;
    LD_ClipPathOperands* clone() const override { return new LD_ClipPathOperandsOnePointWidthHeight(*this); }
};

// The geometry parsers on narrow (ASCII / UTF-8) text, for readers that hold the document's own
// bytes; LD_JDF::parseStringAs... narrow their wide text and call these.
namespace vorlan::geometry {
void parsePoints(std::string_view text, std::vector<LD_Point*>& points);
// The first point of the text into point (its text untouched); false when there is none.
bool parseFirstPoint(std::string_view text, LD_Point& point);
void parseBox(std::string_view text, LD_Box* box);
void parseCTM(std::string_view text, LD_CTM* ctm);
bool parseClipPath(std::string_view text, std::vector<LD_ClipPathOperations*>& ops);
}  // namespace vorlan::geometry
