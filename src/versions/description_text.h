// Reading attribute values of a version description: texts, flags, numbers and name lists.
//
// Names are compared ignoring ASCII case; the first attribute of a name counts, and an absent
// attribute reads as empty text. Values are decoded from UTF-8 into wide text.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "versions/xml_tree.h"

class LD_JDF;

namespace vorlan::versions {

// The attribute's value as wide text; empty when the node or the attribute is absent.
std::wstring attributeText(const _kvXmlNode* node, const char* name);
// True only for the text "true", ignoring case.
bool attributeFlag(const _kvXmlNode* node, const char* name);
// The value read like _wtoi: 0 when absent or not a number; saturates at the int32 limits.
int32_t attributeNumber(const _kvXmlNode* node, const char* name);

// A new malloc copy of text; throws std::bad_alloc when it cannot be allocated.
wchar_t* newTextCopy(const std::wstring& text);

// Appends the comma-separated names of the attribute to list, each a new malloc block, blanks
// around names removed; empty names are dropped. Throws std::bad_alloc when out of memory.
void appendNameList(LD_JDF& worker, const _kvXmlNode* node, const char* name, std::vector<wchar_t*>& list);

}  // namespace vorlan::versions
