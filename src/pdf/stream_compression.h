// Streams written anew (edited content, form copies) are compressed here, once, at zlib's fastest
// level: the writer then copies them as they stand instead of compressing them on each of its
// linearisation passes, and no process-wide compression setting of qpdf is touched.
#pragma once

#include <qpdf/QPDF.hh>
#include <qpdf/QPDFObjectHandle.hh>

#include <string>

namespace vorlan::pdf {

// Replaces the stream's data with `bytes`, stored flate-compressed (/Filter /FlateDecode, no
// /DecodeParms). Data that does not compress is stored as it is, without a filter.
void setCompressedStreamData(QPDFObjectHandle stream, const std::string& bytes);

// A new stream of the document holding `bytes`, stored as setCompressedStreamData stores them.
QPDFObjectHandle newCompressedStream(QPDF& pdf, const std::string& bytes);

}  // namespace vorlan::pdf
