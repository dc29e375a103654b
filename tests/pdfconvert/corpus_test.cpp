// Corpus PDFs with spot colours (listed in the corpus manifest, read at test time) and the
// encrypted ones (restricted files that open with the empty user password): conversion and both
// rewriting modes (written together from one reading of the file) succeed, pass qpdf --check when
// the input does, keep the input's encryption, leave the input unchanged, and render as they
// should.
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <sstream>

#include "pdf/separation_layers.h"
#include "pdf/separation_rewrite.h"
#include "plates.h"
#include "render.h"
#include "test_support.h"

namespace fs = std::filesystem;
using vorlan::test::TempDir;

namespace {

struct SpotFile {
    fs::path path;
    std::vector<std::string> spots;  // empty for an encrypted file without spot colours
};



std::vector<std::string> split(const std::string& text, char separator) {
    std::vector<std::string> parts;
    std::stringstream in(text);
    for (std::string part; std::getline(in, part, separator);) parts.push_back(part);
    return parts;
}

std::vector<SpotFile> spotFiles() {
    std::vector<SpotFile> files;
    const fs::path dir = vorlan::test::corpusDir() / "pdf";
    std::ifstream manifest(dir / "MANIFEST.tsv");
    std::string line;
    std::getline(manifest, line);
    const std::vector<std::string> header = split(line, '\t');
    size_t fileColumn = 0, spotColumn = 0;
    for (size_t i = 0; i < header.size(); ++i) {
        if (header[i] == "file") fileColumn = i;
        if (header[i] == "spot_colorants") spotColumn = i;
    }
    while (std::getline(manifest, line)) {
        const std::vector<std::string> cells = split(line, '\t');
        if (cells.size() <= std::max(fileColumn, spotColumn)) continue;
        const fs::path path = dir / cells[fileColumn];
        if (!cells[spotColumn].empty()) files.push_back({path, split(cells[spotColumn], '|')});
        else if (vorlan::test::encryptionOf(path.string()).first != 0) files.push_back({path, {}});
    }
    return files;
}


}  // namespace

TEST(CorpusConversion, SpotColourFilesConvertAndHideEverythingWhenGroupsAreOff) {
    VORLAN_REQUIRE_CORPUS();
    if (!vorlan::test::haveProgram("pdftoppm")) GTEST_SKIP() << "pdftoppm missing";
    const std::vector<SpotFile> files = spotFiles();
    ASSERT_GE(files.size(), 10u);
    ASSERT_TRUE(std::any_of(files.begin(), files.end(), [](const SpotFile& f) { return f.spots.empty(); }))
        << "the corpus holds a restricted file";
    TempDir dir;
    int rendered = 0;
    for (const SpotFile& f : files) {
        SCOPED_TRACE(f.path.filename().string());
        const std::string before = vorlan::test::readFile(f.path);
        const std::string out = (dir / "converted.pdf").string();
        std::vector<const char*> seps;
        for (const std::string& s : f.spots) seps.push_back(s.c_str());
        ASSERT_EQ(vorlan::pdf::convertPDF(nullptr, f.path.c_str(), out.c_str(), seps.data(), nullptr,
                                          static_cast<int>(seps.size()), 0), 0);
        EXPECT_EQ(vorlan::test::readFile(f.path), before);
        if (vorlan::test::qpdfCheckPasses(f.path.string())) {
            std::string check;
            EXPECT_TRUE(vorlan::test::qpdfCheckPasses(out, &check)) << check;
        }
        EXPECT_EQ(vorlan::test::encryptionOf(out), vorlan::test::encryptionOf(f.path.string()));
        const vorlan::test::GreyImage original = vorlan::test::renderPage(f.path.string(), 1, 20, false);
        if (original.pixels.empty()) continue;  // a page pdftoppm cannot render (a broken file): nothing to compare
        ++rendered;
        const std::string hidden = (dir / "hidden.pdf").string();
        ASSERT_TRUE(vorlan::test::showOnlyGroups(out, hidden, {}));
        EXPECT_EQ(vorlan::test::renderPage(hidden, 1, 20).inked(), 0);
        const std::vector<std::string> all = vorlan::test::allGroups(out);
        const std::string shown = (dir / "shown.pdf").string();
        ASSERT_TRUE(vorlan::test::showOnlyGroups(out, shown, all));
        const long converted = vorlan::test::renderPage(shown, 1, 20).inked();
        EXPECT_NEAR(converted, original.inked(), original.inked() / 50 + 2);
    }
    EXPECT_GE(rendered, 20) << "too few files pdftoppm can render to compare";
}

TEST(CorpusRewrite, SpotColourFilesDropAndKeepTheirFirstSpot) {
    VORLAN_REQUIRE_CORPUS();
    if (!vorlan::test::haveProgram("gs")) GTEST_SKIP() << "gs missing";
    TempDir dir;
    int compared = 0;
    for (const SpotFile& f : spotFiles()) {
        SCOPED_TRACE(f.path.filename().string());
        const std::string spot = f.spots.empty() ? std::string() : f.spots.front();
        const std::string drop = (dir / "drop.pdf").string(), keep = (dir / "keep.pdf").string();
        // Both variants from one reading of the file, as jobs write them.
        const std::vector<int> written =
            vorlan::pdf::rewriteSeparationVariants(nullptr, f.path.c_str(), {{drop, {spot}, false}, {keep, {spot}, true}});
        ASSERT_EQ(written, (std::vector<int>{0, 0}));
        if (vorlan::test::qpdfCheckPasses(f.path.string())) {
            EXPECT_TRUE(vorlan::test::qpdfCheckPasses(drop));
            EXPECT_TRUE(vorlan::test::qpdfCheckPasses(keep));
        }
        EXPECT_EQ(vorlan::test::encryptionOf(drop), vorlan::test::encryptionOf(f.path.string()));
        EXPECT_EQ(vorlan::test::encryptionOf(keep), vorlan::test::encryptionOf(f.path.string()));
        const auto input = vorlan::test::platePixels(f.path.string(), 1);
        if (input.empty()) continue;  // no page gs can render (a broken page tree): nothing to compare
        ++compared;
        auto original = vorlan::test::inkedPlates(input);
        auto dropped = vorlan::test::inkedPlates(drop, 1);
        auto kept = vorlan::test::inkedPlates(keep, 1);
        EXPECT_EQ(dropped.count(spot), 0u);
        for (auto& [name, pixels] : kept) {
            EXPECT_EQ(name, spot) << "only the kept spot prints";
        }
        original.erase(spot);
        for (auto& [name, pixels] : original) {
            EXPECT_NEAR(dropped[name], pixels, pixels / 50 + 2) << name;
        }
    }
    EXPECT_GE(compared, 20) << "too few files gs can render to compare";
}
