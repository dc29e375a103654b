// PDFs, runs, interpreting parameters, ordinal rows and die cuts.
#include <cstdlib>

#include "vorlan/LD_Records.h"

LD_PDF::LD_PDF()
    : url(LD_NewTextBuffer()), mimeType(LD_NewTextBuffer()), nativePath(LD_NewTextBuffer()),
      convertedPath(LD_NewTextBuffer()), firstVariantPath(LD_NewTextBuffer()),
      secondVariantPath(LD_NewTextBuffer()), thirdVariantPath(LD_NewTextBuffer()) {}

LD_PDF::~LD_PDF() {
    for (wchar_t* text : {url, mimeType, nativePath, convertedPath, firstVariantPath, secondVariantPath,
                          thirdVariantPath})
        std::free(text);
}

LD_Run::LD_Run() : runName(LD_NewTextBuffer()) {}

LD_Run::~LD_Run() {
    std::free(runName);
    std::free(VersionName);
}

LD_OCG_InterpretingParams::LD_OCG_InterpretingParams()
    : runName(LD_NewTextBuffer()), OCGDefault(LD_NewTextBuffer()), OCGIntent(LD_NewTextBuffer()),
      OCGProcess(LD_NewTextBuffer()) {
    LD_SetTextBuffer(OCGDefault, L"FromPDF");
    LD_SetTextBuffer(OCGIntent, L"View");
    LD_SetTextBuffer(OCGProcess, L"View");
}

LD_OCG_InterpretingParams::~LD_OCG_InterpretingParams() {
    for (wchar_t* text : {runName, OCGDefault, OCGIntent, OCGProcess}) std::free(text);
    LD_FreeTextList(m_OCGOn);
    LD_FreeTextList(m_OCGOff);
}

LD_OrdinalTableElement::~LD_OrdinalTableElement() {
    delete content;
    delete mark;
}

LD_DieCut::~LD_DieCut() {
    LD_FreeTextList(dieLayerInternalNames);
    LD_FreeTextList(dieSepInternalNames);
}
