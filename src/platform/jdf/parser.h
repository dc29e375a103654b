// JDFParser: reads a JDF (or any XML) file into a document.
#pragma once

#include <functional>
#include <string>

#include "platform/jdf/jdf_doc.h"

namespace JDF {

class ErrorHandler;  // accepted for call compatibility; no handler is ever called

class JDFParser {
public:
    JDFParser() = default;

    // Parses a file (path as text, UTF-8 on this platform). Returns false, and keeps no
    // document, when the file cannot be read or is not well-formed XML; never throws.
    // bEraseEmpty drops white-space-only text (true) or keeps it (false). bValidate, the error
    // handler, the schema location and the two trailing integers are accepted and not used:
    // this layer does not validate while parsing. Comments, processing instructions and the
    // XML declaration are kept, so a written document keeps them.
    bool Parse(const WString& inFile, bool bValidate = false, bool bEraseEmpty = true, bool bDoNamespaces = true,
               ErrorHandler* pErrorHandler = nullptr, const WString& schemaLocation = WString(),
               int reserved1 = 0, int reserved2 = 0);
    // The same for a document held in memory.
    bool ParseString(const std::string& xml, bool bEraseEmpty = true);

    // The parsed document (null before a successful Parse).
    XMLDoc GetDocument() const { return doc_; }
    KElement GetRoot() const { return doc_.GetRoot(); }
    // Text of the last parse error ("" after success).
    const std::string& GetError() const { return error_; }

private:
    bool adopt(const std::function<pugi::xml_parse_result(pugi::xml_document&)>& load);

    XMLDoc doc_;
    std::string error_;
};

}  // namespace JDF
