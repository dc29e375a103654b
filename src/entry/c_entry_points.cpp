// The C entry points. No exception crosses this boundary: anything thrown becomes LD_FAILED.
#include <cstdlib>
#include <cstring>

#include "entry/description_file.h"
#include "pdf/proofs.h"
#include "pdf/xmp_scan.h"
#include "versions/valid_description.h"
#include "vorlan/JDFinterface.h"
#include "vorlan/vorlan.h"


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

VORLAN_API int vorlan_proof_ticket(const char* ticketPath, const char* outputFolder, ProofCallback report,
                                   void* userData) {
    try {
        return vorlan::pdf::writeProofs(ticketPath, outputFolder, report, userData);
    } catch (...) {
        return LD_FAILED;
    }
}

}  // extern "C"
