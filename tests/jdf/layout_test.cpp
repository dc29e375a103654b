// The layout reader: both ways of writing a layout, indices and counters, placed objects.
#include <gtest/gtest.h>

#include "model/geometry_strings.h"
#include "ticket_fixture.h"

namespace {

using vorlan::test::jdfTicket;
using vorlan::test::ReadTicket;

const std::string kLayoutLink = R"(<LayoutLink rRef="L" Usage="Input"/>)";

std::string surface(const std::string& side, const std::string& objects = "") {
    return R"(<Surface Side=")" + side + R"(" SurfaceContentsBox="0 0 612 792">)" + objects + "</Surface>";
}

std::string content(int ord) { return R"(<ContentObject CTM="1 0 0 1 0 0" Ord=")" + std::to_string(ord) + R"("/>)"; }

// Two signatures of two and three sheets, each sheet with a front and a back: nested, or as a
// Layout partitioned by SignatureName, SheetName and Side.
std::string twoSignatureLayout(bool partitioned) {
    std::string layout = R"(<Layout ID="L" Class="Parameter" Status="Available")" +
                         std::string(partitioned ? R"( PartIDKeys="SignatureName SheetName Side">)" : ">");
    int ord = 0;
    for (int s = 0; s < 2; ++s) {
        const std::string signature = "Sig" + std::to_string(s);
        layout += partitioned ? "<Layout SignatureName=\"" + signature + "\">" : "<Signature Name=\"" + signature + "\">";
        for (int sheet = 0; sheet < 2 + s; ++sheet, ord += 2) {
            const std::string name = "Sh" + std::to_string(s) + std::to_string(sheet);
            if (partitioned)
                layout += R"(<Layout SheetName=")" + name + R"(" SurfaceContentsBox="0 0 612 792"><Layout Side="Front">)" +
                          content(ord) + R"(</Layout><Layout Side="Back">)" + content(ord + 1) + "</Layout></Layout>";
            else
                layout += "<Sheet Name=\"" + name + "\">" + surface("Front", content(ord)) +
                          surface("Back", content(ord + 1)) + "</Sheet>";
        }
        layout += partitioned ? "</Layout>" : "</Signature>";
    }
    return layout + "</Layout>";
}

void expectTwoSignatureTree(LD_JDF& w) {
    ASSERT_EQ(w.JDF_GetNumberOfSignatures(), 2);
    EXPECT_EQ(w.JDF_GetNumberOfSheets(), 5);
    EXPECT_EQ(w.JDF_GetNumberOfSurfaces(), 10);
    EXPECT_EQ(w.JDF_GetRangeOfSheetsPerSignature(1)->first, 2);
    EXPECT_EQ(w.JDF_GetRangeOfSheetsPerSignature(1)->last, 4);
    std::vector<int32_t> numbers;
    for (LD_Sheet* sheet : w.sheets) numbers.push_back(sheet->numberInSignature);
    EXPECT_EQ(numbers, (std::vector<int32_t>{1, 2, 1, 2, 3}));
    EXPECT_STREQ(w.sheets[3]->name, L"Sh11");
    EXPECT_EQ(w.sheets[3]->signatureIndex, 1);
    LD_Sheet* sheet = w.sheets[4];
    ASSERT_NE(sheet->front, nullptr);
    ASSERT_NE(sheet->back, nullptr);
    EXPECT_EQ(sheet->front->index, 8);
    EXPECT_EQ(sheet->back->SurfaceContentsBox->upperRight.y, 792);
    EXPECT_EQ(sheet->back->contentObjects.at(0)->Ord, 9);
    EXPECT_EQ(sheet->back->contentObjects.at(0)->surfaceIndex, 9);
}

TEST(LayoutReader, NestedAndPartitionedLayoutsGiveTheSameTree) {
    for (bool partitioned : {false, true}) {
        SCOPED_TRACE(partitioned ? "partitioned" : "nested");
        ReadTicket t(jdfTicket(twoSignatureLayout(partitioned), kLayoutLink));
        ASSERT_EQ(t.result, LD_OK);
        expectTwoSignatureTree(*t);
    }
}

TEST(LayoutReader, RepeatedOrdsAreFlaggedOnEveryOccurrence) {
    std::string layout = R"(<Layout ID="L" Status="Available"><Signature><Sheet>)" +
                         surface("Front", content(4) + content(7) + content(4) + "<ContentObject/>") +
                         surface("Back", content(4)) + "</Sheet></Signature></Layout>";
    ReadTicket t(jdfTicket(layout, kLayoutLink));
    ASSERT_EQ(t->contentObjects.size(), 5u);
    EXPECT_TRUE(t->contentObjects[0]->ordRepeated);
    EXPECT_FALSE(t->contentObjects[1]->ordRepeated);
    EXPECT_TRUE(t->contentObjects[2]->ordRepeated);
    EXPECT_EQ(t->contentObjects[3]->Ord, 0);  // no Ord reads 0
    EXPECT_FALSE(t->contentObjects[4]->ordRepeated);  // another surface
    ASSERT_EQ(t->contentObjectOrdinalMap.size(), 5u);
    EXPECT_EQ(t->contentObjectOrdinalMap[2].ord, 4);
}

TEST(LayoutReader, PlacedObjectGeometryAndFlags) {
    std::string objects =
        R"(<ContentObject CTM="0 1 -1 0 100 200" Ord="3" ClipBox="1 2 3 4" ClipPath=""
               SourceClipPath="0 0 m 10 0 l h" TrimCTM="1 0 0 1 5 5" TrimSize="10"
               xmlns:ADBE="http://ns.adobe.com/jdf/1.0/" ADBE:CachePlacedObject="TRUE" ADBE:IgnoreClipForReuse="false"/>
           <MarkObject CTM="1 0 0 1 0 0" Ord="2" TrimSize="20 30"/>
           <Comment>not placed</Comment>
           <ContentObject CTM="" TrimSize="4 5 6 7"/>)";
    std::string layout = R"(<Layout ID="L" Status="Available"><Signature><Sheet>)" + surface("front", objects) +
                         surface("Front") + "</Sheet></Signature></Layout>";
    ReadTicket t(jdfTicket(layout, kLayoutLink));
    ASSERT_EQ(t.result, LD_OK);
    ASSERT_EQ(t->contentObjects.size(), 2u);
    LD_ContentObject* first = t->contentObjects[0];
    EXPECT_STREQ(first->CTM->text, L"0 1 -1 0 100 200");
    ASSERT_NE(first->ClipBox, nullptr);
    EXPECT_STREQ(first->ClipBox->text, L"1 2 3 4");
    ASSERT_NE(first->ClipPath, nullptr);
    ASSERT_EQ(first->ClipPath->size(), 3u);
    EXPECT_STREQ(first->clipPathText, L"0 0 m 10 0 l h");
    EXPECT_EQ(first->TrimCTM->f, 5);
    ASSERT_NE(first->TrimSize, nullptr);
    EXPECT_EQ(first->TrimSize->x, -1);  // one number is no point
    EXPECT_TRUE(first->CachePlacedObject);
    EXPECT_FALSE(first->IgnoreClipForReuse);

