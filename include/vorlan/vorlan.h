/*
 * vorlan: job preparation for print servers.
 *
 * The C entry points a print server's job host calls, once per job, on its own thread.
 * Two jobs must not run at the same time in one process.
 */
#ifndef VORLAN_H
#define VORLAN_H

#include <stdbool.h>

#include "vorlan_export.h"

#ifdef __cplusplus
extern "C" {
#endif

/*
 * Result codes of every operation (LDError): X(name, value, meaning) for each, the one table the
 * host's messages and the README's table are made from. Values 2, 5, 7 and 10 are never produced.
 */
#define VORLAN_RESULT_CODES(X)                                                                          \
    X(LD_OK, 0, "success")                                                                              \
    X(LD_FAILED, 1, "general failure (description not well-formed, expansion or die-cut failure, ...)") \
    X(LD_QUERY_TARGET_ABSENT, 3, "a query named a PDF, node type or process that does not exist")       \
    X(LD_JDF_UNUSABLE, 4, "the ticket cannot be used, or its layout is automated (copied unchanged)")   \
    X(LD_JDF_RESOURCE_MISSING, 6, "a node or resource is absent, or the ticket has nothing to print")   \
    X(LD_FILE_NOT_FOUND, 8, "data file of no known kind, or a PDF of the job is missing")               \
    X(LD_REFERENCE_OUT_OF_RANGE, 9, "the description names a PDF or ordinal that does not exist")       \
    X(LD_PDF_CONVERSION_FAILED, 11, "converting a PDF for the versions failed")                         \
    X(LD_INVALID_INPUT, 12, "the data file is missing or of no usable kind")                            \
    X(LD_JDF_WRITE_FAILED, 13, "building or writing the new ticket failed")

#define VORLAN_RESULT_ENUMERATOR(name, value, meaning) name = value,
typedef enum LDError { VORLAN_RESULT_CODES(VORLAN_RESULT_ENUMERATOR) } LDError;
#undef VORLAN_RESULT_ENUMERATOR

/* Progress callback: stored with the worker, never called. */
typedef int (*ProgressCallback)(float progress, void* userData);
/* Asked for each new output file: the host writes a NUL-terminated path into buffer (size bytes). */
typedef int (*FilePathCallback)(char* buffer, int size, void* userData);

/*
 * Runs one job: reads the version description at impinfoPath (job number from its file name
 * "job<N>.impinfo"), classifies dataFile (job folder or bare PDF) and writes the new ticket to
 * outputJdfPath. Returns an LDError, or -1 when the description buffer cannot be allocated.
 */
VORLAN_API int vorlan_consume_job(const char* dataFile, const char* impinfoPath, char* outputJdfPath,
                                  const char* jobFolder, const char* pageRange, ProgressCallback progress,
                                  FilePathCallback filePath, void* userData);

/* True when path is a well-formed XML file whose root is OptionalContentGroupData (any case). */
VORLAN_API bool vorlan_is_valid_job(const char* path);

/* Rewrites the ticket at jdfPath in place into an imposed layout from the auto-impose settings file
   (defaults where it is missing or unreadable). Returns 0 when the ticket was rewritten, else 1, and
   then the ticket file is as it was. The callbacks are kept and not called. */
VORLAN_API int vorlan_autoimp(const char* settingsPath, const char* jdfPath, ProgressCallback progress,
                              FilePathCallback filePath);

/* Scans the PDF's inks and writes a version description to outputPath. mode "True" matches the
 * pages against the die library; any other text reads the Esko technical inks of the XMP. */
VORLAN_API int vorlan_scan_xmp(const char* pdfPath, char* outputPath, const char* mode);

/* One version's proof, as vorlan_proof_ticket reports it (texts valid during the callback). */
typedef struct VorlanProofVersion {
    const char* version; /* the version name; "Default" for surfaces and runs without one */
    const char* path;    /* the proof PDF, OUTDIR/<version>.pdf with a safe file name */
    int pages;           /* pages of the proof: one per printed surface */
    int result;          /* LD_OK when written, else why not (an LDError) */
    const char* message; /* empty when written, else the line saying what is missing */
} VorlanProofVersion;
typedef void (*ProofCallback)(const VorlanProofVersion* version, void* userData);

/* Writes proof PDFs of a ticket this library wrote: for each version one PDF in outputFolder with
 * one page per printed surface in sheet order (the sheet's media size; each placed object drawn
 * from its logical page through its CTM, clipped to its ClipBox, with the content of groups its
 * ordinal switches off left out; a label naming version, copies, sheet, side and content type).
 * Job files are only read. Every version is reported through report (may be null); one that
 * cannot be written leaves the others to be written. Returns LD_OK when all were written, else
 * the first failure's code (LD_FILE_NOT_FOUND: a PDF is missing; LD_REFERENCE_OUT_OF_RANGE: a
 * page is missing), or the ticket reader's code. */
VORLAN_API int vorlan_proof_ticket(const char* ticketPath, const char* outputFolder, ProofCallback report,
                                   void* userData);

#ifdef __cplusplus
}
#endif

#endif /* VORLAN_H */
