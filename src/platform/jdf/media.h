// Media resources. Enumeration getters return the token-table numbers: MediaType 12 Paper
// (0 when missing), GrainDirection 0 when missing, MediaUnit 3 (Sheet) when missing.
#pragma once

#include "platform/jdf/geometry.h"
#include "platform/jdf/jdf_resource.h"

namespace JDF {

class JDFAutoMedia : public JDFResource {
public:
    JDFAutoMedia() = default;
    JDFAutoMedia(const KElement& e) : JDFResource(e) {}
    int GetMediaType() const;
    void SetMediaType(int type);  // 0 writes "Unknown"
    // Dimension (inherited); 0 0 when missing or not a pair.
    JDFXYPair GetDimension() const;
    void SetDimension(const JDFXYPair& d) { SetAttribute(L"Dimension", d.GetString()); }
    int GetGrainDirection() const;
    int GetMediaUnit() const;
    double GetThickness() const { return number(L"Thickness"); }
    double GetWeight() const { return number(L"Weight"); }

private:
    double number(const WString& key) const;
};

class JDFMedia : public JDFAutoMedia {
public:
    JDFMedia() = default;
    JDFMedia(const KElement& e) : JDFAutoMedia(e) {}
};

}  // namespace JDF
