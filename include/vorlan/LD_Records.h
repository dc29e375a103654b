// The job model: records the worker LD_JDF holds for one job.
//
// Records are plain structures created with new and referred to by raw pointers; a pointer may
// stand in several lists, and exactly one owner list frees it. Text is wide, NUL-terminated and
// allocated with the C allocator (free it with free()). Each text is allocated at the length it
// holds; the library reallocates it when it changes the text, so a text's address may change and
// nothing outside the library writes into one. Texts set from a ticket or a description are cut
// to LD_TEXT_BUFFER_CHARS - 1 characters (file paths made for a job are kept whole).
#pragma once

#include <cstdint>
#include <cwchar>
#include <initializer_list>
#include <memory>
#include <vector>

#include "vorlan_export.h"

// The longest text a ticket or description value is cut to, terminator included (a 1024-byte
// buffer of 16-bit characters on the original platform).
inline constexpr size_t LD_TEXT_BUFFER_CHARS = 512;

// The JDF library's status value of the element a record describes (3 and 7 are set by us).
typedef int32_t LD_Status;
// The JDF library's activation value of a process node.
typedef int32_t LD_Activation;

enum JDFNode_Types : int32_t {
    JDF_NODE_ROOT = 0,                 // the ticket's root JDF node
    JDF_NODE_PROCESS = 1,              // the process (imposition) node found by the reader
    JDF_NODE_LAYOUT = 2,               // the Layout resource
    JDF_NODE_INTERPRETING_PARAMS = 3,  // the InterpretingParams resource
};

enum InputDataFileTypes : int32_t {
    INPUT_FOLDER = 0,
    INPUT_COMPRESSED = 1,
    INPUT_PDF = 2,
    INPUT_UNKNOWN = 3,
    INPUT_MISSING = 4,
};

enum ContentType : int32_t {
    CONTENT_UNDEFINED = -1,
    CONTENT_DIE_ONLY = 0,
    CONTENT_DIE_WITH_CONTENT = 1,
    CONTENT_CONTENT = 2,
};

// Wide text helpers for records. Every returned block is freed with free().
wchar_t* LD_NewText(const wchar_t* text = L"");     // exact-size copy, cut to LD_TEXT_BUFFER_CHARS - 1
wchar_t* LD_CopyText(const wchar_t* text);          // exact-size copy; null for null
// Replaces field by text (empty for null), cut to LD_TEXT_BUFFER_CHARS - 1 characters and
// reallocated at that length. When memory runs out the field keeps its old text.
void LD_SetText(wchar_t*& field, const wchar_t* text);
void LD_FreeTextList(std::vector<wchar_t*>& list);  // frees every entry and clears

// The page list of a run. Copies share one list until one of them changes it (copy on write), so
// copying a run that covers a whole document costs nothing until the copy's pages differ. Reads
// look like those of a std::vector<int32_t>.
class LD_PageList {
public:
    using value_type = int32_t;
    using const_iterator = std::vector<int32_t>::const_iterator;

    LD_PageList() = default;
    LD_PageList(std::vector<int32_t> pages);  // NOLINT: a vector converts, as assignment did
    LD_PageList(std::initializer_list<int32_t> pages) : LD_PageList(std::vector<int32_t>(pages)) {}

    const std::vector<int32_t>& values() const;
    operator const std::vector<int32_t>&() const { return values(); }  // NOLINT: reads as the vector
    size_t size() const { return values().size(); }
    bool empty() const { return values().empty(); }
    const_iterator begin() const { return values().begin(); }
    const_iterator end() const { return values().end(); }
    int32_t front() const { return values().front(); }
    int32_t operator[](size_t i) const { return values()[i]; }

    void push_back(int32_t page);
    void clear() { shared_.reset(); }
    // Sorts ascending. A list already in order is left as it is (and stays shared).
    void sort();
    // Same pages in the same order; lists sharing storage compare in constant time.
    bool operator==(const LD_PageList& other) const;
    bool operator!=(const LD_PageList& other) const { return !(*this == other); }

private:
    struct Pages;
    std::vector<int32_t>& own();  // this list's own storage, copied first if shared
    std::shared_ptr<Pages> shared_;
};

struct LD_PDF {
    int32_t index = -1;
    wchar_t* url = nullptr;
    wchar_t* mimeType = nullptr;
    LD_Status status = 0;
    wchar_t* nativePath = nullptr;
    wchar_t* convertedPath = nullptr;
    wchar_t* firstVariantPath = nullptr;
    wchar_t* secondVariantPath = nullptr;
    wchar_t* thirdVariantPath = nullptr;
    bool converted = false;
    bool firstVariantWritten = false;
    bool secondVariantWritten = false;
    bool thirdVariantWritten = false;

