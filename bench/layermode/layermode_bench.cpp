// Layer-mode consume time on a generated ticket job: S surfaces (two-sided sheets) with 8
// content objects each and 20 versions, each version on its own run of sheets switching its own
// language layer for every object. Runs the job at S and at factor × S through
// vorlan_consume_job and checks that the time grows linearly (factor × the job within
// 1.2 × factor the time).
//
//     layermode_bench [surfaces=5000] [factor=10]
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <string>

#include "job_builder.h"
#include "test_support.h"

namespace fs = std::filesystem;
using namespace layermode_test;

namespace {

constexpr int kObjects = 8;
constexpr int kVersions = 20;

std::string description(int surfaces) {
    std::vector<LayerSpec> layers = {{"Base", false, true}};
    for (int v = 0; v < kVersions; ++v) layers.push_back({"Lang" + std::to_string(v), false, false});
    std::vector<VersionSpec> versions;
    for (int v = 0; v < kVersions; ++v) {
        VersionSpec version{"Version " + std::to_string(v), 100 + v, true, {}};
        for (int s = v * surfaces / kVersions; s < (v + 1) * surfaces / kVersions; ++s) {
            SurfaceSwitch surface{s, {}};
            for (int o = 0; o < kObjects; ++o)
                surface.objects.push_back({s * kObjects + o, "Base,Lang" + std::to_string(v), "", "", ""});
            version.surfaces.push_back(surface);
        }
        versions.push_back(version);
    }
    return descriptionXml(layers, versions);
}

// Seconds to consume a freshly generated job of that many surfaces (generation not counted).
double consumeSeconds(int surfaces) {
    vorlan::test::TempDir tmp;
    TicketSpec shape;
    shape.sheets = surfaces / 2;
    shape.objectsPerSurface = kObjects;
    shape.pagePartitions = true;  // one Run partition per page, as this writer itself writes them
    Job job = writeTicketJob(tmp.path(), shape, description(surfaces));
    setenv("VORLAN_JOB_STORE", (tmp / "store").c_str(), 1);
    auto start = std::chrono::steady_clock::now();
    int rc = consume(job);
    double seconds = std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    std::uintmax_t size = fs::exists(job.output) ? fs::file_size(job.output) : 0;
    std::printf("%6d surfaces, %7d content objects, %d versions: result %d, %.2f s, ticket %.1f MB\n", surfaces,
                surfaces * kObjects, kVersions, rc, seconds, static_cast<double>(size) / 1e6);
    if (rc != 0) std::exit(2);
    return seconds;
}

}  // namespace

int main(int argc, char** argv) {
    int surfaces = argc > 1 ? std::atoi(argv[1]) : 5000;
    int factor = argc > 2 ? std::atoi(argv[2]) : 10;
    double base = consumeSeconds(surfaces);
    double scaled = consumeSeconds(surfaces * factor);
    double ratio = scaled / base;
    std::printf("%dx the job took %.2fx the time (linear: at most %.1fx)\n", factor, ratio, 1.2 * factor);
    return ratio <= 1.2 * factor ? 0 : 1;
}
