// Media getters with the enumeration defaults.
#include "platform/jdf/media.h"

#include <cstdlib>

#include "platform/jdf/enum_tables.h"
#include "platform/jdf/exception.h"

namespace JDF {

int JDFAutoMedia::GetMediaType() const { return Tables::Number(Tables::MediaType, GetAttribute(L"MediaType")); }

void JDFAutoMedia::SetMediaType(int type) { SetEnumAttribute(L"MediaType", type, Tables::MediaType, true); }

JDFXYPair JDFAutoMedia::GetDimension() const {
    try {
        return JDFXYPair(GetAttribute(L"Dimension"));
    } catch (const JDFException&) {
        return JDFXYPair();
    }
}

int JDFAutoMedia::GetGrainDirection() const {
    return Tables::Number(Tables::GrainDirection, GetAttribute(L"GrainDirection"));
}

int JDFAutoMedia::GetMediaUnit() const {
    if (!HasAttribute(L"MediaUnit")) return 3;
    return Tables::Number(Tables::MediaUnit, GetAttribute(L"MediaUnit"));
}

double JDFAutoMedia::number(const WString& key) const {
    std::string v = GetAttribute(key).getUTF8();
    char* end = nullptr;
    double d = std::strtod(v.c_str(), &end);
    return end == v.c_str() ? 0.0 : d;
}

}  // namespace JDF
