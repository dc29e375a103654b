// The query interface on a read ticket.
#include <stdexcept>

#include <gtest/gtest.h>

#include "ticket_fixture.h"

namespace {

using vorlan::test::jdfTicket;
using vorlan::test::ReadTicket;

class ReadQueries : public ::testing::Test {
protected:
    static std::string ticket() {
        std::string runs = vorlan::test::runListByRun(
            "RL", vorlan::test::runPartition(0, "Art.pdf", R"(NPage="2")") +
                      vorlan::test::runPartition(1, "other.pdf", R"(NPage="1")", R"(Status="Draft")"));
        std::string layout = R"(<Layout ID="L" Class="Parameter" Status="Available"><Signature Name="S1"><Sheet Name="A">
            <Surface Side="Front"><ContentObject CTM="1 0 0 1 0 0" Ord="0"/></Surface></Sheet></Signature></Layout>)";
        return jdfTicket(runs + layout + R"(<InterpretingParams ID="IP" Status="Available"/>)",
                         R"(<RunListLink rRef="RL" Usage="Input" ProcessUsage="Document"/><LayoutLink rRef="L" Usage="Input"/>)",
                         R"(Type="Imposition" Activation="Held" ICSVersions="Base_L1-1.0 LayCrImp_L1-1.0")");
    }
    ReadTicket t{ticket()};
};

TEST_F(ReadQueries, PdfsAndStatus) {
    ASSERT_EQ(t.result, LD_OK);
    std::vector<LD_PDF*> available = t->JDF_GetContentPDFsByStatus(7);
    ASSERT_EQ(available.size(), 1u);
    EXPECT_TRUE(t->JDF_GetMarkPDFsByStatus(7).empty());
    EXPECT_EQ(t->JDF_GetPDFStatus(const_cast<wchar_t*>(L"Art.pdf")), 7);
    EXPECT_EQ(t->JDF_GetPDFStatus(const_cast<wchar_t*>(L"art.pdf")), 0);  // case matters here
    EXPECT_EQ(t->JDF_GetLastErrorCode(), LD_QUERY_TARGET_ABSENT);
    t->JDF_GetAllContentPDFs();
    EXPECT_EQ(t->JDF_GetLastErrorCode(), LD_OK);
}

TEST_F(ReadQueries, LayoutAndNodes) {
    EXPECT_EQ(t->JDF_GetSignaturesInLayoutByIndex(0)->sheetRange.last, 0);
    EXPECT_THROW(t->JDF_GetSignaturesInLayoutByIndex(1), std::out_of_range);
    EXPECT_THROW(t->JDF_GetRangeOfSheetsPerSignature(-1), std::out_of_range);
    EXPECT_EQ(t->JDF_GetLogicalContentPageByOrdinalNumber(9), nullptr);
    EXPECT_EQ(t->JDF_GetStatusOfNodeByType(JDF_NODE_ROOT), 1);  // Waiting
    EXPECT_EQ(t->JDF_GetStatusOfNodeByType(JDF_NODE_LAYOUT), 7);
    EXPECT_EQ(t->JDF_GetStatusOfNodeByType(JDF_NODE_INTERPRETING_PARAMS), 0);
    t->lastError = LD_OK;
    EXPECT_EQ(t->JDF_GetStatusOfNodeByType(static_cast<JDFNode_Types>(7)), 0);
    EXPECT_EQ(t->JDF_GetLastErrorCode(), LD_QUERY_TARGET_ABSENT);
    EXPECT_EQ(t->JDF_GetActivationOfProcessByType(JDF_NODE_PROCESS), 3);  // Held
    EXPECT_STREQ(t->JDF_GetIDofProcessByType(JDF_NODE_ROOT), L"n1");
    EXPECT_EQ(t->JDF_GetIDofProcessByType(JDF_NODE_LAYOUT), nullptr);
    EXPECT_STREQ(t->JDF_GetJDFVersion(), L"1.3");
    std::vector<wchar_t*> ics = t->JDF_GetICSVersions();
    ASSERT_EQ(ics.size(), 2u);
    EXPECT_STREQ(ics[1], L"LayCrImp_L1-1.0");
}

}  // namespace
