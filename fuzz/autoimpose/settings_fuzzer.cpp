// Fuzzes the auto-impose settings file: each input is read as the settings, then the policies and
// the sheet-label texts are derived from what was read.
#include <cstdint>

#include "autoimpose/settings.h"
#include "autoimpose/sheet_labels.h"
#include "platform/os/text.h"
#include "scratch_file.h"

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    vorlan::os::ensureUtf8Locale();
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    static const vorlan::fuzz::ScratchFile settingsFile("vorlan-settings-fuzz");
    if (!settingsFile.write(data, size)) return 0;

    vorlan::autoimpose::AutoImpositionSettings settings;
    settings.settingsPath = settingsFile.path();
    vorlan::autoimpose::readAutoImpositionSettings(settings);
    vorlan::autoimpose::deriveImpositionPolicies(settings);
    vorlan::autoimpose::sheetLabelText(settings);
    return 0;
}
