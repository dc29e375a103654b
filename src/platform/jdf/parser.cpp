// JDFParser on pugixml.
#include "platform/jdf/parser.h"

#include <functional>
#include <new>

namespace JDF {
namespace {

unsigned parseOptions(bool bEraseEmpty) {
    unsigned opts = pugi::parse_default | pugi::parse_declaration | pugi::parse_comments | pugi::parse_pi |
                    pugi::parse_doctype;
    if (!bEraseEmpty) opts |= pugi::parse_ws_pcdata;
    return opts;
}

}  // namespace

// Loads a document with `load` (a pugixml load call on the given document) and keeps it when it
// has a root element; otherwise records why not.
bool JDFParser::adopt(const std::function<pugi::xml_parse_result(pugi::xml_document&)>& load) {
    doc_ = XMLDoc();
    error_.clear();
    try {
        auto state = std::make_shared<detail::DocumentState>();
        pugi::xml_parse_result res = load(state->doc);
        if (!res || !state->doc.document_element()) {
            error_ = res ? "no root element" : res.description();
            return false;
        }
        doc_ = XMLDoc(std::move(state));
        return true;
    } catch (const std::bad_alloc&) {
        error_ = "out of memory";
        return false;
    }
}

bool JDFParser::Parse(const WString& inFile, bool, bool bEraseEmpty, bool, ErrorHandler*, const WString&, int, int) {
    if (inFile.empty()) {
        doc_ = XMLDoc();
        error_ = "empty file name";
        return false;
    }
    const std::string path = inFile.getUTF8();
    return adopt([&](pugi::xml_document& doc) { return doc.load_file(path.c_str(), parseOptions(bEraseEmpty)); });
}

bool JDFParser::ParseString(const std::string& xml, bool bEraseEmpty) {
    return adopt(
        [&](pugi::xml_document& doc) { return doc.load_buffer(xml.data(), xml.size(), parseOptions(bEraseEmpty)); });
}

}  // namespace JDF
