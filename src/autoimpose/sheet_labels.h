// The texts of the sheet labels that auto-imposition prints: a printf-style format (what is
// printed) and a template naming the job fields that fill it, by binding, job kind and delivery.
#pragma once

#include <string>

#include "autoimpose/settings.h"

namespace vorlan::autoimpose {

struct SheetLabelText {
    std::wstring format;       // e.g. L"Job 7 Sheet %d/%s"
    std::string jobTemplate;   // e.g. "SheetCount, Side"
    // A job field gets both texts, or neither when one is empty.
    bool complete() const { return !format.empty() && !jobTemplate.empty(); }
};

// The label texts the settings ask for: the job name, then the sheet number by case, then date
// and time. Reverse delivery counts sheets down from TotalCount, which the template then holds
// as a number.
SheetLabelText sheetLabelText(const AutoImpositionSettings& settings);

}  // namespace vorlan::autoimpose
