// The die library read with the XML document tree.
#include "versions/die_library.h"

#include <fstream>
#include <iterator>
#include <set>
#include <utility>

#include "platform/os/file_system.h"
#include "versions/xml_tree.h"

namespace {

bool flagIs(const _kvXmlNode* node, const char* attribute, const char* value) {
    _kvXmlAttribute* found = kvXmlFindAttribute(node, attribute);
    return found && kvXmlTextEquals(found->value, value);
}

// One entry per child named `element` of a section; nameless children make none.
void readSection(const _kvXmlNode* section, const char* element, int kind, std::vector<DieLibraryEntry>& entries) {
    for (const _kvXmlNode* child = kvXmlFirstChild(section); child; child = kvXmlNextSibling(child)) {
        if (!kvXmlTextEquals(kvXmlName(child), element)) continue;
        _kvXmlAttribute* name = kvXmlFindAttribute(child, "Name");
        if (!name || kvXmlAttributeValue(name)->length == 0) continue;
        DieLibraryEntry entry;
        entry.name = kvXmlBytes(kvXmlAttributeValue(name));
        entry.kind = kind;
        entry.locked = flagIs(child, "Locked", "true");
        entry.printable = !flagIs(child, "Printable", "false");
        entries.push_back(std::move(entry));
    }
}

}  // namespace

bool parseDieLibrary(DieLibrary& library, const std::string& text) {
    KvXmlDocumentPtr document(kvXmlCreateDocument());
    if (!document || !kvXmlFeedBuffer(document.get(), text.data(), text.size())) return false;
    const _kvXmlNode* root = kvXmlRoot(document.get());
    if (!kvXmlTextEquals(kvXmlName(root), "AutoDieLibrary")) return true;
    for (const _kvXmlNode* child = kvXmlFirstChild(root); child; child = kvXmlNextSibling(child)) {
        if (kvXmlTextEquals(kvXmlName(child), "Layers")) readSection(child, "Layer", 0, library.entries);
        else if (kvXmlTextEquals(kvXmlName(child), "Separations")) readSection(child, "Separation", 1, library.entries);
    }
    return true;
}

bool loadDieLibrary(DieLibrary& library, const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    if (!in) return false;
    library.path = path;
    library.text.assign(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
    return !in.bad() && parseDieLibrary(library, library.text);
}

bool matchDieLibrary(const DieLibrary& library, const std::vector<DieLibraryEntry>& wanted,
                     std::vector<DieLibraryEntry>& result) {
    std::set<std::pair<int, std::string>> held;
    for (const DieLibraryEntry& entry : library.entries) held.emplace(entry.kind, entry.name);
    const size_t before = result.size();
    for (const DieLibraryEntry& entry : wanted)
        if (held.count({entry.kind, entry.name})) result.push_back(entry);
    return result.size() > before;
}

std::string dieLibraryPath() {
    return (vorlan::os::homeFolder() / "DieLib" / "AutoDieLib.xml").string();
}

std::vector<std::string> dieSeparations(const DieLibrary& library, const std::vector<std::string>& inks) {
    std::vector<DieLibraryEntry> wanted(inks.size()), found;
    for (size_t i = 0; i < inks.size(); ++i) {
        wanted[i].name = inks[i];
        wanted[i].kind = 1;
    }
    matchDieLibrary(library, wanted, found);
    std::vector<std::string> names;
    names.reserve(found.size());
    for (DieLibraryEntry& entry : found) names.push_back(std::move(entry.name));
    return names;
}
