// Pruning after the description was read: the kind of OCG the mode does not use goes, except the
// names of the first die cut.
#include <string>

#include <gtest/gtest.h>

#include "description_fixture.h"

using vorlan::test::DescriptionTest;
using vorlan::test::Names;
using vorlan::test::names;

namespace {

// Two layers and three separations, one version switching some of each, and optional die cuts.
std::string description(bool layerMode, const std::string& dieCuts) {
    return std::string("<OptionalContentGroupData export='1' DefaultLayerMode='") + (layerMode ? "true" : "false") +
           R"('>
      <OptionalLayer OCGName="Base" displayName="Base art" default="true"/>
      <OptionalLayer OCGName="Cut" displayName="Die line"/>
      <OptionalLayer OCGName="Cyan" displayName="C" isSep="true" default="true"/>
      <OptionalLayer OCGName="CutContour" displayName="Contour" isSep="true"/>
      <OptionalLayer OCGName="White" displayName="W" isSep="true"/>
      <OptionalLayer OCGName="Inner" isNested="true"/>
      <OptionalLayer OCGName="Spot" isSep="true" isNested="true"/>
      <Versions><Version name="A"><Surface index="0">
        <ContentObject LayerNameOn="Base" LayerNameOff="Cut" SepNameOn="Cyan" SepNameOff="White"/>
      </Surface></Version></Versions>)" +
           dieCuts + "</OptionalContentGroupData>";
}

const char* kContourDie = R"(<DieCut><Surface dieLayerInternalNames="Cut" dieSepInternalNames="cutcontour"/>
                                      <Surface dieSepInternalNames="White"/></DieCut>)";

}  // namespace

class ClientModeTest : public DescriptionTest {
protected:
    void readAndPrune(bool layerMode, const std::string& dieCuts) {
        ASSERT_EQ(read(description(layerMode, dieCuts)), LD_OK);
        ASSERT_EQ(worker.applyClientModeChangesToXMLBufferData(), LD_OK);
    }
    const XMLContentObjectData& object() { return *worker.versions.at(0)->surfaces.at(0)->contentObjects.at(0); }
};

TEST_F(ClientModeTest, SeparationModeWithoutDieDropsEveryLayer) {
    readAndPrune(false, "");
    EXPECT_TRUE(object().layerNameOn.empty() && object().layerNameOff.empty());
    EXPECT_EQ(names(object().sepNameOn), Names{L"Cyan"});
    EXPECT_EQ(names(object().sepNameOff), Names{L"White"});
    XMLLayerData& record = layers(nullptr);
    EXPECT_TRUE(record.layerOCGNames.empty() && record.layerDisplayNames.empty());
    // Without a die the default switches stay (the ticket writes them); separation data is untouched.
    EXPECT_EQ(names(record.defaultOnOCGNames), (Names{L"Base", L"Cyan"}));
    EXPECT_EQ(names(record.defaultOffOCGNames), (Names{L"Cut", L"CutContour", L"White"}));
    EXPECT_EQ(names(record.sepOCGNames), (Names{L"Cyan", L"CutContour", L"White"}));
    EXPECT_EQ(names(record.sepDisplayNames), (Names{L"C", L"Contour", L"W"}));
    EXPECT_EQ(names(record.nestedLayerOCGNames), Names{L"Inner"});  // nested lists stay
}

TEST_F(ClientModeTest, SeparationModeKeepsTheDieLayers) {
    readAndPrune(false, kContourDie);
    XMLLayerData& record = layers(nullptr);
    EXPECT_EQ(names(record.layerOCGNames), Names{L"Cut"});
    EXPECT_EQ(names(record.layerDisplayNames), Names{L"Die line"});
    EXPECT_EQ(names(record.defaultOnOCGNames), Names{L"Cyan"});
    EXPECT_EQ(names(record.defaultOffOCGNames), (Names{L"Cut", L"CutContour", L"White"}));
    EXPECT_TRUE(object().layerNameOff.empty());  // version switches go even for die layers
    EXPECT_EQ(worker.m_XMLDieCuts.size(), 2u);   // die cuts themselves stay
}

