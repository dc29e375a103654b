// Writing a document with deferred children: a filter between pugixml's serialiser and the
// output that replaces each marker line by the batches its maker makes.
#include "platform/jdf/deferred_output.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <string_view>

#include "platform/jdf/exception.h"

namespace JDF::detail {
namespace {

const char* const kIndent = "\t";
constexpr std::string_view kMarkerOpen = "<!--vorlan-deferred:";
constexpr std::string_view kMarkerClose = "-->";

// The namespace declarations in scope at an element, outermost first, so inner ones win when
// copied in order.
void copyNamespaceDeclarations(pugi::xml_node from, pugi::xml_node to) {
    if (!from) return;
    copyNamespaceDeclarations(from.parent(), to);
    for (pugi::xml_attribute a : from.attributes()) {
        if (std::strncmp(a.name(), "xmlns", 5) != 0 || (a.name()[5] != '\0' && a.name()[5] != ':')) continue;
        pugi::xml_attribute existing = to.attribute(a.name());
        if (!existing) existing = to.append_attribute(a.name());
        existing.set_value(a.value());
    }
}

struct TextWriter : pugi::xml_writer {
    std::string text;
    void write(const void* data, size_t size) override { text.append(static_cast<const char*>(data), size); }
};

class DeferredChildrenWriter : public pugi::xml_writer {
public:
    DeferredChildrenWriter(const DocumentState& state, pugi::xml_writer& out, unsigned flags)
        : state_(state), out_(out), flags_(flags) {}

    void write(const void* data, size_t size) override {
        pending_.append(static_cast<const char*>(data), size);
        drain(false);
    }
    void finish() { drain(true); }

private:
    void emit(size_t count) {
        if (count == 0) return;
        out_.write(pending_.data(), count);
        pending_.erase(0, count);
    }

    // Writes everything that cannot be part of a marker; each complete marker, with the tabs
    // before it and the line break after it, becomes its batches.
    void drain(bool atEnd) {
        const bool indented = (flags_ & pugi::format_indent) != 0 && (flags_ & pugi::format_raw) == 0;
        for (;;) {
            const size_t at = pending_.find(kMarkerOpen);
            if (at == std::string::npos) break;
            size_t lineStart = at;
            while (lineStart > 0 && pending_[lineStart - 1] == '\t') --lineStart;
            const size_t close = pending_.find(kMarkerClose, at + kMarkerOpen.size());
            // The marker, and the line break after it, must be whole before it is replaced.
            if (close == std::string::npos || (indented && close + kMarkerClose.size() == pending_.size() && !atEnd)) {
                emit(lineStart);
                return;
            }
            const std::string number(pending_, at + kMarkerOpen.size(), close - at - kMarkerOpen.size());
            size_t end = close + kMarkerClose.size();
            if (indented && end < pending_.size() && pending_[end] == '\n') ++end;
            const unsigned depth = static_cast<unsigned>(at - lineStart);
            emit(lineStart);
            pending_.erase(0, end - lineStart);
            writeBatches(number, depth);
        }
        if (atEnd) {
            emit(pending_.size());
            return;
        }
        // Hold back what may begin a marker: its first characters, and the tabs before them.
        size_t keep = pending_.size() - std::min(pending_.size(), kMarkerOpen.size() - 1);
        while (keep > 0 && pending_[keep - 1] == '\t') --keep;
        emit(keep);
    }

    void writeBatches(const std::string& number, unsigned depth) {
        char* end = nullptr;
        const unsigned long index = std::strtoul(number.c_str(), &end, 10);
        if (number.empty() || *end != '\0' || index >= state_.deferred.size())
            throw JDFException("save: a deferred-children marker names no deferred children");
        const DeferredChildren& deferred = state_.deferred[index];
        // One scratch document for every batch, emptied after each: its memory is reused.
        auto scratch = std::make_shared<DocumentState>();
        pugi::xml_node root = scratch->doc.append_child("Scratch");
        copyNamespaceDeclarations(deferred.parent.parent(), root);
        pugi::xml_node parent = root.append_child(deferred.parent.name());
        for (bool more = true; more;) {
            parent.remove_attributes();
            parent.remove_children();
            for (pugi::xml_attribute a : deferred.parent.attributes())
                parent.append_attribute(a.name()).set_value(a.value());
            more = deferred.makeBatch(parent, scratch);
            // pugixml flushes every printed node: collected first, a batch reaches the output in one write.
            TextWriter text;
            for (pugi::xml_node child : parent.children())
                child.print(text, kIndent, flags_, pugi::encoding_utf8, depth);
            out_.write(text.text.data(), text.text.size());
        }
    }

    const DocumentState& state_;
    pugi::xml_writer& out_;
    unsigned flags_;
    std::string pending_;
};

}  // namespace

std::string deferredMarkerText(size_t index) {
    // The comment's text: the marker without its "<!--" and "-->".
    return std::string(kMarkerOpen.substr(4)) + std::to_string(index);
}

void saveDocument(const DocumentState& state, pugi::xml_writer& out, unsigned flags) {
    if (state.deferred.empty()) {
        state.doc.save(out, kIndent, flags, pugi::encoding_utf8);
        return;
    }
    DeferredChildrenWriter writer(state, out, flags);
    state.doc.save(writer, kIndent, flags, pugi::encoding_utf8);
    writer.finish();
}

}  // namespace JDF::detail
