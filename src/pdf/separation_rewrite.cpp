// Separation rewriting: colour operators, images, shadings, patterns, forms, Type 3 glyphs and
// annotation appearances of every page.
#include "pdf/separation_rewrite.h"

#include <qpdf/QPDFObjectHandle.hh>
#include <qpdf/QPDFPageObjectHelper.hh>

#include <unistd.h>

#include <cstring>
#include <exception>
#include <map>
#include <memory>
#include <set>

#include "pdf/content_edit.h"
#include "pdf/content_tree.h"
#include "pdf/form_variants.h"
#include "pdf/pdf_document.h"
#include "pdf/pdf_save.h"
#include "pdf/pdf_session.h"
#include "pdf/zipped_jdf_file_system.h"

namespace vorlan::pdf {
namespace {

// Sets every process colour of the content's starting state to CMYK 0 0 0 0 (keep-listed mode).
constexpr const char* kKnockOutStart = "0 0 0 0 k 0 0 0 0 K\n";

bool isDelimiter(char c) { return std::strchr("()<>[]{}/%", c) != nullptr; }
bool isSpace(char c) { return std::strchr(" \t\r\n\f", c) != nullptr || c == '\0'; }

// The byte range of the name that follows /CS or /ColorSpace in an inline image's dictionary.
bool inlineColourSpaceName(const std::string& bytes, size_t begin, size_t end, size_t& nameBegin, size_t& nameEnd) {
    bool next = false;
    for (size_t i = begin; i < end;) {
        if (isSpace(bytes[i])) {
            ++i;
            continue;
        }
        size_t j = i + 1;
        while (j < end && !isSpace(bytes[j]) && !isDelimiter(bytes[j])) ++j;
        const std::string token = bytes.substr(i, j - i);
        if (next) {
            if (token.size() < 2 || token[0] != '/') return false;
            nameBegin = i;
            nameEnd = j;
            return true;
        }
        if (token == "ID") return false;
        next = token == "/CS" || token == "/ColorSpace";
        i = j;
    }
    return false;
}

bool isProcessLike(const ColourSpaceRef& space) {
    if (!space) return true;
    switch (space->family) {
        case ColourFamily::Separation:
        case ColourFamily::DeviceN:
        case ColourFamily::Pattern:
            return false;
        case ColourFamily::Indexed:
            return isProcessLike(space->base);
        default:
            return true;
    }
}

bool hasColorants(const ColourSpaceRef& space) {
    if (!space) return false;
    if (space->family == ColourFamily::Separation || space->family == ColourFamily::DeviceN) return true;
    return (space->family == ColourFamily::Indexed || space->family == ColourFamily::Pattern) && hasColorants(space->base);
}

std::shared_ptr<Content> parseForRewriting(QPDFObjectHandle page, ColourSpaceResolver::SharedCache* cache,
                                           FormCache* forms) {
    return parsePageContent(page, cache, StateLeaves::ColourOnly, forms);
}

class SeparationRewriter {
public:
    // With recordChanges the rewriter keeps its changes to the document aside (see changes()), so
    // that other rewriters can work on the same document.
    SeparationRewriter(QPDF& pdf, const std::vector<std::string>& separations, bool keepListed,
                       bool recordChanges = false)
        : pdf_(pdf),
          listed_(separations.begin(), separations.end()),
          keep_(keepListed),
          edits_(recordChanges),
          variants_(pdf, compressor_, &edits_) {}

    // Parses the page of this document and rewrites it.
    bool rewritePage(QPDFObjectHandle page) {
        std::shared_ptr<Content> content = parseForRewriting(page, &cache_, &forms_);
        return rewritePage(page, *content);
    }

    // Rewrites a page from its content as parsed (the parse may be shared with other rewriters:
    // it is not changed).
    bool rewritePage(QPDFObjectHandle page, const Content& parsed) {
        if (!parsed.complete && parsed.bytes.empty()) return false;  // unreadable: left alone
        Content view;
        view.owner = page;
        view.resources = pageResources(page);
        view.bytes = parsed.bytes;
        ContentEditor editor(view, &edits_);
        if (keep_) editor.insertText(0, kKnockOutStart);
        rewrite(view, parsed.elements, editor);
        editor.apply(pdf_, compressor_);
        rewriteAnnotations(page, view.resources);
        return parsed.complete;
    }

    void finish() { variants_.finish(); }

