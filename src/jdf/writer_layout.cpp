// The writer's Layout: signatures, sheets (those with a selected surface), surfaces with their
// version and die tags, and the placed objects in their original order.
#include <algorithm>

#include "jdf/ticket_writing.h"

namespace {

using namespace vorlan::jdf;

bool hasBox(const LD_Box* box) {
    return box && !(box->lowerLeft.x == -1 && box->lowerLeft.y == -1 && box->upperRight.x == -1 &&
                    box->upperRight.y == -1);
}
bool hasSize(const LD_OCG_Media* media) { return media && !(media->width == -1 && media->height == -1); }

// Geometry values from the text the reader kept when it reads as one, else from its numbers.
template <typename Value>
Value fromText(const wchar_t* text, Value fallback) {
    if (text && *text) {
        try {
            return Value(JDF::WString(text));
        } catch (const JDF::JDFException&) {
        }
    }
    return fallback;
}
JDF::JDFMatrix matrix(const LD_CTM& m) { return fromText(m.text, JDF::JDFMatrix(m.a, m.b, m.c, m.d, m.e, m.f)); }
JDF::JDFRectangle rectangle(const LD_Box& b) {
    return fromText(b.text, JDF::JDFRectangle(b.lowerLeft.x, b.lowerLeft.y, b.upperRight.x, b.upperRight.y));
}
JDF::JDFXYPair pair(const LD_Point& p) { return fromText(p.text, JDF::JDFXYPair(p.x, p.y)); }

void setDimension(JDF::JDFMedia media, double width, double height) { media.SetDimension(JDF::JDFXYPair(width, height)); }

void writeContentObject(JDF::JDFContentObject object, const LD_ContentObject& source) {
    // CTM is required on every placed object; the reader's matrix is the identity when absent.
    object.SetCTM(matrix(*source.CTM));
    if (source.ClipBox) object.SetClipBox(rectangle(*source.ClipBox));
    if (source.clipPathText && *source.clipPathText) object.SetAttribute(L"SourceClipPath", source.clipPathText);
    object.SetOrd(source.Ord);
    if (source.TrimCTM) object.SetTrimCTM(matrix(*source.TrimCTM));
    if (source.TrimSize) object.SetTrimSize(pair(*source.TrimSize));
    if (source.IgnoreClipForReuse) object.SetAttribute(L"ADBE:IgnoreClipForReuse", L"true", kAdobeExtensionNs);
    if (source.CachePlacedObject || source.ordRepeated)
        object.SetAttribute(L"ADBE:CachePlacedObject", L"true", kAdobeExtensionNs);
}

void writeMarkObject(JDF::JDFMarkObject object, const LD_MarkObject& source) {
    object.SetCTM(matrix(*source.CTM));
    if (source.ClipBox) object.SetClipBox(rectangle(*source.ClipBox));
    object.SetOrd(source.Ord);
    if (source.TrimCTM) object.SetTrimCTM(matrix(*source.TrimCTM));
    if (source.TrimSize) object.SetTrimSize(pair(*source.TrimSize));
}

// One selected surface of a sheet.
void writeSurface(LD_JDF& w, JDF::JDFSheet& sheet, JDF::JDFMedia& sheetMedia, bool sheetHasOwnSize,
                  const LD_Sheet& source, LD_Surface& surface, bool back) {
    if (hasBox(surface.SurfaceContentsBox) && !sheetHasOwnSize)
        setDimension(sheetMedia, surface.SurfaceContentsBox->upperRight.x, surface.SurfaceContentsBox->upperRight.y);
    JDF::JDFSurface jdfSurface = need(back ? sheet.GetCreateBackSurface() : sheet.GetCreateFrontSurface());
    if (surface.VersionName) setVersionTags(jdfSurface, surface.VersionName, surface.VersionIndex, surface.VersionCopyCount);
    if (source.front && source.back) {
        setTicketAttribute(jdfSurface, L"IsBackDie", back ? L"true" : L"false");
        setTicketAttribute(jdfSurface, L"is_duplex", L"1");
    }
    w.addSurfaceDieTags(jdfSurface, &surface);
    if (surface.StepAndRepeat) jdfSurface.SetAttribute(L"ADBE:StepAndRepeat", L"true", kAdobeExtensionNs);
    // A surface without a contents box (none in the ticket) writes none rather than -1 -1 -1 -1.
    if (hasBox(surface.SurfaceContentsBox)) jdfSurface.SetSurfaceContentsBox(rectangle(*surface.SurfaceContentsBox));
    if (w.addObjectListToJDFSurface(jdfSurface, &surface) != LD_OK) throw WriteFailure{};
}

}  // namespace

