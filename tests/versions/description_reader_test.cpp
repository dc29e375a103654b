// Reading version descriptions into the worker: root flags, OCG records, versions, nested-name
// filtering, die cuts, errors.
#include <string>

#include <gtest/gtest.h>

#include "description_fixture.h"
#include "versions/xml_tree.h"

using vorlan::test::DescriptionTest;
using vorlan::test::Names;
using vorlan::test::names;

namespace {

std::string description(const std::string& rootAttributes, const std::string& body) {
    return "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<OptionalContentGroupData " + rootAttributes + ">" + body +
           "</OptionalContentGroupData>";
}

}  // namespace

// ---- Root element and flags ---------------------------------------------------------------------

TEST_F(DescriptionTest, RootFlagsFollowTheFormatRules) {
    EXPECT_EQ(read(description("DefaultLayerMode=\"TRUE\" export=\"false\"", "")), LD_OK);
    EXPECT_TRUE(worker.defaultLayerMode);
    EXPECT_TRUE(worker.exportMode);  // any non-empty text sets it

    for (const char* value : {"1", "yes", "true ", ""}) {
        LD_JDF fresh;
        std::string text = description(std::string("DefaultLayerMode=\"") + value + "\" export=\"\"", "<Versions/>");
        EXPECT_EQ(fresh.parseXMLBuffer(text.data(), static_cast<long>(text.size()), false, nullptr), LD_OK);
        EXPECT_FALSE(fresh.defaultLayerMode) << value;
        EXPECT_FALSE(fresh.exportMode);
    }
}

TEST_F(DescriptionTest, RootNameIgnoresCaseOtherRootsAreNoDescription) {
    EXPECT_EQ(read("<optionalcontentgroupdata DefaultLayerMode='true'/>"), LD_OK);
    EXPECT_TRUE(worker.defaultLayerMode);

    LD_JDF other;
    std::string text = "<Other DefaultLayerMode='true'><OptionalLayer OCGName='x'/></Other>";
    EXPECT_EQ(other.parseXMLBuffer(text.data(), static_cast<long>(text.size()), false, nullptr), LD_OK);
    EXPECT_FALSE(other.defaultLayerMode);
    EXPECT_TRUE(other.layerDataMap.empty());
}

TEST_F(DescriptionTest, MalformedDescriptionFailsAndRecordsNothing) {
    EXPECT_EQ(read(description("", "<OptionalLayer OCGName='a'/><Versions>")), LD_FAILED);
    EXPECT_EQ(worker.lastError, LD_FAILED);
    EXPECT_TRUE(worker.layerDataMap.empty());
    EXPECT_EQ(read("<OptionalContentGroupData>\xFF</OptionalContentGroupData>"), LD_FAILED);  // not UTF-8
}

TEST_F(DescriptionTest, EmptyBufferWithTicketIsNoDescription) {
    giveTicket(1, 0);
    worker.lastError = LD_FILE_NOT_FOUND;
    EXPECT_EQ(worker.parseXMLBuffer("", 0, true, nullptr), LD_OK);
    EXPECT_EQ(worker.lastError, LD_OK);
    EXPECT_EQ(worker.parseXMLBuffer(nullptr, 10, true, nullptr), LD_OK);
    LD_JDF noTicket;
    EXPECT_EQ(noTicket.parseXMLBuffer("", 0, false, nullptr), LD_OK);
    EXPECT_TRUE(noTicket.layerDataMap.empty());
}

// A buffer whose length is a multiple of 512 is fed without a short final piece: it must still be
// read completely, and a truncated one must still fail.
TEST_F(DescriptionTest, BufferOfExactMultipleOf512) {
    std::string body = "<OptionalLayer OCGName='Cyan' isSep='true' displayName='";
    std::string tail = "'/>";
    std::string head = description("", "");
    size_t padding = 1024 - head.size() - body.size() - tail.size();
    std::string text = description("", body + std::string(padding, 'd') + tail);
    ASSERT_EQ(text.size(), 1024u);
    EXPECT_EQ(read(text), LD_OK);
    EXPECT_EQ(names(layers(nullptr).sepOCGNames), Names{L"Cyan"});

    LD_JDF truncated;
    std::string cut = text.substr(0, text.size() - 8) + "        ";  // root never closed
    EXPECT_EQ(truncated.parseXMLBuffer(cut.data(), 1024, false, nullptr), LD_FAILED);
}

// ---- OptionalLayer records ------------------------------------------------------------------------

