// The C entry points. No exception crosses this boundary: anything thrown becomes LD_FAILED.
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <new>

#include "pdf/xmp_scan.h"
#include "versions/valid_description.h"
#include "vorlan/JDFinterface.h"
#include "vorlan/vorlan.h"

namespace {

// The job number from ".../job<N>.impinfo"; -1 when the file name does not start with job<N>.
int jobNumberFromDescriptionPath(const char* impinfoPath) {
    if (!impinfoPath) return -1;
    const char* slash = std::strrchr(impinfoPath, '/');
    if (!slash) return -1;
    int number = -1;
    if (std::sscanf(slash + 1, "job%d.impinfo", &number) != 1) return -1;
    return number;
}

// Reads the whole description file into a zeroed buffer 16 bytes larger than the file.
// Returns false only when memory runs out; *buffer stays null when the file cannot be read.
bool readDescriptionFile(const char* path, char** buffer, long* length) {
    *buffer = nullptr;
    *length = 0;
    FILE* in = path ? std::fopen(path, "rb") : nullptr;
    if (!in) {
        std::fputs("Invalid or absent xml buffer file, continuing as unversioned job... \n", stderr);
        return true;
    }
    long size = -1;
    if (std::fseek(in, 0, SEEK_END) == 0) size = std::ftell(in);
    std::rewind(in);
    if (size < 0) {
        // Not seekable (a pipe, a folder): treat it like an unreadable description.
        std::fclose(in);
        std::fputs("Invalid or absent xml buffer file, continuing as unversioned job... \n", stderr);
        return true;
    }
    auto* bytes = static_cast<char*>(std::calloc(static_cast<size_t>(size) + 16, 1));
    if (!bytes) {
        std::fclose(in);
        std::fputs("Not enough memory!\n", stderr);
        return false;
    }
    size_t got = std::fread(bytes, 1, static_cast<size_t>(size), in);
    std::fclose(in);
    *buffer = bytes;
    *length = static_cast<long>(got);  // a file that shrank meanwhile yields only what was read
    return true;
}

}  // namespace

extern "C" {

VORLAN_API int vorlan_consume_job(const char* dataFile, const char* impinfoPath, char* outputJdfPath,
                                  const char* jobFolder, const char* pageRange, ProgressCallback progress,
                                  FilePathCallback filePath, void* userData) {
    int jobNumber = jobNumberFromDescriptionPath(impinfoPath);
    char* buffer = nullptr;
    long length = 0;
    if (!readDescriptionFile(impinfoPath, &buffer, &length)) return -1;
    int result = LD_FAILED;
    try {
        JDFinterface job(progress, filePath, userData);
        result = job.JDF_InitializeAndCreateNewJDF(outputJdfPath, buffer, length, dataFile, jobFolder, pageRange,
                                                   jobNumber);
    } catch (...) {
        result = LD_FAILED;
    }
    std::free(buffer);
    return result;
}

VORLAN_API bool vorlan_is_valid_job(const char* path) {
    try {
        return isVersionDescriptionFile(path);
    } catch (...) {
        return false;
    }
}

VORLAN_API int vorlan_autoimp(const char* settingsPath, const char* jdfPath, ProgressCallback progress,
                              FilePathCallback filePath) {
    try {
        LD_JDF worker(progress, filePath, nullptr);
        return worker.JDF_AutoImposition(settingsPath, jdfPath);
    } catch (...) {
        return LD_FAILED;
    }
}

VORLAN_API int vorlan_scan_xmp(const char* pdfPath, char* outputPath, const char* mode) {
    try {
        bool dieLibrary = mode && std::strcmp(mode, "True") == 0;
        return scanPdfInksToDescription(pdfPath, outputPath, dieLibrary);
    } catch (...) {
        return LD_FAILED;
    }
}

}  // extern "C"
