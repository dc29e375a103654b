// Copy-on-write of form XObjects whose edits depend on where they are used.
//
// A form inherits the graphics state of each use, so the edits of one use can differ from those
// of another. Each distinct edited content of a form is one variant: the first variant met keeps
// the original object, every other one gets its own copy, and uses with equal variants share an
// object. Originals are rewritten only by finish(), so every use is parsed from the unedited form.
#pragma once

#include <qpdf/QPDF.hh>
#include <qpdf/QPDFObjectHandle.hh>

#include <functional>
#include <map>
#include <string>

#include "pdf/content_edit.h"

namespace vorlan::pdf {

class FormVariants {
public:
    // Changes to existing objects go through `edits` (made at once without it).
    FormVariants(QPDF& pdf, StreamCompressor& compressor, DocumentEdits* edits = nullptr)
        : pdf_(pdf), compressor_(compressor), edits_(edits ? *edits : direct_) {}

    // The stream that carries `bytes` for one use of `form`, whose unedited content is `original`:
    // the form itself when the bytes are its first variant (or the first variant is claimed
    // now), else a copy with these bytes.
    QPDFObjectHandle objectFor(QPDFObjectHandle form, const std::string& original, std::string bytes);

    // For the use `e` of a form inside the content `parent` edits: edits the parsed form once
    // (`edit` walks it into the editor it is given), however many uses share that parsing, and
    // points this use at the variant that carries the result.
    void editUse(const ContentElement& e, ContentEditor& parent,
                 const std::function<void(Content&, ContentEditor&)>& edit);

    // The same for edits made in a document other than the one the form was parsed in (another
    // opening of the same file): `form` is this document's form and `parentResources` the
    // resources, here, of the content that uses it. `edit` gets a view of the parsed form whose
    // owner and resources are this document's (bytes as parsed, no elements) and the parsed form
    // with its elements.
    void editUse(const ContentElement& e, QPDFObjectHandle form, QPDFObjectHandle parentResources,
                 ContentEditor& parent, const std::function<void(Content&, const Content&, ContentEditor&)>& edit);

    // Writes the claimed variants into the original forms.
    void finish();

private:
    // Points the use at `target` (made by `make` for the parsed form once) in the parent content.
    void pointUse(const ContentElement& e, QPDFObjectHandle form, ContentEditor& parent,
                  const std::function<QPDFObjectHandle()>& make);

    struct Entry {
        QPDFObjectHandle form;
        std::string claimed;
        bool changed = false;
        std::map<std::string, QPDFObjectHandle> copies;
    };
    QPDF& pdf_;
    StreamCompressor& compressor_;
    DocumentEdits direct_;
    DocumentEdits& edits_;
    std::map<QPDFObjGen, Entry> entries_;
    std::map<const Content*, QPDFObjectHandle> targets_;  // what each parsed form became
};

}  // namespace vorlan::pdf
