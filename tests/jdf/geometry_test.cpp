// Geometry strings: boxes, matrices, points, clip paths and the mark test. Their copies are
// checked with the surface copy in tests/entry/records_test.cpp.
#include <cstdlib>
#include <memory>

#include <gtest/gtest.h>

#include "model/geometry_strings.h"
#include "platform/jdf/wstring.h"
#include "vorlan/LD_JDF.h"

namespace {

struct ClipPath {
    std::vector<LD_ClipPathOperations*> ops;
    bool wellFormed = true;
    explicit ClipPath(const wchar_t* text) { wellFormed = LD_JDF::parseStringAsClipPathOperations(text, ops); }
    ~ClipPath() {
        for (auto* op : ops) delete op;
    }
    const LD_Point& point(size_t i) const {
        return dynamic_cast<const LD_ClipPathOperandsOnePoint&>(*ops.at(i)->operands).point1;
    }
};

TEST(GeometryStrings, BoxesMatricesAndPoints) {
    // Four numbers make a box, fewer leave it unset (-1), further ones cycle through the corners;
    // only single spaces separate numbers.
    const struct {
        const wchar_t* text;
        double llx, lly, urx, ury;
    } boxes[] = {
        {L"0 0 612 792", 0, 0, 612, 792},
        {L"1 2 3", -1, -1, -1, -1},
        {L"1 2 3 4 5", 5, 2, 3, 4},
        {L"1  2   3 4", 1, 2, 3, 4},
    };
    for (const auto& c : boxes) {
        LD_Box box;
        LD_JDF::parseStringAsBox(c.text, &box);
        EXPECT_EQ((std::vector<double>{box.lowerLeft.x, box.lowerLeft.y, box.upperRight.x, box.upperRight.y}),
                  (std::vector<double>{c.llx, c.lly, c.urx, c.ury}))
            << JDF::WString(c.text).getUTF8();
    }
    std::unique_ptr<std::vector<double>> numbers(LD_JDF::splitIntoFloatTokensBySpace(L"10\t20 30"));
    EXPECT_EQ(*numbers, (std::vector<double>{10, 30}));  // the tab joins two numbers into one token, read as 10
    std::unique_ptr<std::vector<double>> odd(LD_JDF::splitIntoFloatTokensBySpace(L"abc -2.5e1 +3"));
    EXPECT_EQ(*odd, (std::vector<double>{0, -25, 3}));

    // A matrix needs six numbers and ignores more.
    LD_CTM ctm, identity;
    LD_JDF::parseStringAsCTM(L"1 0 0 1 10 20 30", &ctm);
    LD_JDF::parseStringAsCTM(L"2 0 0 2 5", &identity);
    EXPECT_EQ((std::vector<double>{ctm.e, ctm.f, identity.a, identity.e}), (std::vector<double>{10, 20, 1, 0}));

    // Points come in pairs; an odd number is left out.
    std::vector<LD_Point*> points;
    LD_JDF::parseStringAsPoints(L"10 20 30", points);
    LD_JDF::parseStringAsPoints(L"7", points);
    ASSERT_EQ(points.size(), 1u);
    EXPECT_EQ(points[0]->x, 10);
    EXPECT_EQ(points[0]->y, 20);
    for (auto* p : points) delete p;
}

TEST(GeometryStrings, ClipPathOperatorsAndTheirOperands) {
    ClipPath square(L"0 0 m 100 0 l 100 100 l h");
    EXPECT_TRUE(square.wellFormed);
    ASSERT_EQ(square.ops.size(), 4u);
    EXPECT_EQ(square.ops[3]->operation, CLIP_CLOSEPATH);
    EXPECT_EQ(square.ops[3]->operands, nullptr);
    EXPECT_EQ(square.point(2).y, 100);

    ClipPath rect(L"10 20 30 40 re");
    ASSERT_EQ(rect.ops.size(), 1u);
    auto& re = dynamic_cast<LD_ClipPathOperandsOnePointWidthHeight&>(*rect.ops[0]->operands);
    EXPECT_EQ(re.point1.x, 10);
    EXPECT_EQ(re.width, 30);
    EXPECT_EQ(re.height, 40);

    ClipPath curves(L"1 2 3 4 5 6 c 7 8 9 10 v 11 12 13 14 y");
    ASSERT_EQ(curves.ops.size(), 3u);
    auto& c = dynamic_cast<LD_ClipPathOperandsThreePoints&>(*curves.ops[0]->operands);
    EXPECT_EQ(c.point3.y, 6);
    auto& y = dynamic_cast<LD_ClipPathOperandsTwoPoints&>(*curves.ops[2]->operands);
    EXPECT_EQ(curves.ops[2]->operation, CLIP_CURVETO_Y);
    EXPECT_EQ(y.point2.x, 13);
    // Only the leading characters name the operator.
    ClipPath words(L"1 2 lineto 3 4 5 6 rect");
    ASSERT_EQ(words.ops.size(), 2u);
    EXPECT_EQ(words.ops[1]->operation, CLIP_RECTANGLE);
}

TEST(GeometryStrings, OperatorWithWrongCountOfNumbersIsLeftOut) {
    ClipPath tooFew(L"5 m 1 2 l");
    EXPECT_FALSE(tooFew.wellFormed);
    ASSERT_EQ(tooFew.ops.size(), 1u);  // the moveto had one number: it is dropped, never over-read
    EXPECT_EQ(tooFew.ops[0]->operation, CLIP_LINETO);
    EXPECT_EQ(tooFew.point(0).x, 1);
    ClipPath curve(L"1 2 3 c");
    EXPECT_FALSE(curve.wellFormed);
    EXPECT_TRUE(curve.ops.empty());
    ClipPath close(L"3 h 0 0 m 9");  // numbers before h, and trailing numbers, are not used
    EXPECT_FALSE(close.wellFormed);
    ASSERT_EQ(close.ops.size(), 1u);
    EXPECT_EQ(close.ops[0]->operation, CLIP_MOVETO);
    ClipPath re(L"1 2 3 re");
    EXPECT_TRUE(re.ops.empty());
}

TEST(GeometryStrings, MarkPresentInAnyCase) {
    for (const wchar_t* text : {L"Marks", L"cropmark.pdf", L"MMARK", L"xMaRkx"})
        EXPECT_TRUE(LD_JDF::isMarkPresent(text)) << JDF::WString(text).getUTF8();
    for (const wchar_t* text : {L"", L"ma rk", L"mar", static_cast<const wchar_t*>(nullptr)})
        EXPECT_FALSE(LD_JDF::isMarkPresent(text)) << (text ? JDF::WString(text).getUTF8() : "null");
}

}  // namespace
