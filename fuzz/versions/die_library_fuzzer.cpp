// Fuzzes the die library reader: each input is the library file's text, whose entries are then
// matched against a fixed ink list and against themselves.
#include <cstdint>
#include <string>
#include <vector>

#include "platform/os/text.h"
#include "versions/die_library.h"

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    vorlan::os::ensureUtf8Locale();
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    DieLibrary library;
    if (!parseDieLibrary(library, std::string(reinterpret_cast<const char*>(data), size))) return 0;
    dieSeparations(library, {"Die", "Cut", "Varnish", ""});
    std::vector<DieLibraryEntry> found;
    matchDieLibrary(library, library.entries, found);
    return 0;
}
