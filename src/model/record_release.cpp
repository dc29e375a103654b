// Release of the worker's records: one function per owner list.
#include <cstdlib>

#include "jdf/ticket_handles.h"
#include "vorlan/LD_JDF.h"

void LD_JDF::releaseLayout() {
    for (LD_Signature* signature : signatures) delete signature;  // frees sheets, surfaces, objects
    signatures.clear();
    if (ticket) ticket->displacedSurfaces->clear();
    sheets.clear();
    surfaces.clear();
    contentObjects.clear();
    markObjects.clear();
}

void LD_JDF::releaseOrdinalTable() {
    for (LD_OrdinalTableElement* row : m_OrdinalTable) delete row;
    m_OrdinalTable.clear();
}

void LD_JDF::releasePDFs(std::vector<LD_PDF*>& pdfs) {
    for (LD_PDF* pdf : pdfs) {
        if (pdf == inputPDF) inputPDF = nullptr;
        delete pdf;
    }
    pdfs.clear();
}

void LD_JDF::releaseRuns(std::vector<LD_Run*>& runs) {
    for (LD_Run* run : runs) delete run;
    runs.clear();
}

void LD_JDF::releaseInterpretingParams() {
    for (LD_OCG_InterpretingParams* params : m_InterpretingParams) delete params;
    m_InterpretingParams.clear();
}

void LD_JDF::releaseVersions() {
    for (XMLVersionData* version : versions) delete version;
    versions.clear();
}

void LD_JDF::releaseSurfaceVersions() {
    for (XMLSurfaceData* surface : surfaceVersions) delete surface;
    surfaceVersions.clear();
}

void LD_JDF::releaseDieCuts() {
    for (LD_DieCut* die : m_XMLDieCuts) delete die;
    m_XMLDieCuts.clear();
}

void LD_JDF::releaseLayerData() {
    for (auto& [pdf, layers] : layerDataMap) delete layers;
    layerDataMap.clear();
    technicalInkMap.clear();
    dieInkMap.clear();
}

void LD_JDF::releaseJobRecords() {
    releaseLayout();
    releaseOrdinalTable();
    releasePDFs(contentPDFs);
    releasePDFs(markPDFs);
    releaseRuns(contentRuns);
    releaseRuns(markRuns);
    releaseVersions();
    releaseDieCuts();
    contentObjectOrdinalMap.clear();
}

void LD_JDF::releaseAllRecords() {
    releaseJobRecords();
    releaseInterpretingParams();
    releaseSurfaceVersions();
    releaseLayerData();
    LD_FreeTextList(layerNameList);
    LD_FreeTextList(nestedComponentList);
    for (LD_AuditData* audit : auditPool) delete audit;
    auditPool.clear();
    delete inputPDF;
    inputPDF = nullptr;
}
