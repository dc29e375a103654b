// Attribute maps: filters for child look-ups and part maps of partitioned resources.
#pragma once

#include <map>

#include "platform/jdf/wstring.h"

namespace JDF {

class JDFAttributeMap : public std::map<WString, WString> {
public:
    JDFAttributeMap() = default;
    JDFAttributeMap(const WString& key, const WString& value) { (*this)[key] = value; }
};

using mAttribute = JDFAttributeMap;

}  // namespace JDF
