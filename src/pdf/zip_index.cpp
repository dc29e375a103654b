// Position of a named entry in a zipped job.
#include "pdf/zipped_jdf_file_system.h"
#include "vorlan/LD_JDF.h"

int32_t LD_JDF::getFileIndexInZip(const char* name) {
    if (getZipEntryCount(zipFileSystem) < 1) return -1;
    return findZipEntry(zipFileSystem, name);
}