    DocumentEdits& changes() { return edits_; }

private:
    static QPDFObjectHandle pageResources(QPDFObjectHandle page) {
        try {
            return QPDFPageObjectHelper(page).getAttribute("/Resources", false);
        } catch (const std::exception&) {
            return QPDFObjectHandle::newNull();
        }
    }

    bool affected(const std::string& colorant) const {
        if (colorant == "None") return false;
        const bool listed = listed_.count(colorant) > 0;
        return keep_ ? !listed && colorant != "All" : listed;
    }

    // ---- colour spaces -------------------------------------------------------------------------

    // The replacement of a space with affected colorants (an indirect object, one per distinct
    // original), or null when nothing in it changes. In keep-listed mode an uncoloured pattern
    // over a process space gets a base that paints nothing.
    QPDFObjectHandle replacement(const ColourSpaceRef& space) {
        if (!space) return QPDFObjectHandle::newNull();
        // Resolved spaces are shared document-wide; the map holds each one, so its address
        // stays its own while the document is rewritten.
        auto seen = bySpace_.find(space.get());
        if (seen != bySpace_.end()) return seen->second.second;
        QPDFObjectHandle made = replacementOf(space);
        bySpace_.emplace(space.get(), std::make_pair(space, made));
        return made;
    }

    QPDFObjectHandle replacementOf(const ColourSpaceRef& space) {
        QPDFObjectHandle original = space->object;
        if (!original.isInitialized() || original.isNull()) return QPDFObjectHandle::newNull();
        const std::string key = original.unparse();
        auto known = replacements_.find(key);
        if (known != replacements_.end()) return known->second;
        QPDFObjectHandle made = QPDFObjectHandle::newNull();
        if (hasColorants(space)) {
            QPDFObjectHandle rewritten = colorantsToNone(original, [this](const std::string& c) { return affected(c); });
            if (!rewritten.isSameObjectAs(original)) made = pdf_.makeIndirectObject(rewritten);
        } else if (keep_ && space->family == ColourFamily::Pattern && space->base && isProcessLike(space->base)) {
            made = pdf_.makeIndirectObject(QPDFObjectHandle::newArray(
                {QPDFObjectHandle::newName("/Pattern"), paintsNothing(space->base->components)}));
        }
        replacements_.emplace(key, made);
        return made;
    }

    // [/DeviceN [/None ...] /DeviceCMYK {pop ... 0 0 0 0}] with n components: paints nothing.
    QPDFObjectHandle paintsNothing(int components) {
        const int n = components > 0 ? components : 1;
        auto known = nothing_.find(n);
        if (known != nothing_.end()) return known->second;
        std::string names, domain, program = "{";
        for (int i = 0; i < n; ++i) {
            names += " /None";
            domain += " 0 1";
            program += " pop";
        }
        program += " 0 0 0 0 }";
        QPDFObjectHandle fn = QPDFObjectHandle::newStream(&pdf_, program);
        fn.getDict().replaceKey("/FunctionType", QPDFObjectHandle::newInteger(4));
        fn.getDict().replaceKey("/Domain", QPDFObjectHandle::parse("[" + domain + " ]"));
        fn.getDict().replaceKey("/Range", QPDFObjectHandle::parse("[0 1 0 1 0 1 0 1]"));
        QPDFObjectHandle space = pdf_.makeIndirectObject(QPDFObjectHandle::newArray(
            {QPDFObjectHandle::newName("/DeviceN"), QPDFObjectHandle::parse("[" + names + " ]"),
             QPDFObjectHandle::newName("/DeviceCMYK"), fn}));
        nothing_.emplace(n, space);
        return space;
    }

    // ---- content -------------------------------------------------------------------------------

    void rewrite(Content& content, const std::vector<ContentElement>& elements, ContentEditor& editor) {
        rewriteFonts(content.resources);
        for (auto e = elements.rbegin(); e != elements.rend(); ++e) {
            switch (e->kind) {
                case ElementKind::Group:
                case ElementKind::MarkedContent:
                case ElementKind::TextObject:
                    rewrite(content, e->children, editor);
                    break;
                case ElementKind::Form:
                    rewriteForm(*e, content, editor);
                    break;
                case ElementKind::State:
                    rewriteColourOperator(content, *e, editor);
                    break;
                case ElementKind::Image:
                    rewriteImage(*e, editor);
                    break;
                case ElementKind::InlineImage:
                    rewriteInlineImage(content, *e, editor);
                    break;
                case ElementKind::Shading:
                    if (shadingPaintsNothing(e->object)) editor.replace(e->begin, e->end, "");
                    break;
                default:
                    break;  // paths and text runs paint with colours set by the operators
            }
        }
    }

