// Generates a version description from the PDFs' inks when the host gave none. Not built yet:
// no inks are found, so nothing is generated.
#include "vorlan/LD_JDF.h"

bool LD_JDF::populateKAVDieLibInks() { return false; }

bool LD_JDF::populateEskoTechInks() {
    eskoInksFound = false;
    return true;
}

bool LD_JDF::generateImpInfoFile(const char*) { return true; }

bool LD_JDF::parseImpInfoFile(const char*, char** buffer, long* length) {
    if (buffer) *buffer = nullptr;
    if (length) *length = 0;
    return false;
}
