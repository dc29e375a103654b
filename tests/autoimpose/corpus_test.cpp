// Public tickets made by others (none of them a template this rewrite accepts as a whole: their
// roots are product or process-group nodes, or their layouts nest): each is rewritten or left byte
// for byte as it was.
#include <gtest/gtest.h>

#include "autoimpose/auto_imposition.h"
#include "template_ticket.h"

TEST(AutoImposeCorpus, TicketsAreRewrittenOrLeftUntouched) {
    VORLAN_REQUIRE_CORPUS();
    vorlan::test::TempDir dir;
    autoimpose_test::writeSettings(dir / "s.xml",
                                   "<Layout SizePolicy='7'><SheetLabels SurfaceNumberPrint='1'/><Binding Type='10' "
                                   "row='2'/></Layout><RangeInfo Type='1' TotalCount='3'/>"
                                   "<PageDeliveryInfo PageDelivery='ReverseOrderFaceUp'/>");
    for (const auto& entry : std::filesystem::directory_iterator(vorlan::test::corpusDir() / "jdf")) {
        const std::filesystem::path ticket = dir / entry.path().filename();
        std::filesystem::copy_file(entry.path(), ticket);
        const std::string before = vorlan::test::readFile(ticket);
        vorlan::autoimpose::AutoImpositionSettings settings;
        settings.settingsPath = (dir / "s.xml").string();
        settings.jdfPath = ticket.string();
        if (!vorlan::autoimpose::imposeTicket(settings, nullptr)) {
            EXPECT_EQ(vorlan::test::readFile(ticket), before) << ticket;
        }
    }
}