    LD_ContentObject* second = t->contentObjects[1];
    EXPECT_EQ(second->CTM->a, 1);
    EXPECT_EQ(second->ClipPath, nullptr);
    EXPECT_EQ(second->TrimSize->y, 5);
    // Every child of a surface advances the object index; only objects take one.
    EXPECT_EQ(first->objectIndex, 0);
    EXPECT_EQ(second->objectIndex, 3);
    EXPECT_EQ(second->contentObjectIndex, 1);
    ASSERT_EQ(t->markObjects.size(), 1u);
    EXPECT_EQ(t->markObjects[0]->objectIndex, 1);
    EXPECT_EQ(t->placedObjectCount, 4);
    // "front" in lower case is a back side; the empty Front surface is empty.
    EXPECT_FALSE(t->surfaces[0]->isFront);
    EXPECT_EQ(t->sheets[0]->back, t->surfaces[0]);
    EXPECT_TRUE(t->surfaces[1]->isEmpty);
    EXPECT_FALSE(t->surfaces[0]->isEmpty);
}

TEST(LayoutReader, MediaOfSignaturesAndSheetsAndRepeatedSides) {
    std::string media = R"(<Media Class="Consumable" Status="Available" MediaType="Paper" Dimension="1000 700"
                               DescriptiveName="Gloss" GrainDirection="ShortEdge" Thickness="90" Weight="115"/>)";
    std::string layout = R"(<Layout ID="L" Status="Available"><Signature Name="S">)" + media + "<Sheet Name=\"A\">" +
                         R"(<Media MediaType="Plate" Dimension="1 1"/>)" + surface("Front") + surface("Front") +
                         "</Sheet></Signature></Layout>";
    ReadTicket t(jdfTicket(layout, kLayoutLink + R"(<MediaLink rRef="M" Usage="Input"/>)"));
    ASSERT_EQ(t.result, LD_OK);
    LD_OCG_Media* m = t->signatures[0]->media;
    ASSERT_NE(m, nullptr);
    EXPECT_EQ(m->height, 700);
    EXPECT_STREQ(m->GrainDirection, L"2");
    EXPECT_STREQ(m->MediaUnit, L"3");  // absent: the library's Sheet
    EXPECT_EQ(m->Weight, 115);
    // A sheet's media that is not paper keeps the defaults.
    ASSERT_NE(t->sheets[0]->media, nullptr);
    EXPECT_EQ(t->sheets[0]->media->width, -1);
    // The second Front surface takes the slot; both stay in the surface list.
    EXPECT_EQ(t->JDF_GetNumberOfSurfaces(), 2);
    EXPECT_EQ(t->sheets[0]->front, t->surfaces[1]);
}

