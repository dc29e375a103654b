// Opening PDF files with qpdf.
#pragma once

#include <qpdf/QPDF.hh>

#include <memory>
#include <string>

namespace vorlan::pdf {

// Opens a PDF for reading. With repair allowed qpdf rebuilds a damaged cross-reference table;
// without it the first structural error fails the open. Files encrypted with an empty user
// password open; others do not. Warnings are kept quiet. Null when the file cannot be opened;
// never throws.
std::unique_ptr<QPDF> openDocument(const char* path, bool allowRepair);

// The pages of a document, or empty when the page tree cannot be read. Never throws.
std::vector<QPDFObjectHandle> documentPages(QPDF& pdf);

// The decoded bytes of the catalog's /Metadata stream (the XMP packet), or empty. Never throws.
std::string documentXmp(QPDF& pdf);

}  // namespace vorlan::pdf
