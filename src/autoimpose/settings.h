// Auto-impose settings: the file that drives one auto-imposition, and the values derived from it.
//
// The settings file is XML with the root AutoImposeSettings; element and attribute names compare
// ignoring case. Integers are read as leading decimal integers and decimals as leading decimal
// numbers: a value that does not start with a number leaves its field as it was. A file that
// cannot be read or parsed, or has another root, leaves every field at its default.
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <utility>
#include <vector>

namespace vorlan::autoimpose {

// The most sheet ranges a settings file may ask for; a larger Count keeps the first ones.
inline constexpr int32_t kMaxSheetRanges = 100000;

struct AutoImpositionSettings {
    std::string settingsPath;
    std::string jdfPath;  // the ticket, rewritten in place
    // Layout/Binding
    int32_t row = 1;
    int32_t col = 1;
    int32_t MaxStackDepth = 1;
    int32_t BindingType = 6;
    // Layout
    std::map<int32_t, std::pair<double, double>> FinishSize;  // by ord
    std::pair<double, double> BleedSize{0, 0};
    int32_t RotationPolicy = 0;
    int32_t isDuplex = 0;
    bool ImpositionMode = false;
    int32_t SizePolicy = 0;
    // Layout/SheetLabels
    bool DateAndTimePrint = false;
    bool JobNamePrint = false;
    bool SurfaceNumberPrint = false;
    std::wstring JobNameString;
    // JobTypePDL: pdl 4 is a variable-data job
    int32_t pdl = 3;
    int32_t jobnum = 0;
    // Derived by deriveImpositionPolicies: the FitPolicy values written into the ticket.
    int32_t rotatePolicy = 1;
    int32_t sizePolicy = 0;
    // RangeInfo
    int32_t RangeType = 0;
    int32_t Count = 0;
    std::vector<std::pair<int32_t, int32_t>> ranges;  // 1-based (start, end), at most kMaxSheetRanges
    int32_t TotalCount = 0;
    // PageDeliveryInfo
    std::string PageDelivery;

    bool variableData() const { return pdl == 4; }
    bool reverseDelivery() const { return PageDelivery == "ReverseOrderFaceUp"; }
};

// Reads settings.settingsPath into settings (see above). A FinishSize or BleedSize whose x or y
// is present but not a number is skipped, keeping the earlier pair. A RangeInfo with a non-zero
// Count gets Count zeroed (start, end) pairs, none for a negative Count; the StartIndex and
// EndIndex attributes of its Range children fill them one value per attribute in document order.
void readAutoImpositionSettings(AutoImpositionSettings& settings);

// rotatePolicy from RotationPolicy (0 → 1, 1 → 3, 2 → 4, else 1) and sizePolicy from SizePolicy
// (1 without ImpositionMode, 5 and 7 → 3; 6 and 8 → 1; else 0).
void deriveImpositionPolicies(AutoImpositionSettings& settings);

}  // namespace vorlan::autoimpose
