// Jobs without a ticket in separation mode: PDF variants and a short ticket.
#pragma once

#include "vorlan/vorlan.h"

class LD_JDF;

class PdfOnlyProcessingJdf {
public:
    PdfOnlyProcessingJdf(char* outputPath, LD_JDF* worker);
    LDError run();

private:
    char* outputPath_;
    LD_JDF* worker_;
};
