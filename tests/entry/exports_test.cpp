// The shared library exports the four C entry points and the two classes, nothing else.
#include <set>
#include <sstream>

#include <gtest/gtest.h>

#include "test_support.h"

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
                                               "vorlan_scan_xmp"}));
}
