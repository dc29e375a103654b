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
using vorlan::test::TestPdf;

namespace {

// A Gold square beside a black one.
void writeSpotPdf(const std::string& path) {
    TestPdf pdf;
    const std::string gold = TestPdf::ref(pdf.object(pdf.separation("Gold")));
    pdf.addPage("q /Au cs 1 scn 10 10 30 30 re f Q q 0 g 60 10 30 30 re f Q", "<< /ColorSpace << /Au " + gold + " >> >>");
    pdf.write(path);
}

// `qpdf --encrypt` with the given user password and key length (128: RC4), forbidding modification.
bool encrypt(const std::string& in, const std::string& out, const std::string& user, const std::string& bits) {
    return vorlan::test::runCommand("qpdf --allow-weak-crypto --encrypt '" + user + "' owner " + bits +
                                    " --modify=none -- '" + in + "' '" + out + "' >/dev/null 2>&1") == 0;
}

std::map<std::string, long> inkedPlates(const std::string& pdf) { return vorlan::test::inkedPlates(pdf, 1); }

}  // namespace

TEST(RestrictedPdf, OpensWithTheEmptyPasswordAndKeepsItsEncryption) {
    if (!vorlan::test::haveProgram("gs") || !vorlan::test::haveProgram("pdftoppm")) GTEST_SKIP() << "gs or pdftoppm missing";
    for (const std::string bits : {"128", "256"}) {  // RC4-128 and AES-256
        SCOPED_TRACE(bits);
        TempDir dir;
        const std::string plain = (dir / "plain.pdf").string(), input = (dir / "in.pdf").string();
        writeSpotPdf(plain);
        ASSERT_TRUE(encrypt(plain, input, "", bits));
        const std::pair<int, int> original = vorlan::test::encryptionOf(input);
        ASSERT_EQ(original.first, bits == "128" ? 3 : 6);
        const std::string before = vorlan::test::readFile(input);
        ASSERT_GT(vorlan::test::renderPage(input, 1).inked(), 0) << "the input renders";

        const std::string converted = (dir / "converted.pdf").string();
        const char* seps[] = {"Gold"};
        PdfFailure why = PdfFailure::CannotOpen;
        ASSERT_EQ(convertPDF(nullptr, input.c_str(), converted.c_str(), seps, nullptr, 1, 0, &why), 0);
        EXPECT_EQ(why, PdfFailure::None);
        const std::string shown = (dir / "shown.pdf").string();
        ASSERT_TRUE(vorlan::test::showOnlyGroups(converted, shown, {"Gold"}));
        const vorlan::test::GreyImage gold = vorlan::test::renderPage(shown, 1);
        ASSERT_FALSE(gold.pixels.empty());
        EXPECT_LT(gold.at(25, 25, 36), 245);
        EXPECT_GE(gold.at(75, 25, 36), 245) << "the black square is in the catch-all group";

        const std::string single = (dir / "single.pdf").string();
        EXPECT_EQ(rewriteSeparations(nullptr, input.c_str(), single.c_str(), {"Gold"}, false), 0);
        const std::string drop = (dir / "drop.pdf").string(), keep = (dir / "keep.pdf").string();
        EXPECT_EQ(rewriteSeparationVariants(nullptr, input.c_str(), {{drop, {"Gold"}, false}, {keep, {"Gold"}, true}}),
                  (std::vector<int>{0, 0}));

        for (const std::string& out : {converted, single, drop, keep}) {
            EXPECT_EQ(vorlan::test::encryptionOf(out), original) << out;
            std::string check;
            EXPECT_TRUE(vorlan::test::qpdfCheckPasses(out, &check)) << out << check;
        }
        EXPECT_EQ(vorlan::test::readFile(input), before);
        const auto plates = inkedPlates(input);
        ASSERT_EQ(plates.count("Gold"), 1u);
        EXPECT_EQ(inkedPlates(drop).count("Gold"), 0u);
        EXPECT_EQ(inkedPlates(single).count("Gold"), 0u);
        const auto kept = inkedPlates(keep);
        EXPECT_EQ(kept.size(), 1u);
        EXPECT_EQ(kept.count("Gold"), 1u);
    }
}

TEST(RefusedPdf, EachRefusalWritesOneLineNamingTheFileAndTheReason) {
    TempDir dir;
    const std::string good = (dir / "good.pdf").string();
    writeSpotPdf(good);
    const std::string locked = (dir / "locked.pdf").string();
    ASSERT_TRUE(encrypt(good, locked, "secret", "256"));
    const std::string damaged = (dir / "damaged.pdf").string();
    vorlan::test::writeFile(damaged, "not a PDF at all\n");
    const std::string missing = (dir / "missing.pdf").string();
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
    EXPECT_NE(failureMessage(PdfFailure::PasswordProtected, locked).find("password-protected"), std::string::npos);

    const std::string longName(kMaxConversionName, 'x');
    const char* tooLong[] = {longName.c_str()};
    PdfFailure why = PdfFailure::None;
    testing::internal::CaptureStderr();
    EXPECT_EQ(convertPDF(nullptr, good.c_str(), out.c_str(), tooLong, nullptr, 1, 0, &why), 1);
    EXPECT_EQ(testing::internal::GetCapturedStderr(), failureMessage(PdfFailure::NameTooLong, good) + "\n");
    EXPECT_EQ(why, PdfFailure::NameTooLong);
}
