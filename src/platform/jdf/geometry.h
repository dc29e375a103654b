// Number-list values of JDF attributes: pairs ("x y"), rectangles ("llx lly urx ury") and
// matrices ("a b c d e f"). Text that does not hold the right count of numbers throws
// JDFException from the text constructors; GetString writes the library's number text.
#pragma once

#include <vector>

#include "platform/jdf/wstring.h"

namespace JDF {

class JDFNumberList {
public:
    JDFNumberList() = default;
    // Parses blank-separated numbers; throws JDFException for a token that is not a number or
    // a count other than expected (0 = any count).
    JDFNumberList(const WString& text, size_t expected);
    explicit JDFNumberList(std::vector<double> values) : values_(std::move(values)) {}
    size_t size() const { return values_.size(); }
    double at(size_t i) const { return i < values_.size() ? values_[i] : 0.0; }
    WString GetString() const;
    bool operator==(const JDFNumberList& o) const { return values_ == o.values_; }

protected:
    std::vector<double> values_;
};

class JDFXYPair : public JDFNumberList {
public:
    JDFXYPair() : JDFNumberList(std::vector<double>{0, 0}) {}
    JDFXYPair(double x, double y) : JDFNumberList(std::vector<double>{x, y}) {}
    explicit JDFXYPair(const WString& text) : JDFNumberList(text, 2) {}
    double GetX() const { return at(0); }
    double GetY() const { return at(1); }
    void SetX(double x) { values_[0] = x; }
    void SetY(double y) { values_[1] = y; }
};

class JDFRectangle : public JDFNumberList {
public:
    JDFRectangle() : JDFNumberList(std::vector<double>{0, 0, 0, 0}) {}
    JDFRectangle(double llx, double lly, double urx, double ury)
        : JDFNumberList(std::vector<double>{llx, lly, urx, ury}) {}
    explicit JDFRectangle(const WString& text) : JDFNumberList(text, 4) {}
    double GetLlx() const { return at(0); }
    double GetLly() const { return at(1); }
    double GetUrx() const { return at(2); }
    double GetUry() const { return at(3); }
};

class JDFMatrix : public JDFNumberList {
public:
    // The identity matrix.
    JDFMatrix() : JDFNumberList(std::vector<double>{1, 0, 0, 1, 0, 0}) {}
    JDFMatrix(double a, double b, double c, double d, double e, double f)
        : JDFNumberList(std::vector<double>{a, b, c, d, e, f}) {}
    explicit JDFMatrix(const WString& text) : JDFNumberList(text, 6) {}
    double GetA() const { return at(0); }
    double GetB() const { return at(1); }
    double GetC() const { return at(2); }
    double GetD() const { return at(3); }
    double GetTx() const { return at(4); }
    double GetTy() const { return at(5); }
};

}  // namespace JDF
