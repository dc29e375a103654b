// Die sheets in the layout: copies of a content sheet whose surfaces show the die, appended
// after the last sheet (or inserted into the first signature), and the look-ups they use.
#include <cstdlib>

#include "vorlan/LD_JDF.h"

namespace {

// A new sheet named "DieSheet" taking its numbers and a copy of its media from sheet.
LD_Sheet* newDieSheet(const LD_Sheet& sheet) {
    auto* made = new LD_Sheet;
    made->index = sheet.index;
    made->numberInSignature = sheet.numberInSignature;
    made->signatureIndex = sheet.signatureIndex;
    LD_SetText(made->name, L"DieSheet");
    if (sheet.media) made->media = new LD_OCG_Media(*sheet.media);
    return made;
}

// A copy of a content surface that shows the die: no version, the given content type.
LD_Surface* dieSurface(const LD_Surface& surface, ContentType type, bool keepVersion = false) {
    LD_Surface* made = surface.copy();
    made->contentType = type;
    if (!keepVersion) {
        std::free(made->VersionName);
        made->VersionName = nullptr;
    }
    return made;
}

// What an appended die sheet copies: the content surface, its sheet and the last signature that
// receives the copy. All null (and the last error set) when any of them is missing.
struct DieSheetSource {
    LD_Surface* surface;
    LD_Sheet* sheet;
    LD_Signature* last;
};

DieSheetSource dieSheetSource(LD_JDF& w, int32_t surfaceIndex) {
    LD_Surface* surface = w.getSurfaceByIndex(surfaceIndex);
    LD_Sheet* sheet = surface ? w.getSheetByIndex(surface->sheetIndex) : nullptr;
    LD_Signature* last = w.getSignatureByIndex(static_cast<int32_t>(w.signatures.size()) - 1);
    if (!surface || !sheet || !last) {
        w.lastError = LD_FAILED;
        return {nullptr, nullptr, nullptr};
    }
    return {surface, sheet, last};
}

}  // namespace

LD_Sheet* LD_JDF::appendDieSheetInLayout(int32_t surfaceIndex, ContentType type) {
    auto [surface, sheet, last] = dieSheetSource(*this, surfaceIndex);
    if (!surface) return nullptr;
    LD_Sheet* made = newDieSheet(*sheet);
    if (sheet->front && sheet->back) {  // a two-sided sheet gives a two-sided die sheet
        made->front = dieSurface(*sheet->front, type);
        made->back = dieSurface(*sheet->back, type);
    } else {
        made->front = dieSurface(*surface, type);
        made->front->isFront = true;
        made->front->isEmpty = false;
    }

    made->numberInSignature = static_cast<int32_t>(last->sheetList.size()) + 1;
    const LD_Sheet* lastSheet = last->sheetList.empty() ? nullptr : last->sheetList.back();
    made->index = (lastSheet ? lastSheet->index : (sheets.empty() || !sheets.back() ? -1 : sheets.back()->index)) + 1;
    int32_t lastSurface = surfaces.empty() || !surfaces.back() ? -1 : surfaces.back()->index;
    made->front->sheetIndex = made->index;
    made->front->index = lastSurface + 1;
    if (made->back) {
        made->back->sheetIndex = made->index;
        made->back->index = lastSurface + 2;
    }

    last->sheetList.push_back(made);
    last->sheetRange.last += 1;
    sheets.push_back(made);
    surfaces.push_back(made->front);
    if (made->back) surfaces.push_back(made->back);
    return made;
}

