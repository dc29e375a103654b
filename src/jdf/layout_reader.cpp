// Reads a Layout resource into signatures, sheets, surfaces and placed objects.
//
// Both ways of writing a layout are accepted: nested Signature / Sheet / Surface elements, and a
// Layout partitioned by SignatureName, SheetName and Side, whose partitions are nested Layouts.
// The counters of the worker are not reset, so a second Layout continues the numbering.
#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <utility>
#include <vector>

#include <pugixml.hpp>

#include "jdf/element_walk.h"
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

// Placed objects are many: they are read straight from the document's UTF-8 bytes, without
// wide copies of names and values on the way.

// Exact-size wide copy of UTF-8 text.
wchar_t* copyText(const char* text) {
    size_t length = std::strlen(text);
    unsigned char bits = 0;
    for (size_t i = 0; i < length; ++i) bits |= static_cast<unsigned char>(text[i]);
    if (bits >= 0x80) return copyText(JDF::WString(text));
    auto* copy = static_cast<wchar_t*>(std::malloc((length + 1) * sizeof(wchar_t)));
    if (!copy) throw OutOfText{};
    for (size_t i = 0; i < length; ++i) copy[i] = static_cast<wchar_t>(static_cast<unsigned char>(text[i]));
    copy[length] = L'\0';
    return copy;
}

bool isAscii(const char* text) {
    for (; *text; ++text)
        if (static_cast<unsigned char>(*text) >= 0x80) return false;
    return true;
}

// The element's local name equals name (ASCII) ignoring case, as the wide comparison has it;
// names beyond ASCII are compared in wide form.
bool namedNode(pugi::xml_node n, const char* name) {
    const char* local = localName(n);
    if (std::strcmp(local, name) == 0 || vorlan::os::equalsIgnoreCaseAscii(local, name)) return true;
    if (isAscii(local)) return false;
    return vorlan::os::equalsIgnoreCase(JDF::WString(local).c_str(), JDF::WString(name).c_str());
}

bool named(const JDF::KElement& e, const char* name) { return namedNode(e.node(), name); }

// LD_SetText of the UTF-8 text, without a heap-allocated wide copy on the way for ASCII text.
void setText(wchar_t*& field, const char* text) {
    if (!isAscii(text)) {
        LD_SetText(field, JDF::WString(text).c_str());
        return;
    }
    wchar_t wide[LD_TEXT_BUFFER_CHARS];
    size_t i = 0;
    for (; text[i] && i < LD_TEXT_BUFFER_CHARS - 1; ++i) wide[i] = static_cast<wchar_t>(text[i]);
    wide[i] = L'\0';
    LD_SetText(field, wide);
}

// Calls fn(child) for each child element as JDFElement::GetChildElementVector(L"*", L"*") gives
// them. That replaces a child that refers to another element (a ...Ref with rRef) by the element
// it refers to; without such a child the document's nodes are taken as they stand.
template <typename Fn>
void forEachChildElement(const JDF::KElement& element, Fn fn) {
    pugi::xml_node node = element.node();
    for (pugi::xml_node c = node.first_child(); c; c = c.next_sibling()) {
        if (c.type() != pugi::node_element) continue;
        const char* local = localName(c);
        size_t length = std::strlen(local);
        if (length > 3 && std::strcmp(local + length - 3, "Ref") == 0 && c.attribute("rRef")) {
            for (const JDF::KElement& child : JDF::JDFElement(element).GetChildElementVector(L"*", L"*")) fn(child);
            return;
        }
    }
    for (pugi::xml_node c = node.first_child(); c; c = c.next_sibling())
        if (c.type() == pugi::node_element) fn(JDF::KElement(c, element.document()));
}

// An attribute as JDFResource::GetAttribute finds it: on the element, else on the enclosing
// elements of the same name (the partitions it belongs to); null when absent.
const char* inheritedAttribute(pugi::xml_node element, const char* key) {
    for (pugi::xml_node e = element; e; e = e.parent()) {
        if (pugi::xml_attribute a = e.attribute(key)) return a.value();
        if (std::strcmp(e.parent().name(), element.name()) != 0) break;
    }
    return nullptr;
}

bool isTrue(const char* value) { return value && vorlan::os::equalsIgnoreCaseAscii(value, "true"); }

// The attributes of a placed object the reader uses, found in one pass over its attributes;
// each is the first of its name (as xml_node::attribute finds it), null when absent.
struct PlacedAttributes {
    const char* ctm = nullptr;
    const char* clipBox = nullptr;
    const char* clipPath = nullptr;
    const char* sourceClipPath = nullptr;
    const char* ord = nullptr;
    const char* trimCtm = nullptr;
    const char* trimSize = nullptr;
    const char* cachePlacedObject = nullptr;
    const char* ignoreClipForReuse = nullptr;

