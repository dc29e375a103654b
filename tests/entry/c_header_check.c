/* The public C header must compile as C. */
#include "vorlan/vorlan.h"

int vorlan_c_header_check(void) {
    LDError code = LD_OK;
    ProgressCallback progress = 0;
    FilePathCallback filePath = 0;
    (void)progress;
    (void)filePath;
    return (int)code + (int)LD_JDF_WRITE_FAILED;
}
