// Fuzzes the auto-impose settings file: each input is read as the settings, then the policies and
// the sheet-label texts are derived from what was read.
#include <unistd.h>

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>

#include "autoimpose/settings.h"
#include "autoimpose/sheet_labels.h"
#include "platform/os/text.h"

namespace {

std::string settingsPath;

}  // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    vorlan::os::ensureUtf8Locale();
    char pattern[] = "/tmp/vorlan-settings-fuzz-XXXXXX";
    int fd = mkstemp(pattern);
    if (fd < 0) std::abort();
    close(fd);
    settingsPath = pattern;
    std::atexit([] { std::remove(settingsPath.c_str()); });
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    FILE* file = std::fopen(settingsPath.c_str(), "wb");
    if (!file) return 0;
    std::fwrite(data, 1, size, file);
    std::fclose(file);

    vorlan::autoimpose::AutoImpositionSettings settings;
    settings.settingsPath = settingsPath;
    vorlan::autoimpose::readAutoImpositionSettings(settings);
    vorlan::autoimpose::deriveImpositionPolicies(settings);
    vorlan::autoimpose::sheetLabelText(settings);
    return 0;
}
