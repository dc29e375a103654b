// Finding the ticket and the PDFs a ticket names inside the job's data folder (a %20 name in a
// sub-folder is found end to end in pipeline_test.cpp).
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

std::string found(wchar_t* hit) {
    std::string text = hit ? vorlan::os::narrow(hit) : std::string("<none>");
    std::free(hit);
    return text;
}

std::string byName(const fs::path& folder, const wchar_t* name) {
    LD_JDF worker;
    std::wstring wideFolder = vorlan::os::widen(folder.c_str());
    std::wstring wideName = name;
    return found(worker.findFileByNameInDir(wideFolder.data(), wideName.data()));
}

std::string byExtension(const fs::path& folder, const wchar_t* extension) {
    LD_JDF worker;
    std::wstring wideFolder = vorlan::os::widen(folder.c_str());
    std::wstring wideExtension = extension;
    return found(worker.findFileByExtentionInDir(wideFolder.data(), wideExtension.data()));
}

}  // namespace

TEST(FolderSearch, EarlierSubFolderWinsOverLaterFileAndCaseIsIgnored) {
    TempDir dir;
    writeFile(dir / "a" / "ART.pdf", "x");
    writeFile(dir / "b.pdf", "x");
    writeFile(dir / "art.pdf", "x");  // listed after folder "a"? "a" < "art.pdf" by byte order
    EXPECT_EQ(byName(dir.path(), L"art.PDF"), (dir / "a" / "ART.pdf").string());
}

TEST(FolderSearch, NothingFoundGivesNull) {
    TempDir dir;
    writeFile(dir / "one.pdf", "x");
    EXPECT_EQ(byName(dir.path(), L"two.pdf"), "<none>");
    EXPECT_EQ(byName(dir / "missing", L"one.pdf"), "<none>");
    EXPECT_EQ(byExtension(dir / "missing", L"jdf"), "<none>");
}

TEST(FolderSearch, SymlinkedFoldersAreNotFollowed) {
    TempDir dir;
    writeFile(dir / "real" / "inner.pdf", "x");
    fs::create_directory_symlink(dir.path(), dir / "real" / "loop");  // a loop back to the top
    fs::create_directory_symlink(dir / "real", dir / "alias");
    EXPECT_EQ(byName(dir.path(), L"inner.pdf"), (dir / "real" / "inner.pdf").string());
    EXPECT_EQ(byName(dir.path(), L"nowhere.pdf"), "<none>");  // terminates
}

TEST(FolderSearch, ExtensionSearchIsFlatSortedAndMatchesFolders) {
    TempDir dir;
    writeFile(dir / "sub" / "deep.jdf", "x");
    writeFile(dir / "b.JDF", "x");
    writeFile(dir / "a.xjdf", "x");
    EXPECT_EQ(byExtension(dir.path(), L"jdf"), (dir / "a.xjdf").string());
    TempDir other;
    fs::create_directory(other / "folder.pdf");
    EXPECT_EQ(byExtension(other.path(), L"pdf"), (other / "folder.pdf").string());
    EXPECT_EQ(byExtension(dir / "sub" / "..", L"txt"), "<none>");
}
