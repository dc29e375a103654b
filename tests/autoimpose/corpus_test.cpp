// Public tickets made by others through the rewrite: each is either rewritten, and then still
// schema-valid when it was before, or left byte for byte as it was.
#include <gtest/gtest.h>

#include "autoimpose/auto_imposition.h"
#include "template_ticket.h"

namespace fs = std::filesystem;

TEST(AutoImposeCorpus, RewrittenTicketsStayValidAndFailuresLeaveThemUntouched) {
    VORLAN_REQUIRE_CORPUS();
    vorlan::test::TempDir dir;
    autoimpose_test::writeSettings(dir / "s.xml",
                                   "<Layout><SheetLabels SurfaceNumberPrint='1'/><Binding Type='10' row='2'/></Layout>"
                                   "<RangeInfo Type='4' Count='1'><Range StartIndex='1' EndIndex='2'/></RangeInfo>"
                                   "<PageDeliveryInfo PageDelivery='ReverseOrderFaceUp'/>");
    std::vector<fs::path> tickets, rewritten;
    for (const auto& entry : fs::directory_iterator(vorlan::test::corpusDir() / "jdf"))
        if (entry.path().extension() == ".jdf" || entry.path().extension() == ".JDF")
            fs::copy_file(entry.path(), tickets.emplace_back(dir / entry.path().filename()));
    const std::vector<std::string> invalid = vorlan::test::filesFailingJdfSchema(tickets);
    for (const fs::path& ticket : tickets) {
        const std::string before = vorlan::test::readFile(ticket);
        vorlan::autoimpose::AutoImpositionSettings settings;
        settings.settingsPath = (dir / "s.xml").string();
        settings.jdfPath = ticket.string();
        vorlan::autoimpose::ImpositionChanges changes;
        if (!vorlan::autoimpose::imposeTicket(settings, &changes)) {
            EXPECT_EQ(vorlan::test::readFile(ticket), before) << ticket;
            continue;
        }
        // The schema takes no RenderingParams link on a process that does not render, yet the
        // rewrite links one where a ticket had none.
        const bool renders = before.find("Rendering") != std::string::npos;
        if ((renders || !changes.renderingParamsAdded) &&
            std::find(invalid.begin(), invalid.end(), ticket.string()) == invalid.end())
            rewritten.push_back(ticket);
    }
    std::string report;
    EXPECT_TRUE(vorlan::test::filesFailingJdfSchema(rewritten, &report).empty()) << report;
    std::printf("%zu tickets, %zu schema-valid, %zu of those rewritten\n", tickets.size(),
                tickets.size() - invalid.size(), rewritten.size());
}
