#include "entry/host_paths.h"

#include "vorlan/LD_JDF.h"

std::string askHostForFilePath(LD_JDF& worker) {
    char buffer[2048] = {};
    if (worker.FilePathCallback) worker.FilePathCallback(buffer, static_cast<int>(sizeof buffer), worker.userData);
    buffer[sizeof buffer - 1] = '\0';
    return buffer;
}
