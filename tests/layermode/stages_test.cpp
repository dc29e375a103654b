// Expansion and die steps on a model built in memory: the cases a generated job cannot reach
// or cannot show in the written ticket (the others run end to end in die_test.cpp and
// end_to_end_test.cpp).
#include <cstdlib>
#include <cwchar>

#include <gtest/gtest.h>

#include "jdf/ticket_handles.h"
#include "vorlan/LD_JDF.h"

namespace {

std::vector<wchar_t*> names(std::initializer_list<const wchar_t*> list) {
    std::vector<wchar_t*> out;
    for (const wchar_t* n : list) out.push_back(LD_CopyText(n));
    return out;
}

std::wstring joined(const std::vector<wchar_t*>& list) {
    std::wstring text;
    for (const wchar_t* n : list) text += (text.empty() ? L"" : L" ") + std::wstring(n);
    return text;
}

// A bare-PDF worker with n pages all selected and layers Art (on), Die and White (off).
struct BarePdf {
    LD_JDF w;
    explicit BarePdf(int n) {
        w.inputPDF = new LD_PDF;
        LD_SetText(w.inputPDF->nativePath, L"/jobs/a.pdf");
        auto* layers = new XMLLayerData;
        layers->layerOCGNames = names({L"Art", L"Die"});
        layers->sepOCGNames = names({L"White"});
        layers->defaultOnOCGNames = names({L"Art"});
        layers->defaultOffOCGNames = names({L"Die", L"White"});
        w.layerDataMap[w.inputPDF] = layers;
        for (int i = 0; i < n; ++i) {
            auto* s = new XMLSurfaceData;
            s->index = i;
            w.surfaceVersions.push_back(s);
        }
        w.pageRangeMode = 0;
        w.applyPageRangeForPDFWithoutVersions();
    }
    void addDie(bool enabled) {
        auto* die = new LD_DieCut;
        die->dieLayerInternalNames = names({L"die"});
        w.m_XMLDieCuts.push_back(die);
        w.dieEnabled = enabled;
    }
};

}  // namespace

TEST(Expansion, ParametersMadeBeforeExpansionAreRefused) {
    LD_JDF w;
    w.jobHasTicket = true;
    w.contentRuns.push_back(new LD_Run);
    w.m_InterpretingParams.push_back(new LD_OCG_InterpretingParams);
    EXPECT_EQ(w.createRunListAndInterpretingParamPairs(true), LD_FAILED);
    w.releaseInterpretingParams();
    w.contentRuns.push_back(nullptr);  // a hole in the run list
    EXPECT_EQ(w.createRunListAndInterpretingParamPairs(true), LD_FAILED);
}

// A layout without surfaces is no failure while no version is printed; it is with one.
TEST(Expansion, LayoutWithoutSurfacesFailsOnlyAPrintedVersion) {
    LD_JDF v;
    JDF::JDFDoc doc(0);
    v.jobHasTicket = true;
    v.ticket->layoutElement = doc.GetRoot().AppendElement(L"Layout");
    for (bool enabled : {false, true}) {
        auto* version = new XMLVersionData;
        version->enabled = enabled;
        version->surfaces.push_back(new XMLSurfaceData);
        v.versions.push_back(version);
        EXPECT_EQ(v.createRunListAndInterpretingParamPairs(true), enabled ? LD_FAILED : LD_OK);
    }
    v.releaseVersions();
    auto* empty = new XMLVersionData;  // enabled, but without surfaces
    empty->enabled = true;
    v.versions.push_back(empty);
    EXPECT_EQ(v.createRunListAndInterpretingParamPairs(true), LD_OK);
}

TEST(Expansion, VersionSwitchesMergeLayersBeforeSeparations) {
    BarePdf job(1);
    auto* version = new XMLVersionData;
    version->name = LD_CopyText(L"V");
    version->enabled = true;
    version->copies = 3;
    auto* surface = new XMLSurfaceData;
    auto* object = new XMLContentObjectData;
    object->layerNameOn = names({L"A"});
    object->sepNameOn = names({L"Cyan"});
    object->layerNameOff = names({L"B"});
    surface->contentObjects.push_back(object);
    version->surfaces.push_back(surface);
    job.w.versions.push_back(version);
    ASSERT_EQ(job.w.createRunListAndInterpretingParamPairs(false), LD_OK);
    ASSERT_EQ(job.w.m_InterpretingParams.size(), 1u);
    EXPECT_EQ(joined(job.w.m_InterpretingParams[0]->m_OCGOn), L"A Cyan");
    EXPECT_EQ(joined(job.w.m_InterpretingParams[0]->m_OCGOff), L"B");
    EXPECT_EQ(job.w.contentRuns[0]->VersionCopyCount, 3);
}

TEST(DieSteps, DisabledDieSwitchesTheDieOffAndAddsNothing) {
    BarePdf job(2);
    ASSERT_EQ(job.w.createRunListAndInterpretingParamPairs(false), LD_OK);
    job.w.m_InterpretingParams[0]->m_OCGOn.push_back(LD_CopyText(L"DIE"));
    job.addDie(false);
    ASSERT_EQ(job.w.addDieCut(false), LD_OK);
    EXPECT_EQ(job.w.contentRuns.size(), 2u);
    EXPECT_EQ(joined(job.w.m_InterpretingParams[0]->m_OCGOn), L"Art KVVersionSpecialOCGName");
    EXPECT_EQ(joined(job.w.m_InterpretingParams[0]->m_OCGOff), L"Die White");
}

TEST(DieSteps, OddPagesGiveOneDiePageOfEachKind) {
    BarePdf job(4);
    job.w.pageSelection = {true, false, true, false};
    ASSERT_EQ(job.w.createRunListAndInterpretingParamPairs(false), LD_OK);
    job.addDie(true);
    ASSERT_EQ(job.w.addDieCut(false), LD_OK);
    EXPECT_FALSE(job.w.dieCutDefined);
    EXPECT_EQ(job.w.contentRuns.size(), 4u);  // two pages, one die with content, one die only
}
