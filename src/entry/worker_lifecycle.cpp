// Construction, copying and destruction of the worker.
#include <cstdlib>

#include "jdf/ticket_handles.h"
#include "pdf/zipped_jdf_file_system.h"
#include "vorlan/LD_JDF.h"

LD_JDF::LD_JDF() : ticket(new LD_JDFHandles), recordShare_(std::make_shared<int>(0)) {}

LD_JDF::LD_JDF(int (*progress)(float, void*), int (*filePath)(char*, int, void*), void* data) : LD_JDF() {
    ProgressCallback = progress;
    FilePathCallback = filePath;
    userData = data;
}

LD_JDF::~LD_JDF() { destroy(); }

// Copies share the records (pointer lists are copied, not the records) and the ticket document.
LD_JDF::LD_JDF(const LD_JDF& other) { copyFrom(other); }

LD_JDF::LD_JDF(LD_JDF&& other) noexcept { moveFrom(other); }

LD_JDF& LD_JDF::operator=(const LD_JDF& other) {
    if (this != &other) {
        destroy();
        copyFrom(other);
    }
    return *this;
}

LD_JDF& LD_JDF::operator=(LD_JDF&& other) noexcept {
    if (this != &other) {
        destroy();
        moveFrom(other);
    }
    return *this;
}

void LD_JDF::copyFrom(const LD_JDF& other) {
    LD_JDFHandles* handles = other.ticket ? new LD_JDFHandles(*other.ticket) : new LD_JDFHandles;
    // Plain memberwise copy of everything, then the members that need care.
    ProgressCallback = other.ProgressCallback;
    FilePathCallback = other.FilePathCallback;
    userData = other.userData;
    inputType = other.inputType;
    jobHasTicket = other.jobHasTicket;
    jdfPath = other.jdfPath;
    jobFolder = other.jobFolder;
    inputPDF = other.inputPDF;
    zipFileSystem = other.zipFileSystem;
    ticket = handles;
    auditPool = other.auditPool;
    numberOfLogicalPages = other.numberOfLogicalPages;
    numberOfLogicalDocs = other.numberOfLogicalDocs;
    contentPDFs = other.contentPDFs;
    markPDFs = other.markPDFs;
    layerNameList = other.layerNameList;
    nestedComponentList = other.nestedComponentList;
    placedObjectCount = other.placedObjectCount;
    contentObjectCount = other.contentObjectCount;
    markObjectCount = other.markObjectCount;
    signatures = other.signatures;
    sheets = other.sheets;
    surfaces = other.surfaces;
    contentObjects = other.contentObjects;
    markObjects = other.markObjects;
    numberOfSignatures = other.numberOfSignatures;
    numberOfSheets = other.numberOfSheets;
    numberOfSurfaces = other.numberOfSurfaces;
    m_OrdinalTable = other.m_OrdinalTable;
    contentObjectOrdinalMap = other.contentObjectOrdinalMap;
    m_InterpretingParams = other.m_InterpretingParams;
    contentRuns = other.contentRuns;
    markRuns = other.markRuns;
    renderingParams = other.renderingParams;
    mediaSettings = other.mediaSettings;
    digitalPrintingParams = other.digitalPrintingParams;
    layerDataMap = other.layerDataMap;
    versions = other.versions;
    m_XMLDieCuts = other.m_XMLDieCuts;
    lastError = other.lastError;
    initializationTime = other.initializationTime;
    defaultLayerMode = other.defaultLayerMode;
    exportMode = other.exportMode;
    pageRange = other.pageRange;
    pageRangeMode = other.pageRangeMode;
    surfaceVersions = other.surfaceVersions;
    jobNumber = other.jobNumber;
    printDieLine = other.printDieLine;
    technicalInkMap = other.technicalInkMap;
    dieInkMap = other.dieInkMap;
    dataPath = other.dataPath;
    eskoInksFound = other.eskoInksFound;
    dieCutDefined = other.dieCutDefined;
    dieEnabled = other.dieEnabled;
    autoDieControl = other.autoDieControl;
    outputJdfPath = other.outputJdfPath;
    ticketDataPath = other.ticketDataPath;
    pageSelection = other.pageSelection;
    recordShare_ = other.recordShare_;
    jobAttributeValue_ = other.jobAttributeValue_;
}

void LD_JDF::moveFrom(LD_JDF& other) noexcept {
    copyFrom(other);  // vectors and maps below are then taken over, leaving other empty
    recordShare_ = std::move(other.recordShare_);
    other.recordShare_ = std::make_shared<int>(0);
    if (other.ticket) ticket->parser = std::move(other.ticket->parser);
    auditPool = std::move(other.auditPool);
    contentPDFs = std::move(other.contentPDFs);
    markPDFs = std::move(other.markPDFs);
    layerNameList = std::move(other.layerNameList);
    nestedComponentList = std::move(other.nestedComponentList);
    signatures = std::move(other.signatures);
    sheets = std::move(other.sheets);
    surfaces = std::move(other.surfaces);
    contentObjects = std::move(other.contentObjects);
    markObjects = std::move(other.markObjects);
    m_OrdinalTable = std::move(other.m_OrdinalTable);
    m_InterpretingParams = std::move(other.m_InterpretingParams);
    contentRuns = std::move(other.contentRuns);
    markRuns = std::move(other.markRuns);
    layerDataMap = std::move(other.layerDataMap);
    versions = std::move(other.versions);
    m_XMLDieCuts = std::move(other.m_XMLDieCuts);
    surfaceVersions = std::move(other.surfaceVersions);
    technicalInkMap = std::move(other.technicalInkMap);
    dieInkMap = std::move(other.dieInkMap);
    other.auditPool.clear();
    other.contentPDFs.clear();
    other.markPDFs.clear();
    other.layerNameList.clear();
    other.nestedComponentList.clear();
    other.signatures.clear();
    other.sheets.clear();
    other.surfaces.clear();
    other.contentObjects.clear();
    other.markObjects.clear();
    other.m_OrdinalTable.clear();
    other.m_InterpretingParams.clear();
    other.contentRuns.clear();
    other.markRuns.clear();
    other.layerDataMap.clear();
    other.versions.clear();
    other.m_XMLDieCuts.clear();
    other.surfaceVersions.clear();
    other.technicalInkMap.clear();
    other.dieInkMap.clear();
    other.inputPDF = nullptr;
    other.zipFileSystem = nullptr;
    other.jdfPath = nullptr;
    other.dataPath = nullptr;
    other.ticketDataPath = nullptr;
}

void LD_JDF::destroy() noexcept {
    // Records an early pipeline exit left behind are released by the last worker sharing them,
    // so a long-running host does not leak a job's model.
    if (recordShare_ && recordShare_.use_count() == 1) {
        releaseAllRecords();
        if (ticketDataPath != dataPath) std::free(ticketDataPath);
        std::free(jdfPath);
        std::free(dataPath);
        destroyZippedJDFFileSystem(zipFileSystem);
    }
    jdfPath = dataPath = ticketDataPath = nullptr;
    zipFileSystem = nullptr;
    delete ticket;
    ticket = nullptr;
    recordShare_.reset();
}

LDError LD_JDF::exitWith(LDError code) {
    lastError = code;
    return code;
}

LDError LD_JDF::JDF_GetLastErrorCode() { return lastError; }
LDError LD_JDF::JDF_ValidateJDFForAPPE() { return LD_OK; }
LDError LD_JDF::createLayoutPerVersion(bool) { return LD_OK; }
void LD_JDF::JDF_Release(long long) {}
void LD_JDF::JDF_ChangeSourceFileNameInJDF(wchar_t*, wchar_t*) {}
