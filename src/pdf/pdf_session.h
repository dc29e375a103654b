// The PDF session: what has to be set up before any PDF work and torn down after it.
//
// qpdf needs no global initialisation and keeps no state between documents, so the session only
// checks that the qpdf it runs against is one this code was built for. Nothing is counted across
// jobs: whether a job started its session is the job's own flag (the file context's
// pdfLibraryStarted), so jobs on different threads never share anything here.
#pragma once

// Starts the session. 0 on success; 1 when the qpdf at hand is too old (it then writes
// "failed on qpdf version <version>" to the debug output).
int startPDFLibrary();
// Ends one started session (nothing to release with qpdf; kept as the pair of the start).
void stopPDFLibrary();

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