    LD_PDF();  // the seven texts start empty
    ~LD_PDF();
    LD_PDF(const LD_PDF&) = delete;
    LD_PDF& operator=(const LD_PDF&) = delete;
};

struct LD_Run {
    wchar_t* runName = nullptr;
    int32_t runNumber = 0;
    LD_PageList pages;
    int32_t NPage = -1;
    int32_t SkipPage = 2147483647;
    int32_t FirstPage = 2147483647;
    bool EndOfDocument = false;
    bool IsBlank = false;
    LD_PDF* pdf = nullptr;  // shared with the PDF lists
    wchar_t* VersionName = nullptr;
    int32_t VersionIndex = -1;
    int64_t VersionCopyCount = -1;
    ContentType contentType = CONTENT_UNDEFINED;

    LD_Run();  // runName starts empty
    ~LD_Run();
    LD_Run(const LD_Run&) = delete;
    LD_Run& operator=(const LD_Run&) = delete;
};

struct LD_OCG_InterpretingParams {
    wchar_t* runName = nullptr;
    int32_t runNumber = 0;
    LD_Status status = 7;
    bool OCGOnEmpty = false;
    wchar_t* OCGDefault = nullptr;  // "FromPDF"
    wchar_t* OCGIntent = nullptr;   // "View"
    wchar_t* OCGProcess = nullptr;  // "View"
    std::vector<int32_t> runNumbers;
    std::vector<wchar_t*> m_OCGOn;
    std::vector<wchar_t*> m_OCGOff;

    LD_OCG_InterpretingParams();
    ~LD_OCG_InterpretingParams();
    LD_OCG_InterpretingParams(const LD_OCG_InterpretingParams&) = delete;
    LD_OCG_InterpretingParams& operator=(const LD_OCG_InterpretingParams&) = delete;
};

struct LD_OCG_RenderingParams {
    LD_Status status = 0;
    const wchar_t* Class = L"Parameter";
    bool Interleaved = true;
};

struct LD_OCG_Digital_Printing_Params {
    const wchar_t* Class = L"Parameter";
};

struct LD_OCG_Media {
    wchar_t* Class = nullptr;  // "Consumable"
    LD_Status status = 3;
    double height = -1;
    double width = -1;
    wchar_t* DescriptiveName = nullptr;
    wchar_t* GrainDirection = nullptr;
    wchar_t* MediaUnit = nullptr;
    double Thickness = 0;
    double Weight = 0;

    LD_OCG_Media();
    ~LD_OCG_Media();
    LD_OCG_Media(const LD_OCG_Media& other);  // deep copy of every text
    LD_OCG_Media& operator=(const LD_OCG_Media& other);
};

struct LD_Point {
    double x = -1;
    double y = -1;
    wchar_t* text = nullptr;

    LD_Point() = default;
    ~LD_Point();
    LD_Point(const LD_Point& other);
    LD_Point& operator=(const LD_Point& other);
};

struct LD_Box {
    LD_Point lowerLeft;
    LD_Point upperRight;
    wchar_t* text = nullptr;

    LD_Box() = default;
    ~LD_Box();
    LD_Box(const LD_Box& other);
    LD_Box& operator=(const LD_Box& other);
};

struct LD_CTM {
    double a = 1, b = 0, c = 0, d = 1, e = 0, f = 0;
    wchar_t* text = nullptr;

    LD_CTM() = default;
    ~LD_CTM();
    LD_CTM(const LD_CTM& other);
    LD_CTM& operator=(const LD_CTM& other);
};

// Operands of one clip-path operation; the geometry parser defines one subclass per operator.
class LD_ClipPathOperands {
public:
    virtual ~LD_ClipPathOperands();
    virtual LD_ClipPathOperands* clone() const = 0;
};

enum LD_ClipPathOperator : int32_t {
    CLIP_MOVETO = 0,
    CLIP_LINETO = 1,
    CLIP_CURVETO = 2,
    CLIP_CURVETO_V = 3,
    CLIP_CURVETO_Y = 4,
    CLIP_CLOSEPATH = 5,
    CLIP_RECTANGLE = 6,
};

struct LD_ClipPathOperations {
    int32_t operation = CLIP_MOVETO;
    LD_ClipPathOperands* operands = nullptr;  // null for closepath; owned

    LD_ClipPathOperations() = default;
    ~LD_ClipPathOperations();
    LD_ClipPathOperations(const LD_ClipPathOperations&) = delete;
    LD_ClipPathOperations& operator=(const LD_ClipPathOperations&) = delete;
};

struct LD_ContentObject {
    int32_t objectIndex = -1;
    int32_t contentObjectIndex = -1;
    int32_t surfaceIndex = -1;
    LD_CTM* CTM = nullptr;  // always allocated
    LD_Box* ClipBox = nullptr;
    std::vector<LD_ClipPathOperations*>* ClipPath = nullptr;
    int32_t Ord = -1;
    LD_CTM* TrimCTM = nullptr;
    LD_Point* TrimSize = nullptr;
    wchar_t* clipPathText = nullptr;
    bool CachePlacedObject = false;
    bool IgnoreClipForReuse = false;
    bool ordRepeated = false;

