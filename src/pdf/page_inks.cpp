// Page ink scan on the content walker.
#include "pdf/page_inks.h"

#include <algorithm>
#include <exception>
#include <set>
#include <tuple>
#include <unordered_set>

#include <qpdf/QPDFPageObjectHelper.hh>

#include "pdf/content_walker.h"

namespace vorlan::pdf {
namespace {

// Forms and patterns may nest; a reference loop must end somewhere.
constexpr int kMaxNesting = 32;

// Gathers inks into one list shared by the page and everything it draws.
struct InkList {
    std::vector<std::string> inks;
    std::unordered_set<const ColourSpace*> seen;  // spaces already added
    std::vector<ColourSpaceRef> keep;             // keeps seen spaces alive (no address reuse)
    std::set<QPDFObjGen> openStreams;             // forms/patterns being walked (loop guard)
    // Streams already walked on this page with a given inherited colour state: walking them
    // again cannot add an ink (a form used many times is read once per state).
    std::set<std::tuple<QPDFObjGen, const ColourSpace*, const ColourSpace*, std::string, std::string>> walked;

    void add(const ColourSpaceRef& cs) {
        if (!cs || !seen.insert(cs.get()).second) return;
        keep.push_back(cs);
        for (const std::string& ink : cs->inks)
            if (std::find(inks.begin(), inks.end(), ink) == inks.end()) inks.push_back(ink);
    }
};

class InkWalker : public ContentWalker {
public:
    InkWalker(QPDFObjectHandle resources, ColourSpaceResolver::SharedCache* cache, InkList& list,
              int depth, GraphicsState start = GraphicsState::initial())
        : ContentWalker(resources, cache, std::move(start)), cache_(cache), list_(list), depth_(depth) {}

protected:
    void handleStep(const Step& step) override {
        switch (step.kind) {
            case StepKind::PathPaint:
            case StepKind::TextShow:
            case StepKind::Image:
            case StepKind::InlineImage:
                if (step.fills) paintWith(state().fill, state().fillPattern);
                if (step.strokes) paintWith(state().stroke, state().strokePattern);
                list_.add(step.ownSpace);
                break;
            case StepKind::Shading:
                list_.add(step.ownSpace);
                break;
            case StepKind::Form:
                walkNested(step.object, state());
                break;
            default:
                break;
        }
    }

private:
    void paintWith(const ColourSpaceRef& cs, const std::string& patternName) {
        if (!cs) return;
        if (cs->family != ColourFamily::Pattern) {
            list_.add(cs);
            return;
        }
        if (cs->base) list_.add(cs->base);  // uncoloured tiling pattern: painted in the base space
        if (patternName.empty() || !resources().isDictionary()) return;
        QPDFObjectHandle patterns = resources().getKey("/Pattern");
        QPDFObjectHandle pattern = patterns.isDictionary() ? patterns.getKey(patternName)
                                                           : QPDFObjectHandle::newNull();
        QPDFObjectHandle dict = pattern.isStream() ? pattern.getDict() : pattern;
        if (!dict.isDictionary()) return;
        int type = 0, paintType = 0;
        dict.getKey("/PatternType").getValueAsInt(type);
        if (type == 2) {
            QPDFObjectHandle shading = dict.getKey("/Shading");
            QPDFObjectHandle sdict = shading.isStream() ? shading.getDict() : shading;
            if (sdict.isDictionary()) list_.add(colourSpaces().byObject(sdict.getKey("/ColorSpace")));
        } else if (type == 1 && pattern.isStream()) {
            dict.getKey("/PaintType").getValueAsInt(paintType);
            if (paintType == 1) walkNested(pattern, GraphicsState::initial());
        }
    }

    void walkNested(QPDFObjectHandle stream, const GraphicsState& start) {
        if (!stream.isStream() || depth_ >= kMaxNesting) return;
        const QPDFObjGen id = stream.getObjGen();
        // Only streams with their own resources: others resolve names against the user's.
        const bool ownResources = stream.getDict().getKey("/Resources").isDictionary();
        if (ownResources) {
            if (!list_.walked.emplace(id, start.fill.get(), start.stroke.get(), start.fillPattern,
                                      start.strokePattern).second)
                return;
            list_.keep.push_back(start.fill);  // the key's addresses stay taken
            list_.keep.push_back(start.stroke);
        }
        if (!list_.openStreams.insert(id).second) return;
        InkWalker nested(streamResources(stream, resources()), cache_, list_, depth_ + 1, start);
        nested.walkStream(stream);
        list_.openStreams.erase(id);
    }

    ColourSpaceResolver::SharedCache* cache_;
    InkList& list_;
    int depth_;
};

// Appearance streams of the annotations that print: /AP /N (a stream, or the state named by /AS).
void addAnnotationInks(QPDFObjectHandle page, ColourSpaceResolver::SharedCache* cache, InkList& list) {
    QPDFObjectHandle annots = page.getKey("/Annots");
    if (!annots.isArray()) return;
    for (QPDFObjectHandle annot : annots.aitems()) {
        if (!annot.isDictionary()) continue;
        int flags = 0;
        annot.getKey("/F").getValueAsInt(flags);
        if ((flags & 2) || !(flags & 4)) continue;  // hidden, or not printed
        QPDFObjectHandle ap = annot.getKey("/AP");
        QPDFObjectHandle normal = ap.isDictionary() ? ap.getKey("/N") : QPDFObjectHandle::newNull();
        if (normal.isDictionary() && !normal.isStream()) {
            QPDFObjectHandle state = annot.getKey("/AS");
            normal = state.isName() ? normal.getKey(state.getName()) : QPDFObjectHandle::newNull();
        }
        if (!normal.isStream()) continue;
        InkWalker walker(streamResources(normal, QPDFObjectHandle::newNull()), cache, list, 1);
        walker.walkStream(normal);
    }
}

}  // namespace

std::vector<std::string> pageInks(QPDFObjectHandle page, ColourSpaceResolver::SharedCache* cache) {
    InkList list;
    try {
        // Resources may be inherited from an ancestor in the page tree.
        QPDFObjectHandle resources = QPDFPageObjectHelper(page).getAttribute("/Resources", false);
        InkWalker walker(resources, cache, list, 0);
        walker.walkPage(page);
        addAnnotationInks(page, cache, list);
    } catch (const std::exception&) {
        // keep what was found before the damage
    }
    return list.inks;
}

}  // namespace vorlan::pdf
