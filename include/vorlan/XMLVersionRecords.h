// Records read from a version description (root OptionalContentGroupData).
// Owned by the worker; texts are C-allocated wide strings freed with free().
#pragma once

#include <cstdint>
#include <cwchar>
#include <vector>

#include "vorlan_export.h"

struct XMLContentObjectData {
    int32_t index = 0;
    std::vector<wchar_t*> layerNameOn;
    std::vector<wchar_t*> layerNameOff;
    std::vector<wchar_t*> sepNameOn;
    std::vector<wchar_t*> sepNameOff;

    XMLContentObjectData() = default;
    ~XMLContentObjectData();
    XMLContentObjectData(const XMLContentObjectData&) = delete;
    XMLContentObjectData& operator=(const XMLContentObjectData&) = delete;
};

struct XMLSurfaceData {
    int32_t index = 0;
    int32_t pageIndex = 0;
    std::vector<XMLContentObjectData*> contentObjects;  // owned

    XMLSurfaceData() = default;
    ~XMLSurfaceData();
    XMLSurfaceData(const XMLSurfaceData&) = delete;
    XMLSurfaceData& operator=(const XMLSurfaceData&) = delete;
};

struct XMLVersionData {
    wchar_t* name = nullptr;
    int32_t position = 0;
    int64_t copies = 0;
    bool enabled = false;
    std::vector<XMLSurfaceData*> surfaces;  // owned

    XMLVersionData() = default;
    ~XMLVersionData();
    XMLVersionData(const XMLVersionData&) = delete;
    XMLVersionData& operator=(const XMLVersionData&) = delete;
};

// The optional-content groups of one PDF. OCG-name and display-name lists of one kind are parallel.
struct XMLLayerData {
    std::vector<wchar_t*> sepOCGNames;
    std::vector<wchar_t*> sepDisplayNames;
    std::vector<wchar_t*> layerOCGNames;
    std::vector<wchar_t*> layerDisplayNames;
    std::vector<wchar_t*> nestedSepOCGNames;
    std::vector<wchar_t*> nestedLayerOCGNames;
    std::vector<wchar_t*> defaultOnOCGNames;
    std::vector<wchar_t*> defaultOffOCGNames;

    XMLLayerData() = default;
    ~XMLLayerData();
    XMLLayerData(const XMLLayerData&) = delete;
    XMLLayerData& operator=(const XMLLayerData&) = delete;
};
