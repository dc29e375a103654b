#include "jobpaths/spot_mode.h"

#include <unordered_set>

#include "entry/host_paths.h"
#include "jobpaths/separation_variants.h"
#include "vorlan/LD_JDF.h"

using vorlan::jobpaths::appendEachOnce;

SpotModeProcessingJdf::SpotModeProcessingJdf(const char* outputPath, LD_JDF* worker)
    : outputPath_(outputPath ? outputPath : ""), worker_(worker) {}

LDError SpotModeProcessingJdf::buildSeparationLists() {
    LD_JDF& w = *worker_;
    switchedOn_.clear();
    dieSeparations_.clear();
    const LD_DieCut* die = w.m_XMLDieCuts.size() == 1 ? w.m_XMLDieCuts.front() : nullptr;
    if (!w.versions.empty() && w.versions.front()) {
        // A version can only switch what the layout places.
        std::unordered_set<int32_t> surfaces, objects;
        for (const LD_Surface* surface : w.surfaces)
            if (surface) surfaces.insert(surface->index);
        for (const LD_ContentObject* object : w.contentObjects)
            if (object) objects.insert(object->contentObjectIndex);
        for (const XMLSurfaceData* surface : w.versions.front()->surfaces) {
            if (!surface || !surfaces.count(surface->index)) return LD_REFERENCE_OUT_OF_RANGE;
            for (const XMLContentObjectData* object : surface->contentObjects) {
                if (!object || !objects.count(object->index)) return LD_REFERENCE_OUT_OF_RANGE;
                appendEachOnce(switchedOn_, object->sepNameOn);
            }
        }
    }
    if (die) {
        appendEachOnce(switchedOn_, die->dieSepInternalNames);
        appendEachOnce(dieSeparations_, die->dieSepInternalNames);
    }
    contentSeparations_ = vorlan::jobpaths::without(switchedOn_, dieSeparations_);
    return LD_OK;
}

void SpotModeProcessingJdf::writeVariants() {
    LD_JDF& w = *worker_;
    for (auto& [pdf, layers] : w.layerDataMap) {
        if (!pdf) continue;
        // The host names the three files first, in the order the variants are listed.
        const std::string first = askHostForFilePath(w);
        const std::string second = askHostForFilePath(w);
        const std::string third = askHostForFilePath(w);
        vorlan::jobpaths::setVariantPath(pdf->firstVariantPath, first);
        vorlan::jobpaths::setVariantPath(pdf->secondVariantPath, second);
        vorlan::jobpaths::setVariantPath(pdf->thirdVariantPath, third);
        const std::vector<int> written = vorlan::jobpaths::writeSeparationVariants(
            w, pdf->nativePath,
            {{first, switchedOn_, false}, {second, dieSeparations_, true}, {third, contentSeparations_, false}});
        pdf->firstVariantWritten = written[0] == 0;
        pdf->secondVariantWritten = written[1] == 0;
        pdf->thirdVariantWritten = written[2] == 0;
    }
}

void SpotModeProcessingJdf::addDieSheets() {
    LD_JDF& w = *worker_;
    if (w.m_XMLDieCuts.size() != 1 || (w.versions.empty() && w.surfaces.empty())) return;
    const int32_t n = static_cast<int32_t>(w.m_OrdinalTable.size());
    int32_t offset = n;
    for (ContentType type : {CONTENT_DIE_WITH_CONTENT, CONTENT_DIE_ONLY}) {
        LD_Sheet* sheet = w.appendDieSheetInLayout(0, type);
        if (!sheet) return;
        for (LD_Surface* surface : {sheet->front, sheet->back}) {
            if (!surface) continue;
            for (LD_ContentObject* object : surface->contentObjects)
                if (object) object->Ord += offset;
            for (LD_MarkObject* mark : surface->markObjects)
                if (mark) mark->Ord += offset;
        }
        offset += n;
    }
}

LDError SpotModeProcessingJdf::run() {
    LD_JDF& w = *worker_;
    if (LDError listed = buildSeparationLists(); listed != LD_OK) {
        w.lastError = listed;
        return listed;
    }
    writeVariants();
    if (w.pageRangeMode != PAGE_RANGE_ALL) w.applyPageRangeForLayout();
    if (w.dieEnabled) {
        addDieSheets();
        w.AddDieInfoFile("KVDieDefined", 1);
        w.setJobAttribute("KVDieDefined", "True");
    }
    return writeTicket();
}
