// The proofs' plan from a ticket: the job model's reader reads the layout, run lists and ordinal
// table; the JDF layer adds what the model does not keep (version tags, optional-content switches).
#pragma once

#include <string>
#include <vector>

#include "pdf/proof_plan.h"
#include "vorlan/vorlan.h"

namespace vorlan::pdf {

// Reads the ticket at `ticketPath` into one ProofVersion per version, in order of first
// appearance. Every printed surface (one with placed objects), in sheet order, front before
// back, becomes a page (the size of the Media nearest the surface in the ticket, else of its
// SurfaceContentsBox, else of the first object's page) of the version named by its KAV_tkt:VersionName (inherited from enclosing
// partitions), else by the version tags of the run-list partition of its first content object's
// ordinal, else "Default"; a ticket without a layout has one page per logical page of its run
// lists (the reader's one sheet per page). Each placed object takes the file and page of its
// Ord (the marks run lists for mark objects) and the OCGControl switches of the InterpretingParams
// partition whose Run equals that run-list partition's Run. File URLs are local paths; a file
// not found there (or a relative URL) is looked for by name in the ticket's folder. The reader's
// result code when the ticket cannot be read; LD_JDF_RESOURCE_MISSING when it has nothing to print.
LDError readProofPlan(const char* ticketPath, std::vector<ProofVersion>& versions);

// A version name as a file name: path separators, control characters and characters that are
// awkward in file names become '_', leading dots are replaced too; empty gives "Default".
std::string safeFileName(const std::string& name);

}  // namespace vorlan::pdf
