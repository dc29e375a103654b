// Not built yet: nothing is written.
#include "jobpaths/spot_mode.h"

SpotModeProcessingJdf::SpotModeProcessingJdf(char* outputPath, LD_JDF* worker)
    : outputPath_(outputPath), worker_(worker) {}

LDError SpotModeProcessingJdf::run() { return LD_OK; }
