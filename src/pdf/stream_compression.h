// Streams written anew (edited content, form copies) are compressed here, once, at zlib's fastest
// level: the writer then copies them as they stand instead of compressing them on each of its
// linearisation passes, and no process-wide compression setting of qpdf is touched.
#pragma once

#include <qpdf/QPDF.hh>
#include <qpdf/QPDFObjectHandle.hh>

#include <memory>
#include <string>

#include "pdf/document_edits.h"

namespace vorlan::pdf {

// One compressor state, reset between streams rather than made anew for each (which costs more
// than compressing a small content stream). Not shared between threads.
class StreamCompressor {
public:
    StreamCompressor();
    ~StreamCompressor();
    StreamCompressor(const StreamCompressor&) = delete;
    StreamCompressor& operator=(const StreamCompressor&) = delete;

    // `bytes` as they are to be stored: flate-compressed (/FlateDecode), or as they are, without
    // a filter, when they do not compress or zlib fails on them.
    StreamData pack(const std::string& bytes);
    // Replaces the stream's data with `bytes`, stored as pack stores them (no /DecodeParms).
    void setData(QPDFObjectHandle stream, const std::string& bytes);
    // A new stream of the document holding `bytes`, stored as setData stores them.
    QPDFObjectHandle newStream(QPDF& pdf, const std::string& bytes);

private:
    struct State;
    bool deflate(const std::string& bytes, std::string& packed);
    std::unique_ptr<State> state_;
};

}  // namespace vorlan::pdf
