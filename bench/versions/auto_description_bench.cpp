// Writing the description a job without one gets from its inks: a layout of many surfaces, each
// with several content objects, over PDFs with several technical inks each. Reports bytes written
// per second; the cost per surface stays the same as the layout grows.
#include <unistd.h>

#include <cstdio>
#include <string>

#include <benchmark/benchmark.h>

#include "vorlan/LD_JDF.h"

namespace {

constexpr int kPdfs = 20, kInks = 6, kObjectsPerSurface = 8;

void GenerateDescription(benchmark::State& state) {
    const int surfaceCount = static_cast<int>(state.range(0));
    LD_JDF worker;
    for (int p = 0; p < kPdfs; ++p) {
        auto* pdf = new LD_PDF;
        worker.contentPDFs.push_back(pdf);
        for (int i = 0; i < kInks; ++i) {
            worker.technicalInkMap[pdf].push_back("Technical ink " + std::to_string(i) + " & <" + std::to_string(p) + ">");
            worker.dieInkMap[pdf].push_back("Die " + std::to_string((p + i) % 30));
        }
        auto* row = new LD_OrdinalTableElement;
        row->ordinal = p;
        row->content = new LD_ContentTableElement;
        row->content->pdf = pdf;
        worker.m_OrdinalTable.push_back(row);
    }
    for (int s = 0; s < surfaceCount; ++s) {
        auto* surface = new LD_Surface;
        for (int o = 0; o < kObjectsPerSurface; ++o) {
            auto* object = new LD_ContentObject;
            object->contentObjectIndex = s * kObjectsPerSurface + o;
            object->Ord = (s + o) % kPdfs;
            surface->contentObjects.push_back(object);
        }
        worker.surfaces.push_back(surface);
    }
    char path[] = "/tmp/vorlan-auto-description-XXXXXX";
    int fd = mkstemp(path);
    if (fd < 0) {
        state.SkipWithError("no temporary file");
        return;
    }
    close(fd);
    for (auto _ : state) worker.generateImpInfoFile(path);
    std::FILE* written = std::fopen(path, "rb");
    long size = 0;
    if (written && std::fseek(written, 0, SEEK_END) == 0) size = std::ftell(written);
    if (written) std::fclose(written);
    std::remove(path);
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations()) * size);
    state.SetComplexityN(surfaceCount);
    for (LD_Surface* surface : worker.surfaces) delete surface;  // surfaces belong to no signature here
    worker.surfaces.clear();
}

}  // namespace

BENCHMARK(GenerateDescription)->RangeMultiplier(10)->Range(100, 100000)->Complexity()->Unit(benchmark::kMillisecond);
BENCHMARK_MAIN();
