// The die library: the separation and layer names that form die lines, kept in the file
// "DieLib/AutoDieLib.xml" of the home folder (root element AutoDieLibrary).
#pragma once

#include <string>
#include <vector>

struct DieLibraryEntry {
    std::string name;       // Name (UTF-8 bytes as written)
    int kind = 0;           // 0 Layer, 1 Separation
    bool locked = false;    // Locked is "true" (any case)
    bool printable = true;  // false only for Printable "false" (any case)
};

// The library as read: where it came from, its text and its entries in document order.
struct DieLibrary {
    std::string path;
    std::string text;
    std::vector<DieLibraryEntry> entries;
};

// Reads the library's entries from text with the XML document tree. False when the text is not
// well-formed XML; a root other than AutoDieLibrary gives true with no entries. Only Layer
// children of Layers and Separation children of Separations count (names ignoring case);
// elements without a Name, or with an empty one, make no entry.
bool parseDieLibrary(DieLibrary& library, const std::string& text);
// Reads the file whole and parses it; false when it cannot be read or parsed.
bool loadDieLibrary(DieLibrary& library, const std::string& path);
// Appends to result each of the wanted entries that the library holds with the same name
// (byte for byte) and kind, in the order of wanted, repeats kept. True when any was appended.
bool matchDieLibrary(const DieLibrary& library, const std::vector<DieLibraryEntry>& wanted,
                     std::vector<DieLibraryEntry>& result);

// The library's file: <home folder>/DieLib/AutoDieLib.xml (home: $VORLAN_HOME or the program's folder).
std::string dieLibraryPath();
// The inks of a list that the library holds as separations (die inks), in list order, repeats kept.
std::vector<std::string> dieSeparations(const DieLibrary& library, const std::vector<std::string>& inks);