    LD_ContentObject();
    ~LD_ContentObject();
    LD_ContentObject(const LD_ContentObject&) = delete;
    LD_ContentObject& operator=(const LD_ContentObject&) = delete;
    LD_ContentObject* copy() const;  // deep copy: shares no pointer with this object
};

struct LD_MarkObject {
    int32_t objectIndex = -1;
    int32_t markObjectIndex = -1;
    int32_t surfaceIndex = -1;
    LD_CTM* CTM = nullptr;  // always allocated
    LD_Box* ClipBox = nullptr;
    int32_t Ord = -1;
    LD_CTM* TrimCTM = nullptr;
    LD_Point* TrimSize = nullptr;

    LD_MarkObject();
    ~LD_MarkObject();
    LD_MarkObject(const LD_MarkObject&) = delete;
    LD_MarkObject& operator=(const LD_MarkObject&) = delete;
    LD_MarkObject* copy() const;  // deep copy
};

struct LD_Range {
    int32_t first = -1;
    int32_t last = -1;
};

struct LD_Surface {
    int32_t index = -1;
    int32_t sheetIndex = -1;
    bool isFront = false;
    bool isEmpty = true;
    bool isSelected = true;
    LD_Box* SurfaceContentsBox = nullptr;  // always allocated
    LD_OCG_Media* media = nullptr;
    std::vector<LD_ContentObject*> contentObjects;  // owned
    std::vector<LD_MarkObject*> markObjects;        // owned
    wchar_t* VersionName = nullptr;
    int32_t VersionIndex = -1;
    int64_t VersionCopyCount = 0;
    ContentType contentType = CONTENT_UNDEFINED;
    bool StepAndRepeat = false;

    LD_Surface();
    ~LD_Surface();  // frees its objects, box, media and version name
    LD_Surface(const LD_Surface&) = delete;
    LD_Surface& operator=(const LD_Surface&) = delete;
    // Deep copy for die sheets; contentType is not copied (the copy starts with 0).
    LD_Surface* copy() const;
};

struct LD_Sheet {
    int32_t index = -1;
    int32_t numberInSignature = -1;
    int32_t signatureIndex = -1;
    wchar_t* name = nullptr;
    LD_Surface* front = nullptr;  // owned
    LD_Surface* back = nullptr;   // owned
    LD_OCG_Media* media = nullptr;

    LD_Sheet();
    ~LD_Sheet();  // frees name, media and both surfaces
    LD_Sheet(const LD_Sheet&) = delete;
    LD_Sheet& operator=(const LD_Sheet&) = delete;
};

struct LD_Signature {
    int32_t index = -1;
    wchar_t* name = nullptr;
    LD_Range sheetRange;
    std::vector<LD_Sheet*> sheetList;  // owned
    LD_OCG_Media* media = nullptr;

    LD_Signature();
    ~LD_Signature();  // frees name, media and every sheet
    LD_Signature(const LD_Signature&) = delete;
    LD_Signature& operator=(const LD_Signature&) = delete;
};

struct LD_ContentTableElement {
    LD_PDF* pdf = nullptr;
    int32_t page = 10000;
    LD_Run* run = nullptr;
    LD_OCG_InterpretingParams* interpretingParams = nullptr;
};

struct LD_MarkTableElement {
    LD_PDF* pdf = nullptr;
    int32_t page = 10000;
    LD_Run* run = nullptr;
};

struct LD_OrdinalTableElement {
    int32_t ordinal = 0;
    LD_ContentTableElement* content = nullptr;  // owned
    LD_MarkTableElement* mark = nullptr;        // owned
    int32_t logicalDocument = 0;

    LD_OrdinalTableElement() = default;
    ~LD_OrdinalTableElement();
    LD_OrdinalTableElement(const LD_OrdinalTableElement&) = delete;
    LD_OrdinalTableElement& operator=(const LD_OrdinalTableElement&) = delete;
};

// One entry of the content-object ordinal map: a content object's Ord and its index.
struct LD_ContentObjectOrdinal {
    int32_t ord = 0;
    int32_t contentObjectIndex = 0;
};

struct LD_DieCut {
    int32_t index = 0;
    std::vector<wchar_t*> dieLayerInternalNames;
    std::vector<wchar_t*> dieSepInternalNames;

    LD_DieCut() = default;
    ~LD_DieCut();
    LD_DieCut(const LD_DieCut&) = delete;
    LD_DieCut& operator=(const LD_DieCut&) = delete;
};

// Element of the audit pool list, which stays empty.
struct LD_AuditData {};
