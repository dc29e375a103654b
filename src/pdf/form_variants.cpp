// Form variants: the first claims the original, the others get copies.
#include "pdf/form_variants.h"

namespace vorlan::pdf {

QPDFObjectHandle FormVariants::objectFor(QPDFObjectHandle form, const std::string& original, std::string bytes) {
    auto [it, isNew] = entries_.try_emplace(form.getObjGen());
    Entry& entry = it->second;
    if (isNew) {
        entry.form = form;
        entry.changed = bytes != original;
        entry.claimed = std::move(bytes);
        return form;
    }
    if (bytes == entry.claimed) return form;
    auto copy = entry.copies.find(bytes);
    if (copy != entry.copies.end()) return copy->second;
    QPDFObjectHandle made = pdf_.makeIndirectObject(
        compressor_.newStream(pdf_, bytes));
    // The copy takes the form's dictionary (resources, matrix, box, group) but not its filters.
    QPDFObjectHandle dict = made.getDict();
    for (auto& [key, value] : form.getDict().ditems())
        if (key != "/Length" && key != "/Filter" && key != "/DecodeParms") dict.replaceKey(key, value);
    entry.copies.emplace(std::move(bytes), made);
    return made;
}

void FormVariants::finish() {
    for (auto& [objGen, entry] : entries_) {
        if (!entry.changed) continue;
        edits_.setStreamData(entry.form, compressor_.pack(entry.claimed));
    }
    entries_.clear();
}

void FormVariants::pointUse(const ContentElement& e, QPDFObjectHandle form, ContentEditor& parent,
                            const std::function<QPDFObjectHandle()>& make) {
    QPDFObjectHandle& target = targets_[e.form.get()];
    if (!target.isInitialized()) target = make();
    if (!target.isSameObjectAs(form))
        parent.replace(e.begin, e.opBegin, parent.resourceName("/XObject", target, "Fm") + " ");
}

void FormVariants::editUse(const ContentElement& e, ContentEditor& parent,
                           const std::function<void(Content&, ContentEditor&)>& edit) {
    QPDFObjectHandle form = e.object;  // a handle copy: qpdf's accessors are not const
    if (!e.form || !form.isStream() || (!e.form->complete && e.form->bytes.empty())) return;
    pointUse(e, form, parent, [&] {
        Content& content = *e.form;
        ContentEditor editor(content, &edits_);
        edit(content, editor);
        std::string bytes = editor.edited() ? editor.result() : content.bytes;
        return objectFor(form, content.bytes, std::move(bytes));
    });
}

void FormVariants::editUse(const ContentElement& e, QPDFObjectHandle form, QPDFObjectHandle parentResources,
                           ContentEditor& parent,
                           const std::function<void(Content&, const Content&, ContentEditor&)>& edit) {
    if (!e.form || !form.isStream() || (!e.form->complete && e.form->bytes.empty())) return;
    pointUse(e, form, parent, [&] {
        const Content& parsed = *e.form;
        Content view;
        view.owner = form;
        view.resources = streamResources(form, parentResources);
        view.bytes = parsed.bytes;
        view.complete = parsed.complete;
        ContentEditor editor(view, &edits_);
        edit(view, parsed, editor);
        std::string bytes = editor.edited() ? editor.result() : parsed.bytes;
        return objectFor(form, parsed.bytes, std::move(bytes));
    });
}

}  // namespace vorlan::pdf
