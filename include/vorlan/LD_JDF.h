// LD_JDF: the worker that processes one job, and the job model it holds.
//
// One worker serves one call of JDF_InitializeAndCreateNewJDF (or JDF_AutoImposition) on the
// host's thread. Workers share nothing: each may run on its own thread alongside others, but one
// worker must not be used from two threads at once (see vorlan.h). Records are created with new and owned by one list each; the pipeline's last
// step releases them, and the destructor releases whatever an early exit left behind.
#pragma once

#include <cstdint>
#include <cwchar>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "LD_Records.h"
#include "XMLVersionRecords.h"
#include "vorlan.h"
#include "vorlan_export.h"

namespace JDF {
class KElement;
class vElement;
class JDFNode;
class JDFLayout;
class JDFRunList;
class JDFMedia;
class JDFResource;
class WString;
}  // namespace JDF

namespace JDF {  // used by the page-range utility and the writer's helpers
class JDFSurface;
class JDFIntegerRangeList;
}  // namespace JDF

struct LD_JDFHandles;        // the parsed ticket's handles (parser, nodes, resources)

// Owns one worker's ticket handles. A copy gets handles of its own that share the ticket document
// (the parser stays with the original); a move takes them over and leaves none behind.
class VORLAN_API LD_TicketHandles {
public:
    LD_TicketHandles();
    ~LD_TicketHandles();
    LD_TicketHandles(const LD_TicketHandles& other);
    LD_TicketHandles(LD_TicketHandles&& other) noexcept;
    LD_TicketHandles& operator=(const LD_TicketHandles& other);
    LD_TicketHandles& operator=(LD_TicketHandles&& other) noexcept;
    LD_JDFHandles* operator->() const { return handles_; }
    LD_JDFHandles& operator*() const { return *handles_; }
    explicit operator bool() const { return handles_ != nullptr; }

private:
    LD_JDFHandles* handles_;
};
struct ZippedJDFFileSystem;  // per-job file context and PDF session flag
struct _kvXmlNode;           // node of the XML document tree

class VORLAN_API LD_JDF {
public:
    LD_JDF();
    LD_JDF(int (*progress)(float, void*), int (*filePath)(char*, int, void*), void* userData);
    ~LD_JDF();
    LD_JDF(const LD_JDF& other);
    LD_JDF(LD_JDF&& other) noexcept;
    LD_JDF& operator=(const LD_JDF& other);
    LD_JDF& operator=(LD_JDF&& other) noexcept;

    // ---- Job pipeline ----------------------------------------------------------------------
    // Runs one job from the data file to the new ticket at outputJdfPath; every exit stores its
    // code as the last error and returns it.
    LDError JDF_InitializeAndCreateNewJDF(char* outputJdfPath, char* xmlBuffer, long xmlLength,
                                          const char* dataFile, const char* jobFolder,
                                          const char* pageRange, int jobNumber);
    // Reads a ticket into the job model.
    LDError JDF_InitializeAndParseJDF(wchar_t* path);
    // Narrow overload: converts with the current locale and calls the wide one.
    LDError JDF_InitializeAndParseJDF(const char* path);
    LDError JDF_ValidateJDFForAPPE();                                // does nothing; 0
    LDError createLayoutPerVersion(bool perVersion);                 // does nothing; 0
    void JDF_Release(long long what);                                // does nothing
    void JDF_ChangeSourceFileNameInJDF(wchar_t* from, wchar_t* to);  // does nothing
    LDError JDF_GetLastErrorCode();
    // Rewrites the ticket at jdfPath in place into an imposed layout from the settings file:
    // LD_OK when it was rewritten, else LD_FAILED with the ticket file as it was.
    LDError JDF_AutoImposition(const char* settingsPath, const char* jdfPath);

