// Changes to the objects of one document, made at once or kept aside.
//
// Direct edits (the default) change the document as they are made. Recorded edits keep every
// change aside and answer reads through themselves, so that several variants can be prepared from
// one reading of a document: apply() makes the recorded changes, undo() takes them back in reverse
// order, and the document is as it was. Only changes made through one DocumentEdits are seen by
// its reads; everything else reads the document itself.
#pragma once

#include <qpdf/QPDFObjectHandle.hh>

#include <map>
#include <unordered_map>
#include <memory>
#include <string>
#include <vector>

namespace vorlan::pdf {

// Stream data as it is to be stored: the bytes and their filter (null: none).
struct StreamData {
    std::string bytes;
    QPDFObjectHandle filter = QPDFObjectHandle::newNull();
};

class DocumentEdits {
public:
    explicit DocumentEdits(bool recorded = false) : recorded_(recorded) {}
    DocumentEdits(const DocumentEdits&) = delete;
    DocumentEdits& operator=(const DocumentEdits&) = delete;

    // dict[key] = value (a stream's dictionary for a stream).
    void setKey(QPDFObjectHandle dict, const std::string& key, QPDFObjectHandle value);
    // dict[key] as these edits leave it; null when absent.
    QPDFObjectHandle key(QPDFObjectHandle dict, const std::string& key) const;
    // The entries of dict as these edits leave them, in key order.
    std::map<std::string, QPDFObjectHandle> items(QPDFObjectHandle dict) const;
    // Replaces a stream's data (and /Filter; /DecodeParms removed).
    void setStreamData(QPDFObjectHandle stream, StreamData data);

    // Recorded edits: makes the changes, in the order they were made; undo() takes back the last
    // apply(). Nothing happens for direct edits.
    void apply();
    void undo();

private:
    struct Change {
        QPDFObjectHandle target;  // the dictionary, or the stream for data
        std::string key;          // empty for stream data
        QPDFObjectHandle value;
        std::shared_ptr<StreamData> data;
        // What apply() replaced.
        QPDFObjectHandle oldValue;
        std::shared_ptr<Buffer> oldData;
        QPDFObjectHandle oldFilter, oldParms;
    };
    // The identity of a dictionary (what isSameObjectAs compares), for the index.
    static const void* identity(QPDFObjectHandle& dict) { return dict.getObjectPtr(); }

    bool recorded_;
    std::vector<Change> changes_;
    std::unordered_map<const void*, std::vector<size_t>> byTarget_;  // key changes per dictionary
};

}  // namespace vorlan::pdf
