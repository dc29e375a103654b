// Ticket jobs that come without a version description: the description made from the content
// PDFs' inks (Esko XMP ink lists, or page inks matched against the die library), as written and
// as the pipeline reads it back, and the plates of the first variant that spot mode prints.
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <memory>
#include <regex>

#include "job_builder.h"
#include "plates.h"
#include "platform/os/text.h"
#include "test_pdf.h"
#include "test_support.h"
#include "ticket_view.h"
#include "vorlan/LD_JDF.h"

namespace fs = std::filesystem;
using namespace layermode_test;
using vorlan::test::DieLibraryHome;

namespace {

std::string joined(const std::vector<wchar_t*>& names) {
    std::string text;
    for (const wchar_t* name : names) text += (text.empty() ? "" : ",") + vorlan::os::toUtf8(name);
    return text;
}

// What the pipeline read back, in short: the first version's switches per surface
// ("index:object=inks" with blanks between) and the die cuts' separations.
struct Parsed {
    std::string switches, die;
    bool operator==(const Parsed& o) const { return switches == o.switches && die == o.die; }
};
std::ostream& operator<<(std::ostream& out, const Parsed& p) {
    return out << "{switches \"" << p.switches << "\", die \"" << p.die << "\"}";
}

Parsed parsedOf(const LD_JDF& worker) {
    Parsed p;
    if (!worker.versions.empty())
        for (const XMLSurfaceData* surface : worker.versions[0]->surfaces)
            for (const XMLContentObjectData* object : surface->contentObjects)
                p.switches += (p.switches.empty() ? "" : " ") + std::to_string(surface->index) + ":" +
                              std::to_string(object->index) + "=" + joined(object->sepNameOff);
    for (const LD_DieCut* die : worker.m_XMLDieCuts) p.die += joined(die->dieSepInternalNames) + ";";
    return p;
}

// Three content PDFs a, b, c on six surfaces: objects 0 and 1 show a.pdf, 2 and 3 b.pdf, 4 and 5
// c.pdf. The job store lives in the job's folder.
class ThreePdfJob {
public:
    ThreePdfJob() {
        setenv("VORLAN_JOB_STORE", (dir / "store").c_str(), 1);
        TicketSpec shape;
        shape.sheets = 3;
        shape.pdfs = {"a.pdf", "b.pdf", "c.pdf"};
        job = writeTicketJob(dir.path(), shape, "");
    }
    ~ThreePdfJob() { unsetenv("VORLAN_JOB_STORE"); }

    void pdf(const char* name, const std::vector<std::vector<std::string>>& pages, const std::string& xmp = "") {
        vorlan::test::writeSpotPdf((job.dataFolder / name).string(), pages, xmp);
    }

    // Runs the pipeline (job 1) without a description from the host; the worker keeps what it read.
    std::unique_ptr<LD_JDF> run() {
        host.folder = job.root / "out";
        fs::create_directories(host.folder);
        auto worker = std::make_unique<LD_JDF>(nullptr, newPdfPath, &host);
        std::string output = job.output.string();
        EXPECT_EQ(worker->JDF_InitializeAndCreateNewJDF(output.data(), nullptr, 0, job.dataFile.c_str(),
                                                        job.root.c_str(), "All", 1),
                  LD_OK);
        return worker;
    }

    // The description the worker generates from its ink maps and layout.
    std::string generated(LD_JDF& worker) {
        const fs::path file = dir / "generated.impinfo";
        EXPECT_TRUE(worker.generateImpInfoFile(file.c_str()));
        return vorlan::test::readFile(file);
    }

    vorlan::test::TempDir dir;
    Job job;
    HostFolder host;
};

}  // namespace

// a.pdf has no ink list but still counts, so the layers of b and c carry pdfIndex 1 and 2; names XML
// must escape come back unchanged through the written file; the die inks of both PDFs are
// sorted, each once.
TEST(AutoDescription, EskoInksOfThreePdfs) {
    ThreePdfJob t;
    const Job& job = t.job;
    const std::string cut = "Cut \"<&>\"";
    t.pdf("a.pdf", {{}, {}});
    t.pdf("b.pdf", {{"Gold"}, {"Gold"}},
          vorlan::test::eskoXmp({{"Gold", "pantone", "normal"}, {"Gloss", "designer", "varnish"},
                                 {"Zeta", "designer", "technical"}, {"Alpha", "designer", "technical"}}));
    t.pdf("c.pdf", {{}, {}}, vorlan::test::eskoXmp({{"Alpha", "designer", "technical"}, {cut, "designer", "technical"}}));
    vorlan::test::writeFile(job.description, "the host's own description");  // present, not handed over

    std::unique_ptr<LD_JDF> worker = t.run();
    EXPECT_TRUE(worker->eskoInksFound);
    EXPECT_EQ(parsedOf(*worker), (Parsed{"0:0= 1:1= 2:2=Gloss,Zeta,Alpha 3:3=Gloss,Zeta,Alpha 4:4=Alpha," + cut +
                                             " 5:5=Alpha," + cut,
                                         "Alpha," + cut + ",Zeta;"}));
    // The layers belong to the PDFs of content runs 1 and 2.
    ASSERT_EQ(worker->contentRuns.size(), 3u);
    for (size_t run : {1u, 2u}) {
        auto layers = worker->layerDataMap.find(worker->contentRuns[run]->pdf);
        ASSERT_NE(layers, worker->layerDataMap.end());
        EXPECT_EQ(joined(layers->second->sepOCGNames), run == 1 ? "Gloss,Zeta,Alpha" : "Alpha," + cut);
    }
    // The host's file is untouched and the generated one is gone.
    EXPECT_EQ(vorlan::test::readFile(job.description), "the host's own description");
    for (const fs::directory_entry& entry : fs::directory_iterator(job.root))
        EXPECT_EQ(entry.path().filename().string().find(".impinfo."), std::string::npos) << entry.path();
}

