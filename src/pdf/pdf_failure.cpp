#include "pdf/pdf_failure.h"

#include <cstdio>

namespace vorlan::pdf {

const char* failureName(PdfFailure failure) {
    switch (failure) {
        case PdfFailure::None: return "";
        case PdfFailure::CannotOpen: return "cannot-open";
        case PdfFailure::PasswordProtected: return "password-protected";
        case PdfFailure::Damaged: return "damaged";
        case PdfFailure::DamagedBeyondRepair: return "damaged-beyond-repair";
        case PdfFailure::CannotWrite: return "cannot-write";
        case PdfFailure::NameTooLong: return "name-too-long";
    }
    return "";
}

std::string failureMessage(PdfFailure failure, const std::string& path) {
    switch (failure) {
        case PdfFailure::None: return {};
        case PdfFailure::CannotOpen: return "Unable to open " + path + ": the file cannot be read";
        case PdfFailure::PasswordProtected: return "Unable to open " + path + ": the file is password-protected";
        case PdfFailure::Damaged: return "Unable to read " + path + ": the file is damaged";
        case PdfFailure::DamagedBeyondRepair: return "Unable to read " + path + ": the file is damaged beyond repair";
        case PdfFailure::CannotWrite: return "Unable to write " + path + ": the output cannot be created";
        case PdfFailure::NameTooLong:
            return "Unable to convert " + path + ": a separation or layer name is missing or too long";
    }
    return {};
}

void reportFailure(PdfFailure failure, const std::string& path) {
    if (failure == PdfFailure::None) return;
    std::fprintf(stderr, "%s\n", failureMessage(failure, path).c_str());
}

int refuse(PdfFailure failure, const std::string& path, PdfFailure* why) {
    reportFailure(failure, path);
    if (why) *why = failure;
    return 1;
}

}  // namespace vorlan::pdf
