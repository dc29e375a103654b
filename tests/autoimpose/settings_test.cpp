// The settings file, the derived policies and the sheet-label texts.
#include <functional>

#include <gtest/gtest.h>

#include "autoimpose/settings.h"
#include "autoimpose/sheet_labels.h"
#include "template_ticket.h"
#include "test_support.h"

using vorlan::autoimpose::AutoImpositionSettings;

namespace {

AutoImpositionSettings read(const std::string& body, bool wrap = true) {
    vorlan::test::TempDir dir;
    if (wrap) autoimpose_test::writeSettings(dir / "s.xml", body);
    else vorlan::test::writeFile(dir / "s.xml", body);
    AutoImpositionSettings s;
    s.settingsPath = (dir / "s.xml").string();
    vorlan::autoimpose::readAutoImpositionSettings(s);
    vorlan::autoimpose::deriveImpositionPolicies(s);
    return s;
}

using Pairs = std::vector<std::pair<int32_t, int32_t>>;

}  // namespace

TEST(AutoImposeSettings, ReadsTheFileAndDerivesPolicies) {
    struct Case {
        const char* xml;
        bool wrap;
        std::function<void(const AutoImpositionSettings&)> check;
    };
    const Case cases[] = {
        {"<autoimposesettings><LAYOUT rotationpolicy='2'><binding TYPE='10' Row='3' col='2' maxstackdepth='-3'/>"
         "</LAYOUT><jobtypepdl PDL='4' JobNum='77'/></autoimposesettings>",
         false,
         [](const AutoImpositionSettings& s) {
             EXPECT_EQ(s.rotatePolicy, 4);
             EXPECT_EQ(s.BindingType, 10);
             EXPECT_EQ(s.row * s.col, 6);
             EXPECT_EQ(s.MaxStackDepth, -3);
             EXPECT_EQ(s.pdl, 4);
             EXPECT_EQ(s.jobnum, 77);
         }},
        // Values that do not start with a number leave the defaults; leading integers count.
        {"<Layout RotationPolicy='7' SizePolicy='x1'><Binding Type='twelve' row=' 4mm' col='-'/></Layout>", true,
         [](const AutoImpositionSettings& s) {
             EXPECT_EQ(s.rotatePolicy, 1);
             EXPECT_EQ(s.sizePolicy, 0);
             EXPECT_EQ(s.BindingType, 6);
             EXPECT_EQ(s.row, 4);
             EXPECT_EQ(s.col, 1);
         }},
        {"<Layout SizePolicy='1' ImpositionMode='1'/>", true,
         [](const AutoImpositionSettings& s) { EXPECT_EQ(s.sizePolicy, 0); }},
        {"<Layout SizePolicy='1' ImpositionMode='0'/>", true,
         [](const AutoImpositionSettings& s) { EXPECT_EQ(s.sizePolicy, 3); }},
        {"<Layout SizePolicy='8'/>", true, [](const AutoImpositionSettings& s) { EXPECT_EQ(s.sizePolicy, 1); }},
        // A repeated ord replaces the earlier pair; a size that is not a number is skipped.
        {"<Layout><FinishSize ord='0' x='1' y='2'/><FinishSize ord='0' x='3.5' y='4e1'/>"
         "<FinishSize ord='1' x='wide' y='5'/><FinishSize ord='2' x='1e999' y='5'/>"
         "<BleedSize x='7' y='8'/><BleedSize x='9' y='nine'/></Layout>",
         true,
         [](const AutoImpositionSettings& s) {
             ASSERT_EQ(s.FinishSize.size(), 1u);
             EXPECT_EQ(s.FinishSize.at(0), std::make_pair(3.5, 40.0));
             EXPECT_EQ(s.BleedSize, std::make_pair(7.0, 8.0));
         }},
        {"<Layout><SheetLabels DateAndTimePrint='2' JobNamePrint='1' SurfaceNumberPrint='0' "
         "JobNameString='Brosch\xC3\xBCre 7'/></Layout><PageDeliveryInfo PageDelivery='ReverseOrderFaceUp'/>",
         true,
         [](const AutoImpositionSettings& s) {
             EXPECT_TRUE(s.DateAndTimePrint && s.JobNamePrint && !s.SurfaceNumberPrint);
             EXPECT_EQ(s.JobNameString, L"Brosch\u00fcre 7");
             EXPECT_TRUE(s.reverseDelivery());
         }},
        // Count pairs, filled one value per attribute; extra ranges are dropped.
        {"<RangeInfo Type='4' Count='2' TotalCount='9'><Range StartIndex='1' EndIndex='2'/>"
         "<Range StartIndex='5' EndIndex='6'/><Range StartIndex='8' EndIndex='9'/></RangeInfo>",
         true,
         [](const AutoImpositionSettings& s) {
             EXPECT_EQ(s.RangeType, 4);
             EXPECT_EQ(s.TotalCount, 9);
             EXPECT_EQ(s.ranges, (Pairs{{1, 2}, {5, 6}}));
         }},
        {"<RangeInfo Count='2'><Range EndIndex='3'/><Range StartIndex='4' EndIndex='5'/></RangeInfo>", true,
         [](const AutoImpositionSettings& s) { EXPECT_EQ(s.ranges, (Pairs{{3, 4}, {5, 0}})); }},
        {"<RangeInfo Count='-5'><Range StartIndex='1' EndIndex='2'/></RangeInfo>", true,
         [](const AutoImpositionSettings& s) { EXPECT_TRUE(s.ranges.empty()); }},
        {"<RangeInfo Count='2147483647'/>", true,
         [](const AutoImpositionSettings& s) {
             EXPECT_EQ(s.ranges.size(), static_cast<size_t>(vorlan::autoimpose::kMaxSheetRanges));
         }},
        // Another root, or a file that is not well-formed: every default stays.
        {"<Settings><Layout RotationPolicy='2'/></Settings>", false,
         [](const AutoImpositionSettings& s) { EXPECT_EQ(s.rotatePolicy, 1); }},
        {"<AutoImposeSettings><Layout RotationPolicy='1'/><Layout>", false,
         [](const AutoImpositionSettings& s) {
             EXPECT_EQ(s.RotationPolicy, 0);
             EXPECT_EQ(s.pdl, 3);
         }},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.xml);
        c.check(read(c.xml, c.wrap));
    }
}

