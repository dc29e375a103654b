// Building the element tree from the content walker's steps.
#include "pdf/content_tree.h"

#include <qpdf/Pl_Buffer.hh>
#include <qpdf/QPDFPageObjectHelper.hh>

#include <exception>
#include <stdexcept>
#include <set>

namespace vorlan::pdf {
namespace {

constexpr int kMaxFormDepth = 16;

bool setsColour(const std::string& op) {
    switch (op.size()) {
        case 1: return op == "g" || op == "G" || op == "k" || op == "K";
        case 2: return op == "cs" || op == "CS" || op == "sc" || op == "SC" || op == "rg" || op == "RG";
        case 3: return op == "scn" || op == "SCN";
        default: return false;
    }
}

ElementKind containerKind(StepKind kind) {
    switch (kind) {
        case StepKind::GroupBegin: return ElementKind::Group;
        case StepKind::TextBegin: return ElementKind::TextObject;
        default: return ElementKind::MarkedContent;
    }
}

class TreeBuilder : public ContentWalker {
public:
    TreeBuilder(Content& content, ColourSpaceResolver::SharedCache* cache, GraphicsState start,
                std::set<QPDFObjGen>& openForms, int depth, StateLeaves states, FormCache* forms)
        : ContentWalker(content.resources, cache, std::move(start)),
          content_(content), cache_(cache), openForms_(openForms), depth_(depth), states_(states), forms_(forms) {
        open_.emplace_back();  // the content itself
    }

    void finish() {
        flushPath();
        while (open_.size() > 1) {
            open_.back().closed = false;
            closeTop(open_.back().end);
        }
        content_.elements = std::move(open_.front().children);
    }

protected:
    void handleStep(const Step& step) override {
        if (states_ == StateLeaves::ColourOnly &&
            (step.kind == StepKind::PathPart || step.kind == StepKind::PathPaint || step.kind == StepKind::TextShow))
            return;
        switch (step.kind) {
            case StepKind::PathPart:
                if (!inPath_) {
                    path_ = leaf(ElementKind::Path, step);
                    inPath_ = true;
                }
                path_.end = step.end;
                return;
            case StepKind::PathPaint: {
                ContentElement e = inPath_ ? std::move(path_) : leaf(ElementKind::Path, step);
                inPath_ = false;
                setPaint(e, step);
                add(std::move(e));
                return;
            }
            default:
                break;
        }
        flushPath();
        switch (step.kind) {
            case StepKind::GroupBegin:
            case StepKind::TextBegin:
            case StepKind::MarkedBegin: {
                ContentElement c = leaf(containerKind(step.kind), step);
                c.name = step.name;
                c.object = step.object;
                c.optionalContent = step.optionalContent;
                open_.push_back(std::move(c));
                return;
            }
            case StepKind::GroupEnd:
                closeOrBarrier(ElementKind::Group, step);
                return;
            case StepKind::TextEnd:
                closeOrBarrier(ElementKind::TextObject, step);
                return;
            case StepKind::MarkedEnd:
                closeOrBarrier(ElementKind::MarkedContent, step);
                return;
            case StepKind::TextShow:
                addPainting(ElementKind::TextRun, step);
                return;
            case StepKind::Image:
                addPainting(ElementKind::Image, step);
                return;
            case StepKind::InlineImage:
                addPainting(ElementKind::InlineImage, step);
                return;
            case StepKind::Shading:
                addPainting(ElementKind::Shading, step);
                return;
            case StepKind::Form: {
                ContentElement e = leaf(ElementKind::Form, step);
                setPaint(e, step);
                const QPDFObjGen id = step.object.getObjGen();
                // Only forms with their own resources read the same at every use.
                QPDFObjectHandle form = step.object;  // a handle copy: qpdf's accessors are not const
                FormCache* shared = forms_ && form.getDict().getKey("/Resources").isDictionary() ? forms_ : nullptr;
                if (shared) e.form = shared->find(id, state());
                if (!e.form && depth_ < kMaxFormDepth && openForms_.insert(id).second) {
                    e.form = parse(step.object, state());
                    openForms_.erase(id);
                    if (shared) shared->add(id, state(), e.form);
                }
                add(std::move(e));
                return;
            }
            default:  // inline image parts before EI are part of the inline image
                if (step.op == "BI" || step.op == "ID") return;
                if (states_ == StateLeaves::None || (states_ != StateLeaves::All && !setsColour(step.op))) return;
                add(leaf(ElementKind::State, step));
                return;
        }
    }

private:
    ContentElement leaf(ElementKind kind, const Step& step) const {
        ContentElement e;
        e.kind = kind;
        e.begin = step.begin;
        e.end = step.end;
        e.opBegin = step.opBegin;
        e.opEnd = step.end;
        e.op = step.op;
        e.state = state();
        return e;
    }

    static void setPaint(ContentElement& e, const Step& step) {
        e.end = step.end;
        e.opBegin = step.opBegin;
        e.opEnd = step.end;
        e.op = step.op;
        e.fills = step.fills;
        e.strokes = step.strokes;
        e.ownSpace = step.ownSpace;
        e.imageMask = step.imageMask;
        e.name = step.name;
        e.object = step.object;
        e.optionalContent = step.optionalContent;
    }

    void addPainting(ElementKind kind, const Step& step) {
        ContentElement e = leaf(kind, step);
        setPaint(e, step);
        add(std::move(e));
    }

    void add(ContentElement e) {
        open_.back().end = e.end;
        open_.back().children.push_back(std::move(e));
    }

    void flushPath() {  // a path interrupted by another operator stays unpainted
        if (!inPath_) return;
        inPath_ = false;
        add(std::move(path_));
    }

