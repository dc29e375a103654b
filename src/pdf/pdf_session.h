// The PDF session: what has to be set up before any PDF work and torn down after it.
//
// qpdf needs no global initialisation, so the session only checks that the qpdf it runs against
// is one this code was built for, and counts starts and stops so that callers can keep the
// started-flag discipline (start before PDF work, stop once when done).
#pragma once

// Starts the session. 0 on success; 1 when the qpdf at hand is too old (it then writes
// "failed on qpdf version <version>" to the debug output).
int startPDFLibrary();
// Ends one started session. Extra stops are ignored.
void stopPDFLibrary();
// True while at least one start has not been matched by a stop (used by tests).
bool pdfLibraryRunning();

namespace vorlan::pdf {

// Starts the session on construction and stops it on destruction: the scan entry points start
// and stop the session on every call.
class PdfSession {
public:
    PdfSession() : result_(startPDFLibrary()) {}
    ~PdfSession() { stopPDFLibrary(); }
    PdfSession(const PdfSession&) = delete;
    PdfSession& operator=(const PdfSession&) = delete;
    int result() const { return result_; }

private:
    int result_;
};

}  // namespace vorlan::pdf
