// Views into the job model for hosts that use the exported classes.
#include <cstdint>
#include <stdexcept>

#include "vorlan/LD_JDF.h"

namespace {

template <typename T>
std::vector<T*> withStatus(const std::vector<T*>& list, LD_Status status) {
    std::vector<T*> found;
    for (T* item : list)
        if (item->status == status) found.push_back(item);
    return found;
}

}  // namespace

std::vector<LD_PDF*>* LD_JDF::JDF_GetAllContentPDFs() {
    lastError = LD_OK;
    return &contentPDFs;
}

std::vector<LD_PDF*>* LD_JDF::JDF_GetAllMarkPDFs() {
    lastError = LD_OK;
    return &markPDFs;
}

std::vector<LD_PDF*> LD_JDF::JDF_GetContentPDFsByStatus(LD_Status status) { return withStatus(contentPDFs, status); }
std::vector<LD_PDF*> LD_JDF::JDF_GetMarkPDFsByStatus(LD_Status status) { return withStatus(markPDFs, status); }

LD_Status LD_JDF::JDF_GetPDFStatus(wchar_t* name) {
    if (name) {
        for (auto* list : {&contentPDFs, &markPDFs})
            for (LD_PDF* pdf : *list)
                if (std::wcscmp(pdf->url, name) == 0) return pdf->status;
    }
    lastError = LD_QUERY_TARGET_ABSENT;
    return 0;
}

std::vector<LD_Run*>* LD_JDF::JDF_GetAllContentRuns() { return &contentRuns; }
std::vector<LD_Run*>* LD_JDF::JDF_GetAllMarkRuns() { return &markRuns; }
std::vector<LD_OCG_InterpretingParams*>* LD_JDF::JDF_GetAllInterpretingParams() { return &m_InterpretingParams; }
LD_OCG_RenderingParams* LD_JDF::JDF_GetGlobalRenderingParams() { return &renderingParams; }
LD_OCG_Media* LD_JDF::JDF_GetGlobalMediaSettings() { return &mediaSettings; }
LD_OCG_Digital_Printing_Params* LD_JDF::JDF_GetDigitalPrintingParams() { return &digitalPrintingParams; }
std::vector<LD_AuditData*>* LD_JDF::JDF_GetAuditPool() { return &auditPool; }

long LD_JDF::JDF_GetMaxOrdinalNumber() { return static_cast<long>(m_OrdinalTable.size()) - 1; }

// Ordinals outside the 32-bit range name no row.
LD_ContentTableElement* LD_JDF::JDF_GetLogicalContentPageByOrdinalNumber(long ordinal) {
    if (ordinal < INT32_MIN || ordinal > INT32_MAX) return nullptr;
    LD_OrdinalTableElement* row = getOrdinalElementByOrdNum(static_cast<int32_t>(ordinal));
    return row ? row->content : nullptr;
}

LD_MarkTableElement* LD_JDF::JDF_GetLogicalMarkPageByOrdinalNumber(long ordinal) {
    if (ordinal < INT32_MIN || ordinal > INT32_MAX) return nullptr;
    LD_OrdinalTableElement* row = getOrdinalElementByOrdNum(static_cast<int32_t>(ordinal));
    return row ? row->mark : nullptr;
}

long LD_JDF::JDF_GetNumberOfLogicalDocs() { return numberOfLogicalDocs; }
long LD_JDF::JDF_GetNumberOfLogicalPages() { return numberOfLogicalPages; }
long LD_JDF::JDF_GetNumberOfSurfaces() { return numberOfSurfaces; }
long LD_JDF::JDF_GetNumberOfSheets() { return numberOfSheets; }
long LD_JDF::JDF_GetNumberOfSignatures() { return numberOfSignatures; }

LD_Signature* LD_JDF::JDF_GetSignaturesInLayoutByIndex(long index) {
    if (index < 0 || index >= numberOfSignatures || static_cast<size_t>(index) >= signatures.size())
        throw std::out_of_range("signature index out of range");
    return signatures[static_cast<size_t>(index)];
}

LD_Range* LD_JDF::JDF_GetRangeOfSheetsPerSignature(long index) {
    return &JDF_GetSignaturesInLayoutByIndex(index)->sheetRange;
}
