#include "jobpaths/separation_names.h"

#include <algorithm>
#include <unordered_set>

#include "platform/os/text.h"

namespace vorlan::jobpaths {

void appendOnce(NameList& list, const wchar_t* name) {
    if (!name) return;
    std::string narrowed = vorlan::os::narrow(name);
    if (std::find(list.begin(), list.end(), narrowed) == list.end()) list.push_back(std::move(narrowed));
}

void appendEachOnce(NameList& list, const std::vector<wchar_t*>& names) {
    for (const wchar_t* name : names) appendOnce(list, name);
}

NameList without(const NameList& list, const NameList& excluded) {
    const std::unordered_set<std::string> drop(excluded.begin(), excluded.end());
    NameList kept;
    for (const std::string& name : list)
        if (!drop.count(name)) kept.push_back(name);
    return kept;
}

}  // namespace vorlan::jobpaths
