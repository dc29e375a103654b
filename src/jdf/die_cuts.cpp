// Die cuts: die-line sheets and the die-info file in the job folder.
#include <cstdio>
#include <string>

#include "vorlan/LD_JDF.h"

// Not built yet: no die sheets are inserted.
LDError LD_JDF::addDieCut(bool) { return LD_OK; }

// One line "key=value" per call, appended to "<job folder>/job<N>.dieinfo"; lines end in CR LF on
// every platform so the file reads the same everywhere.
void LD_JDF::AddDieInfoFile(const char* key, int32_t value) {
    if (!key) return;
    std::string path = std::string(jobFolder ? jobFolder : ".") + "/job" + std::to_string(jobNumber) + ".dieinfo";
    FILE* out = std::fopen(path.c_str(), "ab");
    if (!out) return;
    std::fprintf(out, "%s=%d\r\n", key, value);
    std::fclose(out);
}
