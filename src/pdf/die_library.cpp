// Die library reader on expat.
#include "pdf/die_library.h"

#include <expat.h>
#include <strings.h>

#include <climits>
#include <fstream>
#include <iterator>
#include <memory>

#include "platform/os/file_system.h"

namespace {

struct DieLibraryReader {
    std::vector<DieLibraryEntry>& entries;
    int depth = 0;
    bool rootOk = false;
    int section = -1;  // kind of the open Layers (0) or Separations (1) element, -1 outside

    void start(const char* name, const char** attributes) {
        const int d = depth++;
        if (d == 0) {
            rootOk = strcasecmp(name, "AutoDieLibrary") == 0;
        } else if (d == 1 && rootOk) {
            section = strcasecmp(name, "Layers") == 0 ? 0 : strcasecmp(name, "Separations") == 0 ? 1 : -1;
        } else if (d == 2 && section >= 0 &&
                   strcasecmp(name, section == 0 ? "Layer" : "Separation") == 0) {
            DieLibraryEntry entry;
            entry.kind = section;
            const char* entryName = nullptr;
            for (const char** a = attributes; a && a[0]; a += 2) {
                if (strcasecmp(a[0], "Name") == 0 && !entryName) entryName = a[1];
                else if (strcasecmp(a[0], "Locked") == 0) entry.locked = strcasecmp(a[1], "true") == 0;
                else if (strcasecmp(a[0], "Printable") == 0) entry.printable = strcasecmp(a[1], "false") != 0;
            }
            if (!entryName || !*entryName) return;
            entry.name = entryName;
            entries.push_back(std::move(entry));
        }
    }
    void end() {
        if (--depth == 1) section = -1;
    }
};

void XMLCALL onStart(void* user, const XML_Char* name, const XML_Char** attributes) {
    static_cast<DieLibraryReader*>(user)->start(name, attributes);
}
void XMLCALL onEnd(void* user, const XML_Char*) { static_cast<DieLibraryReader*>(user)->end(); }

}  // namespace

bool parseDieLibrary(const std::string& text, std::vector<DieLibraryEntry>& entries) {
    if (text.size() > static_cast<size_t>(INT_MAX)) return false;
    std::unique_ptr<XML_ParserStruct, void (*)(XML_Parser)> parser(XML_ParserCreate(nullptr), XML_ParserFree);
    if (!parser) return false;
    std::vector<DieLibraryEntry> found;
    DieLibraryReader reader{found};
    XML_SetUserData(parser.get(), &reader);
    XML_SetElementHandler(parser.get(), onStart, onEnd);
    if (XML_Parse(parser.get(), text.data(), static_cast<int>(text.size()), XML_TRUE) == XML_STATUS_ERROR)
        return false;
    entries.insert(entries.end(), found.begin(), found.end());
    return true;
}

bool loadDieLibrary(const std::string& path, std::vector<DieLibraryEntry>& entries) {
    std::ifstream in(path, std::ios::binary);
    if (!in) return false;
    std::string text((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
    return parseDieLibrary(text, entries);
}

std::string dieLibraryPath() {
    return (vorlan::os::homeFolder() / "DieLib" / "AutoDieLib.xml").string();
}

bool isDieSeparation(const std::vector<DieLibraryEntry>& entries, const std::string& ink) {
    for (const DieLibraryEntry& e : entries)
        if (e.kind == 1 && e.name == ink) return true;
    return false;
}
