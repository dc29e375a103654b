// Reading version descriptions: a typical one, one of many megabytes, many nested names against
// many placed objects, and one huge attribute value. Reports bytes per second and the peak
// resident size of the process (ru_maxrss) after each case.
#include <sys/resource.h>

#include <string>

#include <benchmark/benchmark.h>

#include "vorlan/LD_JDF.h"

namespace {

// OCGs, then versions x surfaces x objects switching them.
std::string makeDescription(int ocgs, int nested, int versions, int surfaces, int objects) {
    std::string text = "<OptionalContentGroupData DefaultLayerMode='true' export='1'>\n";
    for (int i = 0; i < ocgs; ++i)
        text += "<OptionalLayer OCGName='Layer " + std::to_string(i) + "' displayName='Shown " + std::to_string(i) +
                "' isSep='" + (i % 3 ? "false" : "true") + "' default='" + (i % 2 ? "true" : "false") + "'/>\n";
    for (int i = 0; i < nested; ++i)
        text += "<OptionalLayer OCGName='Nested " + std::to_string(i) + "' isNested='true'/>\n";
    text += "<Versions>\n";
    for (int v = 0; v < versions; ++v) {
        text += "<Version name='Version " + std::to_string(v) + "' enable='true' copies='100'>\n";
        for (int s = 0; s < surfaces; ++s) {
            text += "<Surface index='" + std::to_string(s) + "'>";
            for (int o = 0; o < objects; ++o)
                text += "<ContentObject index='" + std::to_string(o) +
                        "' LayerNameOn='Layer 1, Layer 2, Nested 1' LayerNameOff='Layer 4, Layer 5' "
                        "SepNameOn='Layer 0' SepNameOff='Layer 3'/>";
            text += "</Surface>\n";
        }
        text += "</Version>\n";
    }
    text += "</Versions>\n<DieCut enable='true'><Surface index='0' dieSepInternalNames='Layer 0'/></DieCut>\n";
    return text + "</OptionalContentGroupData>\n";
}

void readDescription(benchmark::State& state, const std::string& text) {
    for (auto _ : state) {
        LD_JDF worker;
        LDError result = worker.parseXMLBuffer(text.data(), static_cast<long>(text.size()), false, nullptr);
        if (result != LD_OK) state.SkipWithError("read failed");
        worker.applyClientModeChangesToXMLBufferData();
        benchmark::DoNotOptimize(worker.versions.data());
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations()) * static_cast<int64_t>(text.size()));
    rusage usage{};
    getrusage(RUSAGE_SELF, &usage);
    state.counters["input_MB"] = static_cast<double>(text.size()) / 1e6;
    state.counters["peak_rss_MB"] = static_cast<double>(usage.ru_maxrss) / 1024.0;
}

void Typical(benchmark::State& state) {
    static const std::string text = makeDescription(40, 5, 8, 4, 6);
    readDescription(state, text);
}

void ManyMegabytes(benchmark::State& state) {
    static const std::string text = makeDescription(2000, 200, 200, 50, 10);
    readDescription(state, text);
}

void ManyNestedNamesAndObjects(benchmark::State& state) {
    static const std::string text = makeDescription(20000, 20000, 1, 1, 20000);
    readDescription(state, text);
}

void HugeAttributeValue(benchmark::State& state) {
    static const std::string text =
        "<OptionalContentGroupData><OptionalLayer OCGName='" + std::string(16 << 20, 'x') + "'/></OptionalContentGroupData>";
    readDescription(state, text);
}

}  // namespace

BENCHMARK(Typical)->Unit(benchmark::kMicrosecond);
BENCHMARK(ManyMegabytes)->Unit(benchmark::kMillisecond);
BENCHMARK(ManyNestedNamesAndObjects)->Unit(benchmark::kMillisecond);
BENCHMARK(HugeAttributeValue)->Unit(benchmark::kMillisecond);
BENCHMARK_MAIN();
