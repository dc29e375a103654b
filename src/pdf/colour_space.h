// Colour spaces of page content, resolved once and shared by every element that paints with them.
#pragma once

#include <qpdf/QPDFObjGen.hh>
#include <qpdf/QPDFObjectHandle.hh>

#include <map>
#include <memory>
#include <string>
#include <vector>

namespace vorlan::pdf {

enum class ColourFamily {
    DeviceGray, DeviceRGB, DeviceCMYK, CalGray, CalRGB, Lab, ICCBased,
    Indexed, Pattern, Separation, DeviceN, Unknown
};

// The names the four process inks are reported under.
inline constexpr const char* kProcessInks[4] = {"Cyan", "Magenta", "Yellow", "Black"};

struct ColourSpace;
using ColourSpaceRef = std::shared_ptr<const ColourSpace>;

struct ColourSpace {
    ColourFamily family = ColourFamily::Unknown;
    // Separation: its one colorant; DeviceN/NChannel: its colorant names in order (names as
    // decoded, without the leading slash, "None" included).
    std::vector<std::string> colorants;
    bool nChannel = false;        // a DeviceN whose attributes say /Subtype /NChannel
    int components = 0;           // 0 when unknown (Pattern without base)
    ColourSpaceRef base;          // Indexed base, or the underlying space of an uncoloured Pattern
    QPDFObjectHandle object;      // the name or array the space was resolved from (for editing)
    // The inks this space marks: process inks for device-like spaces, the colorants of
    // Separation/DeviceN without "None" and "All", the base's inks for Indexed/Pattern.
    std::vector<std::string> inks;
};

// The device space a name stands for ("/DeviceGray", "/G", ...); null for other names.
ColourSpaceRef deviceColourSpace(const std::string& name);

// Resolves colour spaces against one resource dictionary, caching by name; indirect colour-space
// objects are cached document-wide through the shared cache. Never throws: malformed input gives
// a space of family Unknown with no inks.
class ColourSpaceResolver {
public:
    // Document-wide: indirect colour-space objects, and names of indirect resource dictionaries
    // (shared by many pages), resolved once.
    struct SharedCache {
        std::map<QPDFObjGen, ColourSpaceRef> objects;
        std::map<std::pair<QPDFObjGen, std::string>, ColourSpaceRef> names;
    };

    ColourSpaceResolver(QPDFObjectHandle resources, SharedCache* shared)
        : resources_(std::move(resources)), shared_(shared) {}

    // A colour-space operand of cs/CS (a name: device or resource).
    ColourSpaceRef byName(const std::string& name);
    // A colour-space object as found in an image, shading or inline image dictionary.
    ColourSpaceRef byObject(QPDFObjectHandle object);

    QPDFObjectHandle resources() const { return resources_; }

private:
    ColourSpaceRef resource(const std::string& name, int depth);
    ColourSpaceRef resolve(QPDFObjectHandle object, int depth);
    ColourSpaceRef resolveArray(QPDFObjectHandle array, int depth);

    QPDFObjectHandle resources_;
    SharedCache* shared_;
    std::map<std::string, ColourSpaceRef> byName_;
};

}  // namespace vorlan::pdf
