// Separation name lists of the separation-variant paths. Names are compared exactly
// (case-sensitive, whole string), unlike the layer-mode lists.
#pragma once

#include <string>
#include <vector>

namespace vorlan::jobpaths {

using NameList = std::vector<std::string>;

// Appends the narrowed name unless the list already holds it; null is ignored.
void appendOnce(NameList& list, const wchar_t* name);
// Appends every name of `names` (narrowed) that the list does not yet hold, in order.
void appendEachOnce(NameList& list, const std::vector<wchar_t*>& names);
// The entries of `list` that `excluded` does not hold, in order (repeats kept).
NameList without(const NameList& list, const NameList& excluded);

}  // namespace vorlan::jobpaths
