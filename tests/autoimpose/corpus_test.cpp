// Public tickets made by others through the rewrite: each is either rewritten, and then still
// schema-valid when it was before, or left byte for byte as it was.
#include <gtest/gtest.h>

#include "autoimpose/auto_imposition.h"
#include "template_ticket.h"
#include "test_support.h"

namespace fs = std::filesystem;

namespace {

// True when the ticket's root process takes rendering parameters (Rendering among its types).
bool rendersPages(const std::string& ticket) {
    JDF::JDFParser parser;
    if (!parser.ParseString(ticket)) return false;
    JDF::JDFNode root = JDF::JDFDoc(parser.GetDocument()).GetJDFRoot();
    return root.GetType() == L"Rendering" || root.GetTypes().contains(L"Rendering");
}

}  // namespace

TEST(AutoImposeCorpus, RewrittenTicketsStayValidAndFailuresLeaveThemUntouched) {
    VORLAN_REQUIRE_CORPUS();
    vorlan::test::TempDir dir;
    autoimpose_test::writeSettings(dir / "s.xml",
                                   "<Layout><SheetLabels SurfaceNumberPrint='1'/><Binding Type='10' row='2' col='2'/>"
                                   "</Layout><RangeInfo Type='4' Count='1'><Range StartIndex='1' EndIndex='2'/>"
                                   "</RangeInfo><PageDeliveryInfo PageDelivery='ReverseOrderFaceUp'/>");
    std::vector<fs::path> tickets;
    for (const auto& entry : fs::directory_iterator(vorlan::test::corpusDir() / "jdf")) {
        std::string ext = entry.path().extension().string();
        if (ext != ".jdf" && ext != ".JDF") continue;
        tickets.push_back(dir / entry.path().filename());
        fs::copy_file(entry.path(), tickets.back());
    }
    ASSERT_FALSE(tickets.empty());
    const std::vector<std::string> invalidBefore = vorlan::test::filesFailingJdfSchema(tickets);
    std::vector<fs::path> rewritten;
    for (const fs::path& ticket : tickets) {
        const std::string before = vorlan::test::readFile(ticket);
        vorlan::autoimpose::AutoImpositionSettings settings;
        settings.settingsPath = (dir / "s.xml").string();
        settings.jdfPath = ticket.string();
        vorlan::autoimpose::ImpositionChanges changes;
        if (vorlan::autoimpose::imposeTicket(settings, &changes)) {
            // The schema allows no RenderingParams link on a process that does not render, yet the
            // rewrite links one where the ticket had none: such tickets cannot stay valid.
            const bool foreignLink = changes.renderingParamsAdded && !rendersPages(before);
            if (!foreignLink &&
                std::find(invalidBefore.begin(), invalidBefore.end(), ticket.string()) == invalidBefore.end())
                rewritten.push_back(ticket);
        } else {
            EXPECT_EQ(vorlan::test::readFile(ticket), before) << ticket;
        }
    }
    std::string report;
    EXPECT_TRUE(vorlan::test::filesFailingJdfSchema(rewritten, &report).empty()) << report;
    std::printf("%zu tickets, %zu valid before, %zu of those rewritten\n", tickets.size(),
                tickets.size() - invalidBefore.size(), rewritten.size());
}
