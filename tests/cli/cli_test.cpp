// The vorlan host: help texts, exit status = result code, job attributes.
#include <gtest/gtest.h>

#include "test_support.h"

using vorlan::test::runCommand;
using vorlan::test::TempDir;
using vorlan::test::writeFile;

namespace {

std::string cli() { return VORLAN_CLI_PATH; }

int run(const std::string& arguments, std::string* output = nullptr) {
    return runCommand(cli() + " " + arguments, output);
}

}  // namespace

TEST(Cli, EveryCommandHasHelp) {
    for (const char* command : {"", "consume", "valid", "autoimpose", "scan-xmp", "job-attr"}) {
        std::string output;
        EXPECT_EQ(run(std::string(command) + " --help", &output), 0) << command;
        EXPECT_NE(output.find("usage: vorlan"), std::string::npos) << command;
    }
    EXPECT_EQ(run("frobnicate"), 2);
    EXPECT_EQ(run(""), 2);
}

TEST(Cli, ConsumeExitsWithTheResultCodeAndNamesIt) {
    TempDir dir;
    std::string output;
    EXPECT_EQ(run("consume " + (dir / "missing.0001").string() + " " + (dir / "out.jdf").string(), &output), 12);
    EXPECT_NE(output.find("result: 12 LD_INVALID_INPUT"), std::string::npos) << output;

    std::filesystem::create_directories(dir / "job3D0001");
    EXPECT_EQ(run("consume --json " + (dir / "job3.0001").string() + " " + (dir / "out.jdf").string(), &output), 8);
    EXPECT_NE(output.find("\"name\": \"LD_FILE_NOT_FOUND\""), std::string::npos) << output;
    EXPECT_NE(output.find("\"ticketWritten\": false"), std::string::npos) << output;
}

TEST(Cli, JobAttributesRoundTripThroughTheStore) {
    TempDir dir;
    std::string env = "VORLAN_JOB_STORE=" + (dir / "store").string() + " ";
    std::string output;
    EXPECT_EQ(runCommand(env + cli() + " job-attr 9 KVPrintDieLine", &output), 1);
    EXPECT_EQ(runCommand(env + cli() + " job-attr 9 KVPrintDieLine True"), 0);
    EXPECT_EQ(runCommand(env + cli() + " job-attr 9 KVPrintDieLine", &output), 0);
    EXPECT_EQ(output, "True\n");
    EXPECT_EQ(runCommand(env + cli() + " job-attr nine KVPrintDieLine"), 2);
}

TEST(Cli, ValidSaysValidOrNotValid) {
    TempDir dir;
    writeFile(dir / "good.xml", "<optionalcontentgroupdata/>");
    writeFile(dir / "bad.xml", "<OptionalContentGroupData>");
    std::string output;
    EXPECT_EQ(run("valid " + (dir / "good.xml").string(), &output), 0);
    EXPECT_EQ(output, "valid\n");
    EXPECT_EQ(run("valid " + (dir / "bad.xml").string(), &output), 1);
    EXPECT_EQ(output, "not valid\n");
}
