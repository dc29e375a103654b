// Lists of OCG names (malloc'd wide texts owned by the list), compared ignoring case.
//
// Two names are equal ignoring case when they have the same length and their characters are
// equal after towlower; the folded form below is the key for that equality, so long lists are
// handled with hash look-ups instead of pairwise comparison.
#pragma once

#include <cwchar>
#include <string>
#include <unordered_map>
#include <vector>

namespace vorlan::versions {

// The case-folded key of a name.
std::wstring foldName(const wchar_t* name);

// A multiset of names ignoring case.
class NameCounts {
public:
    NameCounts() = default;
    explicit NameCounts(const std::vector<wchar_t*>& names);

    void add(const wchar_t* name);
    bool contains(const wchar_t* name) const;
    bool empty() const { return counts_.empty(); }

    // Removes and frees, for each counted name, as many of its first occurrences in list as it is
    // counted, keeping the order of the rest. This equals removing, for each counted name in
    // turn, the first remaining equal entry.
    void removeFrom(std::vector<wchar_t*>& list) const;

private:
    std::unordered_map<std::wstring, size_t> counts_;
};

}  // namespace vorlan::versions
