// Read-only questions put to a PDF file: page count, size of the first page, page inks.
#pragma once

#include <string>
#include <vector>

struct ZippedJDFFileSystem;
class QPDF;

// Number of pages of the PDF at path (repair allowed); 0 when it cannot be opened, after writing
// "Unable to open <path>" to standard error. Starts the PDF session through fs's flag.
int getPDFPageCount(ZippedJDFFileSystem* fs, const char* path);

// Height and width in points of the first page as it is shown: crop box (then media box, then
// trim box when a box is empty) turned by /Rotate, each rounded down to four decimals. The
// out-parameters are written only when the first page could be read.
void getFirstPageSize(ZippedJDFFileSystem* fs, const char* path, double* height, double* width);

// Appends every ink of every page, page by page, except the four process inks ("Cyan",
// "Magenta", "Yellow", "Black"); an ink used on several pages is appended once per page.
// A file that cannot be opened appends nothing and writes "Unable to open <path>".
void scanPDFPageInks(const char* path, std::vector<std::string>& inks);

namespace vorlan::pdf {
// The page-ink scan of an open document (used by the scan above and by the benchmark).
void documentPageInks(QPDF& pdf, std::vector<std::string>& inks);
}  // namespace vorlan::pdf