TEST_F(DescriptionTest, LayersAndSeparationsWithoutTicketGoToOneRecord) {
    ASSERT_EQ(read(description("", R"(
        <OptionalLayer OCGName="Cyan" displayName="C" isSep="true" default="true"/>
        <OptionalLayer OCGName="Varnish" displayName="Gloss" isSep="TRUE"/>
        <OptionalLayer OCGName="Base" displayName="Base art" default="True"/>
        <OptionalLayer OCGName="Text" displayName="Words" default="no"/>
        <OptionalLayer OCGName="Inner" isNested="true"/>
        <OptionalLayer OCGName="Spot" isSep="true" isNested="true" default="true"/>)")),
              LD_OK);
    ASSERT_EQ(worker.layerDataMap.size(), 1u);
    XMLLayerData& record = layers(nullptr);  // folder job: no inputPDF yet
    EXPECT_EQ(names(record.sepOCGNames), (Names{L"Cyan", L"Varnish"}));
    EXPECT_EQ(names(record.sepDisplayNames), (Names{L"C", L"Gloss"}));
    EXPECT_EQ(names(record.layerOCGNames), (Names{L"Base", L"Text"}));
    EXPECT_EQ(names(record.layerDisplayNames), (Names{L"Base art", L"Words"}));
    EXPECT_EQ(names(record.defaultOnOCGNames), (Names{L"Cyan", L"Base"}));
    EXPECT_EQ(names(record.defaultOffOCGNames), (Names{L"Varnish", L"Text"}));
    EXPECT_EQ(names(record.nestedLayerOCGNames), Names{L"Inner"});
    EXPECT_EQ(names(record.nestedSepOCGNames), Names{L"Spot"});
    EXPECT_EQ(names(worker.layerNameList), Names{L"Inner"});
    EXPECT_EQ(names(worker.nestedComponentList), Names{L"Spot"});
    EXPECT_NE(record.nestedLayerOCGNames[0], worker.layerNameList[0]);  // separate copies
}

TEST_F(DescriptionTest, PdfJobKeysTheRecordByItsPdf) {
    worker.inputPDF = new LD_PDF;
    ASSERT_EQ(read(description("", "<OptionalLayer OCGName='A'/><OptionalLayer OCGName='B'/>")), LD_OK);
    EXPECT_EQ(names(layers(worker.inputPDF).layerOCGNames), (Names{L"A", L"B"}));
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
        LD_JDF& w = worker;
        std::string text = description("export='1'", std::string(R"(
            <OptionalLayer OCGName="Ok" isNested="true"/>
            <Versions><Version name="V"><Surface index="0"/></Version></Versions>
            <DieCut><Surface/></DieCut>
            <OptionalLayer pdfIndex=")") + index + R"(" OCGName="Bad"/>)");
        EXPECT_EQ(read(text), LD_REFERENCE_OUT_OF_RANGE) << index;
        EXPECT_EQ(w.lastError, LD_REFERENCE_OUT_OF_RANGE);
        EXPECT_TRUE(w.layerDataMap.empty());
        EXPECT_TRUE(w.versions.empty());
        EXPECT_TRUE(w.m_XMLDieCuts.empty());
        EXPECT_TRUE(w.layerNameList.empty());
    }
}

TEST_F(DescriptionTest, NonAsciiNamesAreDecoded) {
    ASSERT_EQ(read(description("", "<OptionalLayer OCGName='\xC3\x9C" "berdruck' displayName='\xE2\x82\xAC'/>")), LD_OK);
    EXPECT_EQ(names(layers(nullptr).layerOCGNames), Names{L"\u00DCberdruck"});
    EXPECT_EQ(names(layers(nullptr).layerDisplayNames), Names{L"\u20AC"});
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
    EXPECT_TRUE(french.enabled);
    ASSERT_EQ(french.surfaces.size(), 2u);
    EXPECT_EQ(french.surfaces[0]->index, 3);
    EXPECT_EQ(french.surfaces[0]->pageIndex, 3);
    EXPECT_EQ(french.surfaces[1]->index, -2);
    ASSERT_EQ(french.surfaces[0]->contentObjects.size(), 2u);
    const XMLContentObjectData& object = *french.surfaces[0]->contentObjects[0];
    EXPECT_EQ(object.index, 7);
    EXPECT_EQ(names(object.layerNameOn), (Names{L"Base", L"Text", L"Logo"}));
    EXPECT_TRUE(object.layerNameOff.empty());  // items of blanks only vanish
    EXPECT_EQ(names(object.sepNameOn), Names{L"Cyan"});
    EXPECT_EQ(names(object.sepNameOff), (Names{L"Magenta", L"Yellow"}));
    EXPECT_EQ(french.surfaces[0]->contentObjects[1]->index, 0);

    const XMLVersionData& german = *worker.versions[1];
    EXPECT_EQ(german.position, 3);
    EXPECT_EQ(german.copies, 2147483647);  // saturates like _wtoi
    EXPECT_FALSE(german.enabled);
    EXPECT_TRUE(worker.surfaceVersions.empty());
}

