// The shared library exports the C entry points and the two classes, nothing else.
#include <set>
#include <sstream>

#include <gtest/gtest.h>

#include "test_support.h"
#include "vorlan/vorlan.h"

TEST(SharedLibrary, ExportsOnlyTheEntryPointsAndTheTwoClasses) {
    if (!vorlan::test::haveProgram("nm")) GTEST_SKIP() << "nm not installed";
    std::string listing;
    ASSERT_EQ(vorlan::test::runCommand(std::string("nm -D --defined-only ") + VORLAN_SHARED_LIBRARY, &listing), 0);
    std::set<std::string> cSymbols;
    std::istringstream lines(listing);
    std::string address, type, name;
    while (lines >> address >> type >> name) {
        if (type != "T" && type != "W" && type != "D" && type != "B" && type != "V" && type != "R") continue;
        if (name.rfind("_Z", 0) == 0) {
            bool ours = name.find("LD_JDF") != std::string::npos || name.find("JDFinterface") != std::string::npos;
            EXPECT_TRUE(ours) << "unexpected C++ export " << name;
        } else if (name.rfind("_", 0) != 0) {
            cSymbols.insert(name);
        }
    }
    EXPECT_EQ(cSymbols, (std::set<std::string>{"vorlan_autoimp", "vorlan_consume_job", "vorlan_is_valid_job",
                                               "vorlan_proof_ticket", "vorlan_scan_xmp"}));
}

TEST(ResultCodes, TheReadmeTableIsTheHeadersTable) {
    std::string expected;
#define VORLAN_RESULT_ROW(name, value, meaning) \
    expected += "| " + std::to_string(value) + " | `" #name "` | " meaning " |\n";
    VORLAN_RESULT_CODES(VORLAN_RESULT_ROW)
#undef VORLAN_RESULT_ROW
    const std::string readme = vorlan::test::readFile(std::string(VORLAN_SOURCE_DIR) + "/README.md");
    const size_t start = readme.find("| 0 | `LD_OK`");
    ASSERT_NE(start, std::string::npos) << "README.md has no result-code table";
    EXPECT_EQ(readme.substr(start, expected.size()), expected);
}
