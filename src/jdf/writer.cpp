// Writes the versioned ticket. Not built yet: nothing is written.
#include "vorlan/LD_JDF.h"

LDError LD_JDF::writeJDF(char*) { return LD_OK; }
