// The ordinal table: construction from runs, appends, inserts and the look-ups by ordinal, on
// the edges written tickets do not show (gaps, empty lists, documents ended by empty runs).
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

TEST_F(OrdinalTable, ConstructionNumbersPagesDocumentsAndMarkRows) {
    run(w.contentRuns, {0, 1, 2}, true);
    LD_Run* ranged = run(w.contentRuns, {});
    ranged->FirstPage = 1;
    ranged->NPage = 3;  // pages from FirstPage below NPage
    ranged->SkipPage = 0;  // a step below 1 counts as 1
    run(w.contentRuns, {}, true)->NPage = 0;  // empty, yet it ends a document
    LD_Run* marks = run(w.markRuns, {});
    marks->FirstPage = 0;
    marks->NPage = 7;
    marks->SkipPage = 1;
    w.constructOrdinalTable();
    EXPECT_EQ(ranged->pages, (std::vector<int32_t>{1, 2}));
    EXPECT_EQ(ordinals(), (std::vector<int32_t>{0, 1, 2, 3, 4, 5, 6}));
    EXPECT_EQ(w.numberOfLogicalPages, 7);
    EXPECT_EQ(w.numberOfLogicalDocs, 3);
    EXPECT_EQ(w.m_OrdinalTable[3]->logicalDocument, 1);
    EXPECT_EQ(w.m_OrdinalTable[4]->content->page, 2);
    // Mark pages attach by position; beyond the content pages a row holds a mark alone.
    EXPECT_EQ(w.JDF_GetLogicalContentPageByOrdinalNumber(5), nullptr);
    EXPECT_EQ(w.JDF_GetLogicalMarkPageByOrdinalNumber(6)->page, 6);
    EXPECT_EQ(w.getMarkRunByOrdNumber(0), marks);
    EXPECT_EQ(w.getRunByOrdNumber(6), nullptr);
    w.constructOrdinalTable();  // rebuilding drops the old rows
    EXPECT_EQ(w.m_OrdinalTable.size(), 7u);
}

TEST_F(OrdinalTable, EqualityIgnoresCaseAndOrderAndTheSearchHonoursThePage) {
    LD_PDF* file = pdf(L"A.pdf");
    LD_Run* a = run(w.contentRuns, {4, 5}, false, file);
    std::unique_ptr<LD_Run> other(new LD_Run), noFile(new LD_Run);
    other->pdf = pdf(L"a.PDF");
    other->pages = noFile->pages = {5, 4};
    EXPECT_TRUE(w.areRunsEqual(a, other.get()));
    EXPECT_FALSE(w.areRunsEqual(a, noFile.get()));
    EXPECT_FALSE(w.areRunsEqual(noFile.get(), a));
    std::unique_ptr<LD_OCG_InterpretingParams> same(params({L"die", L"LAYER1"})), fewer(params({L"Layer1"}));
    auto* p = params({L"Layer1", L"Die"}, 0);
    w.m_InterpretingParams.push_back(p);
    EXPECT_TRUE(w.areInterpretingParamsEqual(p, same.get()));
    EXPECT_FALSE(w.areInterpretingParamsEqual(fewer.get(), p));
    EXPECT_FALSE(w.areInterpretingParamsEqual(p, nullptr));
    w.constructOrdinalTable();
    EXPECT_EQ(w.searchOrdinalTableForRunIPPair(other.get(), same.get(), -1), w.m_OrdinalTable[0]);
    EXPECT_EQ(w.searchOrdinalTableForRunIPPair(other.get(), same.get(), 5), w.m_OrdinalTable[1]);
    EXPECT_EQ(w.searchOrdinalTableForRunIPPair(other.get(), same.get(), 7), nullptr);
    EXPECT_EQ(w.getInterpretingParamsByOrdNumber(1), p);
}

TEST_F(OrdinalTable, InsertMovesLaterRowsUpAndATableWithGapsIsRefusedUntouched) {
    run(w.contentRuns, {10, 11, 12});
    w.constructOrdinalTable();
    LD_Run* inserted = run(w.contentRuns, {7});
    std::unique_ptr<LD_OCG_InterpretingParams> p(params({}));
    EXPECT_EQ(w.updateAndInsertToOrdinalTable(inserted, p.get(), 1), 1);
    EXPECT_EQ(ordinals(), (std::vector<int32_t>{0, 1, 2, 3}));
    EXPECT_EQ(w.JDF_GetLogicalContentPageByOrdinalNumber(1)->page, 7);
    EXPECT_EQ(w.JDF_GetLogicalContentPageByOrdinalNumber(3)->page, 12);
    EXPECT_TRUE(p->OCGOnEmpty);
    EXPECT_EQ(w.updateAndInsertToOrdinalTable(inserted, p.get(), 4), -1);
    EXPECT_EQ(w.updateAndInsertToOrdinalTable(inserted, p.get(), -1), -1);
    w.m_OrdinalTable[1]->ordinal = 9;  // a gap: no row carries ordinal 1 any more
    EXPECT_EQ(w.updateAndInsertToOrdinalTable(inserted, p.get(), 0), -1);
    EXPECT_EQ(w.lastError, LD_FAILED);
    EXPECT_EQ(ordinals(), (std::vector<int32_t>{0, 9, 2, 3}));
}

TEST_F(OrdinalTable, AppendFillsTheFirstMarkOnlyRowAndNumbersTheRun) {
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
    EXPECT_STREQ(added->runName, L"1");
    EXPECT_STREQ(p->runName, L"1");
    EXPECT_FALSE(p->OCGOnEmpty);
    EXPECT_EQ(w.getInterpretingParamsByRunNumber(1), p);
}

TEST_F(OrdinalTable, AppendAfterAnEndOfDocumentOrToNoContentRuns) {
    run(w.contentRuns, {0}, true);
    w.constructOrdinalTable();
    auto* added = new LD_Run;
    added->pages = {1};
    int32_t n = w.updateAndAppendToOrdinalTable(added, nullptr);
    w.contentRuns.push_back(added);
    // The construction counted the closed document and the open one; the append counts the end
    // of document once more, as the table's numbering rules say.
    EXPECT_EQ(w.numberOfLogicalDocs, 3);
    EXPECT_EQ(w.getOrdinalElementByOrdNum(n)->logicalDocument, 2);

    LD_JDF empty;
    empty.jobHasTicket = true;
    auto* first = new LD_Run;
    std::unique_ptr<LD_OCG_InterpretingParams> p(params({}));
    EXPECT_EQ(empty.updateAndAppendToOrdinalTable(first, p.get()), 0);  // reads nothing past the empty list
    EXPECT_EQ(empty.JDF_GetLogicalContentPageByOrdinalNumber(0)->page, -1);
    empty.contentRuns.push_back(first);
}

TEST_F(OrdinalTable, RowsAndContentObjectOrdinalsBySetters) {
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

    w.contentObjectOrdinalMap = {{4, 0}, {7, 1}, {4, 2}};
    auto* object = new LD_ContentObject;
    object->contentObjectIndex = 2;
    w.contentObjects.push_back(object);
    w.jobHasTicket = true;
    EXPECT_EQ(w.getOrdNumberFromContentObjectIndex(1), 1);  // no layout: the index itself
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

    std::vector<LD_Run*> source{new LD_Run, nullptr}, destination;  // a hole in the list
    EXPECT_EQ(w.copyRunlist(source, destination), LD_INVALID_INPUT);
    EXPECT_EQ(destination.size(), 1u);
    delete source[0];
}

}  // namespace
