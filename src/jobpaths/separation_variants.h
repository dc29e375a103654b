// Writing separation variants of a job's PDFs into files the host named.
#pragma once

#include <string>
#include <vector>

#include "pdf/separation_rewrite.h"

class LD_JDF;

namespace vorlan::jobpaths {

// Replaces a record's variant path with a wide copy of `path` (exact size, never cut; an empty
// text when it cannot be converted).
void setVariantPath(wchar_t*& field, const std::string& path);

// Writes the variants of the PDF at `input` (a wide path) through the worker's file context; one
// result per variant, 0 when written. A variant that fails leaves nothing at its output path.
std::vector<int> writeSeparationVariants(LD_JDF& worker, const wchar_t* input,
                                         const std::vector<vorlan::pdf::SeparationVariant>& variants);

}  // namespace vorlan::jobpaths
