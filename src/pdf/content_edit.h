// Edits of parsed content, applied as byte-slice edits at operator boundaries and written back
// as one new content stream.
#pragma once

#include <qpdf/QPDF.hh>
#include <qpdf/QPDFObjectHandle.hh>

#include <functional>
#include <map>
#include <string>
#include <vector>

#include "pdf/content_tree.h"
#include "pdf/document_edits.h"
#include "pdf/stream_compression.h"

namespace vorlan::pdf {

class ContentEditor {
public:
    // Changes to objects (resources, /Contents, stream data) go through `edits`; without it they
    // are made at once.
    explicit ContentEditor(Content& content, DocumentEdits* edits = nullptr)
        : content_(content), edits_(edits ? *edits : direct_) {}

    // Puts the sibling elements first..last (same parent, first not after last) into the optional
    // content group `ocg`: "/OC /<name> BDC" before them and "EMC" after them, the group listed
    // under /Properties of the content's own resources (made its own when shared or inherited).
    // Image XObjects among them also get /OC in their dictionary. Barriers are never wrapped:
    // false when the run holds one.
    bool wrapInOptionalContent(const ContentElement& first, const ContentElement& last, QPDFObjectHandle ocg);

    // Takes the marks of an element off the page while keeping its effect on the graphics state:
    // a path's painting operator becomes n (its clip stays), a text run is shown in render mode 3
    // (invisible) and the mode restored after it, images, inline images, shadings and forms are
    // dropped. Containers are emptied of their marks element by element.
    void remove(const ContentElement& element);

    // Replaces the bytes [begin, end) of the content with text (e.g. a colour operator).
    void replace(size_t begin, size_t end, std::string text);
    // Inserts text at a byte position, before any replacement starting there.
    void insertText(size_t at, std::string text) { insert(at, std::move(text), false); }

    // The name under which `object` is listed in the category ("/XObject", "/ColorSpace",
    // "/Properties") of the content's own resources, adding it under prefix<n> when absent;
    // returned as a name token to write into the content (escaped where needed).
    // Dictionaries shared with other contents only gain keys, so their users see no change.
    std::string resourceName(const char* category, QPDFObjectHandle object, const char* prefix);

    bool edited() const { return !changes_.empty(); }
    // The content with every edit applied.
    std::string result() const;
    // Writes the result into the owner, compressed by `compressor`: a page gets one new /Contents
    // stream (streams shared with other pages stay untouched), a form XObject gets new stream
    // data. Nothing happens without edits.
    void apply(QPDF& pdf, StreamCompressor& compressor);

private:
    struct Edit {
        size_t begin, end;
        std::string text;
        int rank;   // at one position: closing insertions, then opening ones, then replacements
        int order;  // then the order they were made in
    };
    void insert(size_t at, std::string text, bool closing);
    QPDFObjectHandle ownResources();

    Content& content_;
    DocumentEdits direct_;
    DocumentEdits& edits_;
    std::vector<Edit> changes_;
    std::map<std::pair<std::string, QPDFObjGen>, std::string> names_;
};

// The content-stream token of a decoded name ("/A B" gives "/A#20B"; '#' is escaped too).
std::string nameToken(const std::string& name);

// Returns the colour space with every colorant for which `affected` is true renamed "None":
// the name of a Separation, the names of a DeviceN (and the keys of an NChannel /Colorants
// dictionary, whose spaces are rewritten too), through Indexed bases and Pattern underlying
// spaces. The original object is returned when nothing is affected; otherwise a new direct copy,
// so that spaces shared with other uses are not changed in place.
QPDFObjectHandle colorantsToNone(QPDFObjectHandle colourSpace,
                                 const std::function<bool(const std::string&)>& affected);

}  // namespace vorlan::pdf
