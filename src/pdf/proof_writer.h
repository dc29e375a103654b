// Drawing proofs: one PDF per version, one page per printed surface, each placed object drawn from
// its source page through its CTM and clipped to its ClipBox, with its hidden optional content
// taken out, and a label in the sheet's lower left margin.
#pragma once

#include <string>

#include "pdf/proof_plan.h"

namespace vorlan::pdf {

// Why a proof was not written; its result code is what the proof entry point reports.
enum class ProofFailure {
    None,
    MissingFile,     // a PDF the version places cannot be found or opened (LD_FILE_NOT_FOUND)
    MissingPage,     // an ordinal without a page, or a page the PDF does not have (LD_REFERENCE_OUT_OF_RANGE)
    UnreadableFile,  // password-protected or damaged (LD_FAILED)
    CannotWrite,     // the proof cannot be written, or would replace a file of the job (LD_FAILED)
};

// Writes the version's proof to `path` (atomically; nothing is written when any object cannot be
// drawn). A source page is placed as a form XObject made from it: its crop box, with /Rotate
// applied, has its lower left corner at the origin the CTM maps from; its annotations are not
// drawn (they are no part of the page's content). Source files are opened
// read-only and never written; `path` must not be one of them. *message says what failed (one
// line naming the file, page or ordinal). Never throws.
ProofFailure writeProof(const ProofVersion& version, const std::string& path, std::string* message);

}  // namespace vorlan::pdf
