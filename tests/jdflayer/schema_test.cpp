// Documents built through the layer validate against the JDF 1.8 schema. The test fails (it
// does not skip) when xmllint is missing or the schema rejects a document.
#include <gtest/gtest.h>

#include "test_support.h"
#include "ticket_builders.h"

using namespace JDF;

TEST(JdfSchema, DocumentsBuiltThroughTheLayerValidate) {
    VORLAN_REQUIRE_CORPUS();
    auto xsd = vorlan::test::corpusDir() / "jdf-schema" / "xmllint-patched" / "JDF_1.8" / "JDF.xsd";
    ASSERT_TRUE(std::filesystem::exists(xsd)) << xsd;
    ASSERT_TRUE(vorlan::test::haveProgram("xmllint")) << "xmllint (libxml2-utils) is needed to check the schema";
    vorlan::test::TempDir tmp;
    std::string files;
    const std::pair<const char*, JDFDoc> docs[] = {
        {"versioned.jdf", jdflayer_test::buildVersionedTicket()},
        {"injected.jdf", jdflayer_test::buildInjectedLayoutTicket(3)},
        {"autoimposed.jdf", jdflayer_test::buildAutoImposedTicket()},
    };
    for (const auto& [name, doc] : docs) {
        auto path = tmp / name;
        ASSERT_TRUE(doc.Write2File(WString(path.string())));
        files += " '" + path.string() + "'";
    }
    std::string output;
    int rc = vorlan::test::runCommand("xmllint --noout --schema '" + xsd.string() + "'" + files + " 2>&1", &output);
    EXPECT_EQ(rc, 0) << output;
}