TEST(LayoutReader, SecondLayoutContinuesTheNumbering) {
    std::string one = R"(<Layout ID="L" Status="Available"><Signature><Sheet>)" + surface("Front", content(0)) +
                      "</Sheet></Signature></Layout>";
    std::string two = R"(<Layout ID="L2" Status="Available"><Signature><Sheet>)" + surface("Front", content(1)) +
                      "</Sheet></Signature></Layout>";
    ReadTicket t(jdfTicket(one + two, kLayoutLink));
    ASSERT_EQ(t->JDF_GetNumberOfSignatures(), 2);
    EXPECT_EQ(t->sheets[1]->index, 1);
    EXPECT_EQ(t->contentObjects[1]->contentObjectIndex, 1);
    EXPECT_EQ(t->JDF_GetRangeOfSheetsPerSignature(1)->first, 1);
}

}  // namespace

TEST(LayoutReader, WorkersMovedAndCopiedKeepPushedOutSurfaces) {
    // A sheet with two Front surfaces: the first is pushed out of its slot but stays listed.
    std::string layout = R"(<Layout ID="L" Status="Available"><Signature Name="S"><Sheet Name="A">)" +
                         surface("Front", content(0)) + surface("Front", content(1)) + "</Sheet></Signature></Layout>";
    ReadTicket t(jdfTicket(layout, kLayoutLink));
    ASSERT_EQ(t.result, LD_OK);
    auto pushedOutOrd = [](LD_JDF& w) { return w.getSurfaceByIndex(0)->contentObjects.at(0)->Ord; };
    // Moved: the moved-from worker is destroyed first, and the new one still reads its surfaces.
    auto moved = std::make_unique<LD_JDF>(std::move(*t.worker));
    t.worker.reset();
    EXPECT_EQ(moved->JDF_GetNumberOfSurfaces(), 2);
    EXPECT_EQ(pushedOutOrd(*moved), 0);
    // Copied: the records are shared, and whichever is destroyed last releases them.
    auto copy = std::make_unique<LD_JDF>(*moved);
    moved.reset();
    EXPECT_EQ(pushedOutOrd(*copy), 0);
    LD_JDF assigned;
    assigned = *copy;
    copy.reset();
    EXPECT_EQ(pushedOutOrd(assigned), 0);
    assigned = LD_JDF();  // releases the records
    EXPECT_EQ(assigned.JDF_GetNumberOfSurfaces(), 0);
}
