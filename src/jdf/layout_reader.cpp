// Reads a Layout resource into signatures, sheets, surfaces and placed objects.
//
// Both ways of writing a layout are accepted: nested Signature / Sheet / Surface elements, and a
// Layout partitioned by SignatureName, SheetName and Side, whose partitions are nested Layouts.
// The counters of the worker are not reset, so a second Layout continues the numbering.
#include <cstdlib>
#include <map>
#include <memory>

#include "jdf/ticket_handles.h"
#include "jdf/ticket_reading.h"
#include "platform/os/text.h"

namespace vorlan::jdf {
namespace {

// Thrown (and caught below) when an exact-size text copy cannot be allocated.
struct OutOfText {};

wchar_t* copyText(const JDF::WString& text) {
    wchar_t* copy = LD_CopyText(text.c_str());
    if (!copy) throw OutOfText{};
    return copy;
}

bool named(const JDF::KElement& e, const wchar_t* name) {
    return vorlan::os::equalsIgnoreCase(e.GetLocalName().c_str(), name);
}

bool isTrue(const JDF::KElement& e, const wchar_t* key) {
    return e.HasAttribute(key) && vorlan::os::equalsIgnoreCase(e.GetAttribute(key).c_str(), L"true");
}

// A new matrix with a copy of the text, parsed.
LD_CTM* readMatrix(const JDF::WString& text) {
    auto ctm = std::make_unique<LD_CTM>();
    ctm->text = copyText(text);
    LD_JDF::parseStringAsCTM(text, ctm.get());
    return ctm.release();
}

LD_Box* readBox(const JDF::WString& text) {
    auto box = std::make_unique<LD_Box>();
    box->text = copyText(text);
    LD_JDF::parseStringAsBox(text, box.get());
    return box.release();
}

// The first point of the text, carrying the text; (-1, -1) without text when there is none.
LD_Point* readTrimSize(const JDF::WString& text) {
    std::vector<LD_Point*> points;
    LD_JDF::parseStringAsPoints(text, points);
    if (points.empty()) return new LD_Point;
    for (size_t i = 1; i < points.size(); ++i) delete points[i];
    std::unique_ptr<LD_Point> first(points[0]);
    first->text = copyText(text);
    return first.release();
}

class LayoutReader {
public:
    explicit LayoutReader(LD_JDF& w) : w_(w) {}

    void readLayout(const JDF::KElement& layout) {
        (void)layout.GetAttribute(L"PartIDKeys");  // read, not used: the element names decide
        for (const JDF::KElement& child : layout.GetChildrenByTagName(L"*", L"*"))
            if (named(child, L"Layout") || named(child, L"Signature")) readSignature(child);
    }

private:
    void readSignature(const JDF::KElement& element) {
        auto* signature = new LD_Signature;
        w_.signatures.push_back(signature);
        bool nested = named(element, L"Signature");
        LD_SetTextBuffer(signature->name, element.GetAttribute(nested ? L"Name" : L"SignatureName").c_str());
        signature->index = w_.numberOfSignatures;
        signature->sheetRange.first = w_.numberOfSheets;

        int32_t number = 1;
        for (const JDF::KElement& child : JDF::JDFElement(element).GetChildElementVector(L"*", L"*")) {
            if (named(child, L"Layout") || named(child, L"Sheet")) {
                readSheet(child, *signature, number);
                ++number;
                ++w_.numberOfSheets;
            } else if (named(child, L"Media")) {
                if (!signature->media) signature->media = new LD_OCG_Media;
                w_.parseMediaNode(JDF::JDFMedia(child), signature->media);
            }
            signature->sheetRange.last = w_.numberOfSheets - 1;
        }
        ++w_.numberOfSignatures;
    }

    void readSheet(const JDF::KElement& element, LD_Signature& signature, int32_t number) {
        auto* sheet = new LD_Sheet;
        w_.sheets.push_back(sheet);
        signature.sheetList.push_back(sheet);
        sheet->index = w_.numberOfSheets;
        sheet->numberInSignature = number;
        sheet->signatureIndex = signature.index;
        bool nested = named(element, L"Sheet");
        LD_SetTextBuffer(sheet->name, element.GetAttribute(nested ? L"Name" : L"SheetName").c_str());

        for (const JDF::KElement& child : JDF::JDFElement(element).GetChildElementVector(L"*", L"*")) {
            if (named(child, L"Layout") || named(child, L"Surface")) {
                readSurface(child, *sheet);
                ++w_.numberOfSurfaces;
            } else if (named(child, L"Media")) {
                delete sheet->media;  // a later Media child replaces an earlier one
                sheet->media = new LD_OCG_Media;
                w_.parseMediaNode(JDF::JDFMedia(child), sheet->media);
            }
        }
    }

    // Puts the surface into its side's slot; a surface already there stays in the surface
    // list and is kept alive by the ticket handles.
    void place(LD_Surface*& slot, LD_Surface* surface) {
        if (slot) w_.ticket->displacedSurfaces.emplace_back(slot);
        slot = surface;
    }

