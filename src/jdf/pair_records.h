// Making the runs and interpreting parameters that version expansion and the die steps add.
#pragma once

#include <vector>

#include "vorlan/LD_JDF.h"

namespace vorlan::jdf {

// A new run of one page of pdf (null for none) with the given content type; everything else at
// the record's defaults.
LD_Run* newPageRun(LD_PDF* pdf, int32_t page, ContentType type);

// A copy of run for a version variant: own name buffer, page list and version name; the PDF is
// shared; the copy's content type is 0.
LD_Run* copyRun(const LD_Run* run);

// Fresh copies of every name of source appended to destination.
void appendNameCopies(std::vector<wchar_t*>& destination, const std::vector<wchar_t*>& source);

// The switches one content object of a version asks for: on = layers on then separations on,
// off = layers off then separations off.
LD_OCG_InterpretingParams* newVersionParams(const XMLContentObjectData& entry);

}  // namespace vorlan::jdf
