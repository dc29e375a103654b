// Reads a Layout resource into signatures, sheets, surfaces and placed objects.
//
// Both ways of writing a layout are accepted: nested Signature / Sheet / Surface elements, and a
// Layout partitioned by SignatureName, SheetName and Side, whose partitions are nested Layouts.
// The counters of the worker are not reset, so a second Layout continues the numbering.
#include <cstdlib>
#include <cstring>
#include <map>
#include <memory>
#include <string_view>

#include <pugixml.hpp>

#include "jdf/ticket_handles.h"
#include "jdf/ticket_reading.h"
#include "model/geometry_strings.h"
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

// Placed objects are many: they are read straight from the document's UTF-8 bytes, without
// wide copies of names and values on the way.

// Exact-size wide copy of UTF-8 text.
wchar_t* copyText(const char* text) {
    size_t length = std::strlen(text);
    bool ascii = true;
    for (size_t i = 0; i < length && ascii; ++i) ascii = static_cast<unsigned char>(text[i]) < 0x80;
    if (!ascii) return copyText(JDF::WString(text));
    auto* copy = static_cast<wchar_t*>(std::malloc((length + 1) * sizeof(wchar_t)));
    if (!copy) throw OutOfText{};
    for (size_t i = 0; i <= length; ++i) copy[i] = static_cast<wchar_t>(static_cast<unsigned char>(text[i]));
    return copy;
}

bool namedNode(pugi::xml_node n, const char* name) {
    const char* qualified = n.name();
    const char* colon = std::strchr(qualified, ':');
    return vorlan::os::equalsIgnoreCaseAscii(colon ? colon + 1 : qualified, name);
}

// An attribute's value; empty when absent.
const char* attribute(pugi::xml_node n, const char* key) { return n.attribute(key).value(); }

bool isTrue(pugi::xml_node n, const char* key) {
    pugi::xml_attribute a = n.attribute(key);
    return a && vorlan::os::equalsIgnoreCaseAscii(a.value(), "true");
}

// An Ord value read like _wtoi.
int32_t readOrd(const char* text) {
    wchar_t wide[32];
    size_t i = 0;
    for (; i + 1 < 32 && text[i]; ++i) wide[i] = static_cast<wchar_t>(static_cast<unsigned char>(text[i]));
    wide[i] = L'\0';
    return vorlan::os::wtoi(wide);
}

// A new matrix with a copy of the text, parsed.
LD_CTM* readMatrix(const char* text) {
    auto ctm = std::make_unique<LD_CTM>();
    ctm->text = copyText(text);
    vorlan::geometry::parseCTM(text, ctm.get());
    return ctm.release();
}

LD_Box* readBox(const char* text) {
    auto box = std::make_unique<LD_Box>();
    box->text = copyText(text);
    vorlan::geometry::parseBox(text, box.get());
    return box.release();
}

// The first point of the text, carrying the text; (-1, -1) without text when there is none.
LD_Point* readTrimSize(const char* text) {
    std::vector<LD_Point*> points;
    vorlan::geometry::parsePoints(text, points);
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

        if (!surface->SurfaceContentsBox) surface->SurfaceContentsBox = new LD_Box;  // made with the surface
        LD_JDF::parseStringAsBox(resource.GetAttribute(L"SurfaceContentsBox"), surface->SurfaceContentsBox);
        if (resource.HasAttribute(L"ADBE:StepAndRepeat") &&
            vorlan::os::equalsIgnoreCase(resource.GetAttribute(L"ADBE:StepAndRepeat").c_str(), L"true"))
            surface->StepAndRepeat = true;

        ords_.clear();
        repeated_ = false;
        for (pugi::xml_node child = element.node().first_child(); child; child = child.next_sibling()) {
            if (child.type() != pugi::node_element) continue;
            surface->isEmpty = false;
            if (namedNode(child, "ContentObject")) readContentObject(child, *surface);
            else if (namedNode(child, "MarkObject")) readMarkObject(child, *surface);
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

    void readContentObject(pugi::xml_node element, LD_Surface& surface) {
        auto* object = new LD_ContentObject;
        w_.contentObjects.push_back(object);
        surface.contentObjects.push_back(object);
        object->objectIndex = w_.placedObjectCount;
        object->contentObjectIndex = w_.contentObjectCount;
        object->surfaceIndex = surface.index;

        const char* ctm = attribute(element, "CTM");
        object->CTM->text = copyText(ctm);
        vorlan::geometry::parseCTM(ctm, object->CTM);
        const char* clipBox = attribute(element, "ClipBox");
        if (*clipBox) object->ClipBox = readBox(clipBox);
        const char* clipPath = attribute(element, "ClipPath");
        if (!*clipPath) clipPath = attribute(element, "SourceClipPath");
        if (*clipPath) {
            object->clipPathText = copyText(clipPath);
            object->ClipPath = new std::vector<LD_ClipPathOperations*>;
            vorlan::geometry::parseClipPath(clipPath, *object->ClipPath);
        }

        object->Ord = readOrd(attribute(element, "Ord"));
        auto [it, added] = ords_.emplace(object->Ord, false);
        if (!added) {
            it->second = true;
            object->ordRepeated = true;
            repeated_ = true;
        }

        const char* trimCtm = attribute(element, "TrimCTM");
        if (*trimCtm) object->TrimCTM = readMatrix(trimCtm);
        const char* trimSize = attribute(element, "TrimSize");
        if (*trimSize) object->TrimSize = readTrimSize(trimSize);
        object->CachePlacedObject = isTrue(element, "ADBE:CachePlacedObject");
        object->IgnoreClipForReuse = isTrue(element, "ADBE:IgnoreClipForReuse");

        w_.contentObjectOrdinalMap.push_back({object->Ord, object->contentObjectIndex});
        ++w_.contentObjectCount;
    }

    void readMarkObject(pugi::xml_node element, LD_Surface& surface) {
        auto* object = new LD_MarkObject;
        w_.markObjects.push_back(object);
        surface.markObjects.push_back(object);
        object->objectIndex = w_.placedObjectCount;
        object->markObjectIndex = w_.markObjectCount;
        object->surfaceIndex = surface.index;

        const char* ctm = attribute(element, "CTM");
        object->CTM->text = copyText(ctm);
        vorlan::geometry::parseCTM(ctm, object->CTM);
        const char* clipBox = attribute(element, "ClipBox");
        if (*clipBox) object->ClipBox = readBox(clipBox);
        object->Ord = readOrd(attribute(element, "Ord"));
        const char* trimCtm = attribute(element, "TrimCTM");
        if (*trimCtm) object->TrimCTM = readMatrix(trimCtm);
        const char* trimSize = attribute(element, "TrimSize");
        if (*trimSize) object->TrimSize = readTrimSize(trimSize);
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
