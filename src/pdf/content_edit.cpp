// Byte-slice editing of parsed content.
#include "pdf/content_edit.h"

#include <qpdf/QPDFPageObjectHelper.hh>

#include <algorithm>
#include <cstring>

namespace vorlan::pdf {
namespace {

constexpr int kMaxColourSpaceDepth = 8;

bool runHasBarrier(const ContentElement* first, const ContentElement* last) {
    for (const ContentElement* e = first; e <= last; ++e)
        if (e->kind == ElementKind::Barrier) return true;
    return false;
}

// The sibling list holding both elements, or null.
const std::vector<ContentElement>* siblingsOf(const std::vector<ContentElement>& list,
                                              const ContentElement* first, const ContentElement* last) {
    if (!list.empty() && first >= list.data() && last < list.data() + list.size()) return &list;
    for (const ContentElement& e : list) {
        if (const auto* found = siblingsOf(e.children, first, last)) return found;
    }
    return nullptr;
}

void markImagesOptional(DocumentEdits& edits, const ContentElement& e, QPDFObjectHandle ocg) {
    QPDFObjectHandle image = e.object;  // a handle copy: qpdf's accessors are not const
    if (e.kind == ElementKind::Image && image.isStream()) edits.setKey(image, "/OC", ocg);
    for (const ContentElement& c : e.children) markImagesOptional(edits, c, ocg);
}

QPDFObjectHandle renamed(QPDFObjectHandle name, const std::function<bool(const std::string&)>& affected,
                         bool& changed) {
    if (name.isName() && name.getName().size() > 1 && affected(name.getName().substr(1))) {
        changed = true;
        return QPDFObjectHandle::newName("/None");
    }
    return name;
}

QPDFObjectHandle rewriteSpace(QPDFObjectHandle cs, const std::function<bool(const std::string&)>& affected,
                              int depth) {
    if (depth > kMaxColourSpaceDepth || !cs.isArray() || cs.getArrayNItems() < 2) return cs;
    std::vector<QPDFObjectHandle> items = cs.getArrayAsVector();
    const std::string family = items[0].isName() ? items[0].getName() : "";
    bool changed = false;
    if (family == "/Separation") {
        items[1] = renamed(items[1], affected, changed);
    } else if (family == "/DeviceN") {
        if (items[1].isArray()) {
            std::vector<QPDFObjectHandle> names = items[1].getArrayAsVector();
            for (auto& n : names) n = renamed(n, affected, changed);
            if (changed) items[1] = QPDFObjectHandle::newArray(names);
        }
        if (items.size() >= 5 && items[4].isDictionary()) {
            QPDFObjectHandle colorants = items[4].getKey("/Colorants");
            if (colorants.isDictionary()) {
                QPDFObjectHandle newColorants = QPDFObjectHandle::newDictionary();
                bool colorantsChanged = false;
                for (const std::string& key : colorants.getKeys()) {
                    QPDFObjectHandle space = colorants.getKey(key);
                    if (key.size() > 1 && affected(key.substr(1))) {
                        newColorants.replaceKey("/None", rewriteSpace(space, affected, depth + 1));
                        colorantsChanged = true;
                    } else {
                        newColorants.replaceKey(key, space);
                    }
                }
                if (colorantsChanged) {
                    QPDFObjectHandle attributes = items[4].shallowCopy();
                    attributes.replaceKey("/Colorants", newColorants);
                    items[4] = attributes;
                    changed = true;
                }
            }
        }
    } else if (family == "/Indexed" || family == "/I" || family == "/Pattern") {
        QPDFObjectHandle base = rewriteSpace(items[1], affected, depth + 1);
        if (!base.isSameObjectAs(items[1])) {
            items[1] = base;
            changed = true;
        }
    }
    return changed ? QPDFObjectHandle::newArray(items) : cs;
}

}  // namespace

std::string nameToken(const std::string& name) {
    static const char* hex = "0123456789ABCDEF";
    std::string token = "/";
    for (size_t i = name.empty() || name[0] != '/' ? 0 : 1; i < name.size(); ++i) {
        const unsigned char c = static_cast<unsigned char>(name[i]);
        if (c < 0x21 || c > 0x7e || std::strchr("#()<>[]{}/%", c)) {
            token += '#';
            token += hex[c >> 4];
            token += hex[c & 15];
        } else {
            token += static_cast<char>(c);
        }
    }
    return token;
}

QPDFObjectHandle colorantsToNone(QPDFObjectHandle colourSpace,
                                 const std::function<bool(const std::string&)>& affected) {
    return rewriteSpace(colourSpace, affected, 0);
}

void ContentEditor::replace(size_t begin, size_t end, std::string text) {
    changes_.push_back({begin, end, std::move(text), 2, static_cast<int>(changes_.size())});
}

void ContentEditor::insert(size_t at, std::string text, bool closing) {
    changes_.push_back({at, at, std::move(text), closing ? 0 : 1, static_cast<int>(changes_.size())});
}

QPDFObjectHandle ContentEditor::ownResources() {
    QPDFObjectHandle owner = content_.owner;
    QPDFObjectHandle resources = edits_.key(owner, "/Resources");
    if (!resources.isDictionary()) {
        // A form gets a dictionary of its own: a copy of what it used; a page gets a copy of
        // the resources it inherits, before they change.
        QPDFObjectHandle used = content_.resources;
        if (!owner.isStream()) {
            try {
                used = QPDFPageObjectHelper(owner).getAttribute("/Resources", false);
            } catch (const std::exception&) {
                used = QPDFObjectHandle::newNull();
            }
        }
        resources = used.isDictionary() ? used.shallowCopy() : QPDFObjectHandle::newDictionary();
        edits_.setKey(owner, "/Resources", resources);
    }
    content_.resources = resources;
    return resources;
}

std::string ContentEditor::resourceName(const char* category, QPDFObjectHandle object, const char* prefix) {
    auto key = std::make_pair(std::string(category), object.getObjGen());
    auto known = names_.find(key);
    if (known != names_.end()) return known->second;
    QPDFObjectHandle resources = ownResources();
    QPDFObjectHandle dict = edits_.key(resources, category);
    // A dictionary shared with other contents gains the key as well: adding a name changes no
    // other content's meaning, and keeping it shared keeps names resolved once per document.
    if (!dict.isDictionary()) {
        dict = QPDFObjectHandle::newDictionary();
        edits_.setKey(resources, category, dict);
    }
    const std::map<std::string, QPDFObjectHandle> listed = edits_.items(dict);
    std::string name;
    for (const auto& [itemKey, item] : listed)
        if (item.isSameObjectAs(object)) {
            name = itemKey;
            break;
        }
    const std::string stem = std::string("/") + prefix;
    for (int n = 1; name.empty(); ++n)
        if (!listed.count(stem + std::to_string(n))) name = stem + std::to_string(n);
    edits_.setKey(dict, name, object);
    std::string token = nameToken(name);
    names_[key] = token;
    return token;
}

bool ContentEditor::wrapInOptionalContent(const ContentElement& first, const ContentElement& last,
                                          QPDFObjectHandle ocg) {
    const auto* siblings = siblingsOf(content_.elements, &first, &last);
    if (!siblings || &first > &last || runHasBarrier(&first, &last)) return false;
    const std::string name = resourceName("/Properties", ocg, "oc");
    insert(first.begin, "/OC " + name + " BDC\n", false);
    insert(last.end, "\nEMC\n", true);
    for (const ContentElement* e = &first; e <= &last; ++e) markImagesOptional(edits_, *e, ocg);
    return true;
}

void ContentEditor::remove(const ContentElement& e) {
    switch (e.kind) {
        case ElementKind::Path:
            if (e.fills || e.strokes) replace(e.opBegin, e.opEnd, "n");
            break;
        case ElementKind::TextRun:
            if (e.fills || e.strokes) {
                insert(e.begin, "3 Tr ", false);
                std::string restore(" ");  // built in steps: g++ 12 warns falsely on "x" + to_string()
                restore += std::to_string(e.state.textRender);
                restore += " Tr";
                insert(e.end, std::move(restore), true);
            }
            break;
        case ElementKind::Image:
        case ElementKind::InlineImage:
        case ElementKind::Shading:
        case ElementKind::Form:
            replace(e.begin, e.end, "");
            break;
        default:
            for (const ContentElement& child : e.children) remove(child);
            break;
    }
}

std::string ContentEditor::result() const {
    std::vector<const Edit*> ordered;
    for (const Edit& e : changes_) ordered.push_back(&e);
    std::stable_sort(ordered.begin(), ordered.end(), [](const Edit* a, const Edit* b) {
        if (a->begin != b->begin) return a->begin < b->begin;
        if (a->rank != b->rank) return a->rank < b->rank;
        return a->order < b->order;
    });
    const std::string& src = content_.bytes;
    std::string out;
    out.reserve(src.size() + 64 * changes_.size());
    size_t at = 0;
    for (const Edit* e : ordered) {
        const size_t begin = std::min(e->begin, src.size());
        if (begin < at) continue;  // overlaps an earlier replacement: skipped
        out.append(src, at, begin - at);
        out += e->text;
        at = std::max(begin, std::min(e->end, src.size()));
    }
    out.append(src, at, std::string::npos);
    return out;
}

void ContentEditor::apply(QPDF& pdf, StreamCompressor& compressor) {
    if (changes_.empty()) return;
    std::string bytes = result();
    if (content_.owner.isStream()) {
        edits_.setStreamData(content_.owner, compressor.pack(bytes));
    } else {
        edits_.setKey(content_.owner, "/Contents", compressor.newStream(pdf, bytes));
    }
    content_.bytes = std::move(bytes);
    changes_.clear();
}

}  // namespace vorlan::pdf
