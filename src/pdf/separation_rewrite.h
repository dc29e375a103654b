// Separation rewriting for spot mode: variants of a PDF in which chosen separations print
// nothing (drop-listed) or only the chosen ones print (keep-listed).
//
// Colorants are replaced by the colorant "None", which makes no marks: in Separation and DeviceN
// colour spaces (NChannel /Colorants included), through Indexed bases and the underlying spaces
// of uncoloured patterns, in images, shadings and shading patterns, and in the content of forms,
// coloured tiling patterns, Type 3 glyphs and annotation appearances. In keep-listed mode process
// colours are also knocked out: colour operators in process spaces paint CMYK 0 0 0 0, images in
// process spaces are removed, and shadings in process spaces are given a colour space of "None"
// colorants, so that they paint nothing.
#pragma once

#include <string>
#include <vector>

#include "pdf_failure.h"

class QPDF;
struct ZippedJDFFileSystem;

namespace vorlan::pdf {

// Rewrites every page of an open document. A colorant is listed when it equals an entry exactly.
// keep-listed: every colorant that is not listed and not "All" becomes "None"; drop-listed: every
// listed colorant becomes "None". False when a page could not be read to its end (the pages are
// still rewritten as far as they were read). Never throws.
bool rewriteDocumentSeparations(QPDF& pdf, const std::vector<std::string>& separations, bool keepListed);

// Opens `input` (no repair; an encrypted file opens with the empty user password), rewrites it
// and saves it linearised, with the input's encryption, to `output` (created with its folders;
// replaced only when the new file is complete). 0 when the document was rewritten and saved, 1
// otherwise; a refusal writes one line naming the file and the reason to standard error
// (reportFailure) and sets *why when given: the input's PdfFailure of openDocument, Damaged when
// a page's content cannot be read to its end, CannotWrite for the output. Starts the PDF session
// through the file context's flag (may be null).
int rewriteSeparations(ZippedJDFFileSystem* fs, const char* input, const char* output,
                       const std::vector<std::string>& separations, bool keepListed, PdfFailure* why = nullptr);
int rewriteSeparations(ZippedJDFFileSystem* fs, const char* input, const char* output, const char* const* separations,
                       int count, bool keepListed);

// One variant of a document: where it goes, which colorants are listed and how.
struct SeparationVariant {
    std::string output;
    std::vector<std::string> separations;
    bool keepListed = false;
};

// Writes every variant of `input`, each as rewriteSeparations would (0 written, 1 not, the reason
// reported on standard error, each distinct line once), and returns one result per variant in
// order. A variant that fails leaves nothing at its output path (a file already there stays as
// it was).
std::vector<int> rewriteSeparationVariants(ZippedJDFFileSystem* fs, const char* input,
                                           const std::vector<SeparationVariant>& variants);

}  // namespace vorlan::pdf
