// Corpus PDFs with spot colours (listed in the corpus manifest, read at test time): conversion
// and both rewriting modes (written together from one reading of the file) succeed, pass qpdf --check when the input does, leave the input
// unchanged, and render as they should.
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
    std::vector<std::string> spots;
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
        if (cells.size() <= std::max(fileColumn, spotColumn) || cells[spotColumn].empty()) continue;
        files.push_back({dir / cells[fileColumn], split(cells[spotColumn], '|')});
    }
    return files;
}

std::map<std::string, long> inked(const std::map<std::string, long>& plates) {
    std::map<std::string, long> out;
    for (auto& [name, pixels] : plates)
        if (pixels > 0) out[name] = pixels;
    return out;
}

}  // namespace

TEST(CorpusConversion, SpotColourFilesConvertAndHideEverythingWhenGroupsAreOff) {
    VORLAN_REQUIRE_CORPUS();
    if (!vorlan::test::haveProgram("pdftoppm")) GTEST_SKIP() << "pdftoppm missing";
    const std::vector<SpotFile> files = spotFiles();
    ASSERT_GE(files.size(), 10u);
    TempDir dir;
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
        const std::string hidden = (dir / "hidden.pdf").string();
        ASSERT_TRUE(vorlan::test::showOnlyGroups(out, hidden, {}));
        EXPECT_EQ(vorlan::test::renderPage(hidden, 1, 20).inked(), 0);
        const std::vector<std::string> all = vorlan::test::allGroups(out);
        const std::string shown = (dir / "shown.pdf").string();
        ASSERT_TRUE(vorlan::test::showOnlyGroups(out, shown, all));
        const long original = vorlan::test::renderPage(f.path.string(), 1, 20).inked();
        const long converted = vorlan::test::renderPage(shown, 1, 20).inked();
        EXPECT_NEAR(converted, original, original / 50 + 2);
    }
}

TEST(CorpusRewrite, SpotColourFilesDropAndKeepTheirFirstSpot) {
    VORLAN_REQUIRE_CORPUS();
    if (!vorlan::test::haveProgram("gs")) GTEST_SKIP() << "gs missing";
    TempDir dir;
    for (const SpotFile& f : spotFiles()) {
        SCOPED_TRACE(f.path.filename().string());
        const std::string spot = f.spots.front();
        const std::string drop = (dir / "drop.pdf").string(), keep = (dir / "keep.pdf").string();
        // Both variants from one reading of the file, as jobs write them.
        const std::vector<int> written =
            vorlan::pdf::rewriteSeparationVariants(nullptr, f.path.c_str(), {{drop, {spot}, false}, {keep, {spot}, true}});
        ASSERT_EQ(written, (std::vector<int>{0, 0}));
        if (vorlan::test::qpdfCheckPasses(f.path.string())) {
            EXPECT_TRUE(vorlan::test::qpdfCheckPasses(drop));
            EXPECT_TRUE(vorlan::test::qpdfCheckPasses(keep));
        }
        auto original = inked(vorlan::test::platePixels(f.path.string(), 1));
        auto dropped = inked(vorlan::test::platePixels(drop, 1));
        auto kept = inked(vorlan::test::platePixels(keep, 1));
        EXPECT_EQ(dropped.count(spot), 0u);
        for (auto& [name, pixels] : kept) {
            EXPECT_EQ(name, spot) << "only the kept spot prints";
        }
        original.erase(spot);
        for (auto& [name, pixels] : original) {
            EXPECT_NEAR(dropped[name], pixels, pixels / 50 + 2) << name;
        }
    }
}
