// Opening PDF files with qpdf.
#pragma once

#include <qpdf/QPDF.hh>

#include <memory>
#include <string>

#include "pdf/pdf_failure.h"

namespace vorlan::pdf {

// Opens a PDF for reading. With repair allowed qpdf rebuilds a damaged cross-reference table;
// without it the first structural error fails the open. Files encrypted with an empty user
// password open (whatever their permissions say); others do not. Warnings are kept quiet. Null
// when the file cannot be opened, and then *why (when given) says why: CannotOpen (missing,
// unreadable, or encrypted in a way qpdf does not support), PasswordProtected, Damaged (without
// repair) or DamagedBeyondRepair. Never throws.
std::unique_ptr<QPDF> openDocument(const char* path, bool allowRepair, PdfFailure* why = nullptr);

// The pages of a document, or empty when the page tree cannot be read. Never throws.
std::vector<QPDFObjectHandle> documentPages(QPDF& pdf);

// The decoded bytes of the catalog's /Metadata stream (the XMP packet), or empty. Never throws.
std::string documentXmp(QPDF& pdf);

}  // namespace vorlan::pdf
