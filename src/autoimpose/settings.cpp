// Reading the auto-impose settings file with the XML document tree.
#include "autoimpose/settings.h"

#include <algorithm>

#include "platform/os/text.h"
#include "versions/description_text.h"
#include "versions/xml_tree.h"

namespace vorlan::autoimpose {
namespace {

// The value of the first attribute called name (ignoring case), as UTF-8; false when absent.
bool attributeValue(const _kvXmlNode* node, const char* name, std::string& value) {
    const _kvXmlAttribute* attribute = kvXmlFindAttribute(node, name);
    if (!attribute) return false;
    value = kvXmlBytes(attribute->value);
    return true;
}

void readInteger(const _kvXmlNode* node, const char* name, int32_t& field) {
    std::string text;
    if (attributeValue(node, name, text)) os::readLeadingInteger(text.c_str(), field);
}

// An integer flag: true when the number is not 0.
void readFlag(const _kvXmlNode* node, const char* name, bool& field) {
    int32_t number = field ? 1 : 0;
    readInteger(node, name, number);
    field = number != 0;
}

// x and y into pair; false, pair unchanged, when one of them is there but not a number. An absent
// coordinate keeps its value.
bool readPair(const _kvXmlNode* node, std::pair<double, double>& pair) {
    std::pair<double, double> read = pair;
    std::string text;
    if (attributeValue(node, "x", text) && !os::readDecimal(text.c_str(), read.first)) return false;
    if (attributeValue(node, "y", text) && !os::readDecimal(text.c_str(), read.second)) return false;
    pair = read;
    return true;
}

void readLayout(const _kvXmlNode* layout, AutoImpositionSettings& s) {
    readInteger(layout, "isDuplex", s.isDuplex);
    readInteger(layout, "RotationPolicy", s.RotationPolicy);
    readFlag(layout, "ImpositionMode", s.ImpositionMode);
    readInteger(layout, "SizePolicy", s.SizePolicy);
    for (const _kvXmlNode* child = kvXmlFirstChild(layout); child; child = kvXmlNextSibling(child)) {
        if (kvXmlTextEquals(child->name, "Binding")) {
            readInteger(child, "Type", s.BindingType);
            readInteger(child, "row", s.row);
            readInteger(child, "col", s.col);
            readInteger(child, "MaxStackDepth", s.MaxStackDepth);
        } else if (kvXmlTextEquals(child->name, "FinishSize")) {
            std::pair<double, double> size{0, 0};
            int32_t ord = 0;
            readInteger(child, "ord", ord);
            if (readPair(child, size)) s.FinishSize[ord] = size;
        } else if (kvXmlTextEquals(child->name, "BleedSize")) {
            readPair(child, s.BleedSize);
        } else if (kvXmlTextEquals(child->name, "SheetLabels")) {
            readFlag(child, "DateAndTimePrint", s.DateAndTimePrint);
            readFlag(child, "JobNamePrint", s.JobNamePrint);
            readFlag(child, "SurfaceNumberPrint", s.SurfaceNumberPrint);
            if (kvXmlFindAttribute(child, "JobNameString"))
                s.JobNameString = versions::attributeText(child, "JobNameString");
        }
    }
}

void readRangeInfo(const _kvXmlNode* info, AutoImpositionSettings& s) {
    readInteger(info, "Type", s.RangeType);
    readInteger(info, "Count", s.Count);
    readInteger(info, "TotalCount", s.TotalCount);
    if (s.Count == 0) return;
    s.ranges.assign(static_cast<size_t>(std::clamp(s.Count, 0, kMaxSheetRanges)), {0, 0});
    // Every StartIndex or EndIndex attribute takes the next slot, whichever of the two it is.
    size_t slot = 0;
    const size_t slots = s.ranges.size() * 2;
    for (const _kvXmlNode* range = kvXmlFirstChild(info); range && slot < slots; range = kvXmlNextSibling(range)) {
        if (!kvXmlTextEquals(range->name, "Range")) continue;
        for (const _kvXmlAttribute* a = kvXmlFirstAttribute(range); a && slot < slots; a = kvXmlAttributeNext(a)) {
            if (!kvXmlTextEquals(a->name, "StartIndex") && !kvXmlTextEquals(a->name, "EndIndex")) continue;
            auto& pair = s.ranges[slot / 2];
            os::readLeadingInteger(kvXmlBytes(a->value).c_str(), slot % 2 ? pair.second : pair.first);
            ++slot;
        }
    }
}

}  // namespace

void readAutoImpositionSettings(AutoImpositionSettings& s) {
    KvXmlDocumentPtr document(kvXmlCreateDocument());
    if (!document || !kvXmlFeedFile(document.get(), s.settingsPath.c_str())) return;
    const _kvXmlNode* root = kvXmlRoot(document.get());
    if (!root || !kvXmlTextEquals(root->name, "AutoImposeSettings")) return;
    for (const _kvXmlNode* child = kvXmlFirstChild(root); child; child = kvXmlNextSibling(child)) {
        std::string text;
        if (kvXmlTextEquals(child->name, "Layout")) {
            readLayout(child, s);
        } else if (kvXmlTextEquals(child->name, "JobTypePDL")) {
            readInteger(child, "pdl", s.pdl);
            readInteger(child, "jobnum", s.jobnum);
        } else if (kvXmlTextEquals(child->name, "PageDeliveryInfo")) {
            if (attributeValue(child, "PageDelivery", text)) s.PageDelivery = text;
        } else if (kvXmlTextEquals(child->name, "RangeInfo")) {
            readRangeInfo(child, s);
        }
    }
}

void deriveImpositionPolicies(AutoImpositionSettings& s) {
    switch (s.RotationPolicy) {
        case 0: s.rotatePolicy = 1; break;
        case 1: s.rotatePolicy = 3; break;
        case 2: s.rotatePolicy = 4; break;
        default: break;
    }
    if ((s.SizePolicy == 1 && !s.ImpositionMode) || s.SizePolicy == 5 || s.SizePolicy == 7) s.sizePolicy = 3;
    else if (s.SizePolicy == 6 || s.SizePolicy == 8) s.sizePolicy = 1;
}

}  // namespace vorlan::autoimpose