    explicit PlacedAttributes(pugi::xml_node element) {
        for (pugi::xml_attribute a = element.first_attribute(); a; a = a.next_attribute()) {
            const char* name = a.name();
            const char** slot = slotOf(name);
            if (slot && !*slot) *slot = a.value();
        }
    }

    // The value, or "" when absent.
    static const char* text(const char* value) { return value ? value : ""; }

private:
    // Names are short: compared inline rather than through strcmp.
    static bool same(const char* a, const char* b) {
        for (; *a && *a == *b; ++a, ++b) {}
        return *a == *b;
    }

    const char** slotOf(const char* name) {
        switch (name[0]) {
            case 'C':
                if (same(name, "CTM")) return &ctm;
                if (same(name, "ClipBox")) return &clipBox;
                if (same(name, "ClipPath")) return &clipPath;
                return nullptr;
            case 'O': return same(name, "Ord") ? &ord : nullptr;
            case 'S': return same(name, "SourceClipPath") ? &sourceClipPath : nullptr;
            case 'T':
                if (same(name, "TrimSize")) return &trimSize;
                if (same(name, "TrimCTM")) return &trimCtm;
                return nullptr;
            case 'A':
                if (same(name, "ADBE:CachePlacedObject")) return &cachePlacedObject;
                if (same(name, "ADBE:IgnoreClipForReuse")) return &ignoreClipForReuse;
                return nullptr;
            default: return nullptr;
        }
    }
};

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
    auto point = std::make_unique<LD_Point>();
    if (vorlan::geometry::parseFirstPoint(text, *point)) point->text = copyText(text);
    return point.release();
}

class LayoutReader {
public:
    explicit LayoutReader(LD_JDF& w) : w_(w) {}

    void readLayout(const JDF::KElement& layout) {
        (void)layout.GetAttribute(L"PartIDKeys");  // read, not used: the element names decide
        for (const JDF::KElement& child : layout.GetChildrenByTagName(L"*", L"*"))
            if (named(child, "Layout") || named(child, "Signature")) readSignature(child);
    }

private:
    void readSignature(const JDF::KElement& element) {
        auto* signature = new LD_Signature;
        w_.signatures.push_back(signature);
        bool nested = named(element, "Signature");
        setText(signature->name, element.node().attribute(nested ? "Name" : "SignatureName").value());
        signature->index = w_.numberOfSignatures;
        signature->sheetRange.first = w_.numberOfSheets;

        int32_t number = 1;
        forEachChildElement(element, [&](const JDF::KElement& child) {
            if (named(child, "Layout") || named(child, "Sheet")) {
                readSheet(child, *signature, number);
                ++number;
                ++w_.numberOfSheets;
            } else if (named(child, "Media")) {
                if (!signature->media) signature->media = new LD_OCG_Media;
                w_.parseMediaNode(JDF::JDFMedia(child), signature->media);
            }
            signature->sheetRange.last = w_.numberOfSheets - 1;
        });
        ++w_.numberOfSignatures;
    }

    void readSheet(const JDF::KElement& element, LD_Signature& signature, int32_t number) {
        auto* sheet = new LD_Sheet;
        w_.sheets.push_back(sheet);
        signature.sheetList.push_back(sheet);
        sheet->index = w_.numberOfSheets;
        sheet->numberInSignature = number;
        sheet->signatureIndex = signature.index;
        bool nested = named(element, "Sheet");
        setText(sheet->name, element.node().attribute(nested ? "Name" : "SheetName").value());

        forEachChildElement(element, [&](const JDF::KElement& child) {
            if (named(child, "Layout") || named(child, "Surface")) {
                readSurface(child, *sheet);
                ++w_.numberOfSurfaces;
            } else if (named(child, "Media")) {
                delete sheet->media;  // a later Media child replaces an earlier one
                sheet->media = new LD_OCG_Media;
                w_.parseMediaNode(JDF::JDFMedia(child), sheet->media);
            }
        });
    }

    // Puts the surface into its side's slot; a surface already there stays in the surface
    // list and is kept alive by the ticket handles.
    void place(LD_Surface*& slot, LD_Surface* surface) {
        if (slot) w_.ticket->displacedSurfaces->emplace_back(slot);
        slot = surface;
    }

