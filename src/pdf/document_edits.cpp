#include "pdf/document_edits.h"

#include <qpdf/Buffer.hh>

namespace vorlan::pdf {
namespace {

QPDFObjectHandle dictionaryOf(QPDFObjectHandle object) { return object.isStream() ? object.getDict() : object; }

void storeData(QPDFObjectHandle stream, const StreamData& data) {
    stream.replaceStreamData(data.bytes, data.filter, QPDFObjectHandle::newNull());
}

}  // namespace

void DocumentEdits::setKey(QPDFObjectHandle dict, const std::string& key, QPDFObjectHandle value) {
    dict = dictionaryOf(dict);
    if (!recorded_) {
        dict.replaceKey(key, value);
        return;
    }
    byTarget_[identity(dict)].push_back(changes_.size());
    changes_.push_back(Change{dict, key, value, nullptr, {}, nullptr, {}, {}});
}

QPDFObjectHandle DocumentEdits::key(QPDFObjectHandle dict, const std::string& key) const {
    dict = dictionaryOf(dict);
    auto changed = byTarget_.find(identity(dict));
    if (changed != byTarget_.end())
        for (auto it = changed->second.rbegin(); it != changed->second.rend(); ++it)
            if (changes_[*it].key == key) return changes_[*it].value;  // the latest change
    return dict.isDictionary() ? dict.getKey(key) : QPDFObjectHandle::newNull();
}

std::map<std::string, QPDFObjectHandle> DocumentEdits::items(QPDFObjectHandle dict) const {
    dict = dictionaryOf(dict);
    std::map<std::string, QPDFObjectHandle> out;
    if (dict.isDictionary()) out = dict.getDictAsMap();
    auto changed = byTarget_.find(identity(dict));
    if (changed != byTarget_.end())
        for (size_t i : changed->second) out[changes_[i].key] = changes_[i].value;
    return out;
}

void DocumentEdits::setStreamData(QPDFObjectHandle stream, StreamData data) {
    if (!recorded_) {
        storeData(stream, data);
        return;
    }
    changes_.push_back(Change{stream, {}, {}, std::make_shared<StreamData>(std::move(data)), {}, nullptr, {}, {}});
}

void DocumentEdits::apply() {
    if (!recorded_) return;
    for (Change& change : changes_) {
        if (change.key.empty()) {
            QPDFObjectHandle dict = change.target.getDict();
            change.oldData = change.target.getRawStreamData();
            change.oldFilter = dict.getKey("/Filter");
            change.oldParms = dict.getKey("/DecodeParms");
            storeData(change.target, *change.data);
        } else {
            change.oldValue = change.target.hasKey(change.key) ? change.target.getKey(change.key)
                                                               : QPDFObjectHandle();
            change.target.replaceKey(change.key, change.value);
        }
    }
}

void DocumentEdits::undo() {
    if (!recorded_) return;
    for (auto it = changes_.rbegin(); it != changes_.rend(); ++it) {
        if (it->key.empty()) {
            if (it->oldData) it->target.replaceStreamData(it->oldData, it->oldFilter, it->oldParms);
        } else if (it->oldValue.isInitialized()) {
            it->target.replaceKey(it->key, it->oldValue);
        } else {
            it->target.removeKey(it->key);
        }
    }
}

}  // namespace vorlan::pdf
