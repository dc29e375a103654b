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
};

std::string joined(const std::vector<wchar_t*>& list) {
    std::string text;
    for (const std::wstring& name : names(list)) text += (text.empty() ? "" : ",") + std::string(name.begin(), name.end());
    return text;
}

// Separation mode drops every layer (but the first die cut's), layer mode every separation
// (but the first die cut's, matched ignoring case; White is named only by the second). Version
// switches of the dropped kind go even for die names; defaults change only with a die; nested
// lists and the die cuts themselves stay.
TEST_F(ClientModeTest, EachModeDropsTheOtherKindExceptTheFirstDiesNames) {
    const struct {
        bool layerMode;
        const char* dieCuts;
        const char *switches, *layers, *separations, *defaultOn, *defaultOff;
    } cases[] = {
        {false, "", "|;Cyan|White", "/", "Cyan,CutContour,White/C,Contour,W", "Base,Cyan", "Cut,CutContour,White"},
        {false, kContourDie, "|;Cyan|White", "Cut/Die line", "Cyan,CutContour,White/C,Contour,W", "Cyan",
         "Cut,CutContour,White"},
        {true, kContourDie, "Base|Cut;|", "Base,Cut/Base art,Die line", "CutContour/Contour", "Base", "Cut,CutContour"},
        {true, "", "Base|Cut;|", "Base,Cut/Base art,Die line", "/", "Base,Cyan", "Cut,CutContour,White"},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(std::string(c.layerMode ? "layer mode" : "separation mode") + (*c.dieCuts ? " with die" : ""));
        worker = LD_JDF();
        readAndPrune(c.layerMode, c.dieCuts);
        const XMLContentObjectData& object = *worker.versions.at(0)->surfaces.at(0)->contentObjects.at(0);
        EXPECT_EQ(joined(object.layerNameOn) + "|" + joined(object.layerNameOff) + ";" + joined(object.sepNameOn) + "|" +
                      joined(object.sepNameOff),
                  c.switches);
        XMLLayerData& record = layers(nullptr);
        EXPECT_EQ(joined(record.layerOCGNames) + "/" + joined(record.layerDisplayNames), c.layers);
        EXPECT_EQ(joined(record.sepOCGNames) + "/" + joined(record.sepDisplayNames), c.separations);
        EXPECT_EQ(joined(record.defaultOnOCGNames), c.defaultOn);
        EXPECT_EQ(joined(record.defaultOffOCGNames), c.defaultOff);
        EXPECT_EQ(joined(record.nestedLayerOCGNames) + joined(record.nestedSepOCGNames), "InnerSpot");
        EXPECT_EQ(worker.m_XMLDieCuts.size(), *c.dieCuts ? 2u : 0u);
    }
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
