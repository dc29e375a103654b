// JDFParser on pugixml.
#include "platform/jdf/parser.h"

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

bool JDFParser::Parse(const WString& inFile, bool, bool bEraseEmpty, bool, ErrorHandler*, const WString&, int, int) {
    doc_ = XMLDoc();
    error_.clear();
    if (inFile.empty()) {
        error_ = "empty file name";
        return false;
    }
    try {
        auto state = std::make_shared<detail::DocumentState>();
        pugi::xml_parse_result res = state->doc.load_file(inFile.getUTF8().c_str(), parseOptions(bEraseEmpty));
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

bool JDFParser::ParseString(const std::string& xml, bool bEraseEmpty) {
    doc_ = XMLDoc();
    error_.clear();
    try {
        auto state = std::make_shared<detail::DocumentState>();
        pugi::xml_parse_result res = state->doc.load_buffer(xml.data(), xml.size(), parseOptions(bEraseEmpty));
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

}  // namespace JDF
