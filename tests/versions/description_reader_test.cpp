// Reading version descriptions into the worker: root flags, OCG records, versions, nested-name
// filtering, die cuts, errors.
#include <string>

#include <gtest/gtest.h>

#include "description_fixture.h"

using vorlan::test::DescriptionTest;
using vorlan::test::Names;
using vorlan::test::names;

namespace {

std::string description(const std::string& rootAttributes, const std::string& body) {
    return "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<OptionalContentGroupData " + rootAttributes + ">" + body +
           "</OptionalContentGroupData>";
}

LDError readInto(LD_JDF& worker, const std::string& text) {
    return worker.parseXMLBuffer(text.data(), static_cast<long>(text.size()), false, nullptr);
}

}  // namespace

// ---- Root element, flags and errors -------------------------------------------------------------

TEST_F(DescriptionTest, RootFlagsFollowTheFormatRules) {
    EXPECT_EQ(read("<optionalcontentgroupdata DefaultLayerMode=\"TRUE\" export=\"false\"/>"), LD_OK);
    EXPECT_TRUE(worker.defaultLayerMode);  // root name and "true" ignore case
    EXPECT_TRUE(worker.exportMode);        // any non-empty text sets it
    for (const char* value : {"1", "yes", "true ", ""}) {
        LD_JDF fresh;
        EXPECT_EQ(readInto(fresh, description(std::string("DefaultLayerMode=\"") + value + "\" export=\"\"", "")), LD_OK);
        EXPECT_FALSE(fresh.defaultLayerMode) << value;
        EXPECT_FALSE(fresh.exportMode);
    }
    LD_JDF other;  // another root is no description
    EXPECT_EQ(readInto(other, "<Other DefaultLayerMode='true'><OptionalLayer OCGName='x'/></Other>"), LD_OK);
    EXPECT_FALSE(other.defaultLayerMode);
    EXPECT_TRUE(other.layerDataMap.empty());
}

TEST_F(DescriptionTest, MalformedOrEmptyInput) {
    EXPECT_EQ(read(description("", "<OptionalLayer OCGName='a'/><Versions>")), LD_FAILED);
    EXPECT_EQ(worker.lastError, LD_FAILED);
    EXPECT_TRUE(worker.layerDataMap.empty());
    EXPECT_EQ(read("<OptionalContentGroupData>\xFF</OptionalContentGroupData>"), LD_FAILED);  // not UTF-8
    // An empty buffer is no description, with or without ticket.
    LD_JDF ticketJob;
    ticketJob.lastError = LD_FILE_NOT_FOUND;
    EXPECT_EQ(ticketJob.parseXMLBuffer("", 0, true, nullptr), LD_OK);
    EXPECT_EQ(ticketJob.lastError, LD_OK);
    EXPECT_EQ(ticketJob.parseXMLBuffer(nullptr, 10, true, nullptr), LD_OK);
    EXPECT_EQ(ticketJob.parseXMLBuffer("", 0, false, nullptr), LD_OK);
    EXPECT_TRUE(ticketJob.layerDataMap.empty());
    EXPECT_EQ(ticketJob.getAttributeValue(nullptr, L"x"), nullptr);
    EXPECT_EQ(ticketJob.lastError, LD_INVALID_INPUT);
}

// ---- OptionalLayer records ------------------------------------------------------------------------