    void rewriteColourOperator(Content& content, const ContentElement& e, ContentEditor& editor) {
        const std::string& op = e.op;
        const bool stroke = !op.empty() && (op[0] == 'C' || op[0] == 'S' || op[0] == 'G' || op[0] == 'R' || op[0] == 'K');
        const ColourSpaceRef& space = stroke ? e.state.stroke : e.state.fill;
        if (op == "cs" || op == "CS") {
            if (keep_ && isProcessLike(space)) {
                editor.replace(e.begin, e.end, stroke ? "/DeviceCMYK CS 0 0 0 0 SC" : "/DeviceCMYK cs 0 0 0 0 sc");
                return;
            }
            QPDFObjectHandle rep = replacement(space);
            if (!rep.isNull()) editor.replace(e.begin, e.opBegin, editor.resourceName("/ColorSpace", rep, "CS") + " ");
        } else if (op == "sc" || op == "scn" || op == "SC" || op == "SCN") {
            if (keep_ && isProcessLike(space)) {
                editor.replace(e.begin, e.end, stroke ? "0 0 0 0 SC" : "0 0 0 0 sc");
                return;
            }
            const std::string& pattern = stroke ? e.state.strokePattern : e.state.fillPattern;
            if (space && space->family == ColourFamily::Pattern && !pattern.empty()) {
                QPDFObjectHandle resources = content.resources;
                QPDFObjectHandle patterns = resources.isDictionary() ? resources.getKey("/Pattern") : resources;
                if (patterns.isDictionary()) rewritePattern(patterns, pattern, content.resources);
            }
        } else if (keep_ && (op == "g" || op == "rg" || op == "k")) {
            editor.replace(e.begin, e.end, "0 0 0 0 k");
        } else if (keep_ && (op == "G" || op == "RG" || op == "K")) {
            editor.replace(e.begin, e.end, "0 0 0 0 K");
        }
    }

    void rewriteImage(const ContentElement& e, ContentEditor& editor) {
        QPDFObjectHandle image = e.object;
        if (e.imageMask || !image.isStream()) return;  // a stencil paints with the fill colour
        if (!hasColorants(e.ownSpace)) {
            if (keep_) editor.replace(e.begin, e.end, "");
            return;
        }
        if (!done_.insert(image.getObjGen()).second) return;
        QPDFObjectHandle rep = replacement(e.ownSpace);
        if (!rep.isNull()) edits_.setKey(image, "/ColorSpace", rep);
    }

    void rewriteInlineImage(Content& content, const ContentElement& e, ContentEditor& editor) {
        if (e.imageMask) return;
        if (!hasColorants(e.ownSpace)) {
            if (keep_) editor.replace(e.begin, e.end, "");
            return;
        }
        QPDFObjectHandle rep = replacement(e.ownSpace);
        size_t nameBegin = 0, nameEnd = 0;
        if (rep.isNull() || !inlineColourSpaceName(content.bytes, e.begin + 2, e.end, nameBegin, nameEnd)) return;
        editor.replace(nameBegin, nameEnd, editor.resourceName("/ColorSpace", rep, "CS"));
    }

    // Shadings have their own colour space, whatever the use: rewritten in place, once. True when
    // the shading would paint nothing (every colorant None, or a process space in keep-listed
    // mode): such shadings are taken out where they are used rather than painted in "None",
    // which renderers do not all leave unmarked at the shading's edges.
    bool shadingPaintsNothing(QPDFObjectHandle shading) {
        const bool indirect = shading.isIndirect();
        if (indirect) {
            auto known = shadings_.find(shading.getObjGen());
            if (known != shadings_.end()) return known->second;
        }
        bool nothing = false;
        QPDFObjectHandle dict = shading.isStream() ? shading.getDict() : shading;
        if (dict.isDictionary()) {
            ColourSpaceResolver resolver(QPDFObjectHandle::newNull(), &cache_);
            ColourSpaceRef space = resolver.byObject(dict.getKey("/ColorSpace"));
            if (hasColorants(space)) {
                nothing = true;
                for (const std::string& c : space->colorants) nothing = nothing && (c == "None" || affected(c));
                QPDFObjectHandle rep = nothing ? QPDFObjectHandle::newNull() : replacement(space);
                if (!rep.isNull()) edits_.setKey(dict, "/ColorSpace", rep);
            } else {
                nothing = keep_;
            }
        }
        if (indirect) shadings_.emplace(shading.getObjGen(), nothing);
        return nothing;
    }

