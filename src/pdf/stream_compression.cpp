#include "pdf/stream_compression.h"

#include <zlib.h>

#include <stdexcept>

namespace vorlan::pdf {
namespace {

// Flate data of `bytes` at the fastest level; empty when zlib fails.
std::string deflateFast(const std::string& bytes) {
    z_stream z{};
    if (deflateInit2(&z, Z_BEST_SPEED, Z_DEFLATED, 15, 8, Z_DEFAULT_STRATEGY) != Z_OK) return {};
    std::string out(deflateBound(&z, static_cast<uLong>(bytes.size())), '\0');
    z.next_in = reinterpret_cast<Bytef*>(const_cast<char*>(bytes.data()));
    z.avail_in = static_cast<uInt>(bytes.size());
    z.next_out = reinterpret_cast<Bytef*>(out.data());
    z.avail_out = static_cast<uInt>(out.size());
    const int status = deflate(&z, Z_FINISH);
    const size_t written = out.size() - z.avail_out;
    deflateEnd(&z);
    if (status != Z_STREAM_END) return {};
    out.resize(written);
    return out;
}

}  // namespace

void setCompressedStreamData(QPDFObjectHandle stream, const std::string& bytes) {
    std::string packed = bytes.size() < UINT32_MAX / 2 ? deflateFast(bytes) : std::string();
    if (packed.empty() || packed.size() >= bytes.size()) {
        stream.replaceStreamData(bytes, QPDFObjectHandle::newNull(), QPDFObjectHandle::newNull());
        return;
    }
    stream.replaceStreamData(packed, QPDFObjectHandle::newName("/FlateDecode"), QPDFObjectHandle::newNull());
}

QPDFObjectHandle newCompressedStream(QPDF& pdf, const std::string& bytes) {
    QPDFObjectHandle stream = QPDFObjectHandle::newStream(&pdf);
    setCompressedStreamData(stream, bytes);
    return stream;
}

}  // namespace vorlan::pdf
