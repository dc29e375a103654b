// Attribute values of a version description.
#include "versions/description_text.h"

#include <cstdlib>
#include <cwchar>
#include <new>

#include "platform/os/text.h"
#include "vorlan/LD_JDF.h"

namespace vorlan::versions {

std::wstring attributeText(const _kvXmlNode* node, const char* name) {
    _kvXmlAttribute* attribute = kvXmlFindAttribute(node, name);
    if (!attribute) return std::wstring();
    return vorlan::os::fromUtf8(kvXmlBytes(attribute->value));
}

bool attributeFlag(const _kvXmlNode* node, const char* name) {
    _kvXmlAttribute* attribute = kvXmlFindAttribute(node, name);
    return attribute && kvXmlTextEquals(attribute->value, "true");
}

int32_t attributeNumber(const _kvXmlNode* node, const char* name) {
    return vorlan::os::wtoi(attributeText(node, name).c_str());
}

wchar_t* newTextCopy(const std::wstring& text) {
    auto* copy = static_cast<wchar_t*>(std::malloc((text.size() + 1) * sizeof(wchar_t)));
    if (!copy) throw std::bad_alloc();
    std::wmemcpy(copy, text.c_str(), text.size() + 1);
    return copy;
}

void appendNameList(LD_JDF& worker, const _kvXmlNode* node, const char* name, std::vector<wchar_t*>& list) {
    std::wstring value = attributeText(node, name);
    if (value.empty()) return;
    std::vector<wchar_t*> items;
    const LDError before = worker.lastError;
    worker.lastError = LD_OK;
    worker.parseStringAttributeToStringVector(value.data(), items);
    const bool lost = worker.lastError != LD_OK;                      // an item could not be copied
    worker.lastError = before;
    try {
        list.reserve(list.size() + items.size());
    } catch (...) {
        LD_FreeTextList(items);
        throw;
    }
    for (wchar_t* item : items) {
        if (*item)
            list.push_back(item);
        else
            std::free(item);  // a name made only of blanks
    }
    if (lost) throw std::bad_alloc();
}

}  // namespace vorlan::versions
