#include "jobpaths/pdf_only.h"

#include "entry/host_paths.h"
#include "jdf/page_selection.h"
#include "jobpaths/separation_variants.h"
#include "pdf/page_geometry.h"
#include "platform/os/text.h"

using vorlan::jobpaths::appendEachOnce;

PdfOnlyProcessingJdf::PdfOnlyProcessingJdf(const char* outputPath, LD_JDF* worker)
    : outputPath_(outputPath ? outputPath : ""), worker_(worker) {}

PdfOnlyProcessingJdf::~PdfOnlyProcessingJdf() = default;

const XMLContentObjectData* PdfOnlyProcessingJdf::firstContentObject() const {
    const LD_JDF& w = *worker_;
    const XMLSurfaceData* surface = nullptr;
    if (w.exportMode) {
        const XMLVersionData* version = w.versions.empty() ? nullptr : w.versions.front();
        surface = version && !version->surfaces.empty() ? version->surfaces.front() : nullptr;
    } else if (!w.surfaceVersions.empty()) {
        surface = w.surfaceVersions.front();
    }
    return surface && !surface->contentObjects.empty() ? surface->contentObjects.front() : nullptr;
}

void PdfOnlyProcessingJdf::buildSeparationLists() {
    LD_JDF& w = *worker_;
    all_.clear();
    die_.clear();
    switchedOff_.clear();
    auto layers = w.layerDataMap.find(w.inputPDF);
    if (layers != w.layerDataMap.end() && layers->second)
        for (const wchar_t* name : layers->second->sepOCGNames) all_.push_back(vorlan::os::narrow(name));

    if (const XMLContentObjectData* object = firstContentObject()) {
        vorlan::jobpaths::NameList on;
        appendEachOnce(on, object->sepNameOn);
        switchedOff_ = vorlan::jobpaths::without(all_, on);
    }
    if (w.m_XMLDieCuts.size() == 1 && w.m_XMLDieCuts.front())
        for (const wchar_t* name : w.m_XMLDieCuts.front()->dieSepInternalNames) die_.push_back(vorlan::os::narrow(name));
    contentOff_ = vorlan::jobpaths::without(switchedOff_, die_);
}

LD_PDF* PdfOnlyProcessingJdf::variantPdf(const std::string& path) {
    auto pdf = std::make_unique<LD_PDF>();
    vorlan::jobpaths::setVariantPath(pdf->convertedPath, path);
    LD_SetText(pdf->mimeType, worker_->inputPDF->mimeType);
    pdf->status = worker_->inputPDF->status;
    pdf->converted = true;
    variants_.push_back(std::move(pdf));
    return variants_.back().get();
}

void PdfOnlyProcessingJdf::makeRuns(int32_t pages) {
    LD_JDF& w = *worker_;
    auto newRun = [&](ContentType type) {
        auto run = std::make_unique<LD_Run>();
        run->contentType = type;
        run->NPage = pages;
        run->pdf = w.inputPDF;
        const XMLVersionData* version = w.versions.empty() ? nullptr : w.versions.front();
        if (type != CONTENT_DIE_ONLY && w.exportMode && version) {
            run->VersionName = LD_CopyText(version->name);
            run->VersionIndex = version->position;
            run->VersionCopyCount = version->copies;
        }
        return run;
    };
    contentRun_ = newRun(CONTENT_CONTENT);
    dieWithContentRun_ = newRun(CONTENT_DIE_WITH_CONTENT);

    // Each variant the runs need, in the order the host is asked for the files: content,
    // die with content, die only. They are written from one reading of the PDF.
    struct Wanted {
        LD_Run* run;
        vorlan::pdf::SeparationVariant variant;
    };
    std::vector<Wanted> wanted;
    if (!switchedOff_.empty()) wanted.push_back({contentRun_.get(), {askHostForFilePath(w), switchedOff_, false}});
    if (!contentOff_.empty())
        wanted.push_back({dieWithContentRun_.get(), {askHostForFilePath(w), contentOff_, false}});
    std::unique_ptr<LD_Run> dieOnly;
    if (!die_.empty()) {
        dieOnly = newRun(CONTENT_DIE_ONLY);
        wanted.push_back({dieOnly.get(), {askHostForFilePath(w), die_, true}});
    }
    std::vector<vorlan::pdf::SeparationVariant> variants;
    for (const Wanted& entry : wanted) variants.push_back(entry.variant);
    const std::vector<int> written = vorlan::jobpaths::writeSeparationVariants(w, w.inputPDF->nativePath, variants);
    for (size_t i = 0; i < wanted.size(); ++i)
        if (written[i] == 0) wanted[i].run->pdf = variantPdf(wanted[i].variant.output);
    // Without its variant the die-only run would print the whole page: it is left out.
    if (dieOnly && dieOnly->pdf != w.inputPDF) dieOnlyRun_ = std::move(dieOnly);
}

LDError PdfOnlyProcessingJdf::run() {
    LD_JDF& w = *worker_;
    buildSeparationLists();
    if (w.jobHasTicket || !w.inputPDF) return w.lastError = LD_INVALID_INPUT;
    const std::string input = vorlan::os::narrow(w.inputPDF->nativePath);
    const int32_t pages = getPDFPageCount(w.zipFileSystem, input.c_str());
    if (pages <= 0) return w.lastError = LD_INVALID_INPUT;
    makeRuns(pages);

    std::vector<bool> selected(static_cast<size_t>(pages), true);
    if (w.pageRangeMode != 0) selected = selectPositions(w, static_cast<size_t>(pages));
    pages_.clear();
    for (int32_t page = 0; page < pages; ++page)
        if (selected[static_cast<size_t>(page)]) pages_.push_back(page);

    if (w.dieEnabled && dieOnlyRun_) {
        w.AddDieInfoFile("KVDieDefined", 1);
        w.setJobAttribute("KVDieDefined", "True");
    }
    return writeTicket();
}