TEST(AutoImposeSettings, SheetLabelTextsByJobKindBindingAndDelivery) {
    struct Case {
        int pdl, binding;
        bool reverse, jobName, sheet, date;
        const wchar_t* format;
        const char* jobTemplate;
    };
    const Case cases[] = {
        {3, 6, false, true, true, false, L"J Sheet %d/%s", "SheetCount, Side"},
        {3, 6, true, false, true, false, L"Sheet %d/%s", "12 - SheetCount + 1, Side"},
        {3, 6, false, false, false, true, L"%s %s", "Date, Time"},
        {3, 6, false, true, false, false, L"J", ""},
        {4, 17, false, false, true, true, L"Sheet %d/%s %s %s", "SheetIndex+1, Side, Date, Time"},
        {4, 17, true, false, true, false, L"Sheet %d/%s", "12 - SheetIndex,  Side"},
        {4, 12, false, false, true, false, L"output-sheet= %d; output-set= %d; id= %d.%d /%s",
         "SheetIndex+1, ImposedSheetSetIndex+1, ImposedSheetSetIndex+1, (SheetIndex+1)/(ImposedSheetSetIndex+1), Side"},
        {4, 12, true, false, true, false, L"output-sheet= %d; output-set= %d; id= %d.%d /%s",
         "12 - SheetIndex, ImposedSheetSetIndex+1, ImposedSheetSetIndex+1, (12-SheetIndex)/(ImposedSheetSetIndex+1), Side"},
        {4, 10, false, false, true, false, L"output-sheet= %d; output-set= %d; id= %d.%d /%s",
         "SheetIndex+1, SetIndex+1, SetIndex+1, SheetCount, Side"},
        {4, 10, true, false, true, false, L"output-sheet= %d; output-set= %d; id= %d.%d /%s",
         "12-SheetIndex, SetIndex+1, SetIndex+1, TotalSheetsInCollect - SheetCount + 1, Side"},
    };
    for (const Case& c : cases) {
        AutoImpositionSettings s;
        s.pdl = c.pdl;
        s.BindingType = c.binding;
        s.PageDelivery = c.reverse ? "ReverseOrderFaceUp" : "";
        s.TotalCount = 12;
        s.JobNamePrint = c.jobName;
        s.JobNameString = L"J";
        s.SurfaceNumberPrint = c.sheet;
        s.DateAndTimePrint = c.date;
        vorlan::autoimpose::SheetLabelText text = vorlan::autoimpose::sheetLabelText(s);
        EXPECT_EQ(text.format, c.format) << c.pdl << " " << c.binding << " " << c.reverse;
        EXPECT_EQ(text.jobTemplate, c.jobTemplate) << c.pdl << " " << c.binding << " " << c.reverse;
    }
}
