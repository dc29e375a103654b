// The PDF session on qpdf.
#include "pdf/pdf_session.h"

#include <qpdf/QPDF.hh>

#include <cstdio>
#include <cstdlib>
#include <string>

namespace {

// The oldest qpdf release whose interfaces this code relies on.
constexpr int kMinimumMajor = 11;

void debugMessage(const std::string& text) {
    if (std::getenv("VORLAN_DEBUG")) std::fputs(text.c_str(), stderr);
}

}  // namespace

int startPDFLibrary() {
    const std::string& version = QPDF::QPDFVersion();
    if (std::atoi(version.c_str()) < kMinimumMajor) {
        debugMessage("failed on qpdf version " + version + "\n");
        return 1;
    }
    return 0;
}

void stopPDFLibrary() {}