TEST_F(ClientModeTest, LayerModeWithDieKeepsOnlyTheFirstDiesSeparations) {
    readAndPrune(true, kContourDie);
    EXPECT_TRUE(object().sepNameOn.empty() && object().sepNameOff.empty());
    EXPECT_EQ(names(object().layerNameOn), Names{L"Base"});
    EXPECT_EQ(names(object().layerNameOff), Names{L"Cut"});
    XMLLayerData& record = layers(nullptr);
    // CutContour matches ignoring case; White is named only by the second die cut and goes.
    EXPECT_EQ(names(record.sepOCGNames), Names{L"CutContour"});
    EXPECT_EQ(names(record.sepDisplayNames), Names{L"Contour"});
    EXPECT_EQ(names(record.defaultOnOCGNames), Names{L"Base"});
    EXPECT_EQ(names(record.defaultOffOCGNames), (Names{L"Cut", L"CutContour"}));
    EXPECT_EQ(names(record.layerOCGNames), (Names{L"Base", L"Cut"}));
    EXPECT_EQ(names(record.nestedSepOCGNames), Names{L"Spot"});
}

TEST_F(ClientModeTest, LayerModeWithoutDieDropsEverySeparation) {
    readAndPrune(true, "");
    XMLLayerData& record = layers(nullptr);
    EXPECT_TRUE(record.sepOCGNames.empty() && record.sepDisplayNames.empty());
    EXPECT_EQ(names(record.defaultOnOCGNames), (Names{L"Base", L"Cyan"}));
    EXPECT_EQ(names(record.defaultOffOCGNames), (Names{L"Cut", L"CutContour", L"White"}));
}

TEST_F(ClientModeTest, ANameTwiceInADefaultListLosesOnlyOneEntry) {
    ASSERT_EQ(read(R"(<OptionalContentGroupData>
        <OptionalLayer OCGName="Dup"/><OptionalLayer OCGName="dup"/><OptionalLayer OCGName="Keep" isSep="true"/>
        <DieCut><Surface dieLayerInternalNames="Cut"/></DieCut>
      </OptionalContentGroupData>)"),
              LD_OK);
    XMLLayerData& record = layers(nullptr);
    // Simulate a duplicate entry only in the default list: the layer list names Dup once.
    LD_FreeTextList(record.layerOCGNames);
    LD_FreeTextList(record.layerDisplayNames);
    record.layerOCGNames.push_back(LD_CopyText(L"DUP"));
    record.layerDisplayNames.push_back(LD_CopyText(L""));
    ASSERT_EQ(worker.applyClientModeChangesToXMLBufferData(), LD_OK);
    EXPECT_EQ(names(record.defaultOffOCGNames), (Names{L"dup", L"Keep"}));
}

TEST_F(ClientModeTest, TicketJobPrunesEveryPdfsRecord) {
    EXPECT_EQ(worker.applyClientModeChangesToXMLBufferData(), LD_OK);  // nothing read, nothing to do
    giveTicket(2, 1);
    ASSERT_EQ(read(R"(<OptionalContentGroupData>
        <OptionalLayer OCGName="L0"/><OptionalLayer OCGName="S0" isSep="true"/>
        <OptionalLayer pdfIndex="1" OCGName="L1"/><OptionalLayer pdfIndex="1" OCGName="S1" isSep="true"/>
      </OptionalContentGroupData>)"),
              LD_OK);
    ASSERT_EQ(worker.applyClientModeChangesToXMLBufferData(), LD_OK);
    ASSERT_EQ(worker.layerDataMap.size(), 3u);
    for (auto& [pdf, record] : worker.layerDataMap) {
        EXPECT_TRUE(record->layerOCGNames.empty());
        EXPECT_EQ(record->sepOCGNames.size(), 1u);
    }
}