TEST_F(DescriptionTest, PlainVersionsAreIgnoredInATicketJob) {
    giveTicket(1, 0);
    ASSERT_EQ(read(description("", "<Versions><Version name='A'><Surface index='0'/></Version></Versions>")), LD_OK);
    EXPECT_TRUE(worker.versions.empty());
    EXPECT_TRUE(worker.surfaceVersions.empty());
}

TEST_F(DescriptionTest, EskoTechnicalVersionIsReadWithoutExport) {
    giveTicket(1, 0);
    ASSERT_EQ(read(description("", R"(<Versions><VERSION name="eskotechnicalversion" copies="1"/>
                                     <Version name="Second"/></Versions>)")),
              LD_OK);
    ASSERT_EQ(worker.versions.size(), 2u);
    EXPECT_STREQ(worker.versions[1]->name, L"Second");
}

TEST_F(DescriptionTest, IsEskoTechnicalVersionLooksOnlyAtTheFirstChild) {
    auto check = [this](const std::string& xml) {
        KvXmlDocumentPtr document(kvXmlCreateDocument());
        EXPECT_TRUE(kvXmlFeedBuffer(document.get(), xml.data(), xml.size()));
        return worker.IsEskoTechnicalVersion(kvXmlRoot(document.get()));
    };
    EXPECT_TRUE(check("<Versions><Version name='EskoTechnicalVersion'/></Versions>"));
    EXPECT_FALSE(check("<Versions/>"));
    EXPECT_FALSE(check("<Versions><x/><Version name='EskoTechnicalVersion'/></Versions>"));
    EXPECT_FALSE(check("<Versions><InternalVersion name='EskoTechnicalVersion'/></Versions>"));
    EXPECT_FALSE(check("<Versions><Version name='EskoTechnicalVersion2'/></Versions>"));
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
    EXPECT_EQ(worker.surfaceVersions[0]->index, 0);
    EXPECT_EQ(worker.surfaceVersions[1]->index, 1);
    EXPECT_EQ(worker.surfaceVersions[1]->pageIndex, 0);
    ASSERT_EQ(worker.surfaceVersions[0]->contentObjects.size(), 1u);
    EXPECT_EQ(names(worker.surfaceVersions[0]->contentObjects[0]->sepNameOn), Names{L"Cyan"});
}

// ---- Nested names --------------------------------------------------------------------------------

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

TEST_F(DescriptionTest, RemoveNestedComponentsFromList) {
    std::vector<wchar_t*> list{LD_CopyText(L"A"), LD_CopyText(L"b"), LD_CopyText(L"a"), LD_CopyText(L"C")};
    std::vector<wchar_t*> nested{LD_CopyText(L"a"), LD_CopyText(L"B"), LD_CopyText(L"x")};
    worker.removeNestedComponentsFromList(list, nested);
    EXPECT_EQ(names(list), (Names{L"a", L"C"}));
    LD_FreeTextList(list);
    LD_FreeTextList(nested);
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
}

TEST_F(DescriptionTest, DieEnabledNeedsThePrintDieLineAttribute) {
    std::string text = description("", "<DieCut enable='TRUE'><Surface/></DieCut>");
    ASSERT_EQ(read(text), LD_OK);
    EXPECT_FALSE(worker.dieEnabled);
    LD_JDF printing;
    printing.printDieLine = true;
    ASSERT_EQ(printing.parseXMLBuffer(text.data(), static_cast<long>(text.size()), false, nullptr), LD_OK);
    EXPECT_TRUE(printing.dieEnabled);
}

// ---- Attribute look-up ---------------------------------------------------------------------------

TEST_F(DescriptionTest, GetAttributeValue) {
    std::string xml = "<r OCGName='first' ocgname='second' e=''/>";
    KvXmlDocumentPtr document(kvXmlCreateDocument());
    ASSERT_TRUE(kvXmlFeedBuffer(document.get(), xml.data(), xml.size()));
    _kvXmlNode* root = kvXmlRoot(document.get());
    for (auto [name, expected] : {std::pair{L"OCGNAME", L"first"}, {L"e", L""}, {L"absent", L""}}) {
        wchar_t* value = worker.getAttributeValue(root, name);
        ASSERT_NE(value, nullptr);
        EXPECT_STREQ(value, expected);
        std::free(value);
    }
    EXPECT_EQ(worker.getAttributeValue(nullptr, L"x"), nullptr);
    EXPECT_EQ(worker.lastError, LD_INVALID_INPUT);
    worker.lastError = LD_OK;
    EXPECT_EQ(worker.getAttributeValue(root, nullptr), nullptr);
    EXPECT_EQ(worker.lastError, LD_INVALID_INPUT);
}
