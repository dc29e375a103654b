// Texts, page lists and deep copies of the job model. Copies of whole workers are checked in
// tests/jdf/layout_test.cpp.
#include <gtest/gtest.h>

#include "model/geometry_strings.h"
#include "vorlan/JDFinterface.h"

namespace {

LD_Surface* surfaceWithEverything() {
    auto* surface = new LD_Surface;
    surface->index = 3;
    surface->VersionName = LD_CopyText(L"English");
    surface->media = new LD_OCG_Media;
    surface->media->DescriptiveName = LD_CopyText(L"Gloss");
    surface->contentType = CONTENT_CONTENT;
    auto* object = new LD_ContentObject;
    object->CTM->e = 10;
    object->CTM->text = LD_CopyText(L"1 0 0 1 10 0");
    object->ClipBox = new LD_Box;
    object->ClipBox->text = LD_CopyText(L"0 0 10 10");
    object->TrimSize = new LD_Point;
    object->TrimCTM = new LD_CTM;
    object->ClipPath = new std::vector<LD_ClipPathOperations*>;
    auto* op = new LD_ClipPathOperations;
    op->operation = CLIP_CURVETO;
    auto* operands = new LD_ClipPathOperandsThreePoints;
    operands->point1.x = 3;
    operands->point3.text = LD_CopyText(L"3 4");
    op->operands = operands;
    object->ClipPath->push_back(op);
    object->clipPathText = LD_CopyText(L"0 0 5 5 re");
    surface->contentObjects.push_back(object);
    auto* mark = new LD_MarkObject;
    mark->ClipBox = new LD_Box;
    surface->markObjects.push_back(mark);
    return surface;
}

}  // namespace

TEST(Records, TextsAreCutAndMayBeSetFromThemselves) {
    wchar_t* text = LD_NewText();
    std::wstring longText(2000, L'x');
    LD_SetText(text, longText.c_str());
    EXPECT_EQ(std::wcslen(text), LD_TEXT_BUFFER_CHARS - 1);
    LD_SetText(text, text + 500);  // a text's own tail
    EXPECT_EQ(std::wstring(text), std::wstring(11, L'x'));
    LD_SetText(text, nullptr);
    EXPECT_STREQ(text, L"");
    std::free(text);
}

// A copied run shares its pages until either changes them; a change never shows in the other.
TEST(Records, RunPageListsCopyOnWrite) {
    LD_PageList original = {5, 3, 9};
    LD_PageList copy = original, appended = original;
    copy.sort();
    appended.push_back(1);
    EXPECT_EQ(original.values(), (std::vector<int32_t>{5, 3, 9}));
    EXPECT_EQ(copy.values(), (std::vector<int32_t>{3, 5, 9}));
    EXPECT_EQ(appended.values(), (std::vector<int32_t>{5, 3, 9, 1}));
    LD_PageList sorted = copy;
    sorted.sort();  // already in order: stays shared, still equal
    EXPECT_EQ(sorted, copy);
    copy.clear();
    EXPECT_TRUE(copy.empty());
    EXPECT_EQ(sorted.size(), 3u);
}

TEST(Records, SurfaceCopySharesNoPointer) {
    LD_Surface* source = surfaceWithEverything();
    LD_Surface* copy = source->copy();
    EXPECT_EQ(copy->contentType, CONTENT_DIE_ONLY);
    EXPECT_NE(copy->SurfaceContentsBox, source->SurfaceContentsBox);
    EXPECT_NE(copy->media, source->media);
    EXPECT_NE(copy->media->DescriptiveName, source->media->DescriptiveName);
    EXPECT_NE(copy->VersionName, source->VersionName);
    ASSERT_EQ(copy->contentObjects.size(), 1u);
    LD_ContentObject* a = source->contentObjects[0];
    LD_ContentObject* b = copy->contentObjects[0];
    EXPECT_NE(a->CTM, b->CTM);
    EXPECT_NE(a->CTM->text, b->CTM->text);
    EXPECT_NE(a->ClipBox, b->ClipBox);
    EXPECT_NE(a->ClipBox->text, b->ClipBox->text);
    EXPECT_NE(a->ClipPath, b->ClipPath);
    auto& copiedOperands = dynamic_cast<LD_ClipPathOperandsThreePoints&>(*(*b->ClipPath)[0]->operands);
    auto& sourceOperands = dynamic_cast<LD_ClipPathOperandsThreePoints&>(*(*a->ClipPath)[0]->operands);
    EXPECT_NE(&copiedOperands, &sourceOperands);
    EXPECT_EQ(copiedOperands.point1.x, 3);
    EXPECT_NE(copiedOperands.point3.text, sourceOperands.point3.text);
    EXPECT_NE(a->clipPathText, b->clipPathText);
    EXPECT_NE(source->markObjects[0]->ClipBox, copy->markObjects[0]->ClipBox);
    b->CTM->e = 99;
    EXPECT_EQ(a->CTM->e, 10);
    delete source;
    EXPECT_STREQ(copy->VersionName, L"English");  // still intact after the source is gone
    EXPECT_STREQ(copiedOperands.point3.text, L"3 4");
    delete copy;
}