    // ---- Input resolution and path utilities ------------------------------------------------
    InputDataFileTypes analizeDataFile(const char* path, wchar_t* out);
    bool checkForPDF(wchar_t* path);
    wchar_t* resolveDataFilePath(const char* path);
    bool checkExtention(const char* fileName, char* extension);
    char* extractFileNameFromPath(const char* path);
    char* createNewTempDirFilePath(const char* fileName, const char* subFolder);
    wchar_t* getNativeFilePath(wchar_t* path);
    wchar_t* findFileByExtentionInDir(wchar_t* folder, wchar_t* extension);
    wchar_t* findFileByNameInDir(wchar_t* folder, wchar_t* name);
    // The file a ticket names by url, looked for by its file name ("%20" read as a blank) in
    // folder and its sub-folders; a new heap path (free), or null when not found.
    wchar_t* findTicketFileInDir(wchar_t* folder, const wchar_t* url);
    void removePercentTwenty(wchar_t* text);
    static char* getCharFromWChar(const wchar_t* text);
    static wchar_t* getWCharFromChar(const char* text);
    char* getHeapCopyOfConstCharPtr(const char* text);
    void parseStringAttributeToStringVector(wchar_t* value, std::vector<wchar_t*>& list);
    void parseRangeAttributeToIntVector(wchar_t* value, std::vector<long>& list);
    bool isRange(wchar_t* token, long& first, long& last);
    wchar_t* trimExtraSpaces(wchar_t* text);

    // ---- Job attributes on the print server -------------------------------------------------
    // Reads an attribute of this worker's job; *value stays valid until the next call.
    bool getJobAttribute(const char* name, char** value);
    bool setJobAttribute(const char* name, const char* value);

    // ---- Version description ------------------------------------------------------------------
    LDError parseXMLBuffer(const char* buffer, long length, bool hasTicket, const char* jobFolder);
    LDError applyClientModeChangesToXMLBufferData();
    bool IsEskoTechnicalVersion(_kvXmlNode* versions);
    void removeNestedComponentsFromList(std::vector<wchar_t*>& list, std::vector<wchar_t*>& nested);
    wchar_t* getAttributeValue(_kvXmlNode* node, const wchar_t* attributeName);

    // ---- Automatic version description --------------------------------------------------------
    // Die inks of every content PDF (page inks the die library lists as separations) into both
    // ink maps; a PDF without page inks gets no entry. True when some PDF has die inks; false
    // also when the library cannot be read.
    bool populateKAVDieLibInks();
    // The Esko XMP ink lists of every content PDF into the maps (an unreadable PDF gives empty
    // lists); sets eskoInksFound when some PDF has technical-version inks. Always true.
    bool populateEskoTechInks();
    // Writes the description made from the ink maps and the layout to path (CR LF lines). Always
    // true: a file that could not be written shows when it is read back.
    bool generateImpInfoFile(const char* path);
    // Reads the file into a new zeroed buffer 16 bytes longer than the file (free() it). False,
    // with a message on standard error, when it cannot be opened or the buffer not allocated.
    bool parseImpInfoFile(const char* path, char** buffer, long* length);

