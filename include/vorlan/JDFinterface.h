// JDFinterface: a thin owning facade around one LD_JDF worker.
#pragma once

#include "LD_JDF.h"

class VORLAN_API JDFinterface {
public:
    JDFinterface(int (*progress)(float, void*), int (*filePath)(char*, int, void*), void* userData);
    ~JDFinterface();
    JDFinterface(const JDFinterface&) = delete;
    JDFinterface& operator=(const JDFinterface&) = delete;

    LDError JDF_InitializeAndParseJDF(wchar_t* path);
    LDError JDF_InitializeAndParseJDF(const char* path);
    LDError JDF_InitializeAndCreateNewJDF(char* outputJdfPath, char* xmlBuffer, long xmlLength,
                                          const char* dataFile, const char* jobFolder,
                                          const char* pageRange, int jobNumber);
    LDError JDF_AutoImposition(const char* settingsPath, const char* jdfPath);
    LDError JDF_GetLastErrorCode();
    LDError JDF_ValidateJDFForAPPE();
    void JDF_ChangeSourceFileNameInJDF(wchar_t* from, wchar_t* to);

    std::vector<LD_PDF*>* JDF_GetAllContentPDFs();
    std::vector<LD_PDF*>* JDF_GetAllMarkPDFs();
    long JDF_GetMaxOrdinalNumber();
    LD_ContentTableElement* JDF_GetLogicalContentPageByOrdinalNumber(long ordinal);
    LD_MarkTableElement* JDF_GetLogicalMarkPageByOrdinalNumber(long ordinal);
    long JDF_GetNumberOfLogicalDocs();
    long JDF_GetNumberOfLogicalPages();
    long JDF_GetNumberOfSurfaces();
    long JDF_GetNumberOfSheets();
    long JDF_GetNumberOfSignatures();
    LD_Range* JDF_GetRangeOfSheetsPerSignature(long index);
    LD_Signature* JDF_GetSignaturesInLayoutByIndex(long index);
    LD_OCG_Media* JDF_GetGlobalMediaSettings();
    LD_OCG_Digital_Printing_Params* JDF_GetDigitalPrintingParams();
    LD_OCG_RenderingParams* JDF_GetGlobalRenderingParams();
    std::vector<LD_Run*>* JDF_GetAllContentRuns();
    std::vector<LD_Run*>* JDF_GetAllMarkRuns();
    std::vector<LD_OCG_InterpretingParams*>* JDF_GetAllInterpretingParams();

    LD_JDF* worker() { return worker_; }

private:
    LD_JDF* worker_;
};
