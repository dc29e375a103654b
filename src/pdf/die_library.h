// The die library: separation and layer names that form die lines ("DieLib/AutoDieLib.xml"
// in the home folder, root element AutoDieLibrary).
#pragma once

#include <string>
#include <vector>

struct DieLibraryEntry {
    std::string name;       // Name (UTF-8)
    int kind = 0;           // 0 Layer, 1 Separation
    bool locked = false;    // Locked is "true" (any case)
    bool printable = true;  // false only for Printable "false" (any case)
};

// Reads the die library text. False when it is not well-formed XML; a root other than
// AutoDieLibrary gives true with no entries. Elements without a Name make no entry.
bool parseDieLibrary(const std::string& text, std::vector<DieLibraryEntry>& entries);
// Reads and parses the file; false when it cannot be read or parsed.
bool loadDieLibrary(const std::string& path, std::vector<DieLibraryEntry>& entries);
// The library's file: <home folder>/DieLib/AutoDieLib.xml (home: $VORLAN_HOME or the program's folder).
std::string dieLibraryPath();
// True when the library holds a Separation named exactly `ink` (byte for byte).
bool isDieSeparation(const std::vector<DieLibraryEntry>& entries, const std::string& ink);