    // ---- Page ranges, expansion, die cuts, writer ---------------------------------------------
    // Page ranges. ConvertPageRangesToPages appends the 0-based positions the page-range text
    // lists (an empty text gives -1); numbers that overflow are left out, and a range is not
    // expanded past the position `limit` (values there are ignored by every consumer).
    void ConvertPageRangesToPages(std::vector<int32_t>& pages, int32_t limit = 10'000'000);
    void applyPageRangeForLayout();
    void applyPageRangeForPDF();
    void applyPageRangeForPDFWithoutVersions();
    // Packs a page list into ranges of consecutive ascending values (list order kept); 0.
    LDError convertPagesVecToJDFRangeList(std::vector<int32_t>& pages, JDF::JDFIntegerRangeList& ranges);
    // Version expansion into run / interpreting-parameter pairs.
    LDError createRunListAndInterpretingParamPairs(bool jobHasTicket);
    LDError markCurrLayoutOrRunlistAsDefaultVersion(bool mark);
    void insertVersionedSheetAndSurfaceInLayout(int32_t surfaceIndex, wchar_t* versionName, int32_t versionIndex,
                                                int64_t copyCount);
    // Die cuts.
    LDError addDieCut(bool jobHasTicket);
    LD_Sheet* appendDieSheetInLayout(int32_t surfaceIndex, ContentType type);
    LDError createDieRunIPPairsAndUpdateDieSurface(LD_Surface* surface, LD_DieCut* dieCut, ContentType type);
    LDError createDieAndContentIP(int32_t contentObjectIndex, LD_OCG_InterpretingParams* dieParams,
                                  LD_OCG_InterpretingParams* target);
    LDError resolveDieLayerNames(LD_PDF* pdf, std::vector<wchar_t*>& layerNames, std::vector<wchar_t*>& sepNames,
                                 std::vector<wchar_t*>& dieNames, std::vector<wchar_t*>& otherNames);
    LD_Surface* appendDieSheetAndSurfaceInLayout(int32_t surfaceIndex);
    LD_Surface* insertDieSheetAndSurfaceInLayout(int32_t contentSurfaceNumber, ContentType type);
    LD_Surface* findContentSurfaceByOriginalIndex(int32_t n);
    LD_Signature* getSignatureByIndex(int32_t index);
    LD_Sheet* getSheetByIndex(int32_t index);
    LD_Surface* getSurfaceByIndex(int32_t index);
    LD_ContentObject* getContentObjectByIndex(int32_t index);
    bool isDie(std::vector<wchar_t*>& names, const wchar_t* name);
    bool isNested(std::vector<wchar_t*>& names, const wchar_t* name);
    // Appends "key=value" to the job's die-info file in the job folder.
    void AddDieInfoFile(const char* key, int32_t value);
    // The writer: the new ticket from the job model, saved atomically to outputPath.
    LDError writeJDF(char* outputPath);
    LDError addObjectListToJDFSurface(JDF::JDFSurface& jdfSurface, LD_Surface* surface);
    void addSurfaceDieTags(JDF::JDFSurface& jdfSurface, LD_Surface* surface);
    void addRunDieTags(JDF::JDFRunList& runList, LD_Run* run, bool backSide);
    void duplicateRunListFiles(JDF::JDFNode& node);

    // ---- PDF work -------------------------------------------------------------------------------
    LDError convertAllPDFs();
    // PDF conversion for versions: separations that the first version switches off, and the die
    // separations of a single die cut, each once (case ignored); the names stay the model's.
    void getListOfSeparationsToBeConverted(std::vector<wchar_t*>& names);
    int32_t getFileIndexInZip(const char* name);

    // ---- Queries ----------------------------------------------------------------------------------
    std::vector<LD_PDF*>* JDF_GetAllContentPDFs();
    std::vector<LD_PDF*>* JDF_GetAllMarkPDFs();
    std::vector<LD_PDF*> JDF_GetContentPDFsByStatus(LD_Status status);
    std::vector<LD_PDF*> JDF_GetMarkPDFsByStatus(LD_Status status);
    LD_Status JDF_GetPDFStatus(wchar_t* name);
    std::vector<LD_Run*>* JDF_GetAllContentRuns();
    std::vector<LD_Run*>* JDF_GetAllMarkRuns();
    std::vector<LD_OCG_InterpretingParams*>* JDF_GetAllInterpretingParams();
    LD_OCG_RenderingParams* JDF_GetGlobalRenderingParams();
    LD_OCG_Media* JDF_GetGlobalMediaSettings();
    LD_OCG_Digital_Printing_Params* JDF_GetDigitalPrintingParams();
    std::vector<LD_AuditData*>* JDF_GetAuditPool();
    long JDF_GetMaxOrdinalNumber();
    LD_ContentTableElement* JDF_GetLogicalContentPageByOrdinalNumber(long ordinal);
    LD_MarkTableElement* JDF_GetLogicalMarkPageByOrdinalNumber(long ordinal);
    long JDF_GetNumberOfLogicalDocs();
    long JDF_GetNumberOfLogicalPages();
    long JDF_GetNumberOfSurfaces();
    long JDF_GetNumberOfSheets();
    long JDF_GetNumberOfSignatures();
    // Both throw std::out_of_range for an index outside the signature list.
    LD_Signature* JDF_GetSignaturesInLayoutByIndex(long index);
    LD_Range* JDF_GetRangeOfSheetsPerSignature(long index);

