// PDFs, runs, interpreting parameters, ordinal rows and die cuts.
#include <cstdlib>

#include "vorlan/LD_Records.h"

LD_PDF::LD_PDF()
    : url(LD_NewText()), mimeType(LD_NewText()), nativePath(LD_NewText()),
      convertedPath(LD_NewText()), firstVariantPath(LD_NewText()),
      secondVariantPath(LD_NewText()), thirdVariantPath(LD_NewText()) {}

LD_PDF::~LD_PDF() {
    for (wchar_t* text : {url, mimeType, nativePath, convertedPath, firstVariantPath, secondVariantPath,
                          thirdVariantPath})
        std::free(text);
}

LD_Run::LD_Run() : runName(LD_NewText()) {}

LD_Run::~LD_Run() {
    std::free(runName);
    std::free(VersionName);
}

LD_OCG_InterpretingParams::LD_OCG_InterpretingParams()
    : runName(LD_NewText()), OCGDefault(LD_NewText(L"FromPDF")), OCGIntent(LD_NewText(L"View")),
      OCGProcess(LD_NewText(L"View")) {}

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
