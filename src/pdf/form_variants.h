// Copy-on-write of form XObjects whose edits depend on where they are used.
//
// A form inherits the graphics state of each use, so the edits of one use can differ from those
// of another. Each distinct edited content of a form is one variant: the first variant met keeps
// the original object, every other one gets its own copy, and uses with equal variants share an
// object. Originals are rewritten only by finish(), so every use is parsed from the unedited form.
#pragma once

#include <qpdf/QPDF.hh>
#include <qpdf/QPDFObjectHandle.hh>

#include <map>
#include <string>

namespace vorlan::pdf {

class FormVariants {
public:
    explicit FormVariants(QPDF& pdf) : pdf_(pdf) {}

    // The stream that carries `bytes` for one use of `form`, whose unedited content is `original`:
    // the form itself when the bytes are its first variant (or the first variant is claimed
    // now), else a copy with these bytes.
    QPDFObjectHandle objectFor(QPDFObjectHandle form, const std::string& original, std::string bytes);

    // Writes the claimed variants into the original forms (unfiltered; the writer compresses them).
    void finish();

private:
    struct Entry {
        QPDFObjectHandle form;
        std::string claimed;
        bool changed = false;
        std::map<std::string, QPDFObjectHandle> copies;
    };
    QPDF& pdf_;
    std::map<QPDFObjGen, Entry> entries_;
};

}  // namespace vorlan::pdf
