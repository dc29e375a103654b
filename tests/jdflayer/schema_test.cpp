// Documents built through the layer validate against the JDF 1.8 schema. The test fails (it
// does not skip) when xmllint is missing or the schema rejects a document.
#include <gtest/gtest.h>

#include "test_support.h"
#include "ticket_builders.h"

using namespace JDF;

TEST(JdfSchema, DocumentsBuiltThroughTheLayerValidate) {
    VORLAN_REQUIRE_CORPUS();
    vorlan::test::TempDir tmp;
    std::vector<std::filesystem::path> files;
    const std::pair<const char*, JDFDoc> docs[] = {
        {"versioned.jdf", jdflayer_test::buildVersionedTicket()},
        {"injected.jdf", jdflayer_test::buildInjectedLayoutTicket(3)},
        {"autoimposed.jdf", jdflayer_test::buildAutoImposedTicket()},
    };
    for (const auto& [name, doc] : docs) {
        files.push_back(tmp / name);
        ASSERT_TRUE(doc.Write2File(WString(files.back().string())));
    }
    std::string output;
    EXPECT_TRUE(vorlan::test::filesFailingJdfSchema(files, &output).empty()) << output;
}
