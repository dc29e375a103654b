// Spells out every version as run-list and interpreting-parameter pairs. Not built yet.
#include "vorlan/LD_JDF.h"

LDError LD_JDF::createRunListAndInterpretingParamPairs(bool) { return LD_OK; }
