// Names and meanings of the result codes, for hosts and logs.
#pragma once

namespace vorlan {

// "LD_OK", "LD_FAILED", ...; "out of memory" for -1 and "unknown" for other values.
const char* resultName(int code);
// One line saying when the code is returned.
const char* resultMeaning(int code);

}  // namespace vorlan
