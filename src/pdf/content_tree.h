// Page and form content as a tree of elements, for the edits of conversion and separation
// rewriting: containers (q..Q groups, BT..ET text objects, BMC/BDC..EMC marked content, form
// XObjects) and leaves (paths, text runs, images, inline images, shadings), each painting leaf with
// the graphics state at its painting operator.
//
// The element kinds of the original content-editing layer map onto these kinds: content (0) is a
// Content; text (1) a TextObject with its TextRun children; image (3) an Image or InlineImage;
// form (4) a Form; marked-content container (12) a MarkedContent; group (17) a Group; element types
// 16 and 23 (shadings with their own colour space) a Shading; paths and the like a Path. State
// leaves hold the operators that only change state; Barrier leaves hold operators that close
// something that is not open (an unmatched Q, EMC or ET) and are never moved or wrapped.
#pragma once

#include <qpdf/QPDFObjectHandle.hh>

#include <map>
#include <memory>
#include <tuple>
#include <string>
#include <vector>

#include "pdf/colour_space.h"
#include "pdf/content_walker.h"

namespace vorlan::pdf {

enum class ElementKind {
    Path, TextObject, TextRun, Image, InlineImage, Form, Shading, Group, MarkedContent, State, Barrier
};

struct Content;

struct ContentElement {
    ElementKind kind = ElementKind::State;
    size_t begin = 0;       // first byte (first operand of the first operator)
    size_t end = 0;         // one past the last operator (the closing one for containers)
    size_t opBegin = 0;     // the painting operator of a leaf; the opening operator of a container
    size_t opEnd = 0;
    std::string op;         // that operator
    GraphicsState state;    // at that operator
    bool fills = false;     // paints with the fill colour
    bool strokes = false;   // paints with the stroke colour
    ColourSpaceRef ownSpace;  // images and shadings
    bool imageMask = false;
    std::string name;       // XObject or shading resource name, marked-content tag
    QPDFObjectHandle object;  // XObject, shading, marked-content properties, inline image dictionary
    bool optionalContent = false;  // marked content /OC, or an XObject with its own /OC
    bool closed = true;     // containers: the closing operator was found
    std::vector<ContentElement> children;  // containers
    std::shared_ptr<Content> form;         // Form: its content, parsed with the state at this use

    ContentElement() = default;
    ContentElement(const ContentElement&) = default;
    ContentElement& operator=(const ContentElement&) = default;
    // Moves never throw, so growing element lists move elements instead of copying them.
    ContentElement(ContentElement&&) noexcept = default;
    ContentElement& operator=(ContentElement&&) noexcept = default;

    bool isContainer() const {
        return kind == ElementKind::TextObject || kind == ElementKind::Group ||
               kind == ElementKind::MarkedContent;
    }
    // True for leaves that put marks on the page (a path painted with n, or invisible text, do not).
    bool paints() const;
    // The colour spaces a painting leaf uses, in the order fill, stroke, own.
    std::vector<ColourSpaceRef> colourSpaces() const;
};

struct Content {
    QPDFObjectHandle owner;      // the page, or the form XObject
    QPDFObjectHandle resources;  // what names resolve against
    std::string bytes;           // the decoded content the offsets point into
    std::vector<ContentElement> elements;
    bool complete = true;        // parsed to its end without damage
};

// Which operators that only change state become State leaves: all of them, only those that set
// colours (cs CS sc scn SC SCN g G rg RG k K), or none. Leaving them out saves work for users
// that edit only painting elements; the byte ranges of the other elements are the same.
// ColourOnly keeps the colour operators and leaves out paths and text runs as well (they paint
// with the colours those operators set): for users that edit only colours and what paints from
// resources (images, inline images, shadings, forms).
enum class StateLeaves { All, Colour, None, ColourOnly };

// Parsed form contents shared between uses that inherit the same colour state (opt-in): a form
// used many times is parsed once per distinct state. The cache keeps the states it was built
// with alive, so their colour spaces stay valid keys for the whole document.
class FormCache {
public:
    std::shared_ptr<Content> find(QPDFObjGen form, const GraphicsState& state) const;
    void add(QPDFObjGen form, const GraphicsState& state, std::shared_ptr<Content> content);

private:
    struct Key {
        QPDFObjGen form;
        const ColourSpace* fill;
        const ColourSpace* stroke;
        bool fillSet, strokeSet;
        int textRender;
        std::string fillPattern, strokePattern;
        bool operator<(const Key& o) const;
    };
    static Key keyOf(QPDFObjGen form, const GraphicsState& state);
    std::map<Key, std::pair<GraphicsState, std::shared_ptr<Content>>> entries_;
};

// Parses a page's content (all its streams as one). Forms are parsed at each use, with the state
// at the use, nested up to a fixed depth; a form that (indirectly) uses itself is not entered
// again. Never throws; damaged content yields the elements before the damage and complete=false.
std::shared_ptr<Content> parsePageContent(QPDFObjectHandle page, ColourSpaceResolver::SharedCache* cache,
                                          StateLeaves states = StateLeaves::All, FormCache* forms = nullptr);
// Parses a form XObject's content with the given starting state.
std::shared_ptr<Content> parseFormContent(QPDFObjectHandle form, QPDFObjectHandle parentResources,
                                          const GraphicsState& start, ColourSpaceResolver::SharedCache* cache,
                                          StateLeaves states = StateLeaves::All, FormCache* forms = nullptr);

}  // namespace vorlan::pdf
