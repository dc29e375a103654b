// Conversion of a PDF for layer-mode versions: page elements that paint with a separation to
// convert go into an optional-content group named after that separation, all other elements not
// already under optional content into the catch-all group "KVVersionSpecialOCGName".
#pragma once

#include <string>
#include <vector>

#include "pdf_failure.h"

class QPDF;
struct ZippedJDFFileSystem;

namespace vorlan::pdf {

inline constexpr const char* kSpecialOCGName = "KVVersionSpecialOCGName";
// Names must stay below this many bytes.
inline constexpr size_t kMaxConversionName = 1024;

// One separation to convert (name == layerName, isSeparation) or one plain layer of the PDF
// (layerName; name unused).
struct ConversionEntry {
    std::string name;
    std::string layerName;
    bool isSeparation = false;
};

// Sorts the content of every page of an open document into groups (see the file comment). When
// every entry is a separation, the default configuration's /Order is emptied first and content
// already under optional content is wrapped as well. False when a page could not be converted
// completely (its content could not be read to the end); the pages are still edited as far as
// they were read. Never throws.
bool convertDocumentSeparations(QPDF& pdf, const std::vector<ConversionEntry>& entries);

// Opens `input` (repairing a damaged cross-reference table; an encrypted file opens with the
// empty user password), converts it and saves it (linearised, with the input's encryption) to
// `output`. False when the input cannot be opened, the conversion reported a failure or the save
// failed; a document that opened is saved even when its conversion failed part way, and *saved
// (when given) tells whether the file was written. *why (when given) says why the input could
// not be opened (PdfFailure of openDocument) or the output not written (CannotWrite).
bool convertSeparationsToLayers(const char* input, const ConversionEntry* entries, int count, const char* output,
                                bool* saved = nullptr, PdfFailure* why = nullptr);

// Converts `input` into `output` with separations and plain layers. 0 when the converted file
// was written, 1 otherwise: a null or empty path, a name of kMaxConversionName bytes or more, an
// output path whose folder or file cannot be created, an input that cannot be opened, a failed
// save. Every refusal writes one line naming the file and the reason to standard error
// (reportFailure) and sets *why when given. Starts the PDF session through the
// file context's flag (the context may be null).
int convertPDF(ZippedJDFFileSystem* fs, const char* input, const char* output, const char* const* separations,
               const char* const* layers, int separationCount, int layerCount, PdfFailure* why = nullptr);

}  // namespace vorlan::pdf
