// pdftoppm rendering and group switching for the conversion tests.
#include "render.h"

#include <qpdf/QPDF.hh>
#include <qpdf/QPDFWriter.hh>

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <cstdio>
#include <sstream>

#include "test_support.h"

namespace vorlan::test {

int GreyImage::at(double x, double y, int dpi) const {
    const int px = static_cast<int>(std::floor(x * dpi / 72.0));
    const int py = height - 1 - static_cast<int>(std::floor(y * dpi / 72.0));
    if (px < 0 || py < 0 || px >= width || py >= height) return -1;
    return pixels[static_cast<size_t>(py) * static_cast<size_t>(width) + static_cast<size_t>(px)];
}

long GreyImage::inked() const {
    return static_cast<long>(std::count_if(pixels.begin(), pixels.end(), [](unsigned char p) { return p < 245; }));
}

namespace {

// pdftoppm's single-page output as a netpbm file of the wanted magic ("P5" grey, "P6" colour):
// the size and the samples, or false.
bool renderNetpbm(const std::string& pdf, int page, int dpi, bool colour, int& width, int& height,
                  std::vector<unsigned char>& samples) {
    if (!haveProgram("pdftoppm")) return false;
    TempDir dir;
    const std::string stem = (dir.path() / "r").string();
    const std::string cmd = std::string("pdftoppm ") + (colour ? "" : "-gray ") + "-r " + std::to_string(dpi) +
                            " -f " + std::to_string(page) + " -l " + std::to_string(page) + " -singlefile '" + pdf +
                            "' '" + stem + "' >/dev/null 2>&1";
    if (runCommand(cmd) != 0) return false;
    const std::string data = readFile(stem + (colour ? ".ppm" : ".pgm"));
    std::istringstream in(data);
    std::string magic;
    int maxValue = 0;
    in >> magic >> width >> height >> maxValue;
    in.get();
    if (magic != (colour ? "P6" : "P5") || width <= 0 || height <= 0) return false;
    const size_t size = static_cast<size_t>(width) * static_cast<size_t>(height) * (colour ? 3 : 1);
    const size_t offset = static_cast<size_t>(in.tellg());
    if (data.size() < offset + size) return false;
    samples.assign(data.begin() + static_cast<long>(offset), data.begin() + static_cast<long>(offset + size));
    return true;
}

}  // namespace

GreyImage renderPage(const std::string& pdf, int page, int dpi, bool mustRender) {
    GreyImage image;
    if (!renderNetpbm(pdf, page, dpi, false, image.width, image.height, image.pixels)) {
        if (mustRender) ADD_FAILURE() << "pdftoppm could not render page " << page << " of " << pdf;
        return GreyImage();
    }
    return image;
}

Rgb ColourImage::at(double x, double y, int dpi) const {
    const int px = static_cast<int>(std::floor(x * dpi / 72.0));
    const int py = height - 1 - static_cast<int>(std::floor(y * dpi / 72.0));
    if (px < 0 || py < 0 || px >= width || py >= height) return {};
    const size_t i = (static_cast<size_t>(py) * static_cast<size_t>(width) + static_cast<size_t>(px)) * 3;
    return {rgb[i], rgb[i + 1], rgb[i + 2]};
}

long ColourImage::count(const Rgb& colour) const {
    long n = 0;
    for (size_t i = 0; i + 2 < rgb.size(); i += 3)
        n += std::abs(rgb[i] - colour.r) < 40 && std::abs(rgb[i + 1] - colour.g) < 40 && std::abs(rgb[i + 2] - colour.b) < 40;
    return n;
}

ColourImage renderColourPage(const std::string& pdf, int page, int dpi) {
    ColourImage image;
    if (!renderNetpbm(pdf, page, dpi, true, image.width, image.height, image.rgb)) return ColourImage();
    return image;
}

bool showOnlyGroups(const std::string& in, const std::string& out, const std::vector<std::string>& names) {
    try {
        QPDF pdf;
        pdf.processFile(in.c_str());
        QPDFObjectHandle properties = pdf.getRoot().getKey("/OCProperties");
        if (!properties.isDictionary()) return false;
        QPDFObjectHandle on = QPDFObjectHandle::newArray(), off = QPDFObjectHandle::newArray();
        for (QPDFObjectHandle ocg : properties.getKey("/OCGs").aitems()) {
            const std::string name = ocg.getKey("/Name").getUTF8Value();
            (std::find(names.begin(), names.end(), name) != names.end() ? on : off).appendItem(ocg);
        }
        QPDFObjectHandle config = properties.getKey("/D");
        config.replaceKey("/ON", on);
        config.replaceKey("/OFF", off);
        config.removeKey("/BaseState");
        QPDFWriter writer(pdf, out.c_str());
        writer.write();
        return true;
    } catch (const std::exception&) {
        return false;
    }
}

std::vector<std::string> allGroups(const std::string& path) {
    std::vector<std::string> names;
    try {
        QPDF pdf;
        pdf.processFile(path.c_str());
        QPDFObjectHandle ocgs = pdf.getRoot().getKey("/OCProperties").getKey("/OCGs");
        if (ocgs.isArray())
            for (QPDFObjectHandle item : ocgs.aitems())
                if (item.isDictionary()) names.push_back(item.getKey("/Name").getUTF8Value());
    } catch (const std::exception&) {
    }
    return names;
}

std::vector<std::string> groupOrder(const std::string& path) {
    std::vector<std::string> names;
    try {
        QPDF pdf;
        pdf.processFile(path.c_str());
        QPDFObjectHandle order = pdf.getRoot().getKey("/OCProperties").getKey("/D").getKey("/Order");
        if (order.isArray())
            for (QPDFObjectHandle item : order.aitems())
                if (item.isDictionary()) names.push_back(item.getKey("/Name").getUTF8Value());
    } catch (const std::exception&) {
    }
    return names;
}

std::pair<int, int> encryptionOf(const std::string& path) {
    int r = 0, p = 0;
    try {
        QPDF pdf;
        pdf.setSuppressWarnings(true);
        pdf.processFile(path.c_str());
        if (!pdf.isEncrypted(r, p)) r = p = 0;
    } catch (const std::exception&) {
        r = p = 0;
    }
    return {r, p};
}

bool qpdfCheckPasses(const std::string& pdf, std::string* output) {
    return runCommand("qpdf --check '" + pdf + "' 2>&1", output) == 0;
}

}  // namespace vorlan::test
