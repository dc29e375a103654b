// Converts the job's PDFs for layer-mode versions. Not built yet: every PDF stays unconverted.
#include "vorlan/LD_JDF.h"

LDError LD_JDF::convertAllPDFs() { return LD_OK; }
