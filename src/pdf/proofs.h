// Proof PDFs of a ticket, one per version, for people to check before the job prints.
#pragma once

#include "vorlan/vorlan.h"

namespace vorlan::pdf {

// Reads the ticket (readProofPlan) and writes OUTDIR/<version>.pdf for every version
// (writeProof), creating the folder; two versions whose safe names meet get "_2", "_3", ...
// Each version is reported through `report` (may be null) whether it was written or not, and a
// version that cannot be written leaves the others to be written. A version not written gets one
// line on standard error. Returns LD_OK when every version was written, else the code of the
// first that was not (LD_FILE_NOT_FOUND for a missing PDF, LD_REFERENCE_OUT_OF_RANGE for a missing
// page, LD_FAILED for an unreadable PDF or an output that cannot be written), or the reader's
// code when the ticket cannot be read. Never throws.
int writeProofs(const char* ticketPath, const char* outputFolder, ProofCallback report, void* userData);

}  // namespace vorlan::pdf
