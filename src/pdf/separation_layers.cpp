// Separations to optional-content groups: the content walk, element classification and wrapping.
#include "pdf/separation_layers.h"

#include <qpdf/QPDFObjectHandle.hh>

#include <exception>
#include <map>
#include <memory>

#include "pdf/content_edit.h"
#include "pdf/content_tree.h"
#include "pdf/form_variants.h"
#include "pdf/optional_content.h"
#include "pdf/pdf_document.h"
#include "pdf/pdf_save.h"
#include "pdf/pdf_session.h"
#include "pdf/zipped_jdf_file_system.h"

namespace vorlan::pdf {
namespace {

constexpr int kUnmatched = -1;
constexpr int kNotWrapped = -2;

class LayerConverter {
public:
    LayerConverter(QPDF& pdf, const std::vector<ConversionEntry>& entries, bool allSeparations)
        : pdf_(pdf), variants_(pdf, compressor_), allSeparations_(allSeparations) {
        for (const ConversionEntry& e : entries) table_.push_back(e.isSeparation ? e.name : std::string());
    }

    // The groups, by index of the separation table (null for plain layers), and the catch-all.
    std::vector<QPDFObjectHandle> separationGroups;
    QPDFObjectHandle special = QPDFObjectHandle::newNull();

    bool convertPage(QPDFObjectHandle page) {
        std::shared_ptr<Content> content = parsePageContent(page, &cache_, StateLeaves::None, &forms_);
        if (!content->complete && content->bytes.empty()) return false;  // unreadable: left alone
        ContentEditor editor(*content);
        walk(*content, content->elements, editor);
        editor.apply(pdf_, compressor_);
        hideAnnotations(page);
        return content->complete;
    }

    void finish() { variants_.finish(); }

    // Annotations paint too: those without optional content of their own join the catch-all
    // group, so that a die-only page (every group off but the die) prints no stamp or form field
    // on the die plate. An annotation's own /OC is left as it is.
    void hideAnnotations(QPDFObjectHandle page) {
        QPDFObjectHandle annots = page.getKey("/Annots");
        if (!annots.isArray()) return;
        for (QPDFObjectHandle annot : annots.aitems()) {
            if (!annot.isDictionary() || annot.hasKey("/OC")) continue;
            if (annot.getKey("/Subtype").isNameAndEquals("/Popup")) continue;  // shown through its parent
            annot.replaceKey("/OC", special);
        }
    }

private:
    // A run of sibling elements that go into one group, wrapped together.
    struct Run {
        const ContentElement* first = nullptr;
        const ContentElement* last = nullptr;
        int target = kNotWrapped;
    };

    void walk(Content& content, const std::vector<ContentElement>& elements, ContentEditor& editor) {
        Run run;
        for (const ContentElement& e : elements) {
            if (!allSeparations_ && underOptionalContent(e)) {
                close(run, editor);
                continue;
            }
            switch (e.kind) {
                case ElementKind::Group:
                case ElementKind::MarkedContent:
                    close(run, editor);
                    walk(content, e.children, editor);
                    continue;
                case ElementKind::Form:
                    close(run, editor);
                    convertForm(e, editor);
                    continue;
                case ElementKind::State:
                    continue;  // joins a run when an element of the same group follows
                case ElementKind::Barrier:
                    close(run, editor);
                    continue;
                case ElementKind::TextObject:
                    if (!e.closed) {  // a text object without ET cannot be bracketed
                        close(run, editor);
                        continue;
                    }
                    break;
                default:
                    if (!e.paints()) continue;  // a clip-only path: state, like the operators
                    break;
            }
            const int target = classify(e);
            if (run.first && run.target == target) {
                run.last = &e;
            } else {
                close(run, editor);
                run = {&e, &e, target};
            }
        }
        close(run, editor);
    }

    void close(Run& run, ContentEditor& editor) {
        if (run.first) {
            QPDFObjectHandle ocg = run.target >= 0 ? separationGroups[static_cast<size_t>(run.target)] : special;
            if (!ocg.isNull()) editor.wrapInOptionalContent(*run.first, *run.last, ocg);
        }
        run = Run();
    }

    void convertForm(const ContentElement& e, ContentEditor& parent) {
        variants_.editUse(e, parent, [&](Content& form, ContentEditor& editor) { walk(form, form.elements, editor); });
    }

    static bool underOptionalContent(const ContentElement& e) {
        if (!e.optionalContent) return false;
        if (e.kind == ElementKind::MarkedContent) return hasOptionalContentMembership(e.object);
        QPDFObjectHandle xobject = e.object;
        return xobject.isStream() && hasOptionalContentMembership(xobject.getDict().getKey("/OC"));
    }

    // Index of a colorant in the separation table, or kUnmatched.
    int lookup(const std::string& colorant) const {
        if (colorant.empty()) return kUnmatched;
        for (size_t i = 0; i < table_.size(); ++i)
            if (table_[i] == colorant) return static_cast<int>(i);
        return kUnmatched;
    }

    // A Separation matches by its colorant; in a DeviceN the last listed colorant decides.
    int examine(const ColourSpaceRef& space) const {
        if (!space) return kUnmatched;
        int found = kUnmatched;
        if (space->family == ColourFamily::Separation || space->family == ColourFamily::DeviceN)
            for (const std::string& c : space->colorants)
                if (int i = lookup(c); i != kUnmatched) found = i;
        return found;
    }

