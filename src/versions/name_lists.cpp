// OCG name lists: look-up, removal, and the filtering of nested names.
#include "versions/name_lists.h"

#include <algorithm>
#include <cstdlib>

#include "platform/os/text.h"
#include "vorlan/LD_JDF.h"

namespace vorlan::versions {

bool containsName(const std::vector<wchar_t*>& list, const wchar_t* name) {
    return std::any_of(list.begin(), list.end(),
                       [name](const wchar_t* entry) { return vorlan::os::equalsIgnoreCase(entry, name); });
}

bool removeFirstName(std::vector<wchar_t*>& list, const wchar_t* name) {
    auto found = std::find_if(list.begin(), list.end(),
                              [name](const wchar_t* entry) { return vorlan::os::equalsIgnoreCase(entry, name); });
    if (found == list.end()) return false;
    std::free(*found);
    list.erase(found);
    return true;
}

}  // namespace vorlan::versions

// For each nested name in order, the first equal entry of list goes; later equal entries stay.
void LD_JDF::removeNestedComponentsFromList(std::vector<wchar_t*>& list, std::vector<wchar_t*>& nested) {
    if (&list == &nested) return;
    for (const wchar_t* name : nested) vorlan::versions::removeFirstName(list, name);
}
