// Entry listing of zipped jobs through the context's file functions.
#include <gtest/gtest.h>

#include "pdf/zipped_jdf_file_system.h"
#include "test_support.h"

using vorlan::test::TempDir;

namespace {

struct Context {
    explicit Context(const std::string& path) : fs(createZippedJDFFileSystem(path.c_str())) {}
    ~Context() { destroyZippedJDFFileSystem(fs); }
    ZippedJDFFileSystem* fs;
};

// Writes a zip archive with the given entry names (stored with small contents) using Python's zipfile.
bool makeZip(const std::string& path, const std::vector<std::string>& names) {
    std::string list;
    for (const std::string& n : names) list += "'" + n + "',";
    return vorlan::test::runCommand("python3 -c \"import zipfile,sys\nwith zipfile.ZipFile('" + path +
                                    "','w',zipfile.ZIP_DEFLATED) as z:\n  [z.writestr(n, 'data '+n) for n in [" +
                                    list + "]]\"") == 0;
}

}  // namespace

TEST(ZipIndex, ContextTakesTheFileNameAfterEitherSeparator) {
    for (auto [path, name] : {std::pair{"/jobs/42/job.zip", "job.zip"}, {"C:\\jobs\\job.zip", "job.zip"}, {"plain", "plain"}})
        EXPECT_STREQ(Context(path).fs->fileName, name);
    EXPECT_EQ(createZippedJDFFileSystem(nullptr), nullptr);
    destroyZippedJDFFileSystem(nullptr);
}

TEST(ZipIndex, FindsEntriesByExactName) {
    if (!vorlan::test::haveProgram("python3")) GTEST_SKIP() << "python3 not installed (makes the archive)";
    TempDir dir;
    std::string zip = (dir / "job.zip").string();
    ASSERT_TRUE(makeZip(zip, {"job.jdf", "Job.jdf", "pdfs/content.pdf", "pdfs/"}));
    Context ctx(zip);
    EXPECT_EQ(getZipEntryCount(ctx.fs), 4);
    const std::pair<const char*, int> lookups[] = {{"job.jdf", 0}, {"Job.jdf", 1}, {"JOB.JDF", -1}, {"pdfs/content.pdf", 2},
                                                   {"content.pdf", -1}, {"pdfs\\content.pdf", -1}, {nullptr, -1}};
    for (auto [name, index] : lookups) EXPECT_EQ(findZipEntry(ctx.fs, name), index) << (name ? name : "null");
    EXPECT_STREQ(getZipEntryName(ctx.fs, 3), "pdfs/");
    EXPECT_EQ(getZipEntryName(ctx.fs, 4), nullptr);
    EXPECT_EQ(getZipEntryName(ctx.fs, -1), nullptr);
}

TEST(ZipIndex, NotAnArchive) {
    TempDir dir;
    vorlan::test::writeFile(dir / "job.pdf", vorlan::test::minimalPdf());
    Context pdf((dir / "job.pdf").string());
    EXPECT_EQ(getZipEntryCount(pdf.fs), -2);
    EXPECT_EQ(findZipEntry(pdf.fs, "job.jdf"), -1);
    EXPECT_EQ(pdf.fs->openFile, nullptr);  // nothing left open
    Context missing((dir / "missing.zip").string());
    EXPECT_EQ(getZipEntryCount(missing.fs), -2);
    Context folder(dir.path().string());
    EXPECT_EQ(getZipEntryCount(folder.fs), -2);
}

TEST(ZipIndex, DamagedArchivesNeverCrash) {
    if (!vorlan::test::haveProgram("python3")) GTEST_SKIP() << "python3 not installed (makes the archive)";
    TempDir dir;
    std::string zip = (dir / "job.zip").string();
    std::vector<std::string> names;
    for (int i = 0; i < 20; ++i) names.push_back("entry" + std::to_string(i) + ".pdf");
    ASSERT_TRUE(makeZip(zip, names));
    std::string bytes = vorlan::test::readFile(zip);
    for (size_t at = 0; at < bytes.size(); at += 37) {
        std::string damaged = bytes;
        for (size_t i = at; i < std::min(at + 8, damaged.size()); ++i) damaged[i] = static_cast<char>(0xff - i);
        std::string path = (dir / "d.zip").string();
        vorlan::test::writeFile(path, damaged);
        Context ctx(path);
        testing::internal::CaptureStdout();
        int32_t count = getZipEntryCount(ctx.fs);
        testing::internal::GetCapturedStdout();
        EXPECT_TRUE(count == -2 || count == -1 || (count >= 0 && count <= 20)) << count;
        findZipEntry(ctx.fs, "entry3.pdf");
    }
    vorlan::test::writeFile(dir / "half.zip", bytes.substr(0, bytes.size() / 2));
    Context half((dir / "half.zip").string());
    EXPECT_EQ(getZipEntryCount(half.fs), -2);
}