    void readSurface(const JDF::KElement& element, LD_Sheet& sheet) {
        auto* surface = new LD_Surface;
        surface->index = w_.numberOfSurfaces;
        surface->sheetIndex = sheet.index;
        surface->contentType = CONTENT_CONTENT;
        // Surface attributes may sit on an enclosing partition (SurfaceContentsBox on the sheet).
        pugi::xml_node node = element.node();
        const char* side = inheritedAttribute(node, "Side");
        surface->isFront = side && std::strcmp(side, "Front") == 0;
        place(surface->isFront ? sheet.front : sheet.back, surface);
        w_.surfaces.push_back(surface);
        w_.ticket->surfaceElements.push_back(element);

        if (!surface->SurfaceContentsBox) surface->SurfaceContentsBox = new LD_Box;  // made with the surface
        const char* contentsBox = inheritedAttribute(node, "SurfaceContentsBox");
        if (!contentsBox) contentsBox = "";
        if (isAscii(contentsBox)) vorlan::geometry::parseBox(contentsBox, surface->SurfaceContentsBox);
        else LD_JDF::parseStringAsBox(JDF::WString(contentsBox), surface->SurfaceContentsBox);
        if (isTrue(inheritedAttribute(node, "ADBE:StepAndRepeat"))) surface->StepAndRepeat = true;

        size_t children = 0;
        for (pugi::xml_node child = node.first_child(); child; child = child.next_sibling())
            children += child.type() == pugi::node_element;
        surface->contentObjects.reserve(children);
        ords_.clear();
        for (pugi::xml_node child = node.first_child(); child; child = child.next_sibling()) {
            if (child.type() != pugi::node_element) continue;
            surface->isEmpty = false;
            if (namedNode(child, "ContentObject")) readContentObject(child, *surface);
            else if (namedNode(child, "MarkObject")) readMarkObject(child, *surface);
            ++w_.placedObjectCount;
        }
        markRepeatedOrds(*surface);
    }

    // Marks every content object of the surface whose Ord another one of the surface shares.
    void markRepeatedOrds(LD_Surface& surface) {
        if (ords_.size() < 2) return;
        std::sort(ords_.begin(), ords_.end());
        for (size_t i = 0; i < ords_.size();) {
            size_t end = i + 1;
            while (end < ords_.size() && ords_[end].first == ords_[i].first) ++end;
            if (end - i > 1)
                for (size_t k = i; k < end; ++k) surface.contentObjects[ords_[k].second]->ordRepeated = true;
            i = end;
        }
    }

    // The geometry content and mark objects share: CTM, ClipBox, Ord, TrimCTM and TrimSize.
    template <typename Placed>
    static void readPlacedGeometry(const PlacedAttributes& a, Placed* object) {
        const char* ctm = PlacedAttributes::text(a.ctm);
        object->CTM->text = copyText(ctm);
        vorlan::geometry::parseCTM(ctm, object->CTM);
        if (a.clipBox && *a.clipBox) object->ClipBox = readBox(a.clipBox);
        object->Ord = readOrd(PlacedAttributes::text(a.ord));
        if (a.trimCtm && *a.trimCtm) object->TrimCTM = readMatrix(a.trimCtm);
        if (a.trimSize && *a.trimSize) object->TrimSize = readTrimSize(a.trimSize);
    }

    void readContentObject(pugi::xml_node element, LD_Surface& surface) {
        auto* object = new LD_ContentObject;
        w_.contentObjects.push_back(object);
        surface.contentObjects.push_back(object);
        object->objectIndex = w_.placedObjectCount;
        object->contentObjectIndex = w_.contentObjectCount;
        object->surfaceIndex = surface.index;

        PlacedAttributes a(element);
        readPlacedGeometry(a, object);
        const char* clipPath = PlacedAttributes::text(a.clipPath);
        if (!*clipPath) clipPath = PlacedAttributes::text(a.sourceClipPath);
        if (*clipPath) {
            object->clipPathText = copyText(clipPath);
            object->ClipPath = new std::vector<LD_ClipPathOperations*>;
            vorlan::geometry::parseClipPath(clipPath, *object->ClipPath);
        }
        ords_.emplace_back(object->Ord, surface.contentObjects.size() - 1);

        object->CachePlacedObject = isTrue(a.cachePlacedObject);
        object->IgnoreClipForReuse = isTrue(a.ignoreClipForReuse);

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

        readPlacedGeometry(PlacedAttributes(element), object);
        ++w_.markObjectCount;
    }

    LD_JDF& w_;
    std::vector<std::pair<int32_t, size_t>> ords_;  // (Ord, position) of the current surface's content objects
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
