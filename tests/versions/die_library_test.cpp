// The die library read with the document tree, and the lookup of die separations in it.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "versions/die_library.h"

namespace {

// "kind:name" per entry, with "!" for locked and "-" for not printable.
std::string entriesOf(const DieLibrary& library) {
    std::string text;
    for (const DieLibraryEntry& e : library.entries)
        text += std::to_string(e.kind) + ":" + e.name + (e.locked ? "!" : "") + (e.printable ? "" : "-") + " ";
    return text;
}

}  // namespace

TEST(DieLibrary, ReadsSectionsOfTheRootOnly) {
    const struct {
        const char* text;
        bool ok;
        const char* entries;
    } cases[] = {
        {"<autodielibrary><LAYERS><layer name='L' LOCKED='True'/></LAYERS>"
         "<Separations><Separation Name='Die' Printable='FALSE'/><Separation/><Separation Name=''/>"
         "<Layer Name='misplaced'/><Separation Name='Cr&amp;ease' Printable='no'/></Separations></autodielibrary>",
         true, "0:L! 1:Die- 1:Cr&ease "},
        {"<AutoDieLibrary><Other><Separations><Separation Name='Deep'/></Separations></Other></AutoDieLibrary>", true, ""},
        {"<OtherRoot><Separations><Separation Name='Die'/></Separations></OtherRoot>", true, ""},
        {"<AutoDieLibrary><Separations><Separation Name='Die'>", false, ""},
        {"", true, ""},
    };
    for (const auto& c : cases) {
        DieLibrary library;
        EXPECT_EQ(parseDieLibrary(library, c.text), c.ok) << c.text;
        EXPECT_EQ(entriesOf(library), c.entries) << c.text;
    }
}

TEST(DieLibrary, MatchesNameBytesAndKindKeepingOrderAndRepeats) {
    DieLibrary library;
    ASSERT_TRUE(parseDieLibrary(library, "<AutoDieLibrary><Layers><Layer Name='Gold'/></Layers><Separations>"
                                         "<Separation Name='Die'/><Separation Name='Cr\xC3\xA9" "ase'/></Separations>"
                                         "</AutoDieLibrary>"));
    EXPECT_EQ(dieSeparations(library, {"Gold", "Die", "die", "Cr\xC3\xA9" "ase", "Die", "Crease"}),
              (std::vector<std::string>{"Die", "Cr\xC3\xA9" "ase", "Die"}));
    std::vector<DieLibraryEntry> found;
    EXPECT_TRUE(matchDieLibrary(library, {{"Gold", 0}, {"Gold", 1}}, found));
    ASSERT_EQ(found.size(), 1u);
    EXPECT_EQ(found[0].kind, 0);
    EXPECT_FALSE(matchDieLibrary(library, {{"Silver", 1}}, found));
    DieLibrary missing;
    EXPECT_FALSE(loadDieLibrary(missing, "/nonexistent/DieLib/AutoDieLib.xml"));
}