TEST_F(DescriptionTest, LayersAndSeparationsWithoutTicketGoToOneRecord) {
    ASSERT_EQ(read(description("", R"(
        <OptionalLayer OCGName="Cyan" displayName="C" isSep="true" default="true"/>
        <OptionalLayer OCGName="Varnish" displayName="Gloss" isSep="TRUE"/>
        <OptionalLayer OCGName="Base" displayName="Base art" default="True"/>
        <OptionalLayer OCGName=")" "\xC3\x9C" R"(berdruck" displayName=")" "\xE2\x82\xAC" R"(" default="no"/>
        <OptionalLayer OCGName="Inner" isNested="true"/>
        <OptionalLayer OCGName="Spot" isSep="true" isNested="true" default="true"/>)")),
              LD_OK);
    ASSERT_EQ(worker.layerDataMap.size(), 1u);
    XMLLayerData& record = layers(nullptr);  // folder job: no inputPDF yet
    EXPECT_EQ(names(record.sepOCGNames), (Names{L"Cyan", L"Varnish"}));
    EXPECT_EQ(names(record.sepDisplayNames), (Names{L"C", L"Gloss"}));
    EXPECT_EQ(names(record.layerOCGNames), (Names{L"Base", L"\u00DCberdruck"}));
    EXPECT_EQ(names(record.layerDisplayNames), (Names{L"Base art", L"\u20AC"}));
    EXPECT_EQ(names(record.defaultOnOCGNames), (Names{L"Cyan", L"Base"}));
    EXPECT_EQ(names(record.defaultOffOCGNames), (Names{L"Varnish", L"\u00DCberdruck"}));
    EXPECT_EQ(names(record.nestedLayerOCGNames), Names{L"Inner"});
    EXPECT_EQ(names(record.nestedSepOCGNames), Names{L"Spot"});
    EXPECT_EQ(names(worker.layerNameList), Names{L"Inner"});
    EXPECT_EQ(names(worker.nestedComponentList), Names{L"Spot"});
    EXPECT_NE(record.nestedLayerOCGNames[0], worker.layerNameList[0]);  // separate copies

    LD_JDF pdfJob;  // a PDF job keys the record by its PDF
    pdfJob.inputPDF = new LD_PDF;
    ASSERT_EQ(readInto(pdfJob, description("", "<OptionalLayer OCGName='A'/>")), LD_OK);
    EXPECT_EQ(pdfJob.layerDataMap.count(pdfJob.inputPDF), 1u);
}

TEST_F(DescriptionTest, PdfIndexSelectsTheContentRunAndItsMarkRun) {
    giveTicket(3, 1);
    ASSERT_EQ(read(description("", R"(
        <OptionalLayer OCGName="First" isSep="true"/>
        <OptionalLayer pdfIndex="2" OCGName="Third"/>
        <OptionalLayer pdfIndex=" 0xyz" OCGName="Again" isSep="true" isNested="true"/>)")),
              LD_OK);
    LD_PDF* content0 = worker.contentRuns[0]->pdf;
    LD_PDF* mark0 = worker.markRuns[0]->pdf;
    EXPECT_EQ(names(layers(content0).sepOCGNames), Names{L"First"});
    EXPECT_EQ(names(layers(worker.contentRuns[2]->pdf).layerOCGNames), Names{L"Third"});
    EXPECT_EQ(worker.layerDataMap.count(worker.contentRuns[1]->pdf), 0u);
    // The mark run of index 0 receives its own copies; index 2 has no mark run.
    EXPECT_EQ(names(layers(mark0).sepOCGNames), Names{L"First"});
    EXPECT_NE(layers(mark0).sepOCGNames[0], layers(content0).sepOCGNames[0]);
    EXPECT_EQ(names(layers(mark0).nestedSepOCGNames), Names{L"Again"});
    EXPECT_EQ(names(worker.nestedComponentList), Names{L"Again"});  // once, not per record
    EXPECT_EQ(worker.layerDataMap.size(), 3u);
}

TEST_F(DescriptionTest, PdfIndexOutOfRangeGives9AndFreesTheRecords) {
    giveTicket(2, 0);
    for (const char* index : {"2", "-1", "99999999999"}) {
        std::string text = description("export='1'", std::string(R"(
            <OptionalLayer OCGName="Ok" isNested="true"/>
            <Versions><Version name="V"><Surface index="0"/></Version></Versions>
            <DieCut><Surface/></DieCut>
            <OptionalLayer pdfIndex=")") + index + R"(" OCGName="Bad"/>)");
        EXPECT_EQ(read(text), LD_REFERENCE_OUT_OF_RANGE) << index;
        EXPECT_EQ(worker.lastError, LD_REFERENCE_OUT_OF_RANGE);
        EXPECT_TRUE(worker.layerDataMap.empty() && worker.versions.empty() && worker.m_XMLDieCuts.empty() &&
                    worker.layerNameList.empty());
    }
}

// ---- Versions ----------------------------------------------------------------------------------

TEST_F(DescriptionTest, VersionsOfAnExport) {
    giveTicket(1, 0);
    ASSERT_EQ(read(description("export='yes'", R"(
        <Versions>
          <Note/><InternalVersion name="hidden"/>
          <Version name="French" enable="true" copies=" 12abc">
            <Surface index="3">
              <ContentObject index="7" LayerNameOn=" Base , Text,,Logo " LayerNameOff=" , "
                             SepNameOn="Cyan" SepNameOff="Magenta,Yellow"/>
              <Other/>
              <ContentObject/>
            </Surface>
            <Surface index="-2"/>
          </Version>
          <Version name="German" copies="99999999999"/>
        </Versions>)")),
              LD_OK);
    ASSERT_EQ(worker.versions.size(), 2u);
    const XMLVersionData& french = *worker.versions[0];
    EXPECT_STREQ(french.name, L"French");
    EXPECT_EQ(french.position, 2);  // the two elements before it count
    EXPECT_EQ(french.copies, 12);
    ASSERT_EQ(french.surfaces.size(), 2u);
    EXPECT_EQ(french.surfaces[0]->pageIndex, 3);
    EXPECT_EQ(french.surfaces[1]->index, -2);
    ASSERT_EQ(french.surfaces[0]->contentObjects.size(), 2u);
    const XMLContentObjectData& object = *french.surfaces[0]->contentObjects[0];
    EXPECT_EQ(object.index, 7);
    EXPECT_EQ(names(object.layerNameOn), (Names{L"Base", L"Text", L"Logo"}));
    EXPECT_TRUE(object.layerNameOff.empty());  // items of blanks only vanish
    EXPECT_EQ(names(object.sepNameOff), (Names{L"Magenta", L"Yellow"}));
    EXPECT_EQ(french.surfaces[0]->contentObjects[1]->index, 0);
    EXPECT_EQ(worker.versions[1]->copies, 2147483647);  // saturates like _wtoi
    EXPECT_FALSE(worker.versions[1]->enabled);
    EXPECT_TRUE(worker.surfaceVersions.empty());
}

// Without export, a ticket job reads versions only when the first child is the technical version.
TEST_F(DescriptionTest, TicketJobWithoutExportReadsOnlyTheTechnicalVersion) {
    const std::pair<const char*, size_t> cases[] = {
        {"<VERSION name='eskotechnicalversion' copies='1'/><Version name='Second'/>", 2},
        {"<Version name='A'><Surface index='0'/></Version>", 0},
        {"<x/><Version name='EskoTechnicalVersion'/>", 0},
        {"<InternalVersion name='EskoTechnicalVersion'/>", 0},
        {"<Version name='EskoTechnicalVersion2'/>", 0},
    };
    for (auto [versions, expected] : cases) {
        LD_JDF w;
        std::string text = description("", std::string("<Versions>") + versions + "</Versions>");
        ASSERT_EQ(w.parseXMLBuffer(text.data(), static_cast<long>(text.size()), true, nullptr), LD_OK);
        EXPECT_EQ(w.versions.size(), expected) << versions;
        EXPECT_TRUE(w.surfaceVersions.empty());
    }
    EXPECT_FALSE(worker.IsEskoTechnicalVersion(nullptr));
}

TEST_F(DescriptionTest, SurfaceVersionsOfAPdfJob) {
    ASSERT_EQ(read(description("", R"(
        <Versions>
          <Other><Surface index="9"/></Other>
          <InternalVersion name="x" copies="4">
            <Surface index="9"><ContentObject index="1" SepNameOn="Cyan"/></Surface>
            <Skip/>
            <Surface index="9"/>
          </InternalVersion>
          <Version><Surface/><Surface/><Surface/></Version>
        </Versions>)")),
              LD_OK);
    EXPECT_TRUE(worker.versions.empty());
    ASSERT_EQ(worker.surfaceVersions.size(), 2u);
    EXPECT_EQ(worker.surfaceVersions[1]->index, 1);
    EXPECT_EQ(worker.surfaceVersions[1]->pageIndex, 0);
    ASSERT_EQ(worker.surfaceVersions[0]->contentObjects.size(), 1u);
    EXPECT_EQ(names(worker.surfaceVersions[0]->contentObjects[0]->sepNameOn), Names{L"Cyan"});
}

TEST_F(DescriptionTest, NestedNamesDeclaredBeforeVersionsAreFilteredOut) {
    ASSERT_EQ(read(description("export='1'", R"(
        <OptionalLayer OCGName="varnish" isNested="true"/>
        <OptionalLayer OCGName="Spot" isSep="true" isNested="true"/>
        <Versions><Version name="A"><Surface index="0">
          <ContentObject LayerNameOn="Base, Varnish, VARNISH" LayerNameOff="Varnish"
                         SepNameOn="Spot,Cyan" SepNameOff="Varnish"/>
        </Surface></Version></Versions>
        <OptionalLayer OCGName="Base" isNested="true"/>)")),
              LD_OK);
    const XMLContentObjectData& object = *worker.versions[0]->surfaces[0]->contentObjects[0];
    EXPECT_EQ(names(object.layerNameOn), (Names{L"Base", L"VARNISH"}));  // only the first goes
    EXPECT_TRUE(object.layerNameOff.empty());
    EXPECT_EQ(names(object.sepNameOn), Names{L"Cyan"});
    EXPECT_EQ(names(object.sepNameOff), Names{L"Varnish"});  // separation lists use their own names
    EXPECT_EQ(names(worker.layerNameList), (Names{L"varnish", L"Base"}));
}

// ---- Die cuts ------------------------------------------------------------------------------------

TEST_F(DescriptionTest, DieCutsFromEveryChildAndTheLastEnableFlag) {
    worker.printDieLine = true;
    ASSERT_EQ(read(description("", R"(
        <DieCut enable="true" name="first">
          <Surface index="1" dieLayerInternalNames="Cut, Crease" dieSepInternalNames="CutContour"/>
          <Anything index="2"/>
        </DieCut>
        <DieCut enable="false"><Surface index="3"/><Surface index="4"/></DieCut>)")),
              LD_OK);
    ASSERT_EQ(worker.m_XMLDieCuts.size(), 4u);
    EXPECT_FALSE(worker.dieEnabled);
    EXPECT_EQ(worker.m_XMLDieCuts[0]->index, 1);
    EXPECT_EQ(names(worker.m_XMLDieCuts[0]->dieLayerInternalNames), (Names{L"Cut", L"Crease"}));
    EXPECT_EQ(names(worker.m_XMLDieCuts[0]->dieSepInternalNames), Names{L"CutContour"});
    EXPECT_EQ(worker.m_XMLDieCuts[1]->index, 2);
    EXPECT_EQ(worker.m_XMLDieCuts[3]->index, 4);
    // A die is enabled only with the job's print-die-line attribute.
    LD_JDF without;
    ASSERT_EQ(readInto(without, description("", "<DieCut enable='TRUE'><Surface/></DieCut>")), LD_OK);
    EXPECT_FALSE(without.dieEnabled);
    without.printDieLine = true;
    ASSERT_EQ(readInto(without, description("", "<DieCut enable='TRUE'><Surface/></DieCut>")), LD_OK);
    EXPECT_TRUE(without.dieEnabled);
}

