// Reads a JDF ticket into the job model. Not built yet: the ticket is accepted without reading.
#include <cstdlib>

#include "platform/os/text.h"
#include "vorlan/LD_JDF.h"

LDError LD_JDF::JDF_InitializeAndParseJDF(wchar_t* path) {
    if (!path) {
        lastError = LD_JDF_UNUSABLE;
        return LD_JDF_UNUSABLE;
    }
    lastError = LD_OK;
    return LD_OK;
}

LDError LD_JDF::JDF_InitializeAndParseJDF(const char* path) {
    wchar_t* wide = vorlan::os::wideCopy(path);
    LDError result = JDF_InitializeAndParseJDF(wide);
    std::free(wide);  // the reader keeps its own copies
    return result;
}
