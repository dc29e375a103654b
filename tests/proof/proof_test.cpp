// Proof PDFs of versioned tickets, rendered with pdftoppm: each version shows its own layers,
// die-only pages only the die, placed objects land and are clipped where the ticket says, and a
// missing file or page fails its version alone.
#include <filesystem>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "job_builder.h"
#include "render.h"
#include "test_pdf.h"
#include "test_support.h"
#include "vorlan/vorlan.h"

namespace fs = std::filesystem;
using namespace layermode_test;
using vorlan::test::Rgb;

namespace {

constexpr int kDpi = 18;
const Rgb kRed{255, 0, 0}, kBlue{0, 0, 255}, kGreen{0, 255, 0}, kWhite{255, 255, 255};

// Renders a proof page; a failure of the test when pdftoppm renders nothing.
vorlan::test::ColourImage render(const fs::path& pdf, int page) {
    vorlan::test::ColourImage image = vorlan::test::renderColourPage(pdf.string(), page, kDpi);
    EXPECT_GT(image.width, 0) << "pdftoppm rendered nothing of " << pdf << " page " << page;
    return image;
}

// The same page drawn `pages` times: English paints red and German blue on the same square,
// the die green beside it; German and the die start off. German is marked content inside a form
// (taken out of the form for the versions that hide it), the die a form with its own /OC.
void writeLayeredPdf(const fs::path& path, int pages) {
    vorlan::test::TestPdf pdf;
    QPDFObjectHandle en = pdf.object("<< /Type /OCG /Name (English) >>");
    QPDFObjectHandle de = pdf.object("<< /Type /OCG /Name (German) >>");
    QPDFObjectHandle die = pdf.object("<< /Type /OCG /Name (Die) >>");
    const std::string r = " ", enRef = vorlan::test::TestPdf::ref(en), deRef = vorlan::test::TestPdf::ref(de),
                      dieRef = vorlan::test::TestPdf::ref(die);
    const std::string form = "<< /Type /XObject /Subtype /Form /BBox [0 0 300 400] ";
    QPDFObjectHandle german = pdf.stream(form + "/Resources << /Properties << /de " + deRef + " >> >> >>",
                                         "/OC /de BDC 0 0 1 rg 50 50 100 100 re f EMC");
    QPDFObjectHandle dieForm = pdf.stream(form + "/OC " + dieRef + " >>", "0 1 0 rg 200 50 50 50 re f");
    vorlan::test::TestPageOptions options;
    options.mediaBox = "[0 0 300 400]";
    for (int i = 0; i < pages; ++i)
        pdf.addPage("/OC /en BDC 1 0 0 rg 50 50 100 100 re f EMC /German Do /Die Do",
                    "<< /Properties << /en " + enRef + " >> /XObject << /German " + vorlan::test::TestPdf::ref(german) +
                        " /Die " + vorlan::test::TestPdf::ref(dieForm) + " >> >>",
                    options);
    pdf.qpdf().getRoot().replaceKey(
        "/OCProperties", QPDFObjectHandle::parse(&pdf.qpdf(), "<< /OCGs [" + enRef + r + deRef + r + dieRef +
                                                                  "] /D << /OFF [" + deRef + r + dieRef + "] >> >>"));
    pdf.write(path.string());
}

struct Reported {
    std::string version, path;
    int pages, result;
};

void collect(const VorlanProofVersion* v, void* userData) {
    static_cast<std::vector<Reported>*>(userData)->push_back({v->version, v->path, v->pages, v->result});
}

int proof(const fs::path& ticket, const fs::path& folder, std::vector<Reported>* reported = nullptr) {
    std::vector<Reported> ignored;
    return vorlan_proof_ticket(ticket.c_str(), folder.c_str(), collect, reported ? reported : &ignored);
}

// A ticket in the form the library writes: one sheet of 400 x 400 per placed object, its front
// tagged with the version, the object's Ord its own partition of the content (or marks) run list.
struct Placement {
    std::string version, file;
    int page = 0;
    std::string ctm = "1 0 0 1 0 0", clipBox;
    bool mark = false;
};

std::string ticketFor(const std::vector<Placement>& placements) {
    std::string runs[2], sheets;
    int ords[2] = {0, 0};
    for (size_t i = 0; i < placements.size(); ++i) {
        const Placement& p = placements[i];
        const int ord = ords[p.mark]++;
        runs[p.mark] += vorlan::test::runPartition(ord, p.file, "Pages=\"" + std::to_string(p.page) + "\"");
        sheets += "<Sheet Name=\"S" + std::to_string(i) + "\"><Media Dimension=\"400 400\"/><Surface Side=\"Front\" "
                  "KAV_tkt:VersionName=\"" + p.version + "\" KAV_tkt:VersionCopyCount=\"1\"><" +
                  (p.mark ? "MarkObject" : "ContentObject") + " CTM=\"" + p.ctm + "\" Ord=\"" + std::to_string(ord) + "\"" +
                  (p.clipBox.empty() ? "" : " ClipBox=\"" + p.clipBox + "\"") + "/></Surface></Sheet>\n";
    }
    return vorlan::test::jdfTicket(
        vorlan::test::runListByRun("rDoc", runs[0]) + vorlan::test::runListByRun("rMarks", runs[1]) +
            R"(<Layout ID="rLayout" Class="Parameter" Status="Available"><Signature Name="Sig1">)" + sheets +
            "</Signature></Layout>",
        R"(<RunListLink rRef="rDoc" Usage="Input" ProcessUsage="Document"/>)"
        R"(<RunListLink rRef="rMarks" Usage="Input" ProcessUsage="Marks"/><LayoutLink rRef="rLayout" Usage="Input"/>)",
        R"(xmlns:KAV_tkt="http://www.vorlan.org/JDF/ticket/1.0" Type="Imposition")");
}

class Proofs : public vorlan::test::JobStoreTest {
protected:
    void SetUp() override {
        JobStoreTest::SetUp();
        if (!vorlan::test::haveProgram("pdftoppm")) GTEST_SKIP() << "pdftoppm missing";
    }
};

}  // namespace

TEST_F(Proofs, EachVersionShowsItsOwnLayersAndDieSheetsOnlyTheDie) {
    setJobAttribute("KVPrintDieLine", "True");
    const std::vector<LayerSpec> layers = {{"English", false, true}, {"German", false, false}, {"Die", false, false}};
    auto version = [](const char* name, std::initializer_list<int> surfaces, const char* on, const char* off) {
        VersionSpec v{name, 10, true, {}};
        for (int s : surfaces) v.surfaces.push_back({s, {{s, on, off, "", ""}}});
        return v;
    };
    const DieSpec die{true, "Die", "", 1};
    Job job = writeTicketJob(tmp.path(), TicketSpec{},
                             descriptionXml(layers, {version("English", {0, 1}, "English", "German"),
                                                     version("German", {2, 3}, "German", "English")},
                                            &die));
    writeLayeredPdf(job.dataFolder / "content.pdf", 4);
    ASSERT_EQ(consume(job), 0);
    const std::string ticketBefore = vorlan::test::readFile(job.output);
    const std::string convertedBefore = vorlan::test::readFile(tmp / "out" / "out-0.pdf");
    ASSERT_FALSE(convertedBefore.empty());

    std::vector<Reported> reported;
    ASSERT_EQ(proof(job.output, tmp / "proofs", &reported), LD_OK);
    ASSERT_EQ(reported.size(), 3u);
    EXPECT_EQ(vorlan::test::readFile(job.output), ticketBefore);
    EXPECT_EQ(vorlan::test::readFile(tmp / "out" / "out-0.pdf"), convertedBefore);
    struct Expected {
        const char* version;
        int page;
        Rgb square, die;  // at the square and beside it; white for nothing
        Rgb never;        // nowhere on the page
    };
    // Die sheets carry no version: they make the Default proof, die with content then die only.
    const Expected table[] = {
        {"English", 1, kRed, kWhite, kBlue},  {"English", 2, kRed, kWhite, kBlue},
        {"German", 1, kBlue, kWhite, kRed},   {"German", 2, kBlue, kWhite, kRed},
        {"Default", 1, kRed, kGreen, kBlue},  {"Default", 3, kWhite, kGreen, kRed},
        {"Default", 4, kWhite, kGreen, kBlue},
    };
    for (const Expected& e : table) {
        SCOPED_TRACE(std::string(e.version) + " page " + std::to_string(e.page));
        vorlan::test::ColourImage image = render(tmp / "proofs" / (std::string(e.version) + ".pdf"), e.page);
        EXPECT_EQ(image.width, 600 * kDpi / 72);  // the sheet's media
        EXPECT_EQ(image.at(100, 100, kDpi), e.square);
        EXPECT_EQ(image.at(225, 75, kDpi), e.die);
        EXPECT_EQ(image.count(e.never), 0);
    }
    // The labels name version, copies, sheet, side and content type.
    std::string text;
    ASSERT_EQ(vorlan::test::runCommand("pdftotext " + (tmp / "proofs" / "Default.pdf").string() + " -", &text), 0);
    EXPECT_NE(text.find("Default | copies - | sheet 4 DieSheet | Back | DieOnly"), std::string::npos) << text;
    ASSERT_EQ(vorlan::test::runCommand("pdftotext " + (tmp / "proofs" / "German.pdf").string() + " -", &text), 0);
    EXPECT_NE(text.find("German | copies 10 | sheet 2 "), std::string::npos) << text;
    for (const Reported& r : reported) EXPECT_EQ(r.pages, r.version == "Default" ? 4 : 2) << r.version;
    EXPECT_EQ(vorlan::test::qpdfCheckPasses((tmp / "proofs" / "Default.pdf").string()), true);
}

TEST_F(Proofs, PlacedObjectsLandAndAreClippedWhereTheTicketSays) {
    // A 100 x 50 page painted red at x 0..20 (a strip along its left edge), as it stands and
    // turned by /Rotate 90 (shown 50 x 100, the strip along its top edge).
    vorlan::test::TestPdf pdf;
    vorlan::test::TestPageOptions options;
    options.mediaBox = "[0 0 100 50]";
    pdf.addPage("1 0 0 rg 0 0 20 50 re f", "<< >>", options);
    options.rotate = 90;
    pdf.addPage("1 0 0 rg 0 0 20 50 re f", "<< >>", options);
    pdf.write((tmp / "strip.pdf").string());
    struct Case {
        int page;
        const char* ctm;
        const char* clipBox;
        double x, y;
        Rgb expected;
        bool mark = false;
    };
    // Turned a quarter anticlockwise and doubled: (x, y) lands on (300 - 2y, 100 + 2x), so the
    // strip covers 200..300 x 100..140. The clip box keeps 200..250 of it.
    const Case cases[] = {
        {0, "0 2 -2 0 300 100", "", 250, 120, kRed},    {0, "0 2 -2 0 300 100", "", 250, 200, kWhite},
        {0, "0 2 -2 0 300 100", "", 150, 120, kWhite},  {0, "0 2 -2 0 300 100", "200 0 250 400", 225, 120, kRed},
        {0, "0 2 -2 0 300 100", "200 0 250 400", 275, 120, kWhite},
        {0, "1 0 0 1 30 60", "", 40, 80, kRed},         {0, "1 0 0 1 30 60", "", 60, 80, kWhite},
        {1, "1 0 0 1 30 60", "", 55, 150, kRed},        {1, "1 0 0 1 30 60", "", 55, 100, kWhite},
        {0, "1 0 0 1 30 60", "", 40, 80, kRed, true},   {0, "1 0 0 1 30 60", "30 60 35 110", 40, 80, kWhite, true},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(std::string(c.ctm) + " clip " + c.clipBox + " page " + std::to_string(c.page) +
                     (c.mark ? " mark" : ""));
        vorlan::test::writeFile(tmp / "t.jdf", ticketFor({{"V", "strip.pdf", c.page, c.ctm, c.clipBox, c.mark}}));
        ASSERT_EQ(proof(tmp / "t.jdf", tmp / "out"), LD_OK);
        EXPECT_EQ(render(tmp / "out" / "V.pdf", 1).at(c.x, c.y, kDpi), c.expected);
    }
}

TEST_F(Proofs, AMissingFileOrPageFailsItsVersionAloneAndJobFilesStay) {
    vorlan::test::writeFile(tmp / "one.pdf", vorlan::test::minimalPdf("1 0 0 rg 0 0 50 50 re f"));
    struct Case {
        Placement broken;
        int result;
    };
    const Case cases[] = {
        {{"B/../x", "missing.pdf", 0, "1 0 0 1 0 0", "", false}, LD_FILE_NOT_FOUND},
        {{"B/../x", "one.pdf", 3, "1 0 0 1 0 0", "", false}, LD_REFERENCE_OUT_OF_RANGE},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.result);
        vorlan::test::TempDir out;
        vorlan::test::writeFile(tmp / "t.jdf", ticketFor({{"A", "one.pdf", 0, "1 0 0 1 0 0", "", false}, c.broken}));
        std::vector<Reported> reported;
        EXPECT_EQ(proof(tmp / "t.jdf", out.path(), &reported), c.result);
        ASSERT_EQ(reported.size(), 2u);
        EXPECT_EQ(reported[0].result, LD_OK);
        EXPECT_EQ(reported[1].result, c.result);
        // The name is made safe: no path separator leads out of the folder.
        EXPECT_EQ(fs::path(reported[1].path).parent_path(), out.path());
        EXPECT_FALSE(fs::exists(reported[1].path));
        EXPECT_EQ(render(out / "A.pdf", 1).at(25, 25, kDpi), kRed);
    }
    // A proof never replaces a file of the job: version "one" proofed into its PDF's folder.
    vorlan::test::writeFile(tmp / "t.jdf", ticketFor({{"one", "one.pdf", 0, "1 0 0 1 0 0", "", false}}));
    const std::string before = vorlan::test::readFile(tmp / "one.pdf");
    EXPECT_EQ(proof(tmp / "t.jdf", tmp.path()), LD_FAILED);
    EXPECT_EQ(vorlan::test::readFile(tmp / "one.pdf"), before);
}

TEST_F(Proofs, CorpusTicketsGiveAPagePerSurface) {
    VORLAN_REQUIRE_CORPUS();
    // Real layouts (rotated and scaled marks, many files in a sub-folder the URLs name), with a
    // generated PDF for every file they name; none carries a version.
    struct Case {
        const char* ticket;
        int surfaces;  // Surface elements of the ticket, each with placed objects
    };
    const Case cases[] = {{"elk_scale_rotate.jdf", 24}, {"elk_16er.jdf", 4}};
    for (const Case& c : cases) {
        SCOPED_TRACE(c.ticket);
        vorlan::test::TempDir dir;
        Job job = writeJobForTicket(dir.path(), vorlan::test::corpusDir() / "jdf" / c.ticket);
        std::vector<Reported> reported;
        ASSERT_EQ(proof(job.dataFolder / "ticket.jdf", dir / "proofs", &reported), LD_OK);
        ASSERT_EQ(reported.size(), 1u);
        EXPECT_EQ(reported[0].version, "Default");
        EXPECT_EQ(reported[0].pages, c.surfaces);
        vorlan::test::ColourImage first = render(reported[0].path, 1);
        EXPECT_GT(first.width * first.height, first.count(kWhite));  // the generated pages' lines show
    }
}
