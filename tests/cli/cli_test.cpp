// The vorlan host: help texts, exit status = result code, job attributes.
#include <gtest/gtest.h>

#include "job_builder.h"
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
    for (const char* command : {"", "consume", "valid", "autoimpose", "scan-xmp", "job-attr", "proof"}) {
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

    // A ticket job: the reader's own lines go to standard error, standard output is one document.
    writeFile(dir / "job4D0001" / "t.jdf", R"(<JDF xmlns="http://www.CIP4.org/JDFSchema_1_1" ID="n" Type="Imposition"/>)");
    writeFile(dir / "job4.0001", "job");
    EXPECT_EQ(runCommand(cli() + " consume --json " + (dir / "job4.0001").string() + " " + (dir / "out4.jdf").string() +
                         " 2>/dev/null | python3 -c 'import json,sys; json.load(sys.stdin)'"),
              0);
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

TEST(Cli, InspectShowsTheLayoutGivenToATicketWithoutOne) {
    TempDir dir;
    writeFile(dir / "t.jdf", R"(<JDF xmlns="http://www.CIP4.org/JDFSchema_1_1" ID="n1" Type="Combined" Types="Interpreting">
        <ResourcePool><RunList ID="R" Class="Parameter" Status="Available" PartIDKeys="Run">
        <RunList Run="0" NPage="3"><LayoutElement><FileSpec URL="a.pdf"/></LayoutElement></RunList></RunList></ResourcePool>
        <ResourceLinkPool><RunListLink rRef="R" Usage="Input"/></ResourceLinkPool></JDF>)");
    std::string output;
    EXPECT_EQ(run("inspect " + (dir / "t.jdf").string(), &output), 0);
    EXPECT_NE(output.find("sheetCount: 3"), std::string::npos) << output;
}

TEST(Cli, ConsumeListsOnlyTheOutputFilesItWrote) {
    TempDir dir;
    // Without separations to convert, the PDF is named an output path but never written there.
    layermode_test::Job job = layermode_test::writeTicketJob(
        dir.path(), layermode_test::TicketSpec{}, layermode_test::descriptionXml({{"English", false, true}}, {}));
    std::string output;
    EXPECT_EQ(runCommand("VORLAN_JOB_STORE=" + (dir / "store").string() + " " + cli() + " consume --json --impinfo " +
                             job.description.string() + " --out-dir " + (dir / "out").string() + " " +
                             job.dataFile.string() + " " + job.output.string(),
                         &output),
              0)
        << output;
    EXPECT_NE(output.find("\"ticketWritten\": true"), std::string::npos) << output;
    const size_t files = output.find("\"outputFiles\": [");
    ASSERT_NE(files, std::string::npos) << output;
    const std::string listed = output.substr(files + 16, output.find(']', files) - files - 16);
    EXPECT_EQ(listed.find('"'), std::string::npos) << output;
}

TEST(Cli, BundledExampleJobsGiveVersionedTickets) {
    if (!vorlan::test::haveProgram("python3")) GTEST_SKIP() << "python3 not installed";
    TempDir dir;
    const std::string example = (dir / "example").string();
    ASSERT_EQ(runCommand(std::string("python3 ") + VORLAN_SOURCE_DIR + "/examples/generate_example.py " + example), 0);
    const std::string env = "VORLAN_JOB_STORE=" + (dir / "store").string() + " ";
    const std::string common = " --job-folder " + example + " --out-dir " + example + "/out ";
    std::string output;
    ASSERT_EQ(runCommand(env + cli() + " job-attr 1 KVPrintDieLine True"), 0);
    EXPECT_EQ(runCommand(env + cli() + " consume --impinfo " + example + "/job1.impinfo" + common + example +
                             "/job1.0001 " + example + "/versioned.jdf",
                         &output),
              0)
        << output;
    const std::string firstConverted = vorlan::test::readFile(example + "/out/vorlan-output-1.pdf");
    EXPECT_FALSE(firstConverted.empty());
    EXPECT_EQ(runCommand(env + cli() + " consume --impinfo " + example + "/job2.impinfo" + common + example +
                             "/job2.pdf " + example + "/bare.jdf",
                         &output),
              0)
        << output;
    // The second job never takes the first job's output name.
    EXPECT_EQ(vorlan::test::readFile(example + "/out/vorlan-output-1.pdf"), firstConverted);
    const std::string ticket = vorlan::test::readFile(example + "/versioned.jdf");
    EXPECT_NE(ticket.find("KAV_tkt:VersionName=\"English\""), std::string::npos);
    EXPECT_NE(ticket.find("KAV_tkt:VersionName=\"German\""), std::string::npos);
    EXPECT_NE(ticket.find("DieSheet"), std::string::npos);
    // The proofs of both tickets: one file per version (the die sheets make "Default"), the job's
    // files left as they were.
    EXPECT_EQ(run("proof --json " + example + "/versioned.jdf " + example + "/proofs", &output), 0) << output;
    EXPECT_EQ(run("proof " + example + "/bare.jdf " + example + "/proofs-bare", &output), 0) << output;
    for (const char* proof : {"/proofs/English.pdf", "/proofs/German.pdf", "/proofs/Default.pdf",
                              "/proofs-bare/English.pdf", "/proofs-bare/German.pdf"})
        EXPECT_EQ(runCommand("qpdf --check " + example + proof + " >/dev/null"), 0) << proof;
    EXPECT_EQ(vorlan::test::readFile(example + "/out/vorlan-output-1.pdf"), firstConverted);
    if (vorlan::test::corpusDir().empty()) return;
    EXPECT_TRUE(vorlan::test::filesFailingJdfSchema({example + "/versioned.jdf", example + "/bare.jdf"}, &output).empty())
        << output;
}

TEST(Cli, AJobWhosePdfForbidsChangesIsConvertedWithItsEncryptionKept) {
    if (!vorlan::test::haveProgram("python3") || !vorlan::test::haveProgram("qpdf")) GTEST_SKIP() << "python3 or qpdf missing";
    TempDir dir;
    const std::string example = (dir / "example").string(), pdf = example + "/job1D0001/brochure.pdf";
    ASSERT_EQ(runCommand(std::string("python3 ") + VORLAN_SOURCE_DIR + "/examples/generate_example.py " + example), 0);
    ASSERT_EQ(runCommand("qpdf --encrypt '' owner 256 --modify=none -- --replace-input " + pdf), 0);
    const std::string env = "VORLAN_JOB_STORE=" + (dir / "store").string() + " ";
    std::string output;
    EXPECT_EQ(runCommand(env + cli() + " consume --impinfo " + example + "/job1.impinfo --job-folder " + example +
                             " --out-dir " + example + "/out " + example + "/job1.0001 " + example + "/versioned.jdf",
                         &output),
              0)
        << output;
    // Exit status 3: encrypted, and no password needed to open it.
    EXPECT_EQ(runCommand("qpdf --requires-password " + example + "/out/vorlan-output-1.pdf"), 3);
}

TEST(Cli, PdfCommandsSayWhyTheyRefuse) {
    TempDir dir;
    const std::string plain = (dir / "plain.pdf").string(), locked = (dir / "locked.pdf").string();
    writeFile(plain, vorlan::test::minimalPdf());
    ASSERT_EQ(runCommand("qpdf --encrypt secret owner 256 -- " + plain + " " + locked), 0);
    const std::string line = "Unable to open " + locked + ": the file is password-protected\n";
    for (const std::string command : {"convert-pdf --seps Gold", "rewrite-seps --drop Gold"}) {
        std::string output;
        EXPECT_EQ(run(command + " --json " + locked + " " + (dir / "out.pdf").string(), &output), 1);
        EXPECT_NE(output.find(line), std::string::npos) << output;  // standard error
        EXPECT_NE(output.find("\"reason\": \"password-protected\""), std::string::npos) << output;
        EXPECT_NE(output.find("\"message\": \"" + line.substr(0, line.size() - 1) + "\""), std::string::npos) << output;
    }
}
