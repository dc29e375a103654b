// JDFIntegerRangeList: the IntegerRangeList attribute type ("0 ~ 3 7 9 ~ -1").
// A range is a single value or "from ~ to"; negative values count from the end: with a
// default (length) xDef, -1 stands for xDef - 1. Ranges may run downwards ("5 ~ 2").
#pragma once

#include <vector>

#include "platform/jdf/wstring.h"

namespace JDF {

class JDFIntegerRange {
public:
    JDFIntegerRange() = default;
    JDFIntegerRange(int from, int to) : from_(from), to_(to) {}
    int GetLeft() const { return from_; }
    int GetRight() const { return to_; }
    // The values of the range with negative ends resolved against xDef; empty when an end stays
    // negative.
    std::vector<int> ToVInt(int xDef) const;
    WString GetString() const;

private:
    int from_ = 0, to_ = 0;
};

class JDFIntegerRangeList {
public:
    JDFIntegerRangeList() = default;
    // Parses the attribute text; throws JDFException when it is not a range list.
    explicit JDFIntegerRangeList(const WString& text);

    // Appends a single value / a range.
    void Append(int value) { ranges_.emplace_back(value, value); }
    void Append(int from, int to) { ranges_.emplace_back(from, to); }
    void Append(const JDFIntegerRange& r) { ranges_.push_back(r); }
    // Number of values, with negative ends resolved against the list's default (SetDef, 0).
    int NElements() const { return static_cast<int>(ToVInt(def_).size()); }
    void SetDef(int xDef) { def_ = xDef; }
    // All values in order, negative ends resolved against xDef (ToVInt(1000) of "0 ~ -1" gives
    // 0 … 999).
    std::vector<int> ToVInt(int xDef) const;
    std::vector<int> ToVInt() const { return ToVInt(def_); }
    int NumRanges() const { return static_cast<int>(ranges_.size()); }
    // True when a range end is negative, i.e. counts from the end: the values then depend on
    // the length given to ToVInt.
    bool CountsFromEnd() const;
    const JDFIntegerRange& at(int i) const { return ranges_.at(static_cast<size_t>(i)); }
    bool empty() const { return ranges_.empty(); }
    // "a ~ b c" form; single-value ranges are written as one number.
    WString GetString() const;

private:
    std::vector<JDFIntegerRange> ranges_;
    int def_ = 0;
};

}  // namespace JDF
