// The ordinal table: construction from runs, appends, inserts and the look-ups by ordinal.
#include <gtest/gtest.h>

#include "jdf/ticket_handles.h"
#include "vorlan/LD_JDF.h"

namespace {

// A worker whose lists the test fills by hand; records are released by the worker.
class OrdinalTable : public ::testing::Test {
protected:
    LD_PDF* pdf(const wchar_t* url) {
        auto* p = new LD_PDF;
        LD_SetText(p->url, url);
        w.contentPDFs.push_back(p);
        return p;
    }
    LD_Run* run(std::vector<LD_Run*>& list, std::vector<int32_t> pages, bool endOfDocument = false,
                LD_PDF* file = nullptr) {
        auto* r = new LD_Run;
        r->pages = std::move(pages);
        r->EndOfDocument = endOfDocument;
        r->pdf = file;
        r->runNumber = static_cast<int32_t>(list.size());
        list.push_back(r);
        return r;
    }
    LD_OCG_InterpretingParams* params(std::vector<const wchar_t*> on, int32_t runNumber = 0) {
        auto* p = new LD_OCG_InterpretingParams;
        for (const wchar_t* name : on) p->m_OCGOn.push_back(LD_CopyText(name));
        p->runNumber = runNumber;
        return p;
    }
    std::vector<int32_t> ordinals() {
        std::vector<int32_t> out;
        for (auto* row : w.m_OrdinalTable) out.push_back(row->ordinal);
        return out;
    }
    LD_JDF w;
};

TEST_F(OrdinalTable, ContentPagesNumberedInRunOrderWithLogicalDocuments) {
    run(w.contentRuns, {0, 1, 2}, true);
    run(w.contentRuns, {5, 6});
    w.constructOrdinalTable();
    EXPECT_EQ(ordinals(), (std::vector<int32_t>{0, 1, 2, 3, 4}));
    EXPECT_EQ(w.numberOfLogicalPages, 5);
    EXPECT_EQ(w.numberOfLogicalDocs, 2);
    EXPECT_EQ(w.m_OrdinalTable[2]->logicalDocument, 0);
    EXPECT_EQ(w.m_OrdinalTable[3]->logicalDocument, 1);
    EXPECT_EQ(w.m_OrdinalTable[4]->content->page, 6);

    w.contentRuns[1]->EndOfDocument = true;
    w.constructOrdinalTable();  // rebuilding drops the old rows
    EXPECT_EQ(w.m_OrdinalTable.size(), 5u);
    EXPECT_EQ(w.numberOfLogicalDocs, 3);
}

TEST_F(OrdinalTable, RangesFillPagesAndEmptyRunsStillEndDocuments) {
    LD_Run* ranged = run(w.contentRuns, {});
    ranged->FirstPage = 0;
    ranged->NPage = 4;
    ranged->SkipPage = 0;  // a step below 1 counts as 1
    LD_Run* empty = run(w.contentRuns, {}, true);
    empty->NPage = 0;
    w.constructOrdinalTable();
    EXPECT_EQ(ranged->pages, (std::vector<int32_t>{0, 1, 2, 3}));
    EXPECT_EQ(w.numberOfLogicalPages, 4);
    EXPECT_EQ(w.numberOfLogicalDocs, 2);
}

TEST_F(OrdinalTable, MarkPagesAttachByPositionAndAppendRows) {
    run(w.contentRuns, {0, 1});
    LD_Run* marks = run(w.markRuns, {});
    marks->FirstPage = 0;
    marks->NPage = 3;
    marks->SkipPage = 1;
    w.constructOrdinalTable();
    ASSERT_EQ(w.m_OrdinalTable.size(), 3u);
    EXPECT_EQ(w.JDF_GetLogicalContentPageByOrdinalNumber(2), nullptr);
    ASSERT_NE(w.JDF_GetLogicalMarkPageByOrdinalNumber(2), nullptr);
    EXPECT_EQ(w.JDF_GetLogicalMarkPageByOrdinalNumber(2)->page, 2);
    EXPECT_EQ(w.getMarkRunByOrdNumber(0), marks);
    EXPECT_EQ(w.getRunByOrdNumber(2), nullptr);
}

TEST_F(OrdinalTable, RunEqualityComparesFilesIgnoringCaseAndSortedPages) {
    LD_Run* a = run(w.contentRuns, {3, 1}, false, pdf(L"A.pdf"));
    LD_Run* b = run(w.contentRuns, {1, 3}, false, pdf(L"a.PDF"));
    EXPECT_TRUE(w.areRunsEqual(a, b));
    LD_Run* noFile = run(w.contentRuns, {1, 3});
    EXPECT_FALSE(w.areRunsEqual(a, noFile));
    EXPECT_FALSE(w.areRunsEqual(noFile, a));
}

TEST_F(OrdinalTable, ParamsEqualityIgnoresCaseAndOrder) {
    std::unique_ptr<LD_OCG_InterpretingParams> a(params({L"Layer1", L"Die"})), b(params({L"die", L"LAYER1"})),
        c(params({L"Layer1"}));
    EXPECT_TRUE(w.areInterpretingParamsEqual(a.get(), b.get()));
    EXPECT_FALSE(w.areInterpretingParamsEqual(c.get(), a.get()));
    EXPECT_FALSE(w.areInterpretingParamsEqual(a.get(), nullptr));
}

TEST_F(OrdinalTable, SearchForPairHonoursThePage) {
    LD_PDF* file = pdf(L"a.pdf");
    run(w.contentRuns, {4, 5}, false, file);
    auto* p = params({L"L"}, 0);
    w.m_InterpretingParams.push_back(p);
    w.constructOrdinalTable();
    std::unique_ptr<LD_Run> probe(new LD_Run);
    probe->pdf = file;
    probe->pages = {5, 4};
    std::unique_ptr<LD_OCG_InterpretingParams> same(params({L"l"}));
    EXPECT_EQ(w.searchOrdinalTableForRunIPPair(probe.get(), same.get(), -1), w.m_OrdinalTable[0]);
    EXPECT_EQ(w.searchOrdinalTableForRunIPPair(probe.get(), same.get(), 5), w.m_OrdinalTable[1]);
    EXPECT_EQ(w.searchOrdinalTableForRunIPPair(probe.get(), same.get(), 7), nullptr);
    EXPECT_EQ(w.getInterpretingParamsByOrdNumber(1), p);
}

TEST_F(OrdinalTable, InsertMovesLaterRowsUpByOne) {
    run(w.contentRuns, {10, 11, 12});
    w.constructOrdinalTable();
    LD_Run* inserted = run(w.contentRuns, {7});
    std::unique_ptr<LD_OCG_InterpretingParams> p(params({}));
    EXPECT_EQ(w.updateAndInsertToOrdinalTable(inserted, p.get(), 1), 1);
    EXPECT_EQ(ordinals(), (std::vector<int32_t>{0, 1, 2, 3}));
    EXPECT_EQ(w.JDF_GetLogicalContentPageByOrdinalNumber(1)->page, 7);
    EXPECT_EQ(w.JDF_GetLogicalContentPageByOrdinalNumber(2)->page, 11);
    EXPECT_EQ(w.JDF_GetLogicalContentPageByOrdinalNumber(3)->page, 12);
    EXPECT_TRUE(p->OCGOnEmpty);
    EXPECT_EQ(w.updateAndInsertToOrdinalTable(inserted, p.get(), 4), -1);
    EXPECT_EQ(w.updateAndInsertToOrdinalTable(inserted, p.get(), -1), -1);
}

TEST_F(OrdinalTable, InsertIntoTableWithGapsIsRefusedUntouched) {
    run(w.contentRuns, {0, 1, 2});
    w.constructOrdinalTable();
    w.m_OrdinalTable[1]->ordinal = 9;  // a gap: no row carries ordinal 1 any more
    std::unique_ptr<LD_Run> r(new LD_Run);
    std::unique_ptr<LD_OCG_InterpretingParams> p(params({}));
    EXPECT_EQ(w.updateAndInsertToOrdinalTable(r.get(), p.get(), 0), -1);
    EXPECT_EQ(w.lastError, LD_FAILED);
    EXPECT_EQ(ordinals(), (std::vector<int32_t>{0, 9, 2}));
}

TEST_F(OrdinalTable, AppendFillsFirstMarkOnlyRowAndNumbersTheRun) {
    run(w.contentRuns, {0});
    LD_Run* marks = run(w.markRuns, {0, 1, 2});
    w.constructOrdinalTable();
    w.jobHasTicket = true;
    auto* added = new LD_Run;
    added->pages = {3};
    auto* p = params({L"X"});
    int32_t n = w.updateAndAppendToOrdinalTable(added, p);
    w.contentRuns.push_back(added);
    w.m_InterpretingParams.push_back(p);
    EXPECT_EQ(n, 1);
    EXPECT_EQ(w.m_OrdinalTable.size(), 3u);
    EXPECT_EQ(w.getMarkRunByOrdNumber(1), marks);
    EXPECT_EQ(w.getRunByOrdNumber(1), added);
    EXPECT_EQ(added->runNumber, 1);
    EXPECT_STREQ(added->runName, L"1");
    EXPECT_STREQ(p->runName, L"1");
    EXPECT_STREQ(p->OCGDefault, L"FromPDF");
    EXPECT_STREQ(p->OCGProcess, L"View");
    EXPECT_FALSE(p->OCGOnEmpty);
    EXPECT_EQ(w.getInterpretingParamsByRunNumber(1), p);
}

TEST_F(OrdinalTable, AppendWithoutContentRunsReadsNothingPastTheList) {
    w.jobHasTicket = true;
    auto* added = new LD_Run;
    w.contentRuns.clear();
    std::unique_ptr<LD_OCG_InterpretingParams> p(params({}));
    EXPECT_EQ(w.updateAndAppendToOrdinalTable(added, p.get()), 0);
    EXPECT_EQ(added->runNumber, 0);
    EXPECT_EQ(w.JDF_GetLogicalContentPageByOrdinalNumber(0)->page, -1);
    w.contentRuns.push_back(added);
}

TEST_F(OrdinalTable, AppendAfterEndOfDocumentStartsANewDocument) {
    run(w.contentRuns, {0}, true);
    w.constructOrdinalTable();
    auto* added = new LD_Run;
    added->pages = {1};
    int32_t n = w.updateAndAppendToOrdinalTable(added, nullptr);
    w.contentRuns.push_back(added);
    // The closed document and the open one were counted by the construction; the append
    // counts the end of document once more, as the table's numbering rules say.
    EXPECT_EQ(w.numberOfLogicalDocs, 3);
    EXPECT_EQ(w.getOrdinalElementByOrdNum(n)->logicalDocument, 2);
}

TEST_F(OrdinalTable, SetOrdinalElementReportsMissingRow) {
    run(w.contentRuns, {0});
    w.constructOrdinalTable();
    auto* row = new LD_OrdinalTableElement;
    w.setOrdinalElementByOrdNum(5, row);
    EXPECT_EQ(w.lastError, LD_FAILED);
    LD_OrdinalTableElement* old = w.m_OrdinalTable[0];
    w.setOrdinalElementByOrdNum(0, row);  // row keeps ordinal 0
    EXPECT_EQ(w.lastError, LD_OK);
    EXPECT_EQ(w.getOrdinalElementByOrdNum(0), row);
    delete old;
}

TEST_F(OrdinalTable, ContentObjectOrdinalsAndLayout) {
    w.contentObjectOrdinalMap = {{4, 0}, {7, 1}, {4, 2}};
    auto* object = new LD_ContentObject;
    object->contentObjectIndex = 2;
    w.contentObjects.push_back(object);
    EXPECT_EQ(w.getOrdNumberFromContentObjectIndex(1), 1);  // no ticket: the index itself
    w.jobHasTicket = true;
    EXPECT_EQ(w.getOrdNumberFromContentObjectIndex(1), 1);  // no layout either
    JDF::JDFParser parser;
    ASSERT_TRUE(parser.ParseString("<Layout/>"));
    w.ticket->layoutElement = parser.GetRoot();
    EXPECT_EQ(w.getOrdNumberFromContentObjectIndex(2), 4);
    EXPECT_EQ(w.getOrdNumberFromContentObjectIndex(5), -1);
    w.setOrdNumberFromContentObjectIndex(1, 9);
    EXPECT_EQ(w.contentObjectOrdinalMap[1].ord, 9);
    w.updateOrdInLayout(2, 12);
    EXPECT_EQ(object->Ord, 12);
    w.updateOrdInLayout(3, 12);
    EXPECT_EQ(w.lastError, LD_FAILED);
    w.contentObjects.clear();
    delete object;
}

TEST_F(OrdinalTable, ListHelpers) {
    std::vector<LD_Run*> source{new LD_Run, nullptr}, destination;
    EXPECT_EQ(w.copyRunlist(source, destination), LD_INVALID_INPUT);
    EXPECT_EQ(w.lastError, LD_INVALID_INPUT);
    EXPECT_EQ(destination.size(), 1u);
    delete source[0];
    std::vector<wchar_t*> names{LD_CopyText(L"Cyan"), LD_CopyText(L"Die")}, copy{LD_CopyText(L"x")};
    EXPECT_EQ(w.stringVecContains(names, L"DIE"), 1);
    EXPECT_EQ(w.stringVecContains(names, L"Black"), -1);
    w.copyOCGVec(copy, names);
    ASSERT_EQ(copy.size(), 3u);
    EXPECT_NE(copy[1], names[0]);
    EXPECT_STREQ(copy[2], L"Die");
    LD_FreeTextList(names);
    LD_FreeTextList(copy);
}

}  // namespace
