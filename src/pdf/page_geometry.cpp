// Page count, first-page size and page inks.
#include "pdf/page_geometry.h"

#include <qpdf/QPDFPageObjectHelper.hh>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <exception>

#include "pdf/page_inks.h"
#include "pdf/pdf_document.h"
#include "pdf/zipped_jdf_file_system.h"

namespace {

void reportUnopenable(const char* path) {
    std::fprintf(stderr, "Unable to open %s\n", path ? path : "");
}

// A box as a rectangle with ordered corners; false for something that is not a rectangle.
bool rectangleOf(QPDFObjectHandle box, QPDFObjectHandle::Rectangle& r) {
    if (!box.isRectangle()) return false;
    QPDFObjectHandle::Rectangle raw = box.getArrayAsRectangle();
    r = QPDFObjectHandle::Rectangle(std::min(raw.llx, raw.urx), std::min(raw.lly, raw.ury),
                                    std::max(raw.llx, raw.urx), std::max(raw.lly, raw.ury));
    return std::isfinite(r.llx) && std::isfinite(r.lly) && std::isfinite(r.urx) && std::isfinite(r.ury);
}

// Width and height of a rectangle as shown after turning it by `rotate` degrees (0, 90, 180,
// 270; other values leave it as it is).
void shownSize(const QPDFObjectHandle::Rectangle& r, int rotate, double& width, double& height) {
    // (left, top, right, bottom), turned as a page turns.
    double left = r.llx, top = r.ury, right = r.urx, bottom = r.lly;
    double l = left, t = top, rt = right, b = bottom;
    switch (rotate) {
        case 90: l = top; t = right; rt = bottom; b = left; break;
        case 180: l = right; t = bottom; rt = left; b = top; break;
        case 270: l = bottom; t = left; rt = top; b = right; break;
        default: break;
    }
    width = std::fabs(l - rt);
    height = std::fabs(t - b);
}

void shownSize(QPDFObjectHandle box, int rotate, double& width, double& height) {
    width = height = 0;
    QPDFObjectHandle::Rectangle r;
    if (rectangleOf(box, r)) shownSize(r, rotate, width, height);
}

// The crop box as it takes effect: clipped to the media box (a crop box reaching beyond the
// medium shows nothing more). An empty overlap gives an empty box.
void shownCropSize(QPDFPageObjectHelper& page, int rotate, double& width, double& height) {
    width = height = 0;
    QPDFObjectHandle::Rectangle crop, media;
    if (!rectangleOf(page.getCropBox(), crop)) return;
    if (rectangleOf(page.getMediaBox(), media)) {
        crop.llx = std::max(crop.llx, media.llx);
        crop.lly = std::max(crop.lly, media.lly);
        crop.urx = std::min(crop.urx, media.urx);
        crop.ury = std::min(crop.ury, media.ury);
        if (crop.urx < crop.llx || crop.ury < crop.lly) return;
    }
    shownSize(crop, rotate, width, height);
}

double floorTo4(double value) { return std::floor(value * 10000.0) / 10000.0; }

bool isProcessInk(const std::string& ink) {
    return ink == "Cyan" || ink == "Magenta" || ink == "Yellow" || ink == "Black";
}

}  // namespace

int getPDFPageCount(ZippedJDFFileSystem* fs, const char* path) {
    ensurePdfLibraryStarted(fs);
    std::unique_ptr<QPDF> pdf = vorlan::pdf::openDocument(path, true);
    if (!pdf) {
        reportUnopenable(path);
        return 0;
    }
    return static_cast<int>(vorlan::pdf::documentPages(*pdf).size());
}

void getFirstPageSize(ZippedJDFFileSystem* fs, const char* path, double* height, double* width) {
    ensurePdfLibraryStarted(fs);
    std::unique_ptr<QPDF> pdf = vorlan::pdf::openDocument(path, true);
    if (!pdf) {
        reportUnopenable(path);
        return;
    }
    std::vector<QPDFObjectHandle> pages = vorlan::pdf::documentPages(*pdf);
    if (pages.empty()) return;
    try {
        QPDFPageObjectHelper page(pages.front());
        long long rotate = 0;
        page.getAttribute("/Rotate", false).getValueAsInt(rotate);
        rotate %= 360;
        if (rotate < 0) rotate += 360;
        double w = 0, h = 0;
        shownCropSize(page, static_cast<int>(rotate), w, h);
        if (w <= 0 && h <= 0) shownSize(page.getMediaBox(), static_cast<int>(rotate), w, h);
        if (w <= 0 && h <= 0) shownSize(page.getAttribute("/TrimBox", false), static_cast<int>(rotate), w, h);
        if (height) *height = floorTo4(h);
        if (width) *width = floorTo4(w);
    } catch (const std::exception&) {
        // a page that cannot be read leaves the out-parameters alone
    }
}

void vorlan::pdf::documentPageInks(QPDF& pdf, std::vector<std::string>& inks) {
    ColourSpaceResolver::SharedCache cache;
    for (QPDFObjectHandle& page : documentPages(pdf))
        for (std::string& ink : pageInks(page, &cache))
            if (!isProcessInk(ink)) inks.push_back(std::move(ink));
}

void scanPDFPageInks(const char* path, std::vector<std::string>& inks) {
    std::unique_ptr<QPDF> pdf = vorlan::pdf::openDocument(path, true);
    if (!pdf) {
        reportUnopenable(path);
        return;
    }
    vorlan::pdf::documentPageInks(*pdf, inks);
}
