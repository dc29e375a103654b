// Colour-space resolution: names through the resources, arrays by family.
#include "pdf/colour_space.h"

#include <algorithm>
#include <exception>

namespace vorlan::pdf {
namespace {

// Colour spaces nest (Indexed over DeviceN over ...); real files need a handful of levels, a
// loop of references needs a stop.
constexpr int kMaxDepth = 8;

std::vector<std::string> processInks(int components) {
    if (components == 1) return {"Black"};
    return {kProcessInks[0], kProcessInks[1], kProcessInks[2], kProcessInks[3]};
}

ColourSpaceRef makeDevice(ColourFamily family, int components) {
    auto cs = std::make_shared<ColourSpace>();
    cs->family = family;
    cs->components = components;
    cs->inks = processInks(components);
    return cs;
}

ColourSpaceRef unknownSpace() {
    static const ColourSpaceRef unknown = std::make_shared<ColourSpace>();
    return unknown;
}

std::string nameOf(QPDFObjectHandle object) {
    std::string name = object.isName() ? object.getName() : std::string();
    return name.size() > 1 ? name.substr(1) : std::string();
}

void addColorantInks(ColourSpace& cs) {
    for (const std::string& c : cs.colorants) {
        if (c.empty() || c == "None" || c == "All") continue;
        if (std::find(cs.inks.begin(), cs.inks.end(), c) == cs.inks.end()) cs.inks.push_back(c);
    }
}

}  // namespace

ColourSpaceRef deviceColourSpace(const std::string& name) {
    static const ColourSpaceRef gray = makeDevice(ColourFamily::DeviceGray, 1);
    static const ColourSpaceRef rgb = makeDevice(ColourFamily::DeviceRGB, 3);
    static const ColourSpaceRef cmyk = makeDevice(ColourFamily::DeviceCMYK, 4);
    static const ColourSpaceRef pattern = [] {
        auto cs = std::make_shared<ColourSpace>();
        cs->family = ColourFamily::Pattern;
        return cs;
    }();
    if (name == "/DeviceGray" || name == "/G") return gray;
    if (name == "/DeviceRGB" || name == "/RGB") return rgb;
    if (name == "/DeviceCMYK" || name == "/CMYK") return cmyk;
    if (name == "/Pattern") return pattern;
    return nullptr;
}

static bool isAbbreviation(const std::string& name) { return name == "/G" || name == "/RGB" || name == "/CMYK"; }

ColourSpaceRef ColourSpaceResolver::byName(const std::string& name) {
    if (!isAbbreviation(name))
        if (ColourSpaceRef device = deviceColourSpace(name)) return device;
    auto it = byName_.find(name);
    if (it != byName_.end()) return it->second;
    // The dictionary that gives the name its meaning, when it is shared across contents.
    QPDFObjGen owner;
    if (shared_ && resources_.isDictionary()) {
        QPDFObjectHandle spaces = resources_.getKey("/ColorSpace");
        if (spaces.isIndirect()) owner = spaces.getObjGen();
        else if (resources_.isIndirect()) owner = resources_.getObjGen();
    }
    if (owner.isIndirect()) {
        auto known = shared_->names.find({owner, name});
        if (known != shared_->names.end()) {
            byName_.emplace(name, known->second);
            return known->second;
        }
    }
    ColourSpaceRef cs;
    try {
        // /G, /RGB and /CMYK are resource names like any other; only where no such resource
        // exists are they read as the inline-image abbreviations.
        cs = resource(name, 0);
        if (cs->family == ColourFamily::Unknown && isAbbreviation(name)) cs = deviceColourSpace(name);
    } catch (const std::exception&) {
        cs = unknownSpace();
    }
    byName_.emplace(name, cs);
    if (owner.isIndirect()) shared_->names.emplace(std::make_pair(owner, name), cs);
    return cs;
}

ColourSpaceRef ColourSpaceResolver::resource(const std::string& name, int depth) {
    if (!isAbbreviation(name) || depth > 0)
        if (ColourSpaceRef device = deviceColourSpace(name)) return device;
    if (depth > kMaxDepth || !resources_.isDictionary()) return unknownSpace();
    QPDFObjectHandle dict = resources_.getKey("/ColorSpace");
    QPDFObjectHandle entry = dict.isDictionary() ? dict.getKey(name) : QPDFObjectHandle::newNull();
    if (entry.isName()) return resource(entry.getName(), depth + 1);
    return entry.isNull() ? unknownSpace() : resolve(entry, depth + 1);
}

ColourSpaceRef ColourSpaceResolver::byObject(QPDFObjectHandle object) {
    try {
        if (object.isName()) return byName(object.getName());
        return resolve(object, 1);
    } catch (const std::exception&) {
        return unknownSpace();
    }
}

ColourSpaceRef ColourSpaceResolver::resolve(QPDFObjectHandle object, int depth) {
    if (depth > kMaxDepth) return unknownSpace();
    // A name inside a colour-space array should be a device space; resource names are tolerated.
    if (object.isName()) return resource(object.getName(), depth + 1);
    if (!object.isArray()) return unknownSpace();
    const bool indirect = object.isIndirect();
    if (indirect && shared_) {
        auto it = shared_->objects.find(object.getObjGen());
        if (it != shared_->objects.end()) return it->second;
    }
    ColourSpaceRef cs = resolveArray(object, depth);
    if (indirect && shared_) shared_->objects.emplace(object.getObjGen(), cs);
    return cs;
}

ColourSpaceRef ColourSpaceResolver::resolveArray(QPDFObjectHandle array, int depth) {
    const int n = array.getArrayNItems();
    if (n < 1) return unknownSpace();
    const std::string family = array.getArrayItem(0).isName() ? array.getArrayItem(0).getName() : "";
    auto cs = std::make_shared<ColourSpace>();
    cs->object = array;
    if (family == "/Separation" && n >= 2) {
        cs->family = ColourFamily::Separation;
        cs->components = 1;
        cs->colorants.push_back(nameOf(array.getArrayItem(1)));
        addColorantInks(*cs);
    } else if (family == "/DeviceN" && n >= 2) {
        cs->family = ColourFamily::DeviceN;
        QPDFObjectHandle names = array.getArrayItem(1);
        if (names.isArray())
            for (QPDFObjectHandle item : names.aitems()) cs->colorants.push_back(nameOf(item));
        cs->components = static_cast<int>(cs->colorants.size());
        if (n >= 5) {
            QPDFObjectHandle attributes = array.getArrayItem(4);
            cs->nChannel = attributes.isDictionary() &&
                           attributes.getKey("/Subtype").isNameAndEquals("/NChannel");
        }
        addColorantInks(*cs);
    } else if ((family == "/Indexed" || family == "/I") && n >= 2) {
        cs->family = ColourFamily::Indexed;
        cs->components = 1;
        QPDFObjectHandle base = array.getArrayItem(1);
        cs->base = resolve(base, depth + 1);
        cs->inks = cs->base->inks;
    } else if (family == "/Pattern") {
        cs->family = ColourFamily::Pattern;
        if (n >= 2) {
            QPDFObjectHandle base = array.getArrayItem(1);
            cs->base = resolve(base, depth + 1);
            cs->components = cs->base->components;
            cs->inks = cs->base->inks;
        }
    } else if (family == "/ICCBased" && n >= 2) {
        cs->family = ColourFamily::ICCBased;
        QPDFObjectHandle stream = array.getArrayItem(1);
        int components = 0;
        if (stream.isStream()) stream.getDict().getKey("/N").getValueAsInt(components);
        cs->components = components;
        cs->inks = processInks(components);
    } else if (family == "/CalGray") {
        cs->family = ColourFamily::CalGray;
        cs->components = 1;
        cs->inks = processInks(1);
    } else if (family == "/CalRGB" || family == "/Lab") {
        cs->family = family == "/Lab" ? ColourFamily::Lab : ColourFamily::CalRGB;
        cs->components = 3;
        cs->inks = processInks(3);
    } else if (n == 1) {  // [/DeviceCMYK] and the like
        ColourSpaceRef device = deviceColourSpace(family);
        return device ? device : unknownSpace();
    } else {
        return unknownSpace();
    }
    return cs;
}

}  // namespace vorlan::pdf