    // A pattern that paints nothing: an empty coloured tiling.
    QPDFObjectHandle emptyPattern() {
        if (emptyPattern_.isNull()) {
            emptyPattern_ = pdf_.makeIndirectObject(QPDFObjectHandle::newStream(&pdf_, std::string()));
            emptyPattern_.getDict().replaceKey("/PatternType", QPDFObjectHandle::newInteger(1));
            emptyPattern_.getDict().replaceKey("/PaintType", QPDFObjectHandle::newInteger(1));
            emptyPattern_.getDict().replaceKey("/TilingType", QPDFObjectHandle::newInteger(1));
            emptyPattern_.getDict().replaceKey("/BBox", QPDFObjectHandle::parse("[0 0 1 1]"));
            emptyPattern_.getDict().replaceKey("/XStep", QPDFObjectHandle::newInteger(1));
            emptyPattern_.getDict().replaceKey("/YStep", QPDFObjectHandle::newInteger(1));
            emptyPattern_.getDict().replaceKey("/Resources", QPDFObjectHandle::newDictionary());
        }
        return emptyPattern_;
    }

    void rewritePattern(QPDFObjectHandle patterns, const std::string& name, QPDFObjectHandle parentResources) {
        QPDFObjectHandle pattern = patterns.getKey(name);
        if (pattern.isIndirect()) {
            // A pattern that paints nothing is replaced where it is listed, in every listing.
            if (emptied_.count(pattern.getObjGen())) edits_.setKey(patterns, name, emptyPattern());
            if (!done_.insert(pattern.getObjGen()).second) return;
        }
        QPDFObjectHandle dict = pattern.isStream() ? pattern.getDict() : pattern;
        if (!dict.isDictionary()) return;
        int type = 0, paint = 0;
        dict.getKey("/PatternType").getValueAsInt(type);
        dict.getKey("/PaintType").getValueAsInt(paint);
        if (type == 2) {
            if (!shadingPaintsNothing(dict.getKey("/Shading"))) return;
            if (pattern.isIndirect()) emptied_.insert(pattern.getObjGen());
            edits_.setKey(patterns, name, emptyPattern());
        } else if (type == 1 && paint == 1 && pattern.isStream()) {
            rewriteStreamInPlace(pattern, parentResources, keep_);
        }
    }

    // Content that starts from its own state wherever it is used (coloured tiling patterns,
    // Type 3 glyphs): edited in place.
    void rewriteStreamInPlace(QPDFObjectHandle stream, QPDFObjectHandle parentResources, bool knockOutStart) {
        std::shared_ptr<Content> content = parseFormContent(stream, parentResources, GraphicsState::initial(), &cache_, StateLeaves::ColourOnly);
        if (!content->complete && content->bytes.empty()) return;
        ContentEditor editor(*content, &edits_);
        if (knockOutStart) editor.insertText(0, kKnockOutStart);
        rewrite(*content, content->elements, editor);
        editor.apply(pdf_, compressor_);
    }

    // Type 3 glyphs may set their own colours (d0): their procedures are rewritten once per font.
    void rewriteFonts(QPDFObjectHandle resources) {
        // Resources and font dictionaries shared by many pages are looked through once.
        if (resources.isIndirect() && !done_.insert(resources.getObjGen()).second) return;
        QPDFObjectHandle fonts = resources.isDictionary() ? resources.getKey("/Font") : resources;
        if (!fonts.isDictionary()) return;
        if (fonts.isIndirect() && !done_.insert(fonts.getObjGen()).second) return;
        for (auto& [name, font] : fonts.ditems()) {
            if (!font.isDictionary() || !font.getKey("/Subtype").isNameAndEquals("/Type3")) continue;
            QPDFObjectHandle procs = font.getKey("/CharProcs");
            if (!procs.isDictionary()) continue;
            if (procs.isIndirect() && !done_.insert(procs.getObjGen()).second) continue;
            QPDFObjectHandle glyphResources = streamResources(QPDFObjectHandle::newNull(), resources);
            QPDFObjectHandle own = font.getKey("/Resources");
            if (own.isDictionary()) glyphResources = own;
            for (auto& [glyph, proc] : procs.ditems())
                if (proc.isStream() && done_.insert(proc.getObjGen()).second)
                    rewriteStreamInPlace(proc, glyphResources, false);
        }
    }

