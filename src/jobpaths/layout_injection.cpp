// Not built yet: the ticket is left as it is.
#include "jobpaths/layout_injection.h"

LayoutInjectionProcessingJdf::LayoutInjectionProcessingJdf(wchar_t* jdfPath, wchar_t* dataPath, char* outputPath,
                                                           LD_JDF* worker)
    : jdfPath_(jdfPath), dataPath_(dataPath), outputPath_(outputPath), worker_(worker) {}

int LayoutInjectionProcessingJdf::run() { return 1; }
