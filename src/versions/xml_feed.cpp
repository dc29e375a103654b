// Feeding bytes to a document's parser: single pieces, whole buffers and files.
//
// Buffers and files go in pieces of 512 bytes; a piece shorter than that is marked final, and
// input that ends on a piece boundary is closed with an empty final piece, so a truncated
// document is always reported.
//
// Expat re-scans an unfinished token from its start on every call. When one token (a huge
// attribute value, say) is still pending after a piece, the next piece is made as large as what
// is pending, so such a token costs linear time instead of one re-scan per 512 bytes.
#include <algorithm>
#include <cstdio>
#include <limits>
#include <vector>

#include "versions/xml_document.h"
#include "versions/xml_tree.h"

namespace {

// Bytes expat holds back as the start of an unfinished token.
uint64_t pendingBytes(const _kvXmlDocument* document) {
    XML_Index index = XML_GetCurrentByteIndex(document->parser);
    if (index < 0 || static_cast<uint64_t>(index) > document->bytesFed) return document->bytesFed;
    return document->bytesFed - static_cast<uint64_t>(index);
}

size_t nextPieceSize(const _kvXmlDocument* document) {
    const uint64_t pending = pendingBytes(document);
    constexpr uint64_t largest = std::numeric_limits<int>::max() / 2;
    return static_cast<size_t>(std::clamp<uint64_t>(pending, kvXmlPieceSize, largest));
}

// Feeds pieces from read(want, &bytes), which gives at most want bytes and 0 at the end.
template <typename Read>
bool feedPieces(_kvXmlDocument* document, Read read) {
    bool fed = false;
    bool finalSent = false;
    while (!finalSent) {
        const char* bytes = nullptr;
        size_t count = 0;
        if (!read(nextPieceSize(document), &bytes, &count)) return false;
        if (count == 0) break;
        fed = true;
        finalSent = count < kvXmlPieceSize;
        if (!kvXmlFeedPiece(document, bytes, count, finalSent)) return false;
    }
    return !fed || finalSent || kvXmlFeedPiece(document, nullptr, 0, true);
}

}  // namespace

bool kvXmlFeedPiece(_kvXmlDocument* document, const char* bytes, size_t length, bool isFinal) {
    if (!document || document->failed) return false;
    if ((!bytes && length > 0) || length > static_cast<size_t>(std::numeric_limits<int>::max())) {
        document->failed = true;
        return false;
    }
    document->bytesFed += length;
    if (XML_Parse(document->parser, bytes, static_cast<int>(length), isFinal) != XML_STATUS_OK) {
        document->failed = true;
        return false;
    }
    return true;
}

bool kvXmlFeedBuffer(_kvXmlDocument* document, const char* bytes, size_t length) {
    if (!document || (!bytes && length > 0)) return false;
    size_t offset = 0;
    return feedPieces(document, [&](size_t want, const char** piece, size_t* count) {
        *piece = bytes + offset;
        *count = std::min(want, length - offset);
        offset += *count;
        return true;
    });
}

bool kvXmlFeedFile(_kvXmlDocument* document, const char* path) {
    if (!document || !path) return false;
    std::FILE* file = std::fopen(path, "rb");
    if (!file) return false;
    std::vector<char> storage;
    bool ok = false;
    try {
        ok = feedPieces(document, [&](size_t want, const char** piece, size_t* count) {
            storage.resize(want);
            *count = std::fread(storage.data(), 1, want, file);
            *piece = storage.data();
            return !std::ferror(file);
        });
    } catch (const std::bad_alloc&) {
        ok = false;
    }
    std::fclose(file);
    return ok;
}