    void rewriteForm(const ContentElement& e, Content& parentView, ContentEditor& parent) {
        variants_.editUse(e, e.object, parentView.resources, parent,
                          [&](Content& view, const Content& parsed, ContentEditor& editor) {
                              rewrite(view, parsed.elements, editor);
                          });
    }

    // Appearance streams are drawn from the initial state, like a form used at the page's start.
    void rewriteAnnotations(QPDFObjectHandle page, QPDFObjectHandle pageResources) {
        QPDFObjectHandle annots = page.getKey("/Annots");
        if (!annots.isArray()) return;
        for (QPDFObjectHandle annot : annots.aitems()) {
            if (!annot.isDictionary()) continue;
            QPDFObjectHandle ap = annot.getKey("/AP");
            if (!ap.isDictionary()) continue;
            for (const char* key : {"/N", "/R", "/D"}) {
                QPDFObjectHandle entry = ap.getKey(key);
                if (entry.isStream()) {
                    QPDFObjectHandle target = rewriteAppearance(entry, pageResources);
                    if (!target.isSameObjectAs(entry)) edits_.setKey(ap, key, target);
                } else if (entry.isDictionary()) {
                    for (auto& [state, stream] : entry.ditems()) {
                        if (!stream.isStream()) continue;
                        QPDFObjectHandle target = rewriteAppearance(stream, pageResources);
                        if (!target.isSameObjectAs(stream)) edits_.setKey(entry, state, target);
                    }
                }
            }
        }
    }

    QPDFObjectHandle rewriteAppearance(QPDFObjectHandle stream, QPDFObjectHandle pageResources) {
        std::shared_ptr<Content> content = parseFormContent(stream, pageResources, GraphicsState::initial(), &cache_, StateLeaves::ColourOnly);
        if (!content->complete && content->bytes.empty()) return stream;
        ContentEditor editor(*content, &edits_);
        if (keep_) editor.insertText(0, kKnockOutStart);
        rewrite(*content, content->elements, editor);
        std::string bytes = editor.edited() ? editor.result() : content->bytes;
        return variants_.objectFor(stream, content->bytes, std::move(bytes));
    }

