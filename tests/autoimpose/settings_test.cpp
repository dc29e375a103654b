// The settings file, the derived policies and the sheet-label texts.
#include <functional>

#include <gtest/gtest.h>

#include "autoimpose/settings.h"
#include "autoimpose/sheet_labels.h"
#include "template_ticket.h"

using vorlan::autoimpose::AutoImpositionSettings;
using Settings = const AutoImpositionSettings&;
using Pairs = std::vector<std::pair<int32_t, int32_t>>;

TEST(AutoImposeSettings, ReadsTheFileAndDerivesPolicies) {
    const std::pair<std::string, std::function<void(Settings)>> cases[] = {
        {"<?xml version='1.0'?><autoimposesettings><LAYOUT rotationpolicy='2'><binding TYPE='10' Row='3' col='2' maxstackdepth='-3'/>"
         "</LAYOUT><jobtypepdl PDL='4' JobNum='77'/></autoimposesettings>",
         [](Settings s) {
             EXPECT_EQ(std::vector<int>({s.rotatePolicy, s.BindingType, s.row, s.col, s.MaxStackDepth, s.pdl, s.jobnum}),
                       std::vector<int>({4, 10, 3, 2, -3, 4, 77}));
         }},
        // Values that do not start with a number keep the defaults; leading integers count.
        {"<Layout RotationPolicy='7' SizePolicy='x1'><Binding Type='twelve' row=' 4mm' col='-'/></Layout>",
         [](Settings s) {
             EXPECT_EQ(std::vector<int>({s.rotatePolicy, s.sizePolicy, s.BindingType, s.row, s.col}),
                       std::vector<int>({1, 0, 6, 4, 1}));
         }},
        {"<Layout SizePolicy='1' ImpositionMode='1'/>", [](Settings s) { EXPECT_EQ(s.sizePolicy, 0); }},
        {"<Layout SizePolicy='1' ImpositionMode='0'/>", [](Settings s) { EXPECT_EQ(s.sizePolicy, 3); }},
        {"<Layout SizePolicy='8'/>", [](Settings s) { EXPECT_EQ(s.sizePolicy, 1); }},
        // A repeated ord replaces the earlier pair; a size that is not a number is skipped.
        {"<Layout><FinishSize ord='0' x='1' y='2'/><FinishSize ord='0' x='3.5' y='4e1'/><FinishSize ord='1' x='wide' "
         "y='5'/><FinishSize ord='2' x='1e999'/><BleedSize x='7' y='8'/><BleedSize x='9' y='nine'/></Layout>",
         [](Settings s) {
             EXPECT_EQ(s.FinishSize, (std::map<int32_t, std::pair<double, double>>{{0, {3.5, 40.0}}}));
             EXPECT_EQ(s.BleedSize, std::make_pair(7.0, 8.0));
         }},
        {"<Layout><SheetLabels DateAndTimePrint='2' JobNamePrint='1' SurfaceNumberPrint='0' JobNameString='Brosch"
         "\xC3\xBCre'/></Layout><PageDeliveryInfo PageDelivery='ReverseOrderFaceUp'/>",
         [](Settings s) {
             EXPECT_TRUE(s.DateAndTimePrint && s.JobNamePrint && !s.SurfaceNumberPrint && s.reverseDelivery());
             EXPECT_EQ(s.JobNameString, L"Brosch\u00fcre");
         }},
        // Count pairs, filled one value per attribute in document order; extra ranges are dropped.
        {"<RangeInfo Type='4' Count='2' TotalCount='9'><Range StartIndex='1' EndIndex='2'/><Range StartIndex='5' "
         "EndIndex='6'/><Range StartIndex='8' EndIndex='9'/></RangeInfo>",
         [](Settings s) {
             EXPECT_EQ(s.RangeType + s.TotalCount, 13);
             EXPECT_EQ(s.ranges, (Pairs{{1, 2}, {5, 6}}));
         }},
        {"<RangeInfo Count='2'><Range EndIndex='3'/><Range StartIndex='4' EndIndex='5'/></RangeInfo>",
         [](Settings s) { EXPECT_EQ(s.ranges, (Pairs{{3, 4}, {5, 0}})); }},
        {"<RangeInfo Count='-5'><Range StartIndex='1' EndIndex='2'/></RangeInfo>",
         [](Settings s) { EXPECT_TRUE(s.ranges.empty()); }},
        {"<RangeInfo Count='2147483647'/>", [](Settings s) { EXPECT_EQ(s.ranges.size(), 100000u); }},
        // Another root, or a file that is not well-formed: every default stays.
        {"<?xml version='1.0'?><Settings><Layout RotationPolicy='2'/></Settings>",
         [](Settings s) { EXPECT_EQ(s.rotatePolicy, 1); }},
        {"<Layout RotationPolicy='1'/><Layout>", [](Settings s) { EXPECT_EQ(s.RotationPolicy, 0); }},
    };
    for (const auto& [xml, check] : cases) {
        SCOPED_TRACE(xml);
        vorlan::test::TempDir dir;
        if (xml.rfind("<?xml", 0) == 0) vorlan::test::writeFile(dir / "s.xml", xml);  // its own root
        else autoimpose_test::writeSettings(dir / "s.xml", xml);
        AutoImpositionSettings s;
        s.settingsPath = (dir / "s.xml").string();
        vorlan::autoimpose::readAutoImpositionSettings(s);
        vorlan::autoimpose::deriveImpositionPolicies(s);
        check(s);
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
        {4, 12, true, false, true, false, L"output-sheet= %d; output-set= %d; id= %d.%d /%s",
         "12 - SheetIndex, ImposedSheetSetIndex+1, ImposedSheetSetIndex+1, (12-SheetIndex)/(ImposedSheetSetIndex+1), Side"},
        {4, 10, false, false, true, false, L"output-sheet= %d; output-set= %d; id= %d.%d /%s",
         "SheetIndex+1, SetIndex+1, SetIndex+1, SheetCount, Side"},
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
        const vorlan::autoimpose::SheetLabelText text = vorlan::autoimpose::sheetLabelText(s);
        EXPECT_EQ(text.format, c.format) << c.pdl << " " << c.binding << " " << c.reverse;
        EXPECT_EQ(text.jobTemplate, c.jobTemplate) << c.pdl << " " << c.binding << " " << c.reverse;
    }
}