    void readSurface(const JDF::KElement& element, LD_Sheet& sheet) {
        auto* surface = new LD_Surface;
        surface->index = w_.numberOfSurfaces;
        surface->sheetIndex = sheet.index;
        surface->contentType = CONTENT_CONTENT;
        // Surface attributes may sit on an enclosing partition (SurfaceContentsBox on the sheet).
        JDF::JDFResource resource(element);
        surface->isFront = resource.GetAttribute(L"Side") == L"Front";
        place(surface->isFront ? sheet.front : sheet.back, surface);
        w_.surfaces.push_back(surface);

        surface->SurfaceContentsBox = new LD_Box;
        LD_JDF::parseStringAsBox(resource.GetAttribute(L"SurfaceContentsBox"), surface->SurfaceContentsBox);
        if (resource.HasAttribute(L"ADBE:StepAndRepeat") &&
            vorlan::os::equalsIgnoreCase(resource.GetAttribute(L"ADBE:StepAndRepeat").c_str(), L"true"))
            surface->StepAndRepeat = true;

        JDF::vElement children = element.GetChildrenByTagName(L"*", L"*");
        surface->isEmpty = children.empty();
        ords_.clear();
        repeated_ = false;
        for (const JDF::KElement& child : children) {
            if (named(child, L"ContentObject")) readContentObject(child, *surface);
            else if (named(child, L"MarkObject")) readMarkObject(child, *surface);
            ++w_.placedObjectCount;
        }
        if (repeated_) markFirstOccurrences(*surface);
    }

    // Objects after the first with the same Ord were marked as they were read; this marks the
    // first one of each repeated Ord too.
    void markFirstOccurrences(LD_Surface& surface) {
        for (LD_ContentObject* object : surface.contentObjects) {
            auto it = ords_.find(object->Ord);
            if (it == ords_.end()) continue;
            if (it->second) object->ordRepeated = true;
            ords_.erase(it);
        }
    }

    void readContentObject(const JDF::KElement& element, LD_Surface& surface) {
        auto* object = new LD_ContentObject;
        w_.contentObjects.push_back(object);
        surface.contentObjects.push_back(object);
        object->objectIndex = w_.placedObjectCount;
        object->contentObjectIndex = w_.contentObjectCount;
        object->surfaceIndex = surface.index;

        JDF::WString ctm = element.GetAttribute(L"CTM");
        object->CTM->text = copyText(ctm);
        LD_JDF::parseStringAsCTM(ctm, object->CTM);
        JDF::WString clipBox = element.GetAttribute(L"ClipBox");
        if (!clipBox.empty()) object->ClipBox = readBox(clipBox);
        JDF::WString clipPath = element.GetAttribute(L"ClipPath");
        if (clipPath.empty()) clipPath = element.GetAttribute(L"SourceClipPath");
        if (!clipPath.empty()) {
            object->clipPathText = copyText(clipPath);
            object->ClipPath = new std::vector<LD_ClipPathOperations*>;
            LD_JDF::parseStringAsClipPathOperations(clipPath, *object->ClipPath);
        }

        object->Ord = vorlan::os::wtoi(element.GetAttribute(L"Ord").c_str());
        auto [it, added] = ords_.emplace(object->Ord, false);
        if (!added) {
            it->second = true;
            object->ordRepeated = true;
            repeated_ = true;
        }

        JDF::WString trimCtm = element.GetAttribute(L"TrimCTM");
        if (!trimCtm.empty()) object->TrimCTM = readMatrix(trimCtm);
        JDF::WString trimSize = element.GetAttribute(L"TrimSize");
        if (!trimSize.empty()) object->TrimSize = readTrimSize(trimSize);
        object->CachePlacedObject = isTrue(element, L"ADBE:CachePlacedObject");
        object->IgnoreClipForReuse = isTrue(element, L"ADBE:IgnoreClipForReuse");

        w_.contentObjectOrdinalMap.push_back({object->Ord, object->contentObjectIndex});
        ++w_.contentObjectCount;
    }

    void readMarkObject(const JDF::KElement& element, LD_Surface& surface) {
        auto* object = new LD_MarkObject;
        w_.markObjects.push_back(object);
        surface.markObjects.push_back(object);
        object->objectIndex = w_.placedObjectCount;
        object->markObjectIndex = w_.markObjectCount;
        object->surfaceIndex = surface.index;

        JDF::WString ctm = element.GetAttribute(L"CTM");
        object->CTM->text = copyText(ctm);
        LD_JDF::parseStringAsCTM(ctm, object->CTM);
        JDF::WString clipBox = element.GetAttribute(L"ClipBox");
        if (!clipBox.empty()) object->ClipBox = readBox(clipBox);
        object->Ord = vorlan::os::wtoi(element.GetAttribute(L"Ord").c_str());
        JDF::WString trimCtm = element.GetAttribute(L"TrimCTM");
        if (!trimCtm.empty()) object->TrimCTM = readMatrix(trimCtm);
        JDF::WString trimSize = element.GetAttribute(L"TrimSize");
        if (!trimSize.empty()) object->TrimSize = readTrimSize(trimSize);
        ++w_.markObjectCount;
    }

    LD_JDF& w_;
    std::map<int32_t, bool> ords_;  // Ord values of the current surface → met more than once
    bool repeated_ = false;
};

}  // namespace

LDError readLayoutResource(LD_JDF& worker, const JDF::KElement& layout) {
    try {
        LayoutReader(worker).readLayout(layout);
    } catch (const OutOfText&) {
        worker.lastError = LD_FAILED;
        return LD_FAILED;
    }
    return LD_OK;
}

}  // namespace vorlan::jdf

void LD_JDF::parseMediaNode(const JDF::JDFMedia& media, LD_OCG_Media* record) {
    if (media.isNull() || !record || media.GetMediaType() != 12) return;
    record->status = media.GetStatus();
    JDF::JDFXYPair dimension = media.GetDimension();
    record->width = dimension.GetX();
    record->height = dimension.GetY();
    auto replace = [](wchar_t*& field, const std::wstring& text) {
        std::free(field);
        field = LD_CopyText(text.c_str());
    };
    replace(record->DescriptiveName, media.GetDescriptiveName());
    replace(record->GrainDirection, std::to_wstring(media.GetGrainDirection()));
    replace(record->MediaUnit, std::to_wstring(media.GetMediaUnit()));
    record->Thickness = media.GetThickness();
    record->Weight = media.GetWeight();
}
