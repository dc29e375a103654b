// The quick test whether a file is a version description, through the C entry point (the command
// line is checked in tests/cli).
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

TEST(ValidDescription, RootDecidesAndBrokenFilesAreNotValid) {
    TempDir dir;
    const std::pair<const char*, bool> cases[] = {
        {"<OptionalContentGroupData/>", true},
        {"<?xml version='1.0'?>\n<optionalcontentgroupdata><Anything/></optionalcontentgroupdata>", true},
        {"<OptionalContentGroup/>", false},
        {"<Other><OptionalContentGroupData/></Other>", false},
        {"", false},
        {"   \n", false},
        {"<OptionalContentGroupData>", false},
        {"<OptionalContentGroupData></optionalcontentgroupdata>", false},
        {"<OptionalContentGroupData a='\xFF'/>", false},
    };
    for (auto [bytes, valid] : cases) EXPECT_EQ(validFile(dir, bytes), valid) << bytes;
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
