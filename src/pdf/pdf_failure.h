// Why a PDF operation was refused, and the one line that tells the operator.
#pragma once

#include <string>

namespace vorlan::pdf {

enum class PdfFailure {
    None,
    CannotOpen,           // the file is missing or cannot be read
    PasswordProtected,    // opening needs a password other than the empty one
    Damaged,              // not readable as a PDF (opened without repair), or a page's content is unreadable
    DamagedBeyondRepair,  // not readable as a PDF even with repair
    CannotWrite,          // the output (or its folder) cannot be created or written
    NameTooLong,          // a separation or layer name to convert is missing or too long
};

// A short stable token for machine-readable output ("cannot-open", "password-protected",
// "damaged", "damaged-beyond-repair", "cannot-write", "name-too-long"); empty for None.
const char* failureName(PdfFailure failure);

// The operator's line for a failure concerning `path`, without the line end, e.g.
// "Unable to open in.pdf: the file is password-protected". Empty for None.
std::string failureMessage(PdfFailure failure, const std::string& path);

// Writes failureMessage and a line end to standard error; nothing for None.
void reportFailure(PdfFailure failure, const std::string& path);

// For the PDF operations' refusals: reports the failure, stores it in *why when given, and
// returns 1 (the operations' failed result).
int refuse(PdfFailure failure, const std::string& path, PdfFailure* why);

}  // namespace vorlan::pdf
