// Content walking: operand gathering, graphics-state tracking and step classification.
#include "pdf/content_walker.h"

#include <qpdf/Buffer.hh>
#include <qpdf/Pl_Buffer.hh>
#include <qpdf/QPDFPageObjectHelper.hh>

#include <cstdlib>
#include <memory>

#include <exception>

namespace vorlan::pdf {
namespace {

// Deeply nested q without Q is legal but bounded by viewers; keep memory bounded as well.
constexpr size_t kMaxSavedStates = 1 << 16;

bool isPathPart(const std::string& op) {
    return op == "m" || op == "l" || op == "c" || op == "v" || op == "y" || op == "h" ||
           op == "re" || op == "W" || op == "W*";
}

// Which colours a path-painting operator uses; false when op paints no path.
bool pathPaint(const std::string& op, bool& fills, bool& strokes) {
    if (op == "S" || op == "s") {
        strokes = true;
    } else if (op == "f" || op == "F" || op == "f*") {
        fills = true;
    } else if (op == "B" || op == "B*" || op == "b" || op == "b*") {
        fills = strokes = true;
    } else if (op != "n") {
        return false;
    }
    return true;
}

QPDFObjectHandle resourceEntry(QPDFObjectHandle resources, const char* category,
                               const std::string& name) {
    if (!resources.isDictionary()) return QPDFObjectHandle::newNull();
    QPDFObjectHandle dict = resources.getKey(category);
    return dict.isDictionary() ? dict.getKey(name) : QPDFObjectHandle::newNull();
}

}  // namespace

GraphicsState GraphicsState::initial() {
    GraphicsState s;
    s.fill = s.stroke = deviceColourSpace("/DeviceGray");
    return s;
}

QPDFObjectHandle streamResources(QPDFObjectHandle stream, QPDFObjectHandle parentResources) {
    if (stream.isStream()) {
        QPDFObjectHandle own = stream.getDict().getKey("/Resources");
        if (own.isDictionary()) return own;
    }
    return parentResources;
}

ContentWalker::ContentWalker(QPDFObjectHandle resources, ColourSpaceResolver::SharedCache* cache,
                             GraphicsState start)
    : resources_(resources), spaces_(resources, cache), state_(std::move(start)) {
    operands_.reserve(16);
}

bool ContentWalker::walkPage(QPDFObjectHandle page) {
    std::string bytes;
    try {
        Pl_Buffer buffer("content");
        QPDFPageObjectHelper(page).pipeContents(&buffer);
        std::unique_ptr<Buffer> data(buffer.getBuffer());
        bytes.assign(reinterpret_cast<const char*>(data->getBuffer()), data->getSize());
    } catch (const std::exception&) {
        return false;
    }
    return walkBytes(bytes);
}

bool ContentWalker::walkStream(QPDFObjectHandle stream) {
    std::string bytes;
    try {
        if (!stream.isStream()) return false;
        Pl_Buffer buffer("content");
        if (!stream.pipeStreamData(&buffer, 0, qpdf_dl_generalized)) return false;
        std::unique_ptr<Buffer> data(buffer.getBuffer());
        bytes.assign(reinterpret_cast<const char*>(data->getBuffer()), data->getSize());
    } catch (const std::exception&) {
        return false;
    }
    return walkBytes(bytes);
}

bool ContentWalker::walkBytes(const std::string& bytes) {
    bytes_ = &bytes;
    ContentLexer lexer(bytes);
    int depth = 0;          // inside an array or dictionary operand
    size_t compositeBegin = 0;
    bool complete = true;
    for (;;) {
        const ContentToken t = lexer.next();
        if (t.kind == ContentToken::End) break;
        if (t.kind == ContentToken::Damaged) {
            complete = false;
            break;
        }
        if (t.kind == ContentToken::Open) {
            if (depth++ == 0) compositeBegin = t.begin;
            continue;
        }
        if (t.kind == ContentToken::Close) {
            if (depth > 0 && --depth == 0) {
                if (!haveOperands_) {
                    operandStart_ = compositeBegin;
                    haveOperands_ = true;
                }
                operands_.push_back({ContentToken::Open, compositeBegin, t.end});
            }
            continue;
        }
        if (depth > 0) continue;
        const size_t length = t.end - t.begin;
        const bool keyword = t.kind == ContentToken::Keyword &&
                             !(length == 4 && (!bytes.compare(t.begin, 4, "true") || !bytes.compare(t.begin, 4, "null"))) &&
                             !(length == 5 && !bytes.compare(t.begin, 5, "false"));
        if (!keyword) {
            if (!haveOperands_) {
                operandStart_ = t.begin;
                haveOperands_ = true;
            }
            operands_.push_back(t);
            continue;
        }
        const std::string op = bytes.substr(t.begin, length);
        handleOperator(op, t.begin, length);
        operands_.clear();
        haveOperands_ = false;
        if (op == "ID" && !lexer.skipInlineImageData(t.end)) {
            complete = false;
            break;
        }
    }
    bytes_ = nullptr;
    return complete;
}

std::string ContentWalker::lastName() const {
    if (operands_.empty() || operands_.back().kind != ContentToken::Name) return {};
    return decodeName(*bytes_, operands_.back().begin, operands_.back().end);
}

QPDFObjectHandle ContentWalker::parseOperand(const ContentToken& token) const {
    try {
        if (token.kind == ContentToken::Name) return QPDFObjectHandle::newName(decodeName(*bytes_, token.begin, token.end));
        return QPDFObjectHandle::parse(bytes_->substr(token.begin, token.end - token.begin));
    } catch (const std::exception&) {
        return QPDFObjectHandle::newNull();
    }
}

void ContentWalker::setColourSpace(bool stroke, ColourSpaceRef space) {
    (stroke ? state_.stroke : state_.fill) = std::move(space);
    (stroke ? state_.strokeSet : state_.fillSet) = true;
    (stroke ? state_.strokePattern : state_.fillPattern).clear();
}

void ContentWalker::handleOperator(const std::string& op, size_t offset, size_t length) {
    Step step;
    step.op = op;
    step.opBegin = offset;
    step.begin = haveOperands_ ? operandStart_ : offset;
    step.end = offset + length;
    step.operands = &operands_;
    step.kind = StepKind::State;

    const char c0 = op.empty() ? '\0' : op[0];
    bool fills = false, strokes = false;
    switch (c0) {
        case 'q':
            if (op == "q") {
                if (saved_.size() < kMaxSavedStates) saved_.push_back(state_);
                step.kind = StepKind::GroupBegin;
            }
            break;
        case 'Q':
            if (op == "Q") {
                if (!saved_.empty()) {
                    state_ = std::move(saved_.back());
                    saved_.pop_back();
                }
                step.kind = StepKind::GroupEnd;
            }
            break;
        case 'c':
        case 'C':
            if (op == "cs" || op == "CS") {
                std::string name = lastName();
                setColourSpace(c0 == 'C', name.empty() ? deviceColourSpace("/DeviceGray")
                                                       : spaces_.byName(name));
            } else if (isPathPart(op)) {
                step.kind = StepKind::PathPart;
            }
            break;
        case 's':
        case 'S':
            if (op == "sc" || op == "SC" || op == "scn" || op == "SCN") {
                const bool stroke = c0 == 'S';
                (stroke ? state_.strokeSet : state_.fillSet) = true;
                (stroke ? state_.strokePattern : state_.fillPattern) = lastName();
            } else if (op == "sh") {
                step.kind = StepKind::Shading;
                step.name = lastName();
                step.object = resourceEntry(resources_, "/Shading", step.name);
                QPDFObjectHandle dict = step.object.isStream() ? step.object.getDict() : step.object;
                if (dict.isDictionary()) step.ownSpace = spaces_.byObject(dict.getKey("/ColorSpace"));
            } else if (pathPaint(op, fills, strokes)) {
                step.kind = StepKind::PathPaint;
            }
            break;
        case 'g': case 'G':
            if (op == "g" || op == "G") setColourSpace(c0 == 'G', deviceColourSpace("/DeviceGray"));
            break;
        case 'r': case 'R':
            if (op == "rg" || op == "RG") setColourSpace(c0 == 'R', deviceColourSpace("/DeviceRGB"));
            else if (op == "re") step.kind = StepKind::PathPart;
            break;
        case 'k': case 'K':
            if (op == "k" || op == "K") setColourSpace(c0 == 'K', deviceColourSpace("/DeviceCMYK"));
            break;
        case 'T':
            if (op == "Tr") {
                int mode = 0;
                if (!operands_.empty() && operands_.back().kind == ContentToken::Number) {
                    mode = std::atoi(bytes_->c_str() + operands_.back().begin);
                    if (mode >= 0 && mode <= 7) state_.textRender = mode;
                }
            } else if (op == "Tj" || op == "TJ") {
                step.kind = StepKind::TextShow;
            }
            break;
        case '\'': case '"':
            step.kind = StepKind::TextShow;
            break;
        case 'B':
            if (op == "BT") step.kind = StepKind::TextBegin;
            else if (op == "BMC" || op == "BDC") step.kind = StepKind::MarkedBegin;
            else if (op == "BI") {
                inlineBegin_ = offset;
                step.kind = StepKind::Other;
                step.name = "BI";
            } else if (pathPaint(op, fills, strokes)) step.kind = StepKind::PathPaint;
            else if (op == "BX") step.kind = StepKind::Other;
            break;
        case 'E':
            if (op == "ET") step.kind = StepKind::TextEnd;
            else if (op == "EMC") step.kind = StepKind::MarkedEnd;
            else if (op == "EI") step.kind = StepKind::InlineImage;
            else step.kind = StepKind::Other;
            break;
        case 'I':
            if (op == "ID") {  // the operands are the image dictionary's keys and values
                inlineDict_ = QPDFObjectHandle::newDictionary();
                for (size_t i = 0; i + 1 < operands_.size(); i += 2)
                    if (operands_[i].kind == ContentToken::Name)
                        inlineDict_.replaceKey(decodeName(*bytes_, operands_[i].begin, operands_[i].end),
                                               parseOperand(operands_[i + 1]));
                step.kind = StepKind::Other;
            }
            break;
        case 'D':
            if (op == "Do") step.kind = StepKind::Other;  // refined below
            else if (op == "DP") step.kind = StepKind::MarkedPoint;
            break;
        case 'M':
            if (op == "MP") step.kind = StepKind::MarkedPoint;
            break;
        case 'd':
            if (op == "d0" || op == "d1") step.kind = StepKind::Other;
            break;
        default:
            if (isPathPart(op)) step.kind = StepKind::PathPart;
            else if (pathPaint(op, fills, strokes)) step.kind = StepKind::PathPaint;
            break;
    }

    if (step.kind == StepKind::PathPaint) {
        step.fills = fills;
        step.strokes = strokes;
    } else if (step.kind == StepKind::TextShow) {
        const int tr = state_.textRender;
        step.fills = tr == 0 || tr == 2 || tr == 4 || tr == 6;
        step.strokes = tr == 1 || tr == 2 || tr == 5 || tr == 6;
    } else if (op == "Do") {
        fillXObjectStep(step);
    } else if (step.kind == StepKind::InlineImage) {
        fillInlineImageStep(step);
    } else if (step.kind == StepKind::MarkedBegin || step.kind == StepKind::MarkedPoint) {
        fillMarkedStep(step);
    }
    handleStep(step);
}

void ContentWalker::fillXObjectStep(Step& step) {
    step.name = lastName();
    QPDFObjectHandle xobject = resourceEntry(resources_, "/XObject", step.name);
    if (!xobject.isStream()) return;  // a missing XObject paints nothing
    QPDFObjectHandle dict = xobject.getDict();
    step.object = xobject;
    step.optionalContent = dict.hasKey("/OC");
    QPDFObjectHandle subtype = dict.getKey("/Subtype");
    if (subtype.isNameAndEquals("/Image")) {
        step.kind = StepKind::Image;
        dict.getKey("/ImageMask").getValueAsBool(step.imageMask);
        if (step.imageMask) step.fills = true;
        else step.ownSpace = spaces_.byObject(dict.getKey("/ColorSpace"));
    } else if (subtype.isNameAndEquals("/Form")) {
        step.kind = StepKind::Form;
    }
}

void ContentWalker::fillInlineImageStep(Step& step) {
    step.begin = inlineBegin_;
    step.object = inlineDict_.isDictionary() ? inlineDict_ : QPDFObjectHandle::newDictionary();
    QPDFObjectHandle mask = step.object.getKey("/IM");
    if (mask.isNull()) mask = step.object.getKey("/ImageMask");
    mask.getValueAsBool(step.imageMask);
    if (step.imageMask) {
        step.fills = true;
    } else {
        QPDFObjectHandle cs = step.object.getKey("/CS");
        if (cs.isNull()) cs = step.object.getKey("/ColorSpace");
        step.ownSpace = spaces_.byObject(cs);
    }
    inlineDict_ = QPDFObjectHandle();
}

void ContentWalker::fillMarkedStep(Step& step) {
    if (operands_.empty() || operands_.front().kind != ContentToken::Name) return;
    step.name = decodeName(*bytes_, operands_.front().begin, operands_.front().end);
    if (operands_.size() >= 2) {
        QPDFObjectHandle props = parseOperand(operands_[1]);
        if (props.isName()) props = resourceEntry(resources_, "/Properties", props.getName());
        step.object = props;
    }
    step.optionalContent = step.name == "/OC";
}

}  // namespace vorlan::pdf
