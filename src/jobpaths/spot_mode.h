// Ticket jobs in separation mode: PDF variants in which chosen separations print nothing or
// print alone, and a ticket that points content and die sheets at them.
#pragma once

#include "vorlan/vorlan.h"

class LD_JDF;

class SpotModeProcessingJdf {
public:
    SpotModeProcessingJdf(char* outputPath, LD_JDF* worker);
    LDError run();

private:
    char* outputPath_;
    LD_JDF* worker_;
};
