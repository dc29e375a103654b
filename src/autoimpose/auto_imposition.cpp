// Not built yet: auto-imposition reports failure and leaves the ticket unchanged.
#include <cstdio>

#include "vorlan/LD_JDF.h"

LDError LD_JDF::JDF_AutoImposition(const char*, const char*) {
    std::fputs("vorlan: auto-imposition is not available in this build\n", stderr);
    lastError = LD_FAILED;
    return LD_FAILED;
}
