#include "pdf/stream_compression.h"

#include <zlib.h>

#include <climits>

namespace vorlan::pdf {

struct StreamCompressor::State {
    z_stream z{};
    bool ready = false;
};

StreamCompressor::StreamCompressor() : state_(std::make_unique<State>()) {
    state_->ready = deflateInit2(&state_->z, Z_BEST_SPEED, Z_DEFLATED, 15, 8, Z_DEFAULT_STRATEGY) == Z_OK;
}

StreamCompressor::~StreamCompressor() {
    if (state_->ready) deflateEnd(&state_->z);
}

bool StreamCompressor::deflate(const std::string& bytes, std::string& packed) {
    z_stream& z = state_->z;
    if (!state_->ready || bytes.size() > UINT_MAX / 2 || deflateReset(&z) != Z_OK) return false;
    packed.resize(deflateBound(&z, static_cast<uLong>(bytes.size())));
    z.next_in = reinterpret_cast<Bytef*>(const_cast<char*>(bytes.data()));
    z.avail_in = static_cast<uInt>(bytes.size());
    z.next_out = reinterpret_cast<Bytef*>(packed.data());
    z.avail_out = static_cast<uInt>(packed.size());
    if (::deflate(&z, Z_FINISH) != Z_STREAM_END) return false;
    packed.resize(packed.size() - z.avail_out);
    return packed.size() < bytes.size();
}

StreamData StreamCompressor::pack(const std::string& bytes) {
    StreamData data;
    if (deflate(bytes, data.bytes)) {
        data.filter = QPDFObjectHandle::newName("/FlateDecode");
    } else {
        data.bytes = bytes;
    }
    return data;
}

void StreamCompressor::setData(QPDFObjectHandle stream, const std::string& bytes) {
    StreamData data = pack(bytes);
    stream.replaceStreamData(data.bytes, data.filter, QPDFObjectHandle::newNull());
}

QPDFObjectHandle StreamCompressor::newStream(QPDF& pdf, const std::string& bytes) {
    QPDFObjectHandle stream = QPDFObjectHandle::newStream(&pdf);
    setData(stream, bytes);
    return stream;
}

}  // namespace vorlan::pdf
