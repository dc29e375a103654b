// JDFinterface forwards every call to the worker it owns.
#include "vorlan/JDFinterface.h"

JDFinterface::JDFinterface(int (*progress)(float, void*), int (*filePath)(char*, int, void*), void* userData)
    : worker_(new LD_JDF(progress, filePath, userData)) {}

JDFinterface::~JDFinterface() { delete worker_; }

LDError JDFinterface::JDF_InitializeAndParseJDF(wchar_t* path) { return worker_->JDF_InitializeAndParseJDF(path); }
LDError JDFinterface::JDF_InitializeAndParseJDF(const char* path) { return worker_->JDF_InitializeAndParseJDF(path); }

LDError JDFinterface::JDF_InitializeAndCreateNewJDF(char* outputJdfPath, char* xmlBuffer, long xmlLength,
                                                    const char* dataFile, const char* jobFolder,
                                                    const char* pageRange, int jobNumber) {
    return worker_->JDF_InitializeAndCreateNewJDF(outputJdfPath, xmlBuffer, xmlLength, dataFile, jobFolder, pageRange,
                                                  jobNumber);
}

LDError JDFinterface::JDF_AutoImposition(const char* settingsPath, const char* jdfPath) {
    return worker_->JDF_AutoImposition(settingsPath, jdfPath);
}

LDError JDFinterface::JDF_GetLastErrorCode() { return worker_->JDF_GetLastErrorCode(); }
LDError JDFinterface::JDF_ValidateJDFForAPPE() { return worker_->JDF_ValidateJDFForAPPE(); }
void JDFinterface::JDF_ChangeSourceFileNameInJDF(wchar_t* from, wchar_t* to) {
    worker_->JDF_ChangeSourceFileNameInJDF(from, to);
}

std::vector<LD_PDF*>* JDFinterface::JDF_GetAllContentPDFs() { return worker_->JDF_GetAllContentPDFs(); }
std::vector<LD_PDF*>* JDFinterface::JDF_GetAllMarkPDFs() { return worker_->JDF_GetAllMarkPDFs(); }
long JDFinterface::JDF_GetMaxOrdinalNumber() { return worker_->JDF_GetMaxOrdinalNumber(); }
LD_ContentTableElement* JDFinterface::JDF_GetLogicalContentPageByOrdinalNumber(long ordinal) {
    return worker_->JDF_GetLogicalContentPageByOrdinalNumber(ordinal);
}
LD_MarkTableElement* JDFinterface::JDF_GetLogicalMarkPageByOrdinalNumber(long ordinal) {
    return worker_->JDF_GetLogicalMarkPageByOrdinalNumber(ordinal);
}
long JDFinterface::JDF_GetNumberOfLogicalDocs() { return worker_->JDF_GetNumberOfLogicalDocs(); }
long JDFinterface::JDF_GetNumberOfLogicalPages() { return worker_->JDF_GetNumberOfLogicalPages(); }
long JDFinterface::JDF_GetNumberOfSurfaces() { return worker_->JDF_GetNumberOfSurfaces(); }
long JDFinterface::JDF_GetNumberOfSheets() { return worker_->JDF_GetNumberOfSheets(); }
long JDFinterface::JDF_GetNumberOfSignatures() { return worker_->JDF_GetNumberOfSignatures(); }
LD_Range* JDFinterface::JDF_GetRangeOfSheetsPerSignature(long index) {
    return worker_->JDF_GetRangeOfSheetsPerSignature(index);
}
LD_Signature* JDFinterface::JDF_GetSignaturesInLayoutByIndex(long index) {
    return worker_->JDF_GetSignaturesInLayoutByIndex(index);
}
LD_OCG_Media* JDFinterface::JDF_GetGlobalMediaSettings() { return worker_->JDF_GetGlobalMediaSettings(); }
LD_OCG_Digital_Printing_Params* JDFinterface::JDF_GetDigitalPrintingParams() {
    return worker_->JDF_GetDigitalPrintingParams();
}
LD_OCG_RenderingParams* JDFinterface::JDF_GetGlobalRenderingParams() { return worker_->JDF_GetGlobalRenderingParams(); }
std::vector<LD_Run*>* JDFinterface::JDF_GetAllContentRuns() { return worker_->JDF_GetAllContentRuns(); }
std::vector<LD_Run*>* JDFinterface::JDF_GetAllMarkRuns() { return worker_->JDF_GetAllMarkRuns(); }
std::vector<LD_OCG_InterpretingParams*>* JDFinterface::JDF_GetAllInterpretingParams() {
    return worker_->JDF_GetAllInterpretingParams();
}
