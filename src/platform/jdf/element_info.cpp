// Schema-declared attribute and element lists.
#include "platform/jdf/element_info.h"

#include "platform/jdf/enum_tables.h"

namespace JDF {
namespace {

struct Row {
    const wchar_t* name;
    const wchar_t* required;
    const wchar_t* optional;
    const wchar_t* elements;
};

const Row kRows[] = {
#include "platform/jdf/element_info_data.inc"
};

bool isResourceKind(const WString& n) {
    return n == L"Layout" || n == L"RunList" || n == L"FileSpec" || n == L"InterpretingParams" ||
           n == L"RenderingParams" || n == L"DigitalPrintingParams" || n == L"Media";
}

}  // namespace

ElementInfo GetElementInfo(const WString& localName) {
    for (const Row& r : kRows) {
        if (localName != r.name) continue;
        ElementInfo info{r.required, r.optional, r.elements, {}};
        if (isResourceKind(localName)) {
            vWString keys(Tables::PartIDKey, L",");
            keys.erase(keys.begin());  // Unknown
            info.partAttributes = keys.GetString(L",");
        }
        return info;
    }
    return {};
}

}  // namespace JDF