    void closeTop(size_t end) {
        ContentElement c = std::move(open_.back());
        open_.pop_back();
        c.end = end;
        add(std::move(c));
    }

    void closeOrBarrier(ElementKind kind, const Step& step) {
        if (open_.size() > 1 && open_.back().kind == kind) {
            closeTop(step.end);
        } else {
            add(leaf(ElementKind::Barrier, step));
        }
    }

    std::shared_ptr<Content> parse(QPDFObjectHandle form, const GraphicsState& start);

    Content& content_;
    ColourSpaceResolver::SharedCache* cache_;
    std::set<QPDFObjGen>& openForms_;
    int depth_;
    StateLeaves states_;
    FormCache* forms_;
    std::vector<ContentElement> open_;
    ContentElement path_;
    bool inPath_ = false;
};

// The decoded content of a form, pattern or glyph stream, or of all the streams of a page (joined
// by newlines). Throws when a stream cannot be decoded, so that content that cannot be read is
// never taken for empty content and replaced.
std::string pipedBytes(QPDFObjectHandle owner) {
    Pl_Buffer buffer("content");
    auto pipe = [&](QPDFObjectHandle stream) {
        if (!stream.isStream() || !stream.pipeStreamData(&buffer, 0, qpdf_dl_generalized))
            throw std::runtime_error("undecodable content");
    };
    if (owner.isStream()) {
        pipe(owner);
    } else {
        QPDFObjectHandle contents = owner.getKey("/Contents");
        if (contents.isArray()) {
            for (QPDFObjectHandle part : contents.aitems()) {
                pipe(part);
                buffer.write(reinterpret_cast<const unsigned char*>("\n"), 1);
            }
        } else if (!contents.isNull()) {
            pipe(contents);
        }
    }
    buffer.finish();
    std::unique_ptr<Buffer> data(buffer.getBuffer());
    return std::string(reinterpret_cast<const char*>(data->getBuffer()), data->getSize());
}

std::shared_ptr<Content> build(QPDFObjectHandle owner, QPDFObjectHandle resources,
                               const GraphicsState& start, ColourSpaceResolver::SharedCache* cache,
                               std::set<QPDFObjGen>& openForms, int depth, StateLeaves states, FormCache* forms) {
    auto content = std::make_shared<Content>();
    content->owner = owner;
    content->resources = resources;
    try {
        content->bytes = pipedBytes(owner);
    } catch (const std::exception&) {
        content->complete = false;
        return content;
    }
    TreeBuilder builder(*content, cache, start, openForms, depth, states, forms);
    content->complete = builder.walkBytes(content->bytes);
    builder.finish();
    return content;
}

std::shared_ptr<Content> TreeBuilder::parse(QPDFObjectHandle form, const GraphicsState& start) {
    return build(form, streamResources(form, resources()), start, cache_, openForms_, depth_ + 1, states_, forms_);
}

}  // namespace

FormCache::Key FormCache::keyOf(QPDFObjGen form, const GraphicsState& s) {
    return {form, s.fill.get(), s.stroke.get(), s.fillSet, s.strokeSet, s.textRender, s.fillPattern, s.strokePattern};
}

bool FormCache::Key::operator<(const Key& o) const {
    return std::tie(form, fill, stroke, fillSet, strokeSet, textRender, fillPattern, strokePattern) <
           std::tie(o.form, o.fill, o.stroke, o.fillSet, o.strokeSet, o.textRender, o.fillPattern, o.strokePattern);
}

std::shared_ptr<Content> FormCache::find(QPDFObjGen form, const GraphicsState& state) const {
    auto it = entries_.find(keyOf(form, state));
    return it == entries_.end() ? nullptr : it->second.second;
}

void FormCache::add(QPDFObjGen form, const GraphicsState& state, std::shared_ptr<Content> content) {
    if (content) entries_.emplace(keyOf(form, state), std::make_pair(state, std::move(content)));
}

bool ContentElement::paints() const {
    switch (kind) {
        case ElementKind::Path:
        case ElementKind::TextRun: return fills || strokes;
        case ElementKind::Image:
        case ElementKind::InlineImage:
        case ElementKind::Shading:
        case ElementKind::Form: return true;
        default: return false;
    }
}

std::vector<ColourSpaceRef> ContentElement::colourSpaces() const {
    std::vector<ColourSpaceRef> spaces;
    if (fills && state.fill) spaces.push_back(state.fill);
    if (strokes && state.stroke) spaces.push_back(state.stroke);
    if (ownSpace) spaces.push_back(ownSpace);
    return spaces;
}

std::shared_ptr<Content> parsePageContent(QPDFObjectHandle page, ColourSpaceResolver::SharedCache* cache,
                                          StateLeaves states, FormCache* forms) {
    std::set<QPDFObjGen> openForms;
    QPDFObjectHandle resources;
    try {
        resources = QPDFPageObjectHelper(page).getAttribute("/Resources", false);
    } catch (const std::exception&) {
        resources = QPDFObjectHandle::newNull();
    }
    return build(page, resources, GraphicsState::initial(), cache, openForms, 0, states, forms);
}

std::shared_ptr<Content> parseFormContent(QPDFObjectHandle form, QPDFObjectHandle parentResources,
                                          const GraphicsState& start, ColourSpaceResolver::SharedCache* cache,
                                          StateLeaves states, FormCache* forms) {
    std::set<QPDFObjGen> openForms{form.getObjGen()};
    return build(form, streamResources(form, parentResources), start, cache, openForms, 0, states, forms);
}

}  // namespace vorlan::pdf
