// A single pass over page or form content: operators with their byte ranges, the graphics state
// at each of them, and what each painting operator paints with.
//
// The content lexer splits the decoded content into tokens; this class gathers operands,
// follows q/Q and the colour operators, resolves colour spaces and XObjects through the
// content's resources, and hands one Step per operator to handleStep(). Users derive from it:
// the element tree (content_tree.h) and the page ink scan (page_inks.h).
#pragma once

#include <qpdf/QPDFObjectHandle.hh>

#include <cstddef>
#include <string>
#include <vector>

#include "pdf/colour_space.h"
#include "pdf/content_lexer.h"

namespace vorlan::pdf {

// The part of the graphics state this layer follows. PDF starts with DeviceGray for both colours;
// fillSet/strokeSet tell whether the content chose a colour space or colour itself.
struct GraphicsState {
    ColourSpaceRef fill;
    ColourSpaceRef stroke;
    bool fillSet = false;
    bool strokeSet = false;
    int textRender = 0;          // Tr
    std::string fillPattern;     // resource name of the pattern of scn when fill is a Pattern space
    std::string strokePattern;

    static GraphicsState initial();
};

enum class StepKind {
    State,        // changes state only (colours, matrices, line style, gs, text state, ...)
    PathPart,     // m l c v y h re, and the clip modifiers W W*
    PathPaint,    // S s f F f* B B* b b* n
    TextBegin,    // BT
    TextEnd,      // ET
    TextShow,     // Tj TJ ' "
    GroupBegin,   // q
    GroupEnd,     // Q
    MarkedBegin,  // BMC BDC
    MarkedEnd,    // EMC
    MarkedPoint,  // MP DP
    Image,        // Do of an image XObject
    Form,         // Do of a form XObject
    InlineImage,  // BI ... ID ... EI, reported once at EI
    Shading,      // sh
    Other         // anything else (unknown operators, Do of a missing XObject, d0/d1, BX/EX)
};

struct Step {
    StepKind kind = StepKind::Other;
    std::string op;
    size_t begin = 0;    // first byte of the first operand (of BI for inline images)
    size_t opBegin = 0;  // first byte of the operator
    size_t end = 0;      // one past the operator
    const std::vector<ContentToken>* operands = nullptr;  // byte ranges in the walked content
    bool fills = false;      // paints with the fill colour (paths, text, image masks)
    bool strokes = false;    // paints with the stroke colour
    ColourSpaceRef ownSpace; // images, inline images and shadings: their own colour space
    bool imageMask = false;
    QPDFObjectHandle object; // XObject stream, shading, marked-content properties, inline image dict
    std::string name;        // XObject or shading resource name, marked-content tag
    bool optionalContent = false;  // BDC /OC, or an XObject with its own /OC entry
};

class ContentWalker {
public:
    // resources: the content's /Resources; cache: document-wide colour-space cache (may be null).
    ContentWalker(QPDFObjectHandle resources, ColourSpaceResolver::SharedCache* cache,
                  GraphicsState start = GraphicsState::initial());

    // Walks a page's content (all its streams), or a form XObject's or tiling pattern's stream.
    // Returns false when the content could not be decoded or parsed to its end; steps seen up
    // to the damage have been handled.
    bool walkPage(QPDFObjectHandle page);
    bool walkStream(QPDFObjectHandle stream);
    // Walks decoded content bytes (which must outlive the walk); offsets point into them.
    bool walkBytes(const std::string& bytes);

    const GraphicsState& state() const { return state_; }
    ColourSpaceResolver& colourSpaces() { return spaces_; }
    QPDFObjectHandle resources() const { return resources_; }

    virtual ~ContentWalker() = default;

protected:
    virtual void handleStep(const Step& step) = 0;

private:
    void handleOperator(const std::string& op, size_t offset, size_t length);
    void setColourSpace(bool stroke, ColourSpaceRef space);
    void fillXObjectStep(Step& step);
    void fillInlineImageStep(Step& step);
    void fillMarkedStep(Step& step);
    std::string lastName() const;
    QPDFObjectHandle parseOperand(const ContentToken& token) const;

    QPDFObjectHandle resources_;
    ColourSpaceResolver spaces_;
    GraphicsState state_;
    std::vector<GraphicsState> saved_;
    const std::string* bytes_ = nullptr;
    std::vector<ContentToken> operands_;
    size_t operandStart_ = 0;
    bool haveOperands_ = false;
    size_t inlineBegin_ = 0;
    QPDFObjectHandle inlineDict_;
};

// The resource dictionary a form or pattern stream uses: its own, else the parent's.
QPDFObjectHandle streamResources(QPDFObjectHandle stream, QPDFObjectHandle parentResources);

}  // namespace vorlan::pdf
