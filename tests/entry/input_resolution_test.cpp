// Classification of the job's data path and the path helpers.
#include <cstdlib>
#include <filesystem>

#include <gtest/gtest.h>

#include "platform/os/text.h"
#include "test_support.h"
#include "vorlan/LD_JDF.h"

namespace fs = std::filesystem;
using vorlan::test::TempDir;
using vorlan::test::writeFile;

namespace {

struct Classified {
    InputDataFileTypes kind;
    std::wstring path;
    LDError lastError;
};

Classified classify(const std::string& dataFile) {
    LD_JDF worker;
    std::vector<wchar_t> out(dataFile.size() + 1, L'\0');
    InputDataFileTypes kind = worker.analizeDataFile(dataFile.c_str(), out.data());
    return {kind, out.data(), worker.JDF_GetLastErrorCode()};
}

std::wstring wide(const fs::path& p) { return vorlan::os::widen(p.c_str()); }

}  // namespace

// A data file resolves to its folder or is a PDF by content, whatever its name; a zero byte before
// the marker, or a marker past the first 300 bytes, makes no PDF.
TEST(DataPathClassification, KindAndResolvedPath) {
    const struct {
        const char* written;  // written first: a folder when bytes is empty, else a file
        std::string bytes;
        const char* dataFile;
        InputDataFileTypes kind;
        const char* resolved;  // checked when set
    } cases[] = {
        {"job1D0001", "", "job1.0001", INPUT_FOLDER, "job1D0001"},
        {"artwork.bin", vorlan::test::minimalPdf(), "artwork.bin", INPUT_PDF, "artwork.bin"},
        {"dataDpdfX", "junk %PDF-1.4 later", "data.pdfX", INPUT_PDF, "dataDpdfX"},
        {nullptr, "", "nothing.0001", INPUT_MISSING, nullptr},
        {"textD0001", "just text", "text.0001", INPUT_UNKNOWN, nullptr},
        {"nulD0001", std::string("ab\0cd%PDF-1.4", 13), "nul.0001", INPUT_UNKNOWN, nullptr},
        {"lateD0001", std::string(300, ' ') + "%PDF-1.4", "late.0001", INPUT_UNKNOWN, nullptr},
    };
    for (const auto& c : cases) {
        TempDir dir;
        if (c.bytes.empty() && c.written) fs::create_directory(dir / c.written);
        else if (c.written) writeFile(dir / c.written, c.bytes);
        Classified got = classify((dir / c.dataFile).string());
        EXPECT_EQ(got.kind, c.kind) << c.dataFile;
        if (c.resolved) {
            EXPECT_EQ(got.path, wide(dir / c.resolved)) << c.dataFile;
        }
        if (c.kind == INPUT_UNKNOWN) {
            EXPECT_EQ(got.lastError, LD_FILE_NOT_FOUND) << c.dataFile;
        }
    }
}

TEST(DataPathClassification, ShortPathsAreNeverWrittenBeforeTheirStart) {
    LD_JDF worker;
    for (const char* shortPath : {"", "a", "ab.c", "abcd"}) {
        wchar_t* resolved = worker.resolveDataFilePath(shortPath);
        ASSERT_NE(resolved, nullptr);
        EXPECT_EQ(std::wstring(resolved), vorlan::os::widen(shortPath));
        std::free(resolved);
    }
    wchar_t* five = worker.resolveDataFilePath("a.pdf");
    EXPECT_EQ(std::wstring(five), L"D.pdf");
    std::free(five);
}

TEST(PathHelpers, ExtensionIsTheLastThreeCharactersIgnoringCase) {
    LD_JDF worker;
    char jdf[] = "jdf";
    EXPECT_TRUE(worker.checkExtention("ticket.JDF", jdf));
    EXPECT_TRUE(worker.checkExtention("xjdf", jdf));  // no dot needed
    EXPECT_FALSE(worker.checkExtention("jd", jdf));
    EXPECT_FALSE(worker.checkExtention(nullptr, jdf));
    EXPECT_FALSE(worker.checkExtention("ticket.jdf.bak", jdf));
}

TEST(PathHelpers, FileNameAfterEitherSeparator) {
    LD_JDF worker;
    for (auto [path, name] : {std::pair{"C:\\jobs\\a b.pdf", "a b.pdf"}, std::pair{"file:///tmp/x/Page%201.pdf",
                                                                                   "Page%201.pdf"},
                              std::pair{"plain.pdf", "plain.pdf"}, std::pair{"ends/", ""}}) {
        char* got = worker.extractFileNameFromPath(path);
        EXPECT_STREQ(got, name);
        std::free(got);
    }
    EXPECT_EQ(worker.extractFileNameFromPath(nullptr), nullptr);
    EXPECT_EQ(worker.JDF_GetLastErrorCode(), LD_INVALID_INPUT);
}

TEST(PathHelpers, NativeFilePathHasThreeSlashes) {
    LD_JDF worker;
    wchar_t posix[] = L"/tmp/a.pdf";
    wchar_t windows[] = L"C:\\jobs\\a.pdf";
    wchar_t* a = worker.getNativeFilePath(posix);
    wchar_t* b = worker.getNativeFilePath(windows);
    EXPECT_EQ(std::wstring(a), L"file:///tmp/a.pdf");
    EXPECT_EQ(std::wstring(b), L"file:///C:/jobs/a.pdf");
    std::free(a);
    std::free(b);
    wchar_t relative[] = L"out/./b.pdf";
    wchar_t* c = worker.getNativeFilePath(relative);
    EXPECT_EQ(std::wstring(c), L"file://" + vorlan::os::widen((fs::current_path() / "out" / "b.pdf").c_str()));
    std::free(c);
    EXPECT_EQ(worker.getNativeFilePath(nullptr), nullptr);
    EXPECT_EQ(worker.JDF_GetLastErrorCode(), LD_FAILED);
}

TEST(PathHelpers, NarrowAndWideRoundTripNonAscii) {
    vorlan::os::ensureUtf8Locale();
    const wchar_t* text = L"Stra\u00dfe \u65e5\u672c.pdf";
    char* narrowText = LD_JDF::getCharFromWChar(text);
    ASSERT_NE(narrowText, nullptr);
    wchar_t* back = LD_JDF::getWCharFromChar(narrowText);
    EXPECT_EQ(std::wstring(back), std::wstring(text));
    std::free(narrowText);
    std::free(back);
}