    // The ticket's nodes (types 0 root, 1 process node, 2 Layout, 3 InterpretingParams).
    LD_Status JDF_GetStatusOfNodeByType(JDFNode_Types type);
    LD_Activation JDF_GetActivationOfProcessByType(JDFNode_Types type);
    // Texts stay valid until the next such query or the worker's destruction.
    wchar_t* JDF_GetIDofProcessByType(JDFNode_Types type);
    wchar_t* JDF_GetJDFVersion();
    std::vector<wchar_t*> JDF_GetICSVersions();
    static uint64_t Debug_GetCurrTimeStampInMilliSeconds();
    LDError Debug_TestVector(JDF::vElement& elements);
    LDError Debug_TestElement(JDF::KElement& element, char flags);

    // ---- Ticket reader: process nodes, resources, run lists, layout ---------------------------
    int FindImpositionNode(JDF::JDFNode& root, JDF::JDFNode& out);
    int IncludesType(const JDF::JDFNode& node, const char* type);
    bool isProcessUsageMarks(const JDF::JDFResource& resource);
    bool isProcessUsageDocument(const JDF::JDFResource& resource);
    int isPDFPresent(std::vector<LD_PDF*>& pdfs, LD_PDF* pdf);
    void parseMediaNode(const JDF::JDFMedia& media, LD_OCG_Media* record);
    // Layout injection for tickets without a Layout, and the automated-layout test.
    bool injectLayoutNode(const JDF::JDFNode& node, JDF::JDFLayout& layout);
    bool parseRunList(const JDF::JDFRunList& runList, JDF::JDFLayout& signature, int& pageCounter,
                      const JDF::JDFMedia& media);
    bool CheckForLayoutNodeAutomatedTrue(const JDF::JDFNode& node);

    // ---- Geometry and clip-path strings -------------------------------------------------------
    static std::vector<double>* splitIntoFloatTokensBySpace(const JDF::WString& text);  // caller deletes
    static void parseStringAsPoints(const JDF::WString& text, std::vector<LD_Point*>& points);
    static void parseStringAsBox(const JDF::WString& text, LD_Box* box);
    static void parseStringAsCTM(const JDF::WString& text, LD_CTM* ctm);
    // False when an operator had the wrong count of numbers; that operator is left out.
    static bool parseStringAsClipPathOperations(const JDF::WString& text, std::vector<LD_ClipPathOperations*>& ops);
    static bool isMarkPresent(const wchar_t* text);

    // ---- Ordinal table --------------------------------------------------------------------------
    void constructOrdinalTable();
    int32_t updateAndAppendToOrdinalTable(LD_Run* run, LD_OCG_InterpretingParams* params);
    int32_t updateAndInsertToOrdinalTable(LD_Run* run, LD_OCG_InterpretingParams* params, int32_t position);
    LD_OrdinalTableElement* searchOrdinalTableForRunIPPair(LD_Run* run, LD_OCG_InterpretingParams* params,
                                                           int32_t page);
    bool areRunsEqual(LD_Run* a, LD_Run* b);
    bool areInterpretingParamsEqual(LD_OCG_InterpretingParams* a, LD_OCG_InterpretingParams* b);
    int32_t getNewContentTableElementPosition();
    LD_OrdinalTableElement* getOrdinalElementByOrdNum(int32_t ordinal);
    void setOrdinalElementByOrdNum(int32_t ordinal, LD_OrdinalTableElement* row);
    LD_Run* getRunByOrdNumber(int32_t ordinal);
    LD_Run* getMarkRunByOrdNumber(int32_t ordinal);
    LD_OCG_InterpretingParams* getInterpretingParamsByOrdNumber(int32_t ordinal);
    LD_OCG_InterpretingParams* getInterpretingParamsByRunNumber(int32_t runNumber);
    int32_t getOrdNumberFromContentObjectIndex(int32_t contentObjectIndex);
    void setOrdNumberFromContentObjectIndex(int32_t contentObjectIndex, int32_t ordinal);
    void updateOrdInLayout(int32_t contentObjectIndex, int32_t ordinal);
    LDError copyRunlist(std::vector<LD_Run*>& source, std::vector<LD_Run*>& destination);
    int32_t stringVecContains(std::vector<wchar_t*>& list, const wchar_t* text);
    void copyOCGVec(std::vector<wchar_t*>& destination, std::vector<wchar_t*>& source);

