// Hidden optional content: group states and their removal from form content.
#include "pdf/hidden_content.h"

#include <exception>
#include <memory>

#include "pdf/content_edit.h"
#include "pdf/content_tree.h"
#include "pdf/form_variants.h"
#include "pdf/optional_content.h"

namespace vorlan::pdf {
namespace {

// Visibility expressions nest; deeper ones (or cycles) count as shown.
constexpr int kMaxExpressionDepth = 32;

void setAll(std::map<QPDFObjGen, bool>& states, QPDFObjectHandle list, bool shown) {
    if (!list.isArray()) return;
    for (QPDFObjectHandle group : list.aitems())
        if (group.isIndirect()) {
            auto known = states.find(group.getObjGen());
            if (known != states.end()) known->second = shown;
        }
}

}  // namespace

OptionalContentStates::OptionalContentStates(QPDF& pdf, const std::map<std::string, bool>& switches) {
    try {
        QPDFObjectHandle properties = pdf.getRoot().getKey("/OCProperties");
        QPDFObjectHandle config = properties.isDictionary() ? properties.getKey("/D") : QPDFObjectHandle::newNull();
        const bool base = !(config.isDictionary() && config.getKey("/BaseState").isNameAndEquals("/OFF"));
        for (QPDFObjectHandle group : documentOCGs(pdf)) shown_[group.getObjGen()] = base;
        if (config.isDictionary()) {
            setAll(shown_, config.getKey("/ON"), true);
            setAll(shown_, config.getKey("/OFF"), false);
        }
        for (QPDFObjectHandle group : documentOCGs(pdf)) {
            auto named = switches.find(ocgName(group));
            if (named != switches.end()) shown_[group.getObjGen()] = named->second;
        }
    } catch (const std::exception&) {
    }
    for (const auto& [group, shown] : shown_) anyOff_ = anyOff_ || !shown;
}

bool OptionalContentStates::groupShown(QPDFObjectHandle group) const {
    if (!group.isIndirect()) return true;
    auto known = shown_.find(group.getObjGen());
    return known == shown_.end() || known->second;
}

bool OptionalContentStates::shown(QPDFObjectHandle oc, int depth) const {
    if (depth > kMaxExpressionDepth) return true;
    if (oc.isArray()) {  // a visibility expression: [/And|/Or|/Not operands...]
        if (oc.getArrayNItems() < 2) return true;
        QPDFObjectHandle op = oc.getArrayItem(0);
        const int n = oc.getArrayNItems();
        if (op.isNameAndEquals("/Not")) return !shown(oc.getArrayItem(1), depth + 1);
        const bool all = op.isNameAndEquals("/And");
        if (!all && !op.isNameAndEquals("/Or")) return true;
        for (int i = 1; i < n; ++i)
            if (shown(oc.getArrayItem(i), depth + 1) != all) return !all;
        return all;
    }
    if (!oc.isDictionary()) return true;
    if (oc.getKey("/Type").isNameAndEquals("/OCG")) return groupShown(oc);
    QPDFObjectHandle expression = oc.getKey("/VE");
    if (expression.isArray()) return shown(expression, depth + 1);
    QPDFObjectHandle groups = oc.getKey("/OCGs");
    if (groups.isDictionary()) groups = QPDFObjectHandle::newArray({groups});
    if (!groups.isArray()) return true;
    int on = 0, off = 0;
    for (QPDFObjectHandle group : groups.aitems()) {
        if (!group.isDictionary()) continue;
        (groupShown(group) ? on : off) += 1;
    }
    if (on + off == 0) return true;
    QPDFObjectHandle policy = oc.getKey("/P");
    if (policy.isNameAndEquals("/AllOn")) return off == 0;
    if (policy.isNameAndEquals("/AnyOff")) return off > 0;
    if (policy.isNameAndEquals("/AllOff")) return on == 0;
    return on > 0;  // /AnyOn, the default
}

bool OptionalContentStates::hides(QPDFObjectHandle oc) const {
    try {
        return !shown(oc, 0);
    } catch (const std::exception&) {
        return false;
    }
}

namespace {

class HiddenContentRemover {
public:
    HiddenContentRemover(QPDF& pdf, const OptionalContentStates& states)
        : pdf_(pdf), states_(states), variants_(pdf, compressor_) {}

    bool removeFrom(QPDFObjectHandle form) {
        std::shared_ptr<Content> content =
            parseFormContent(form, QPDFObjectHandle::newNull(), GraphicsState::initial(), &cache_, StateLeaves::None);
        if (!content->complete && content->bytes.empty()) return false;
        ContentEditor editor(*content);
        walk(content->elements, editor);
        editor.apply(pdf_, compressor_);
        variants_.finish();
        return content->complete;
    }

private:
    bool hidden(const ContentElement& e) const {
        if (!e.optionalContent) return false;
        if (e.kind == ElementKind::MarkedContent) return states_.hides(e.object);
        if (e.kind != ElementKind::Image && e.kind != ElementKind::Form) return false;
        QPDFObjectHandle object = e.object;
        return object.isStream() && states_.hides(object.getDict().getKey("/OC"));
    }

    void walk(const std::vector<ContentElement>& elements, ContentEditor& editor) {
        for (const ContentElement& e : elements) {
            if (hidden(e)) {
                editor.remove(e);
                continue;
            }
            if (e.isContainer()) walk(e.children, editor);
            else if (e.kind == ElementKind::Form)
                variants_.editUse(e, editor, [&](Content& form, ContentEditor& inner) { walk(form.elements, inner); });
        }
    }

    QPDF& pdf_;
    const OptionalContentStates& states_;
    StreamCompressor compressor_;
    FormVariants variants_;
    ColourSpaceResolver::SharedCache cache_;
};

}  // namespace

bool removeHiddenContent(QPDF& pdf, QPDFObjectHandle form, const OptionalContentStates& states) {
    if (!states.anyOff()) return true;
    try {
        return HiddenContentRemover(pdf, states).removeFrom(form);
    } catch (const std::exception&) {
        return false;
    }
}

}  // namespace vorlan::pdf
