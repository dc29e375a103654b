// The quick test whether a file is a version description, through the C entry point and the CLI.
#include <cstdlib>
#include <string>

#include <gtest/gtest.h>

#include "test_support.h"
#include "vorlan/vorlan.h"

using vorlan::test::TempDir;
using vorlan::test::writeFile;

namespace {

bool validFile(const TempDir& dir, const std::string& bytes) {
    writeFile(dir / "job1.impinfo", bytes);
    return vorlan_is_valid_job((dir / "job1.impinfo").c_str());
}

}  // namespace

TEST(ValidDescription, RootDecides) {
    TempDir dir;
    EXPECT_TRUE(validFile(dir, "<OptionalContentGroupData/>"));
    EXPECT_TRUE(validFile(dir, "<?xml version='1.0'?>\n<optionalcontentgroupdata><Anything/></optionalcontentgroupdata>"));
    EXPECT_FALSE(validFile(dir, "<OptionalContentGroup/>"));
    EXPECT_FALSE(validFile(dir, "<Other><OptionalContentGroupData/></Other>"));
}

TEST(ValidDescription, EmptyMalformedAndMissingFilesAreNotValid) {
    TempDir dir;
    EXPECT_FALSE(validFile(dir, ""));
    EXPECT_FALSE(validFile(dir, "   \n"));
    EXPECT_FALSE(validFile(dir, "<OptionalContentGroupData>"));
    EXPECT_FALSE(validFile(dir, "<OptionalContentGroupData></optionalcontentgroupdata>"));
    EXPECT_FALSE(validFile(dir, "<OptionalContentGroupData a='\xFF'/>"));
    EXPECT_FALSE(vorlan_is_valid_job((dir / "absent.impinfo").c_str()));
    EXPECT_FALSE(vorlan_is_valid_job(dir.path().c_str()));
    EXPECT_FALSE(vorlan_is_valid_job(nullptr));
}

// The file is read 512 bytes at a time; one whose size is a multiple of 512 gets no short final
// read, and must still be checked to its end.
TEST(ValidDescription, FileSizesOnPieceBoundaries) {
    TempDir dir;
    for (size_t size : {511u, 512u, 513u, 1024u, 4096u}) {
        std::string open = "<OptionalContentGroupData v='";
        std::string close = "'></OptionalContentGroupData>";
        std::string whole = open + std::string(size - open.size() - close.size(), 'x') + close;
        ASSERT_EQ(whole.size(), size);
        EXPECT_TRUE(validFile(dir, whole)) << size;
        std::string truncated = open + std::string(size - open.size() - 2, 'x') + "'>";
        ASSERT_EQ(truncated.size(), size);
        EXPECT_FALSE(validFile(dir, truncated)) << size;
    }
}

TEST(ValidDescription, CommandLine) {
    const char* cli = std::getenv("VORLAN_CLI");
    if (!cli || !*cli) cli = VORLAN_CLI_PATH;
    TempDir dir;
    writeFile(dir / "good.impinfo", "<OptionalContentGroupData/>");
    writeFile(dir / "bad.impinfo", "<OptionalContentGroupData>");
    std::string output;
    EXPECT_EQ(vorlan::test::runCommand(std::string(cli) + " valid " + (dir / "good.impinfo").string(), &output), 0);
    EXPECT_EQ(output, "valid\n");
    EXPECT_EQ(vorlan::test::runCommand(std::string(cli) + " valid " + (dir / "bad.impinfo").string(), &output), 1);
    EXPECT_EQ(output, "not valid\n");
}