    // The colours an element paints with: the fill colour when it fills, then the stroke colour.
    int examineState(const ContentElement& e) const {
        int found = e.fills ? examine(e.state.fill) : kUnmatched;
        if (found == kUnmatched && e.strokes) found = examine(e.state.stroke);
        return found;
    }

    int lastRun(const ContentElement& e, bool& seen) const {
        int result = kUnmatched;
        for (const ContentElement& child : e.children) {
            if (child.kind == ElementKind::TextRun) {
                result = examineState(child);
                seen = true;
            } else if (!child.children.empty()) {
                bool inner = false;
                int r = lastRun(child, inner);
                if (inner) {
                    result = r;
                    seen = true;
                }
            }
        }
        return result;
    }

    int classify(const ContentElement& e) const {
        switch (e.kind) {
            case ElementKind::TextObject: {
                bool seen = false;
                return lastRun(e, seen);
            }
            case ElementKind::Image:
            case ElementKind::InlineImage:
                if (e.imageMask) return examineState(e);
                return e.ownSpace && e.ownSpace->family == ColourFamily::Separation ? examine(e.ownSpace)
                                                                                   : kUnmatched;
            case ElementKind::Shading:
                return examine(e.ownSpace);
            default:
                return examineState(e);
        }
    }

    QPDF& pdf_;
    StreamCompressor compressor_;
    FormVariants variants_;
    bool allSeparations_;
    std::vector<std::string> table_;
    ColourSpaceResolver::SharedCache cache_;
    FormCache forms_;                                   // parsed forms, shared between uses
};

}  // namespace

bool convertDocumentSeparations(QPDF& pdf, const std::vector<ConversionEntry>& entries) {
    bool allSeparations = true;
    for (const ConversionEntry& e : entries) allSeparations = allSeparations && e.isSeparation;
    LayerConverter converter(pdf, entries, allSeparations);
    try {
        if (allSeparations) clearDefaultOrder(pdf);
        std::vector<std::pair<std::string, QPDFObjectHandle>> created;  // one group per name
        for (const ConversionEntry& e : entries) {
            QPDFObjectHandle ocg = QPDFObjectHandle::newNull();
            if (e.isSeparation) {
                for (auto& [name, group] : created)
                    if (name == e.layerName) ocg = group;
                if (ocg.isNull()) {
                    ocg = findOrCreateOCG(pdf, e.layerName);
                    created.emplace_back(e.layerName, ocg);
                }
            }
            converter.separationGroups.push_back(ocg);
        }
        converter.special = findOrCreateOCG(pdf, kSpecialOCGName);
    } catch (const std::exception&) {
        return false;
    }
    bool result = true;
    if (converter.special.isNull()) return result;  // nothing to sort content into
    for (QPDFObjectHandle page : documentPages(pdf)) {
        try {
            result = converter.convertPage(page);
        } catch (const std::exception&) {
            result = false;
        }
    }
    try {
        converter.finish();
    } catch (const std::exception&) {
        result = false;
    }
    return result;
}

bool convertSeparationsToLayers(const char* input, const ConversionEntry* entries, int count, const char* output,
                                bool* saved, PdfFailure* why) {
    if (saved) *saved = false;
    std::unique_ptr<QPDF> pdf = openDocument(input, true, why);
    if (!pdf) return false;
    if (!output || !*output) {
        if (why) *why = PdfFailure::CannotWrite;
        return false;
    }
    std::vector<ConversionEntry> list(entries, entries + (count > 0 ? count : 0));
    const bool converted = convertDocumentSeparations(*pdf, list);
    const bool written = saveDocument(*pdf, output);
    if (saved) *saved = written;
    if (!written && why) *why = PdfFailure::CannotWrite;
    return converted && written;
}

int convertPDF(ZippedJDFFileSystem* fs, const char* input, const char* output, const char* const* separations,
               const char* const* layers, int separationCount, int layerCount, PdfFailure* why) {
    if (why) *why = PdfFailure::None;
    if (fs) ensurePdfLibraryStarted(fs);
    if (!input || !*input) return refuse(PdfFailure::CannotOpen, input ? input : "", why);
    if (!output || !*output) return refuse(PdfFailure::CannotWrite, output ? output : "", why);
    std::vector<ConversionEntry> entries;
    for (int i = 0; i < separationCount; ++i) {
        if (!separations[i] || std::string(separations[i]).size() >= kMaxConversionName)
            return refuse(PdfFailure::NameTooLong, input, why);
        entries.push_back({separations[i], separations[i], true});
    }
    for (int i = 0; i < layerCount; ++i) {
        if (!layers[i] || std::string(layers[i]).size() >= kMaxConversionName)
            return refuse(PdfFailure::NameTooLong, input, why);
        entries.push_back({std::string(), layers[i], false});
    }
    const std::filesystem::path target = prepareOutputPath(output);
    if (target.empty()) return refuse(PdfFailure::CannotWrite, output, why);
    // Judged by the file: a conversion that failed part way is still saved and counts.
    bool saved = false;
    PdfFailure failure = PdfFailure::None;
    convertSeparationsToLayers(input, entries.data(), static_cast<int>(entries.size()), target.c_str(), &saved,
                               &failure);
    if (saved) return 0;
    return refuse(failure, failure == PdfFailure::CannotWrite ? output : input, why);
}

}  // namespace vorlan::pdf
