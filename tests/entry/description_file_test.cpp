// The job number and the description buffer that vorlan_consume_job derives from its arguments.
#include <cstdlib>
#include <cstring>

#include <gtest/gtest.h>

#include "entry/description_file.h"
#include "test_support.h"

using vorlan::test::TempDir;
using vorlan::test::writeFile;

TEST(JobNumber, ReadFromTheFileNameAfterTheLastSlash) {
    EXPECT_EQ(jobNumberFromDescriptionPath("/jobs/in/job12.impinfo"), 12);
    EXPECT_EQ(jobNumberFromDescriptionPath("/jobs/job12_copy.xml"), 12);  // whatever follows the number
    EXPECT_EQ(jobNumberFromDescriptionPath("/a/job-3.impinfo"), -3);
    EXPECT_EQ(jobNumberFromDescriptionPath("/jobs/job7.impinfo/job8.impinfo"), 8);
}

TEST(JobNumber, MinusOneWhenThePatternDoesNotMatch) {
    EXPECT_EQ(jobNumberFromDescriptionPath(nullptr), -1);
    EXPECT_EQ(jobNumberFromDescriptionPath("job12.impinfo"), -1);          // no '/'
    EXPECT_EQ(jobNumberFromDescriptionPath("C:\\jobs\\job12.impinfo"), -1); // backslashes only
    EXPECT_EQ(jobNumberFromDescriptionPath("/jobs/Job12.impinfo"), -1);     // capital J
    EXPECT_EQ(jobNumberFromDescriptionPath("/jobs/jobX.impinfo"), -1);
    EXPECT_EQ(jobNumberFromDescriptionPath("/jobs/"), -1);
}

TEST(DescriptionFile, ReadIntoAZeroedBufferSixteenBytesLarger) {
    TempDir dir;
    writeFile(dir / "job1.impinfo", "<OptionalContentGroupData/>");
    char* buffer = nullptr;
    long length = -1;
    ASSERT_TRUE(readDescriptionFile((dir / "job1.impinfo").c_str(), &buffer, &length));
    ASSERT_NE(buffer, nullptr);
    EXPECT_EQ(length, 27);
    EXPECT_EQ(std::string(buffer), "<OptionalContentGroupData/>");
    for (int i = 27; i < 27 + 16; ++i) EXPECT_EQ(buffer[i], 0);
    std::free(buffer);
}

TEST(DescriptionFile, EmptyFileGivesZeroedBufferAndLengthZero) {
    TempDir dir;
    writeFile(dir / "job1.impinfo", "");
    char* buffer = nullptr;
    long length = -1;
    ASSERT_TRUE(readDescriptionFile((dir / "job1.impinfo").c_str(), &buffer, &length));
    ASSERT_NE(buffer, nullptr);
    EXPECT_EQ(length, 0);
    EXPECT_EQ(buffer[0], 0);
    std::free(buffer);
}

TEST(DescriptionFile, MissingOrUnreadableMeansUnversioned) {
    TempDir dir;
    for (const std::string& path : {(dir / "absent.impinfo").string(), dir.path().string()}) {
        char* buffer = reinterpret_cast<char*>(1);
        long length = -1;
        testing::internal::CaptureStderr();
        EXPECT_TRUE(readDescriptionFile(path.c_str(), &buffer, &length));
        std::string said = testing::internal::GetCapturedStderr();
        EXPECT_EQ(buffer, nullptr);
        EXPECT_EQ(length, 0);
        EXPECT_EQ(said, "Invalid or absent xml buffer file, continuing as unversioned job... \n");
    }
}