    // ---- Record release (each owner list has one) ---------------------------------------------
    void releaseLayout();
    void releaseOrdinalTable();
    void releasePDFs(std::vector<LD_PDF*>& pdfs);
    void releaseRuns(std::vector<LD_Run*>& runs);
    void releaseInterpretingParams();
    void releaseVersions();
    void releaseSurfaceVersions();
    void releaseDieCuts();
    void releaseLayerData();
    // The job's records in the pipeline's release order: layout, ordinal table, PDFs, runs,
    // versions, die cuts, content-object ordinal map.
    void releaseJobRecords();
    void releaseAllRecords();  // everything any list still owns

    // ---- Members ----------------------------------------------------------------------------------
    int (*ProgressCallback)(float, void*) = nullptr;
    int (*FilePathCallback)(char*, int, void*) = nullptr;
    void* userData = nullptr;
    InputDataFileTypes inputType = INPUT_UNKNOWN;
    bool jobHasTicket = false;
    wchar_t* jdfPath = nullptr;
    char* jobFolder = nullptr;  // borrowed from the host
    LD_PDF* inputPDF = nullptr;
    ZippedJDFFileSystem* zipFileSystem = nullptr;
    LD_TicketHandles ticket;  // parser, rootNode, processNode and the resource elements
    std::vector<LD_AuditData*> auditPool;
    int32_t numberOfLogicalPages = 0;
    int32_t numberOfLogicalDocs = 1;
    std::vector<LD_PDF*> contentPDFs;
    std::vector<LD_PDF*> markPDFs;
    std::vector<wchar_t*> layerNameList;
    std::vector<wchar_t*> nestedComponentList;
    int32_t placedObjectCount = 0;
    int32_t contentObjectCount = 0;
    int32_t markObjectCount = 0;
    std::vector<LD_Signature*> signatures;
    std::vector<LD_Sheet*> sheets;
    std::vector<LD_Surface*> surfaces;
    std::vector<LD_ContentObject*> contentObjects;
    std::vector<LD_MarkObject*> markObjects;
    int32_t numberOfSignatures = 0;
    int32_t numberOfSheets = 0;
    int32_t numberOfSurfaces = 0;
    std::vector<LD_OrdinalTableElement*> m_OrdinalTable;
    std::vector<LD_ContentObjectOrdinal> contentObjectOrdinalMap;
    std::vector<LD_OCG_InterpretingParams*> m_InterpretingParams;
    std::vector<LD_Run*> contentRuns;
    std::vector<LD_Run*> markRuns;
    LD_OCG_RenderingParams renderingParams;
    LD_OCG_Media mediaSettings;
    LD_OCG_Digital_Printing_Params digitalPrintingParams;
    std::map<LD_PDF*, XMLLayerData*> layerDataMap;
    std::vector<XMLVersionData*> versions;
    std::vector<LD_DieCut*> m_XMLDieCuts;
    LDError lastError = LD_OK;
    uint64_t initializationTime = 0;
    bool defaultLayerMode = false;
    bool exportMode = false;
    char* pageRange = nullptr;  // borrowed from the caller
    int32_t pageRangeMode = PAGE_RANGE_ALL;  // a PageRangeMode
    std::vector<XMLSurfaceData*> surfaceVersions;
    int32_t jobNumber = -1;
    bool printDieLine = false;
    // Inks of each content PDF found for the automatic description (UTF-8 names as the PDF
    // spells them): those to switch off, and those that make the die line.
    std::map<LD_PDF*, std::vector<std::string>> technicalInkMap;
    std::map<LD_PDF*, std::vector<std::string>> dieInkMap;
    wchar_t* dataPath = nullptr;
    bool eskoInksFound = false;
    bool dieCutDefined = false;  // die-cut state flag
    bool dieEnabled = false;
    bool autoDieControl = false;
    char* outputJdfPath = nullptr;  // borrowed from the caller
    wchar_t* ticketDataPath = nullptr;
    std::vector<bool> pageSelection;

private:
    // Releases what this worker owns when it is the last one sharing its records.
    void destroy() noexcept;
    LDError exitWith(LDError code);
    // Copies of one worker share their records; the last one destroyed releases them.
    std::shared_ptr<int> recordShare_;
    // The last job attribute read; getJobAttribute hands out a pointer into it.
    std::string jobAttributeValue_;
};
