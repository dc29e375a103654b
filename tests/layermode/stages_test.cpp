// Expansion and die steps on a model built in memory: the cases a generated job cannot reach
// or cannot show in the written ticket.
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

TEST(Expansion, BarePdfPagesGetTheFirstPdfsDefaults) {
    BarePdf job(3);
    ASSERT_EQ(job.w.createRunListAndInterpretingParamPairs(false), LD_OK);
    ASSERT_EQ(job.w.contentRuns.size(), 3u);
    EXPECT_EQ(job.w.m_OrdinalTable.size(), 3u);
    EXPECT_EQ(job.w.contentRuns[2]->pages, std::vector<int32_t>{2});
    EXPECT_EQ(job.w.contentRuns[2]->contentType, CONTENT_CONTENT);
    EXPECT_EQ(joined(job.w.m_InterpretingParams[1]->m_OCGOn), L"Art");
    EXPECT_EQ(joined(job.w.m_InterpretingParams[1]->m_OCGOff), L"Die White");
}

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

TEST(Expansion, TicketJobsThatAreNotFailures) {
    // Two content PDFs, the description covering only the first: the second gets no switches.
    LD_JDF w;
    w.jobHasTicket = true;
    for (const wchar_t* name : {L"/jobs/a.pdf", L"/jobs/b.pdf"}) {
        auto* pdf = new LD_PDF;
        LD_SetText(pdf->nativePath, name);
        w.contentPDFs.push_back(pdf);
        auto* run = new LD_Run;
        run->pdf = pdf;
        w.contentRuns.push_back(run);
    }
    auto* layers = new XMLLayerData;
    layers->defaultOnOCGNames = names({L"Art"});
    w.layerDataMap[w.contentPDFs[0]] = layers;
    ASSERT_EQ(w.createRunListAndInterpretingParamPairs(true), LD_OK);
    ASSERT_EQ(w.m_InterpretingParams.size(), 2u);
    EXPECT_EQ(joined(w.m_InterpretingParams[0]->m_OCGOn), L"Art");
    EXPECT_TRUE(w.m_InterpretingParams[1]->m_OCGOn.empty() && w.m_InterpretingParams[1]->m_OCGOff.empty());

    // A layout without surfaces is no failure while no version is printed; it is with one.
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

TEST(DieSteps, BarePdfOfFourPagesGetsTwoDiePagesOfEachKind) {
    BarePdf job(4);
    ASSERT_EQ(job.w.createRunListAndInterpretingParamPairs(false), LD_OK);
    job.addDie(true);
    ASSERT_EQ(job.w.addDieCut(false), LD_OK);
    EXPECT_TRUE(job.w.dieCutDefined);
    ASSERT_EQ(job.w.contentRuns.size(), 8u);
    EXPECT_EQ(job.w.contentRuns[4]->contentType, CONTENT_DIE_WITH_CONTENT);
    EXPECT_EQ(job.w.contentRuns[5]->pages, std::vector<int32_t>{1});
    EXPECT_EQ(job.w.contentRuns[6]->contentType, CONTENT_DIE_ONLY);
    EXPECT_EQ(job.w.contentRuns[7]->pages, std::vector<int32_t>{1});
    // Both die-only pages share one parameter record.
    LD_OCG_InterpretingParams* dieOnly = job.w.getInterpretingParamsByOrdNumber(6);
    EXPECT_EQ(dieOnly, job.w.getInterpretingParamsByOrdNumber(7));
    EXPECT_EQ(job.w.m_InterpretingParams.size(), 7u);
    EXPECT_EQ(joined(dieOnly->m_OCGOn), L"Die");
    EXPECT_EQ(joined(dieOnly->m_OCGOff), L"Art White KVVersionSpecialOCGName");
    EXPECT_EQ(joined(job.w.getInterpretingParamsByOrdNumber(4)->m_OCGOn), L"Art KVVersionSpecialOCGName Die");
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

TEST(DieSteps, LayoutDieSheetsShareRowsForTheSamePage) {
    // A one-sheet, one-sided layout whose surface shows page 0 twice.
    LD_JDF w;
    JDF::JDFDoc doc(0);
    w.ticket->layoutElement = doc.GetRoot().AppendElement(L"Layout");
    w.jobHasTicket = true;
    auto* signature = new LD_Signature;
    signature->index = 0;
    auto* sheet = new LD_Sheet;
    sheet->index = 0;
    auto* surface = new LD_Surface;
    surface->index = 0;
    surface->sheetIndex = 0;
    surface->contentType = CONTENT_CONTENT;
    for (int i = 0; i < 2; ++i) {
        auto* object = new LD_ContentObject;
        object->contentObjectIndex = i;
        object->Ord = 0;
        surface->contentObjects.push_back(object);
        w.contentObjects.push_back(object);
        w.contentObjectOrdinalMap.push_back({0, i});
    }
    sheet->front = surface;
    signature->sheetList.push_back(sheet);
    w.signatures.push_back(signature);
    w.sheets.push_back(sheet);
    w.surfaces.push_back(surface);
    auto* pdf = new LD_PDF;
    LD_SetText(pdf->url, L"a.pdf");
    LD_SetText(pdf->nativePath, L"/jobs/a.pdf");
    w.contentPDFs.push_back(pdf);
    auto* run = new LD_Run;
    run->pdf = pdf;
    run->pages = {0};
    run->contentType = CONTENT_CONTENT;
    w.contentRuns.push_back(run);
    auto* layers = new XMLLayerData;
    layers->layerOCGNames = names({L"Art", L"Die"});
    layers->defaultOnOCGNames = names({L"Art"});
    layers->defaultOffOCGNames = names({L"Die"});
    w.layerDataMap[pdf] = layers;
    w.constructOrdinalTable();

    ASSERT_EQ(w.createRunListAndInterpretingParamPairs(true), LD_OK);
    auto* die = new LD_DieCut;
    die->dieLayerInternalNames = names({L"Die"});
    w.m_XMLDieCuts.push_back(die);
    w.dieEnabled = true;
    ASSERT_EQ(w.addDieCut(true), LD_OK);
    ASSERT_EQ(w.sheets.size(), 3u);
    EXPECT_EQ(std::wstring(w.sheets[2]->name), L"DieSheet");
    EXPECT_EQ(w.sheets[1]->index, 1);
    EXPECT_EQ(w.sheets[2]->index, 2);
    EXPECT_EQ(w.surfaces[2]->index, 2);
    EXPECT_EQ(signature->sheetList.size(), 3u);
    // Each die sheet's two objects show page 0: one new row per die sheet.
    EXPECT_EQ(w.m_OrdinalTable.size(), 3u);
    for (LD_Sheet* dieSheet : {w.sheets[1], w.sheets[2]}) {
        EXPECT_EQ(dieSheet->front->contentObjects[0]->Ord, dieSheet->front->contentObjects[1]->Ord);
        EXPECT_EQ(dieSheet->front->VersionName, nullptr);
    }
    EXPECT_EQ(w.sheets[1]->front->contentType, CONTENT_DIE_WITH_CONTENT);
    EXPECT_EQ(w.sheets[2]->front->contentType, CONTENT_DIE_ONLY);
    EXPECT_EQ(surface->contentObjects[0]->Ord, 0);  // the content sheet is untouched
}
