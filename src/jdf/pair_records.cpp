// Runs and interpreting parameters made by version expansion and the die steps.
#include "jdf/pair_records.h"

#include <cstdlib>

namespace vorlan::jdf {

LD_Run* newPageRun(LD_PDF* pdf, int32_t page, ContentType type) {
    auto* run = new LD_Run;
    run->pdf = pdf;
    run->pages.push_back(page);
    run->contentType = type;
    return run;
}

LD_Run* copyRun(const LD_Run* run) {
    auto* made = new LD_Run;
    LD_SetText(made->runName, run->runName);
    made->runNumber = run->runNumber;
    made->pages = run->pages;
    made->NPage = run->NPage;
    made->SkipPage = run->SkipPage;
    made->FirstPage = run->FirstPage;
    made->EndOfDocument = run->EndOfDocument;
    made->IsBlank = run->IsBlank;
    made->pdf = run->pdf;
    made->VersionName = LD_CopyText(run->VersionName);
    made->VersionIndex = run->VersionIndex;
    made->VersionCopyCount = run->VersionCopyCount;
    made->contentType = CONTENT_DIE_ONLY;
    return made;
}

void appendNameCopies(std::vector<wchar_t*>& destination, const std::vector<wchar_t*>& source) {
    destination.reserve(destination.size() + source.size());
    for (const wchar_t* name : source) destination.push_back(LD_CopyText(name));
}

LD_OCG_InterpretingParams* newVersionParams(const XMLContentObjectData& entry) {
    auto* params = new LD_OCG_InterpretingParams;
    appendNameCopies(params->m_OCGOn, entry.layerNameOn);
    appendNameCopies(params->m_OCGOn, entry.sepNameOn);
    appendNameCopies(params->m_OCGOff, entry.layerNameOff);
    appendNameCopies(params->m_OCGOff, entry.sepNameOff);
    return params;
}

}  // namespace vorlan::jdf
