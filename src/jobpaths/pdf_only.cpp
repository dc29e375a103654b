// Not built yet: nothing is written.
#include "jobpaths/pdf_only.h"

PdfOnlyProcessingJdf::PdfOnlyProcessingJdf(char* outputPath, LD_JDF* worker)
    : outputPath_(outputPath), worker_(worker) {}

LDError PdfOnlyProcessingJdf::run() { return LD_OK; }
