// OCG name lists: case-insensitive counting and removal, and the filtering of nested names.
#include "versions/name_lists.h"

#include <cstdlib>
#include <cwctype>

#include "vorlan/LD_JDF.h"

namespace vorlan::versions {

std::wstring foldName(const wchar_t* name) {
    std::wstring folded = name ? name : L"";
    for (wchar_t& c : folded) c = static_cast<wchar_t>(std::towlower(static_cast<wint_t>(c)));
    return folded;
}

NameCounts::NameCounts(const std::vector<wchar_t*>& names) {
    for (const wchar_t* name : names) add(name);
}

void NameCounts::add(const wchar_t* name) {
    if (name) ++counts_[foldName(name)];
}

bool NameCounts::contains(const wchar_t* name) const { return name && counts_.count(foldName(name)) > 0; }

void NameCounts::removeFrom(std::vector<wchar_t*>& list) const {
    if (counts_.empty() || list.empty()) return;
    // First decide (this may run out of memory, and then nothing has changed), then free.
    std::vector<bool> drop(list.size());
    std::unordered_map<std::wstring, size_t> removed;
    for (size_t i = 0; i < list.size(); ++i) {
        if (!list[i]) continue;
        auto counted = counts_.find(foldName(list[i]));
        if (counted != counts_.end() && removed[counted->first]++ < counted->second) drop[i] = true;
    }
    size_t kept = 0;
    for (size_t i = 0; i < list.size(); ++i) {
        if (drop[i])
            std::free(list[i]);
        else
            list[kept++] = list[i];
    }
    list.resize(kept);
}

}  // namespace vorlan::versions

// For each nested name in order, the first equal entry of list goes; later equal entries stay.
void LD_JDF::removeNestedComponentsFromList(std::vector<wchar_t*>& list, std::vector<wchar_t*>& nested) {
    if (&list == &nested) return;
    vorlan::versions::NameCounts(nested).removeFrom(list);
}
