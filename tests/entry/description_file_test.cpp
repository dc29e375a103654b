// The job number and the description buffer that vorlan_consume_job derives from its arguments.
// What a missing description prints is checked once, end to end, in pipeline_test.cpp.
#include <cstdlib>
#include <cstring>

#include <gtest/gtest.h>

#include "entry/description_file.h"
#include "test_support.h"

using vorlan::test::TempDir;
using vorlan::test::writeFile;

// The number after "job" in the name after the last '/'; -1 when the pattern does not match.
TEST(JobNumber, ReadFromTheFileNameAfterTheLastSlash) {
    const std::pair<const char*, int> cases[] = {
        {"/jobs/in/job12.impinfo", 12}, {"/jobs/job12_copy.xml", 12}, {"/a/job-3.impinfo", -3},
        {"/jobs/job7.impinfo/job8.impinfo", 8}, {nullptr, -1}, {"job12.impinfo", -1},
        {"C:\\jobs\\job12.impinfo", -1}, {"/jobs/Job12.impinfo", -1}, {"/jobs/jobX.impinfo", -1}, {"/jobs/", -1},
    };
    for (auto [path, number] : cases) EXPECT_EQ(jobNumberFromDescriptionPath(path), number) << (path ? path : "null");
}

// Read into a zeroed buffer sixteen bytes larger; a missing or unreadable file means unversioned.
TEST(DescriptionFile, ReadIntoAZeroedBufferOrNoneForAnUnversionedJob) {
    TempDir dir;
    for (const std::string text : {"<OptionalContentGroupData/>", ""}) {
        writeFile(dir / "job1.impinfo", text);
        char* buffer = nullptr;
        long length = -1;
        ASSERT_TRUE(readDescriptionFile((dir / "job1.impinfo").c_str(), &buffer, &length));
        ASSERT_NE(buffer, nullptr);
        EXPECT_EQ(length, static_cast<long>(text.size()));
        EXPECT_EQ(std::string(buffer), text);
        for (size_t i = text.size(); i < text.size() + 16; ++i) EXPECT_EQ(buffer[i], 0);
        std::free(buffer);
    }
    for (const std::string& path : {(dir / "absent.impinfo").string(), dir.path().string()}) {
        char* buffer = reinterpret_cast<char*>(1);
        long length = -1;
        testing::internal::CaptureStderr();
        EXPECT_TRUE(readDescriptionFile(path.c_str(), &buffer, &length));
        testing::internal::GetCapturedStderr();
        EXPECT_EQ(buffer, nullptr);
        EXPECT_EQ(length, 0);
    }
}
