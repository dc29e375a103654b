// The worker's conversion of a job's PDFs: the separations collected from the first version and a
// single die cut, and the failure result. Which PDFs a job converts, into the paths its host names,
// is checked end to end by the proof and command-line tests.
#include <gtest/gtest.h>

#include <cwchar>
#include <string>
#include <vector>

#include "platform/os/text.h"
#include "test_pdf.h"
#include "test_support.h"
#include "vorlan/LD_JDF.h"

using vorlan::test::TempDir;
using vorlan::test::TestPdf;

namespace {

struct Host {
    std::vector<std::string> answers;  // the paths handed out, in order
    size_t calls = 0;
};

int namePath(char* buffer, int size, void* user) {
    auto* host = static_cast<Host*>(user);
    const std::string& path = host->answers.at(host->calls++);
    std::snprintf(buffer, static_cast<size_t>(size), "%s", path.c_str());
    return 0;
}

wchar_t* copy(const wchar_t* text) {
    auto* out = static_cast<wchar_t*>(std::malloc((std::wcslen(text) + 1) * sizeof(wchar_t)));
    std::wcscpy(out, text);
    return out;
}

struct Job {
    TempDir dir;
    Host host;
    LD_JDF worker{nullptr, namePath, &host};
    std::string input = (dir / "in.pdf").string();

    Job() {
        vorlan::os::ensureUtf8Locale();
        TestPdf pdf;
        pdf.addPage("/Au cs 1 scn 10 10 20 20 re f 0 g 50 10 20 20 re f",
                    "<< /ColorSpace << /Au " + pdf.separation("Gold") + " >> >>");
        pdf.write(input);
    }

    LD_PDF* addPdf(std::vector<const wchar_t*> layers = {}) {
        auto* pdf = new LD_PDF;
        LD_SetText(pdf->nativePath, vorlan::os::widen(input.c_str()).c_str());
        worker.contentPDFs.push_back(pdf);
        auto* data = new XMLLayerData;
        for (const wchar_t* l : layers) data->layerOCGNames.push_back(copy(l));
        worker.layerDataMap[pdf] = data;
        return pdf;
    }

    void switchOff(std::vector<const wchar_t*> names) {
        auto* version = new XMLVersionData;
        auto* surface = new XMLSurfaceData;
        auto* object = new XMLContentObjectData;
        for (const wchar_t* n : names) object->sepNameOff.push_back(copy(n));
        surface->contentObjects.push_back(object);
        version->surfaces.push_back(surface);
        worker.versions.push_back(version);
    }

    void addDieCut(std::vector<const wchar_t*> separations) {
        auto* die = new LD_DieCut;
        for (const wchar_t* s : separations) die->dieSepInternalNames.push_back(copy(s));
        worker.m_XMLDieCuts.push_back(die);
    }
};

std::string narrow(const wchar_t* text) { return vorlan::os::narrow(text); }

}  // namespace

TEST(ConvertAllPDFs, SeparationsComeFromTheFirstVersionAndASingleDieCut) {
    Job job;
    job.switchOff({L"Gold", L"gold", L"Silver"});
    job.switchOff({L"Copper"});  // a later version adds nothing
    job.addDieCut({L"Die", L"GOLD"});
    std::vector<wchar_t*> names;
    job.worker.getListOfSeparationsToBeConverted(names);
    ASSERT_EQ(names.size(), 3u);
    EXPECT_EQ(narrow(names[0]), "Gold");
    EXPECT_EQ(narrow(names[1]), "Silver");
    EXPECT_EQ(narrow(names[2]), "Die");
    job.addDieCut({L"Other"});  // two die cuts: no die separations
    names.clear();
    job.worker.getListOfSeparationsToBeConverted(names);
    EXPECT_EQ(names.size(), 2u);
}

TEST(ConvertAllPDFs, FirstFailureStopsWithConversionFailed) {
    Job job;
    job.switchOff({L"Gold"});
    job.addPdf();
    job.addPdf();
    vorlan::test::writeFile(job.dir / "file", "x");
    job.host.answers = {(job.dir / "file" / "x.pdf").string(), (job.dir / "ok.pdf").string()};
    EXPECT_EQ(job.worker.convertAllPDFs(), LD_PDF_CONVERSION_FAILED);
    EXPECT_EQ(job.worker.JDF_GetLastErrorCode(), LD_PDF_CONVERSION_FAILED);
    EXPECT_EQ(job.host.calls, 1u);
    auto first = job.worker.layerDataMap.begin(), second = std::next(first);
    EXPECT_FALSE(first->first->converted);
    EXPECT_EQ(narrow(second->first->convertedPath), "") << "later PDFs are not visited";

    Job longName;
    const std::wstring name(1024, L'G');
    longName.switchOff({name.c_str()});
    longName.addPdf();
    longName.host.answers = {(longName.dir / "out.pdf").string()};
    EXPECT_EQ(longName.worker.convertAllPDFs(), LD_PDF_CONVERSION_FAILED);
}
