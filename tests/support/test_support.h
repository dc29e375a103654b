// Helpers shared by the test suites.
#pragma once

#include <cstdlib>
#include <filesystem>
#include <string>
#include <vector>

#include <gtest/gtest.h>

namespace vorlan::test {

// Folder holding the third-party corpus (jdf/, pdf/, jdf-schema/), or empty when it is absent.
std::filesystem::path corpusDir();

// A fresh folder under the system temporary folder, removed with the object.
class TempDir {
public:
    TempDir();
    ~TempDir();
    TempDir(const TempDir&) = delete;
    TempDir& operator=(const TempDir&) = delete;
    const std::filesystem::path& path() const { return path_; }
    std::filesystem::path operator/(const std::string& name) const { return path_ / name; }

private:
    std::filesystem::path path_;
};

// Points VORLAN_HOME at a fresh folder holding `library` as the die library
// (DieLib/AutoDieLib.xml), for the object's lifetime.
class DieLibraryHome {
public:
    explicit DieLibraryHome(const std::string& library);
    ~DieLibraryHome();

private:
    TempDir home_;
};

// Writes bytes to a file, creating parent folders.
void writeFile(const std::filesystem::path& file, const std::string& bytes);
// Reads a whole file; empty when it cannot be read.
std::string readFile(const std::filesystem::path& file);
// Runs a shell command, returning its exit status; output goes to *output when given.
int runCommand(const std::string& command, std::string* output = nullptr);
// True when a program is on PATH.
bool haveProgram(const std::string& name);
// Validates JDF files against the JDF 1.8 schema in one xmllint call. Returns the names of the
// files that do not validate (empty when all do); *report receives xmllint's messages when given.
// Fails the calling test when the corpus schema or xmllint is missing.
std::vector<std::string> filesFailingJdfSchema(const std::vector<std::filesystem::path>& files,
                                               std::string* report = nullptr);
// A minimal valid PDF of that many pages (each showing the content stream) as bytes.
std::string minimalPdf(const std::string& content = "0 0 m 10 10 l S", int pages = 1);
// count() of an XPath 1.0 expression over an XML file, by xmllint; -1 when xmllint fails.
int xpathCount(const std::filesystem::path& file, const std::string& xpath);
// A PDF of the given object bodies, numbered from 1 (object 1 is the catalog), with a
// cross-reference table.
std::string handWrittenPdf(const std::vector<std::string>& objects);

// A JDF root with the given attributes around a resource pool and a link pool.
inline std::string jdfTicket(const std::string& resources, const std::string& links = "",
                             const std::string& rootAttributes = R"(Type="Imposition")") {
    return R"(<?xml version="1.0" encoding="UTF-8"?>
<JDF xmlns="http://www.CIP4.org/JDFSchema_1_1" ID="n1" JobPartID="p1" Status="Waiting" Version="1.3" )" +
           rootAttributes + ">\n<ResourcePool>\n" + resources + "\n</ResourcePool>\n<ResourceLinkPool>\n" + links +
           "\n</ResourceLinkPool>\n</JDF>\n";
}

// A RunList partitioned by Run with one partition per file (NPage pages each).
inline std::string runListByRun(const std::string& id, const std::string& partitions) {
    return R"(<RunList ID=")" + id + R"(" Class="Parameter" Status="Available" PartIDKeys="Run">)" + partitions +
           "</RunList>";
}

inline std::string runPartition(int run, const std::string& url, const std::string& pageAttributes,
                                const std::string& extra = "") {
    return R"(<RunList Run=")" + std::to_string(run) + "\" " + pageAttributes + " " + extra +
           R"(><LayoutElement><FileSpec URL=")" + url + R"(" MimeType="Application/PDF"/></LayoutElement></RunList>)";
}

// A test with a temporary folder (tmp) that holds the job attribute store the library uses
// while the test runs (VORLAN_JOB_STORE).
class JobStoreTest : public testing::Test {
protected:
    void SetUp() override { setenv("VORLAN_JOB_STORE", (tmp / "store").c_str(), 1); }
    void TearDown() override { unsetenv("VORLAN_JOB_STORE"); }

    TempDir tmp;
};

}  // namespace vorlan::test

// Skips the current test with a clear message when the corpus is not present.
#define VORLAN_REQUIRE_CORPUS()                                                              \
    do {                                                                                     \
        if (::vorlan::test::corpusDir().empty())                                             \
            GTEST_SKIP() << "third-party corpus not found (set VORLAN_SHARED_DIR to the folder" \
                            " holding corpus/); skipping";                                   \
    } while (0)
