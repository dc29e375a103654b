// The layout tree: signatures own sheets, sheets own surfaces, surfaces own placed objects.
#include <cstdlib>

#include "vorlan/LD_Records.h"

namespace {

template <typename T>
T* copyOrNull(const T* source) {
    return source ? new T(*source) : nullptr;
}

std::vector<LD_ClipPathOperations*>* copyClipPath(const std::vector<LD_ClipPathOperations*>* source) {
    if (!source) return nullptr;
    auto* copy = new std::vector<LD_ClipPathOperations*>;
    copy->reserve(source->size());
    for (const LD_ClipPathOperations* op : *source) {
        auto* made = new LD_ClipPathOperations;
        made->operation = op->operation;
        made->operands = op->operands ? op->operands->clone() : nullptr;
        copy->push_back(made);
    }
    return copy;
}

}  // namespace

LD_OCG_Media::LD_OCG_Media() : Class(LD_CopyText(L"Consumable")) {}

LD_OCG_Media::~LD_OCG_Media() {
    std::free(Class);
    std::free(DescriptiveName);
    std::free(GrainDirection);
    std::free(MediaUnit);
}

LD_OCG_Media::LD_OCG_Media(const LD_OCG_Media& other)
    : Class(LD_CopyText(other.Class)), status(other.status), height(other.height), width(other.width),
      DescriptiveName(LD_CopyText(other.DescriptiveName)), GrainDirection(LD_CopyText(other.GrainDirection)),
      MediaUnit(LD_CopyText(other.MediaUnit)), Thickness(other.Thickness), Weight(other.Weight) {}

LD_OCG_Media& LD_OCG_Media::operator=(const LD_OCG_Media& other) {
    if (this != &other) {
        LD_OCG_Media copy(other);
        std::swap(Class, copy.Class);
        std::swap(DescriptiveName, copy.DescriptiveName);
        std::swap(GrainDirection, copy.GrainDirection);
        std::swap(MediaUnit, copy.MediaUnit);
        status = other.status;
        height = other.height;
        width = other.width;
        Thickness = other.Thickness;
        Weight = other.Weight;
    }
    return *this;
}

LD_ContentObject::LD_ContentObject() : CTM(new LD_CTM) {}

LD_ContentObject::~LD_ContentObject() {
    delete CTM;
    delete ClipBox;
    if (ClipPath) {
        for (LD_ClipPathOperations* op : *ClipPath) delete op;
        delete ClipPath;
    }
    delete TrimCTM;
    delete TrimSize;
    std::free(clipPathText);
}

LD_ContentObject* LD_ContentObject::copy() const {
    auto* made = new LD_ContentObject;
    made->objectIndex = objectIndex;
    made->contentObjectIndex = contentObjectIndex;
    made->surfaceIndex = surfaceIndex;
    *made->CTM = *CTM;
    made->ClipBox = copyOrNull(ClipBox);
    made->ClipPath = copyClipPath(ClipPath);
    made->Ord = Ord;
    made->TrimCTM = copyOrNull(TrimCTM);
    made->TrimSize = copyOrNull(TrimSize);
    made->clipPathText = LD_CopyText(clipPathText);
    made->CachePlacedObject = CachePlacedObject;
    made->IgnoreClipForReuse = IgnoreClipForReuse;
    made->ordRepeated = ordRepeated;
    return made;
}

LD_MarkObject::LD_MarkObject() : CTM(new LD_CTM) {}

LD_MarkObject::~LD_MarkObject() {
    delete CTM;
    delete ClipBox;
    delete TrimCTM;
    delete TrimSize;
}

LD_MarkObject* LD_MarkObject::copy() const {
    auto* made = new LD_MarkObject;
    made->objectIndex = objectIndex;
    made->markObjectIndex = markObjectIndex;
    made->surfaceIndex = surfaceIndex;
    *made->CTM = *CTM;
    made->ClipBox = copyOrNull(ClipBox);
    made->Ord = Ord;
    made->TrimCTM = copyOrNull(TrimCTM);
    made->TrimSize = copyOrNull(TrimSize);
    return made;
}

LD_Surface::LD_Surface() : SurfaceContentsBox(new LD_Box) {}

LD_Surface::~LD_Surface() {
    delete SurfaceContentsBox;
    delete media;
    for (LD_ContentObject* object : contentObjects) delete object;
    for (LD_MarkObject* object : markObjects) delete object;
    std::free(VersionName);
}

LD_Surface* LD_Surface::copy() const {
    auto* made = new LD_Surface;
    made->index = index;
    made->sheetIndex = sheetIndex;
    made->isFront = isFront;
    made->isEmpty = isEmpty;
    made->isSelected = isSelected;
    *made->SurfaceContentsBox = *SurfaceContentsBox;
    made->media = copyOrNull(media);
    for (const LD_ContentObject* object : contentObjects) made->contentObjects.push_back(object->copy());
    for (const LD_MarkObject* object : markObjects) made->markObjects.push_back(object->copy());
    made->VersionName = LD_CopyText(VersionName);
    made->VersionIndex = VersionIndex;
    made->VersionCopyCount = VersionCopyCount;
    made->contentType = CONTENT_DIE_ONLY;  // the die steps decide the kind of the copy
    made->StepAndRepeat = StepAndRepeat;
    return made;
}

LD_Sheet::LD_Sheet() : name(LD_NewText()) {}

LD_Sheet::~LD_Sheet() {
    std::free(name);
    delete media;
    delete front;
    if (back != front) delete back;
}

LD_Signature::LD_Signature() : name(LD_NewText()) {}

LD_Signature::~LD_Signature() {
    std::free(name);
    delete media;
    for (LD_Sheet* sheet : sheetList) delete sheet;
}
