// Encrypted inputs and refused operations: files that open with the empty user password are
// converted and rewritten with their encryption kept; every refusal says why, once.
#include <gtest/gtest.h>

#include "pdf/pdf_failure.h"
#include "pdf/separation_layers.h"
#include "pdf/separation_rewrite.h"
#include "plates.h"
#include "render.h"
#include "test_pdf.h"
#include "test_support.h"

using namespace vorlan::pdf;
using vorlan::test::TempDir;

namespace {

// A Gold square beside a black one, encrypted by `qpdf --encrypt` with the given user password
// and key length (128: RC4), forbidding changes.
bool writeEncryptedSpotPdf(const TempDir& dir, const std::string& path, const std::string& user, const char* bits) {
    vorlan::test::TestPdf pdf;
    const std::string gold = vorlan::test::TestPdf::ref(pdf.object(pdf.separation("Gold")));
    pdf.addPage("q /Au cs 1 scn 10 10 30 30 re f Q q 0 g 60 10 30 30 re f Q", "<< /ColorSpace << /Au " + gold + " >> >>");
    const std::string plain = (dir / "plain.pdf").string();
    pdf.write(plain);
    return vorlan::test::runCommand("qpdf --allow-weak-crypto --encrypt '" + user + "' owner " + bits +
                                    " --modify=none -- " + plain + " " + path) == 0;
}

}  // namespace

TEST(RestrictedPdf, OpensWithTheEmptyPasswordAndKeepsItsEncryption) {
    if (!vorlan::test::haveProgram("gs") || !vorlan::test::haveProgram("pdftoppm")) GTEST_SKIP() << "gs or pdftoppm missing";
    for (const char* bits : {"128", "256"}) {  // RC4-128 and AES-256
        SCOPED_TRACE(bits);
        TempDir dir;
        const std::string input = (dir / "in.pdf").string(), converted = (dir / "converted.pdf").string();
        const std::string single = (dir / "single.pdf").string(), drop = (dir / "drop.pdf").string(),
                          keep = (dir / "keep.pdf").string();
        ASSERT_TRUE(writeEncryptedSpotPdf(dir, input, "", bits));
        const char* seps[] = {"Gold"};
        ASSERT_EQ(convertPDF(nullptr, input.c_str(), converted.c_str(), seps, nullptr, 1, 0), 0);
        EXPECT_EQ(rewriteSeparations(nullptr, input.c_str(), single.c_str(), {"Gold"}, false), 0);
        EXPECT_EQ(rewriteSeparationVariants(nullptr, input.c_str(), {{drop, {"Gold"}, false}, {keep, {"Gold"}, true}}),
                  (std::vector<int>{0, 0}));
        for (const std::string& out : {converted, single, drop, keep}) {
            EXPECT_EQ(vorlan::test::encryptionOf(out), vorlan::test::encryptionOf(input)) << out;
            EXPECT_TRUE(vorlan::test::qpdfCheckPasses(out)) << out;
        }
        const vorlan::test::GreyImage hidden = vorlan::test::renderPage(converted, 1);
        EXPECT_EQ(hidden.inked(), 0) << "the new groups start OFF";
        EXPECT_EQ(vorlan::test::inkedPlates(input, 1).count("Gold"), 1u);
        EXPECT_EQ(vorlan::test::inkedPlates(drop, 1).count("Gold"), 0u);
        EXPECT_EQ(vorlan::test::inkedPlates(single, 1).count("Gold"), 0u);
        const auto kept = vorlan::test::inkedPlates(keep, 1);
        EXPECT_EQ(kept.size(), 1u);
        EXPECT_EQ(kept.count("Gold"), 1u);
    }
}

TEST(RefusedPdf, EachRefusalWritesOneLineNamingTheFileAndTheReason) {
    TempDir dir;
    const std::string good = (dir / "good.pdf").string(), locked = (dir / "locked.pdf").string();
    ASSERT_TRUE(writeEncryptedSpotPdf(dir, good, "", "256"));
    ASSERT_TRUE(writeEncryptedSpotPdf(dir, locked, "secret", "256"));
    const std::string damaged = (dir / "damaged.pdf").string(), missing = (dir / "missing.pdf").string();
    vorlan::test::writeFile(damaged, "not a PDF at all\n");
    const std::string out = (dir / "out.pdf").string(), blocked = (dir / "good.pdf" / "out.pdf").string();
    struct Case {
        std::string input, output;
        PdfFailure convert, rewrite;  // the reasons of the two operations
        std::string named;            // the file the line names
    };
    const Case cases[] = {
        {missing, out, PdfFailure::CannotOpen, PdfFailure::CannotOpen, missing},
        {locked, out, PdfFailure::PasswordProtected, PdfFailure::PasswordProtected, locked},
        {damaged, out, PdfFailure::DamagedBeyondRepair, PdfFailure::Damaged, damaged},
        {good, blocked, PdfFailure::CannotWrite, PdfFailure::CannotWrite, blocked},
    };
    const char* seps[] = {"Gold"};
    for (const Case& c : cases) {
        SCOPED_TRACE(c.input + " -> " + c.output);
        PdfFailure why = PdfFailure::None;
        testing::internal::CaptureStderr();
        EXPECT_EQ(convertPDF(nullptr, c.input.c_str(), c.output.c_str(), seps, nullptr, 1, 0, &why), 1);
        EXPECT_EQ(testing::internal::GetCapturedStderr(), failureMessage(c.convert, c.named) + "\n");
        EXPECT_EQ(why, c.convert);
        testing::internal::CaptureStderr();
        EXPECT_EQ(rewriteSeparations(nullptr, c.input.c_str(), c.output.c_str(), {"Gold"}, false, &why), 1);
        EXPECT_EQ(testing::internal::GetCapturedStderr(), failureMessage(c.rewrite, c.named) + "\n");
        EXPECT_EQ(why, c.rewrite);
        // Two variants refused for one reason: one line.
        testing::internal::CaptureStderr();
        EXPECT_EQ(rewriteSeparationVariants(nullptr, c.input.c_str(), {{c.output, {"Gold"}, false}, {c.output, {}, true}}),
                  (std::vector<int>{1, 1}));
        EXPECT_EQ(testing::internal::GetCapturedStderr(), failureMessage(c.rewrite, c.named) + "\n");
        EXPECT_FALSE(std::filesystem::exists(out));
    }
}
