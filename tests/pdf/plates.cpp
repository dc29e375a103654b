// Plate rendering with gs tiffsep and a reader for its uncompressed 8-bit TIFF plates.
#include "plates.h"

#include <cstdint>
#include <cstring>
#include <filesystem>

#include "test_support.h"

namespace vorlan::test {
namespace {

uint32_t read16(const std::string& d, size_t at, bool le) {
    if (at + 2 > d.size()) return 0;
    auto b = [&](size_t i) { return static_cast<uint32_t>(static_cast<unsigned char>(d[at + i])); };
    return le ? b(0) | b(1) << 8 : b(0) << 8 | b(1);
}
uint32_t read32(const std::string& d, size_t at, bool le) {
    return le ? read16(d, at, le) | read16(d, at + 2, le) << 16 : read16(d, at, le) << 16 | read16(d, at + 2, le);
}

// Inked pixels of a single-strip-set, uncompressed, 8-bit grey TIFF; -1 when it cannot be read.
long inkedPixels(const std::string& d) {
    if (d.size() < 8) return -1;
    const bool le = d[0] == 'I';
    size_t ifd = read32(d, 4, le);
    const uint32_t n = read16(d, ifd, le);
    uint32_t photometric = 1, compression = 1, stripCount = 0, offsetsAt = 0, countsAt = 0;
    uint16_t offsetsType = 4, countsType = 4;
    for (uint32_t i = 0; i < n; ++i) {
        size_t e = ifd + 2 + 12 * i;
        uint32_t tag = read16(d, e, le), type = read16(d, e + 2, le), count = read32(d, e + 4, le);
        uint32_t value = type == 3 ? read16(d, e + 8, le) : read32(d, e + 8, le);
        if (tag == 259) compression = value;
        if (tag == 262) photometric = value;
        if (tag == 273) { stripCount = count; offsetsAt = count == 1 ? e + 8 : value; offsetsType = type; }
        if (tag == 279) { countsAt = count == 1 ? e + 8 : value; countsType = type; }
    }
    if (compression != 1 || stripCount == 0) return -1;
    const unsigned char white = photometric == 0 ? 0 : 255;
    long inked = 0;
    for (uint32_t s = 0; s < stripCount; ++s) {
        uint32_t off = offsetsType == 3 ? read16(d, offsetsAt + 2 * s, le) : read32(d, offsetsAt + 4 * s, le);
        uint32_t len = countsType == 3 ? read16(d, countsAt + 2 * s, le) : read32(d, countsAt + 4 * s, le);
        for (uint32_t i = 0; i < len && off + i < d.size(); ++i)
            if (static_cast<unsigned char>(d[off + i]) != white) ++inked;
    }
    return inked;
}

}  // namespace

std::map<std::string, long> platePixels(const std::string& pdf, int page, int dpi) {
    std::map<std::string, long> plates;
    if (!haveProgram("gs")) return plates;
    TempDir out;
    const std::string cmd = "gs -q -dNOPAUSE -dBATCH -dSAFER -dUseCropBox -sDEVICE=tiffsep -sCompression=none -r" +
                            std::to_string(dpi) + " -dFirstPage=" + std::to_string(page) +
                            " -dLastPage=" + std::to_string(page) + " -sOutputFile='" +
                            (out.path() / "p_%d.tif").string() + "' '" + pdf + "' >/dev/null 2>&1";
    if (runCommand(cmd) != 0) return plates;
    for (const auto& entry : std::filesystem::directory_iterator(out.path())) {
        const std::string name = entry.path().filename().string();
        const size_t open = name.find('('), close = name.rfind(')');
        if (open == std::string::npos || close == std::string::npos || close < open) continue;
        plates[name.substr(open + 1, close - open - 1)] = inkedPixels(readFile(entry.path()));
    }
    return plates;
}

std::map<std::string, long> inkedPlates(const std::map<std::string, long>& plates) {
    std::map<std::string, long> out;
    for (auto& [name, pixels] : plates)
        if (pixels > 0) out[name] = pixels;
    return out;
}

std::map<std::string, long> inkedPlates(const std::string& pdf, int page) {
    const std::map<std::string, long> plates = platePixels(pdf, page);
    EXPECT_FALSE(plates.empty()) << "gs could not render page " << page << " of " << pdf;
    return inkedPlates(plates);
}

}  // namespace vorlan::test
