// Lists of OCG names (malloc'd wide texts owned by the list), compared ignoring case.
#pragma once

#include <cwchar>
#include <vector>

namespace vorlan::versions {

// True when list holds name, ignoring case.
bool containsName(const std::vector<wchar_t*>& list, const wchar_t* name);
// Removes and frees the first entry equal to name ignoring case; false when there is none.
bool removeFirstName(std::vector<wchar_t*>& list, const wchar_t* name);

}  // namespace vorlan::versions