namespace vorlan::jdf {

bool writeLayout(LD_JDF& w, JDF::JDFNode& root) {
    if (w.signatures.empty()) return false;
    JDF::JDFLayout layout = need(root.AppendMatchingResource(L"Layout", 1));
    layout.SetStatus(LD_RESOURCE_AVAILABLE);
    layout.SetPartUsage(3);
    for (size_t i = 0; i < w.signatures.size(); ++i) {
        LD_Signature* signature = w.signatures[i];
        if (!signature) continue;
        JDF::JDFSignature jdfSignature = need(layout.GetCreateSignature(static_cast<int>(i)));
        jdfSignature.SetName(signature->name);
        if (signature->media)
            setDimension(need(jdfSignature.GetCreateMedia(0)), signature->media->width, signature->media->height);
        for (size_t j = 0; j < signature->sheetList.size(); ++j) {
            LD_Sheet* sheet = signature->sheetList[j];
            if (!sheet) continue;
            bool front = sheet->front && sheet->front->isSelected;
            bool back = sheet->back && sheet->back->isSelected;
            if (!front && !back) continue;  // nothing of this sheet is in the page range
            // GetCreateSheet(j) appends here (fewer than j + 1 sheets are written so far, as
            // skipped positions are not reused); appending outright avoids recounting them.
            JDF::JDFSheet jdfSheet = need(JDF::JDFSheet(jdfSignature.AppendElement(L"Sheet")));
            jdfSheet.SetName(sheet->name);
            JDF::JDFMedia media;
            if (sheet->media) {
                media = need(jdfSheet.GetCreateMedia(0));
                setDimension(media, sheet->media->width, sheet->media->height);
            } else {
                media = need(JDF::JDFMedia(root.AppendMatchingResource(L"Media", 1)));
                media.SetStatus(LD_RESOURCE_AVAILABLE);
                setDimension(media, 612, 792);
                need(jdfSheet.RefMedia(media));
            }
            bool ownSize = sheet->media && hasSize(sheet->media);
            if (front) writeSurface(w, jdfSheet, media, ownSize, *sheet, *sheet->front, false);
            if (back) writeSurface(w, jdfSheet, media, ownSize, *sheet, *sheet->back, true);
        }
    }
    return true;
}

}  // namespace vorlan::jdf

LDError LD_JDF::addObjectListToJDFSurface(JDF::JDFSurface& jdfSurface, LD_Surface* surface) {
    if (!surface) return LD_OK;
    // Content and mark objects merged by objectIndex; on equal indices the mark comes first.
    size_t c = 0, m = 0;
    int contentWritten = 0, marksWritten = 0;
    const auto& contents = surface->contentObjects;
    const auto& marks = surface->markObjects;
    while (c < contents.size() || m < marks.size()) {
        bool takeMark = m < marks.size() &&
                        (c >= contents.size() || !contents[c] || (marks[m] && marks[m]->objectIndex <= contents[c]->objectIndex));
        if (takeMark) {
            if (marks[m]) {
                JDF::JDFMarkObject object = jdfSurface.GetCreateMarkObject(marksWritten++);
                if (object.isNull()) return LD_JDF_WRITE_FAILED;
                writeMarkObject(object, *marks[m]);
            }
            ++m;
        } else {
            if (contents[c]) {
                JDF::JDFContentObject object = jdfSurface.GetCreateContentObject(contentWritten++);
                if (object.isNull()) return LD_JDF_WRITE_FAILED;
                writeContentObject(object, *contents[c]);
            }
            ++c;
        }
    }
    return LD_OK;
}

void LD_JDF::addSurfaceDieTags(JDF::JDFSurface& jdfSurface, LD_Surface* surface) {
    if (!surface) return;
    if (const wchar_t* text = contentTypeText(surface->contentType)) setTicketAttribute(jdfSurface, L"VersContentType", text);
}