// The die library is read only when KVAutoDieControl is "True"; a library that yields no die ink
// (wrong root, only a Layer of that name) leaves the job to the Esko ink lists, here c.pdf's
// varnish, which makes no die cut. A PDF without page inks (a.pdf) takes no pdfIndex.
TEST(AutoDescription, DieLibraryOrEskoInks) {
    const std::string separations = "<AutoDieLibrary><Layers><Layer Name='Gold'/></Layers>"
                                    "<Separations><Separation Name='Die'/></Separations></AutoDieLibrary>";
    const Parsed esko{"0:0= 1:1= 2:2= 3:3= 4:4=Varnish 5:5=Varnish", ""};
    const struct {
        std::string library;
        const char* autoDieControl;
        std::string layers;
        Parsed parsed;
    } cases[] = {
        {separations, "True", "0:Die 1:Die 1:Die", {"0:0= 1:1= 2:2=Die 3:3=Die 4:4=Die,Die 5:5=Die,Die", "Die;"}},
        {separations, "true", "2:Varnish", esko},
        {separations, nullptr, "2:Varnish", esko},
        {"<DieLibrary><Separations><Separation Name='Die'/></Separations></DieLibrary>", "True", "2:Varnish", esko},
        {"<AutoDieLibrary><Layers><Layer Name='Die'/></Layers></AutoDieLibrary>", "True", "2:Varnish", esko},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.library + " / " + (c.autoDieControl ? c.autoDieControl : "(absent)"));
        ThreePdfJob t;
        t.pdf("a.pdf", {{}, {}});
        t.pdf("b.pdf", {{"Die", "Gold"}, {"Gold"}});
        t.pdf("c.pdf", {{"Die"}, {"Die"}}, vorlan::test::eskoXmp({{"Varnish", "designer", "varnish"}}));
        if (c.autoDieControl) setJobAttribute("KVAutoDieControl", c.autoDieControl);
        DieLibraryHome home(c.library);

        std::unique_ptr<LD_JDF> worker = t.run();
        EXPECT_EQ(parsedOf(*worker), c.parsed);
        const std::string text = t.generated(*worker);
        std::string layers;
        static const std::regex line("pdfIndex=\"(\\d+)\" OCGName=\"([^\"]*)\"");
        for (std::sregex_iterator m(text.begin(), text.end(), line), end; m != end; ++m)
            layers += (layers.empty() ? "" : " ") + (*m)[1].str() + ":" + (*m)[2].str();
        EXPECT_EQ(layers, c.layers);
        EXPECT_EQ(text.find("<DieCut") != std::string::npos, !c.parsed.die.empty());
    }
}

// Through vorlan_consume_job: a ticket job whose die ink is found through its Esko ink list, or
// through the die library with KVAutoDieControl "True", runs in spot mode; the first variant
// leaves the die plate blank while the other spot still prints.
TEST(AutoDescriptionPlates, FirstVariantLeavesTheDiePlateBlank) {
    if (!vorlan::test::haveProgram("gs")) GTEST_SKIP() << "Ghostscript (gs) is needed to render the plates";
    const struct {
        const char* source;
        std::string xmp;
        const char* autoDieControl;
    } cases[] = {
        {"Esko ink list", vorlan::test::eskoXmp({{"Gold", "pantone", "normal"}, {"Die", "designer", "technical"}}), nullptr},
        {"die library", "", "True"},
    };
    DieLibraryHome home("<AutoDieLibrary><Separations><Separation Name='Die'/></Separations></AutoDieLibrary>");
    for (const auto& c : cases) {
        SCOPED_TRACE(c.source);
        vorlan::test::TempDir dir;
        setenv("VORLAN_JOB_STORE", (dir / "store").c_str(), 1);
        Job job = writeTicketJob(dir.path(), TicketSpec{}, "");  // four content pages of content.pdf
        vorlan::test::writeSpotPdf((job.dataFolder / "content.pdf").string(), vorlan::test::samePages({"Gold", "Die"}, 4),
                                   c.xmp);
        if (c.autoDieControl) setJobAttribute("KVAutoDieControl", c.autoDieControl);
        const int result = consume(job, "All", true);
        unsetenv("VORLAN_JOB_STORE");
        ASSERT_EQ(result, 0);
        ASSERT_TRUE(fs::exists(job.output));
        TicketView ticket(job.output);
        const std::string url = ticket.attr("//RunList[@Run='0']/LayoutElement/FileSpec", "URL");
        ASSERT_EQ(url.rfind("file://", 0), 0u) << url;
        std::map<std::string, long> plates = vorlan::test::platePixels(url.substr(7), 1);
        ASSERT_FALSE(plates.empty()) << "Ghostscript could not render " << url;
        EXPECT_GT(plates["Gold"], 0);
        EXPECT_EQ(plates.count("Die") ? plates["Die"] : 0, 0) << "the die plate of the first variant is inked";
    }
}

// A generated file that cannot be read back leaves the job without a description, and says so.
TEST(AutoDescription, AnUnreadableFileGivesNoBuffer) {
    LD_JDF worker;
    char* buffer = nullptr;
    long length = 0;
    testing::internal::CaptureStderr();
    EXPECT_FALSE(worker.parseImpInfoFile("", &buffer, &length));
    EXPECT_EQ(buffer, nullptr);
    EXPECT_EQ(testing::internal::GetCapturedStderr(),
              "Invalid or absent xml buffer file, continuing as unversioned job... \n");
}
