// Applies the job's page range to the layout or the PDF. Not built yet: everything stays selected.
#include "vorlan/LD_JDF.h"

void LD_JDF::applyPageRangeForLayout() {}
void LD_JDF::applyPageRangeForPDF() {}
void LD_JDF::applyPageRangeForPDFWithoutVersions() {}