    QPDF& pdf_;
    std::set<std::string> listed_;
    bool keep_;
    DocumentEdits edits_;
    StreamCompressor compressor_;
    FormVariants variants_;
    ColourSpaceResolver::SharedCache cache_;
    FormCache forms_;                                   // parsed forms, shared between uses
    std::map<std::string, QPDFObjectHandle> replacements_;
    std::map<const ColourSpace*, std::pair<ColourSpaceRef, QPDFObjectHandle>> bySpace_;
    std::map<int, QPDFObjectHandle> nothing_;
    std::set<QPDFObjGen> done_;
    std::map<QPDFObjGen, bool> shadings_;
    std::set<QPDFObjGen> emptied_;
    QPDFObjectHandle emptyPattern_ = QPDFObjectHandle::newNull();
};

}  // namespace

bool rewriteDocumentSeparations(QPDF& pdf, const std::vector<std::string>& separations, bool keepListed) {
    SeparationRewriter rewriter(pdf, separations, keepListed);
    bool result = true;
    for (QPDFObjectHandle page : documentPages(pdf)) {
        try {
            if (!rewriter.rewritePage(page)) result = false;
        } catch (const std::exception&) {
            result = false;
        }
    }
    try {
        rewriter.finish();
    } catch (const std::exception&) {
        result = false;
    }
    return result;
}

int rewriteSeparations(ZippedJDFFileSystem* fs, const char* input, const char* output,
                       const std::vector<std::string>& separations, bool keepListed, PdfFailure* why) {
    if (why) *why = PdfFailure::None;
    if (fs) ensurePdfLibraryStarted(fs);
    if (!input || !*input) return refuse(PdfFailure::CannotOpen, input ? input : "", why);
    const std::filesystem::path target = output ? prepareOutputPath(output) : std::filesystem::path();
    if (target.empty()) return refuse(PdfFailure::CannotWrite, output ? output : "", why);
    PdfFailure failure = PdfFailure::None;
    std::unique_ptr<QPDF> pdf = openDocument(input, false, &failure);
    if (!pdf) return refuse(failure, input, why);
    if (!rewriteDocumentSeparations(*pdf, separations, keepListed)) return refuse(PdfFailure::Damaged, input, why);
    return saveDocument(*pdf, target) ? 0 : refuse(PdfFailure::CannotWrite, output, why);
}

std::vector<int> rewriteSeparationVariants(ZippedJDFFileSystem* fs, const char* input,
                                           const std::vector<SeparationVariant>& variants) {
    if (fs) ensurePdfLibraryStarted(fs);
    std::vector<int> results(variants.size(), 1);
    if (variants.empty()) return results;
    // Variants refused for the same reason share one line.
    std::set<std::string> reported;
    auto refuseVariant = [&](PdfFailure failure, const std::string& path) {
        if (reported.insert(failureMessage(failure, path)).second) reportFailure(failure, path);
    };
    if (!input || !*input) {
        refuseVariant(PdfFailure::CannotOpen, input ? input : "");
        return results;
    }
    PdfFailure failure = PdfFailure::None;
    std::unique_ptr<QPDF> pdf = openDocument(input, false, &failure);
    if (!pdf) {
        refuseVariant(failure, input);
        return results;
    }
    // Every page is read and parsed once; each variant's rewriter records its changes, which are
    // made for its save alone and taken back afterwards.
    struct Target {
        size_t index;
        std::filesystem::path path;
        std::unique_ptr<SeparationRewriter> rewriter;
        bool ok = true;
    };
    std::vector<Target> targets;
    for (size_t i = 0; i < variants.size(); ++i) {
        std::filesystem::path path = prepareOutputPath(variants[i].output);
        if (path.empty()) {
            refuseVariant(PdfFailure::CannotWrite, variants[i].output);
            continue;
        }
        targets.push_back({i, std::move(path),
                           std::make_unique<SeparationRewriter>(*pdf, variants[i].separations,
                                                                variants[i].keepListed, true)});
    }
    {
        ColourSpaceResolver::SharedCache cache;
        FormCache forms;
        for (QPDFObjectHandle page : documentPages(*pdf)) {
            std::shared_ptr<Content> parsed;
            try {
                parsed = parseForRewriting(page, &cache, &forms);
            } catch (const std::exception&) {
            }
            for (Target& t : targets) {
                try {
                    if (!parsed || !t.rewriter->rewritePage(page, *parsed)) t.ok = false;
                } catch (const std::exception&) {
                    t.ok = false;
                }
            }
        }
    }
    size_t next = 0;
    for (; next < targets.size(); ++next) {
        Target& t = targets[next];
        DocumentEdits& changes = t.rewriter->changes();
        try {
            t.rewriter->finish();
            if (!t.ok) {
                refuseVariant(PdfFailure::Damaged, input);
            } else {
                // The shared document is written as it is (qpdf cannot linearise one document
                // twice) and that file, opened afresh, is saved linearised. An encrypted input
                // gives an encrypted plain file, which opens with the same empty user password,
                // so the variant keeps the input's encryption.
                std::filesystem::path plain = t.path;
                plain += ".vorlan-plain-" + std::to_string(::getpid()) + ".tmp";
                changes.apply();
                const bool written = saveDocument(*pdf, plain, false);
                changes.undo();
                std::unique_ptr<QPDF> copy = written ? openDocument(plain.c_str(), false) : nullptr;
                if (copy && saveDocument(*copy, t.path)) results[t.index] = 0;
                else refuseVariant(PdfFailure::CannotWrite, variants[t.index].output);
                copy.reset();
                std::error_code ec;
                std::filesystem::remove(plain, ec);
            }
        } catch (const std::exception&) {
            // A variant whose changes could not be made or taken back leaves the document in an
            // unknown state: the variants after it are not written.
            results[t.index] = 1;
            break;
        }
        t.rewriter.reset();
    }
    for (; next < targets.size(); ++next) refuseVariant(PdfFailure::CannotWrite, variants[targets[next].index].output);
    return results;
}

int rewriteSeparations(ZippedJDFFileSystem* fs, const char* input, const char* output, const char* const* separations,
                       int count, bool keepListed) {
    std::vector<std::string> list;
    for (int i = 0; i < count; ++i)
        if (separations && separations[i]) list.emplace_back(separations[i]);
    return rewriteSeparations(fs, input, output, list, keepListed);
}

}  // namespace vorlan::pdf
