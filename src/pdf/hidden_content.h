// Optional content that a set of switches hides, taken out of content for good: what a proof
// draws of a placed object whose ordinal switches groups off.
#pragma once

#include <qpdf/QPDF.hh>
#include <qpdf/QPDFObjectHandle.hh>

#include <map>
#include <string>

namespace vorlan::pdf {

// The state of every group of one document: the default configuration (/BaseState, then /ON
// and /OFF), overridden by name for the switched groups (names compared exactly).
class OptionalContentStates {
public:
    OptionalContentStates(QPDF& pdf, const std::map<std::string, bool>& switches);

    // True when content under `oc` (a group, or a membership dictionary by its /VE expression or
    // else its /P policy over /OCGs) is hidden. Groups the document does not list are shown, and
    // so is anything that is neither a group nor a membership dictionary.
    bool hides(QPDFObjectHandle oc) const;
    // True when at least one group of the document is off.
    bool anyOff() const { return anyOff_; }

private:
    bool shown(QPDFObjectHandle oc, int depth) const;
    bool groupShown(QPDFObjectHandle group) const;

    std::map<QPDFObjGen, bool> shown_;
    bool anyOff_ = false;
};

// Takes every hidden element out of a form XObject's content (marked content /OC, images and
// forms with their own /OC; the state effects of the removed elements are kept, as
// ContentEditor::remove keeps them), in nested forms too. Nested forms are edited in place, so
// every use in the document sees the same removal: a document serves one set of states. False
// when the content could not be read to its end (it is edited as far as it was read). Never
// throws.
bool removeHiddenContent(QPDF& pdf, QPDFObjectHandle form, const OptionalContentStates& states);

}  // namespace vorlan::pdf
