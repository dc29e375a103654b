// Form variants: the first claims the original, the others get copies.
#include "pdf/form_variants.h"

#include "pdf/stream_compression.h"

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
        newCompressedStream(pdf_, bytes));
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
        setCompressedStreamData(entry.form, entry.claimed);
    }
    entries_.clear();
}

void FormVariants::editUse(const ContentElement& e, ContentEditor& parent,
                           const std::function<void(Content&, ContentEditor&)>& edit) {
    QPDFObjectHandle form = e.object;  // a handle copy: qpdf's accessors are not const
    if (!e.form || !form.isStream() || (!e.form->complete && e.form->bytes.empty())) return;
    QPDFObjectHandle& target = targets_[e.form.get()];
    if (!target.isInitialized()) {
        Content& content = *e.form;
        ContentEditor editor(content);
        edit(content, editor);
        std::string bytes = editor.edited() ? editor.result() : content.bytes;
        target = objectFor(form, content.bytes, std::move(bytes));
    }
    if (!target.isSameObjectAs(form))
        parent.replace(e.begin, e.opBegin, parent.resourceName("/XObject", target, "Fm") + " ");
}

}  // namespace vorlan::pdf
