// Documents: XMLDoc (any XML document) and JDFDoc (a JDF document, new or parsed).
//
// A document is shared: copies of XMLDoc/JDFDoc and every element handle taken from it refer to
// the same tree, which lives as long as any of them.
#pragma once

#include "platform/jdf/jdf_node.h"

namespace JDF {

class XMLDoc {
public:
    XMLDoc() = default;
    explicit XMLDoc(detail::DocumentPtr doc) : doc_(std::move(doc)) {}

    bool isNull() const { return !doc_; }
    // The root element; null for an empty or null document.
    KElement GetRoot() const;
    // Writes the document (UTF-8, tab indentation — none for trees nested deeper than 100
    // levels, whose indentation would outgrow the content —, deterministic bytes) to a temporary
    // file in the target's folder and renames it over the target, so a failed or interrupted
    // write never leaves a partial file. Returns false (target untouched) on any failure.
    bool Write2File(const WString& fileName) const;
    // The document as text, in the bytes Write2File writes.
    std::string ToString() const;
    const detail::DocumentPtr& document() const { return doc_; }

protected:
    detail::DocumentPtr doc_;
};

class JDFDoc : public XMLDoc {
public:
    // A new JDF document: root JDF in the JDF 1.1 schema namespace, Version "1.3", ID and
    // JobPartID "n…", Status "Waiting", an AuditPool with one Created audit (TimeStamp from
    // SOURCE_DATE_EPOCH when set, else now), an empty ResourcePool and ResourceLinkPool.
    // The argument selects the kind of document; 0 (JDF) is the only kind supported.
    explicit JDFDoc(int type);
    JDFDoc() = default;
    JDFDoc(const XMLDoc& doc) : XMLDoc(doc) {}

    // The root JDF node; null when the root element is not JDF.
    JDFNode GetJDFRoot() const;
};

}  // namespace JDF