LD_Surface* LD_JDF::appendDieSheetAndSurfaceInLayout(int32_t surfaceIndex) {
    auto [surface, sheet, last] = dieSheetSource(*this, surfaceIndex);
    if (!surface) return nullptr;
    LD_Sheet* made = newDieSheet(*sheet);
    made->front = dieSurface(*surface, CONTENT_DIE_ONLY, true);
    made->front->isFront = true;
    made->front->isEmpty = false;
    made->numberInSignature = static_cast<int32_t>(last->sheetList.size()) + 1;
    const LD_Sheet* lastSheet = last->sheetList.empty() ? nullptr : last->sheetList.back();
    made->index = (lastSheet ? lastSheet->index : -1) + 1;
    made->front->sheetIndex = made->index;
    made->front->index = (surfaces.empty() || !surfaces.back() ? -1 : surfaces.back()->index) + 1;
    last->sheetList.push_back(made);
    last->sheetRange.last += 1;
    sheets.push_back(made);
    surfaces.push_back(made->front);
    return made->front;
}

LD_Surface* LD_JDF::insertDieSheetAndSurfaceInLayout(int32_t n, ContentType type) {
    LD_Surface* content = findContentSurfaceByOriginalIndex(n);
    LD_Sheet* sheet = content ? getSheetByIndex(content->sheetIndex) : nullptr;
    LD_Signature* first = getSignatureByIndex(0);
    if (!content || !sheet || !first) {
        lastError = LD_FAILED;
        return nullptr;
    }
    LD_Sheet* made = newDieSheet(*sheet);
    LD_Surface* front = dieSurface(*content, type, true);
    front->isFront = true;
    front->isEmpty = false;
    made->front = front;
    if (type == CONTENT_DIE_ONLY) {  // the die sheet becomes the first sheet
        made->numberInSignature = 1;
        made->index = 0;
        front->index = 0;
    } else if (type == CONTENT_DIE_WITH_CONTENT) {  // right after the n-th content sheet
        made->numberInSignature = n + 2;
        made->index = n + 1;
        front->sheetIndex = front->index = n + 1;
    }

    for (LD_Sheet* other : sheets) {
        if (!other) continue;
        if (other->numberInSignature >= made->numberInSignature) ++other->numberInSignature;
        if (other->index >= made->index) ++other->index;
    }
    auto clampedInsert = [](auto& list, auto* item, int32_t at) {
        size_t pos = at < 0 ? 0 : static_cast<size_t>(at);
        if (pos > list.size()) pos = list.size();
        list.insert(list.begin() + static_cast<std::ptrdiff_t>(pos), item);
    };
    clampedInsert(first->sheetList, made, made->index);
    first->sheetRange.last += 1;
    for (LD_Signature* signature : signatures) {
        if (!signature || signature->index <= first->index) continue;
        signature->sheetRange.first += 1;
        signature->sheetRange.last += 1;
    }
    clampedInsert(sheets, made, made->index);
    for (LD_Surface* surface : surfaces) {
        if (!surface || surface->index < front->index) continue;
        ++surface->index;
        ++surface->sheetIndex;
    }
    clampedInsert(surfaces, front, front->index);
    return front;
}

LD_Surface* LD_JDF::findContentSurfaceByOriginalIndex(int32_t n) {
    int32_t seen = 0;
    for (LD_Surface* surface : surfaces) {
        if (!surface || surface->contentType != CONTENT_CONTENT) continue;
        if (seen++ == n) return surface;
    }
    return nullptr;
}

namespace {

// The first record of list whose index field equals index, or null.
template <typename Record, typename Field>
Record* firstWithIndex(const std::vector<Record*>& list, Field Record::*field, int32_t index) {
    for (Record* record : list)
        if (record && record->*field == index) return record;
    return nullptr;
}

}  // namespace

LD_Signature* LD_JDF::getSignatureByIndex(int32_t index) { return firstWithIndex(signatures, &LD_Signature::index, index); }

LD_Sheet* LD_JDF::getSheetByIndex(int32_t index) { return firstWithIndex(sheets, &LD_Sheet::index, index); }

LD_Surface* LD_JDF::getSurfaceByIndex(int32_t index) { return firstWithIndex(surfaces, &LD_Surface::index, index); }

LD_ContentObject* LD_JDF::getContentObjectByIndex(int32_t index) {
    return firstWithIndex(contentObjects, &LD_ContentObject::contentObjectIndex, index);
}
