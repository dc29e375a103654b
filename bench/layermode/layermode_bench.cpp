// Layer-mode consume on generated ticket jobs: S surfaces (two-sided sheets) with 8 content
// objects each and 20 versions, each version on its own run of sheets switching its own language
// layer for every object. Both run-list shapes are measured: one Run partition per page (as this
// library writes tickets) and the whole document as one partition whose Pages cover every page (as
// imposition tools write them). Each job runs through vorlan_consume_job in a fresh process, so
// its time and peak memory are its own.
//
//     layermode_bench [--shape pages|one-run|both] [--sizes 1000,10000] [--runs 3] [--keep]
//
// Each size runs --runs times; the best CPU time and the highest peak memory count.
//
// Goals: 10x the job in at most 10.5x the time (each size against the first), and peak memory at
// most 4x the output ticket's size. Exit status 1 when a goal does not hold, 2 when a job fails.
#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <string>
#include <vector>

#include "child_process.h"
#include "job_builder.h"
#include "platform/os/text.h"
#include "test_support.h"

namespace fs = std::filesystem;
using namespace layermode_test;
using namespace vorlan::bench;

namespace {

constexpr int kObjects = 8;
constexpr int kVersions = 20;
constexpr double kTimeSlack = 1.05;   // 10x the job in at most 10.5x the time
constexpr double kMemoryPerTicket = 4.0;

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

struct Result {
    ChildRun run;
    double ticketMb = 0;
};

Result measure(const char* self, const fs::path& root, int surfaces, bool pagePartitions) {
    TicketSpec shape;
    shape.sheets = surfaces / 2;
    shape.objectsPerSurface = kObjects;
    shape.pagePartitions = pagePartitions;
    Job job = writeTicketJob(root, shape, description(surfaces));
    Result result;
    result.run = runProgram({self, "--child", root.string()});
    if (fs::exists(job.output)) result.ticketMb = static_cast<double>(fs::file_size(job.output)) / 1e6;
    return result;
}

// The child: consume the job generated in root.
int consumeIn(const fs::path& root) {
    if (!std::freopen("/dev/null", "w", stdout)) return 2;  // the reader prints its timing
    setenv("VORLAN_JOB_STORE", (root / "store").c_str(), 1);
    return consume(ticketJobAt(root));
}

std::vector<int> sizesFrom(const std::string& list) {
    std::vector<int> sizes;
    for (const std::string& item : vorlan::os::splitList<char>(list, ","))
        if (std::atoi(item.c_str()) > 0) sizes.push_back(std::atoi(item.c_str()));
    return sizes;
}

}  // namespace

int main(int argc, char** argv) {
    if (argc == 3 && std::strcmp(argv[1], "--child") == 0) return consumeIn(argv[2]);
    std::string shapes = "both";
    std::vector<int> sizes = {1000, 10000};
    bool keep = false;
    int runs = 3;
    for (int i = 1; i < argc; ++i) {
        if (!std::strcmp(argv[i], "--shape") && i + 1 < argc) shapes = argv[++i];
        else if (!std::strcmp(argv[i], "--sizes") && i + 1 < argc) sizes = sizesFrom(argv[++i]);
        else if (!std::strcmp(argv[i], "--keep")) keep = true;
        else if (!std::strcmp(argv[i], "--runs") && i + 1 < argc) runs = std::max(1, std::atoi(argv[++i]));
        else {
            std::fprintf(stderr, "usage: layermode_bench [--shape pages|one-run|both] [--sizes N,N...] [--runs N] [--keep]\n");
            return 2;
        }
    }
    if (sizes.empty()) return 2;
    const fs::path self = fs::read_symlink("/proc/self/exe");
    bool held = true;
    std::printf("%-8s %9s %8s %9s %10s %9s %11s %s\n", "shape", "surfaces", "wall s", "cpu s", "peak MB", "ticket MB",
                "peak/ticket", "growth (time vs size)");
    for (bool pages : {true, false}) {
        if (shapes != "both" && shapes != (pages ? "pages" : "one-run")) continue;
        double baseCpu = 0;
        for (size_t k = 0; k < sizes.size(); ++k) {
            const fs::path root = fs::temp_directory_path() /
                                  ("vorlan-layermode-bench-" + std::to_string(getpid()) + "-" + std::to_string(k));
            // Best time of the runs (the least disturbed by other load), highest peak memory.
            Result r;
            for (int run = 0; run < runs; ++run) {
                fs::remove_all(root);
                const Result one = measure(self.c_str(), root, sizes[k], pages);
                if (!keep || run + 1 < runs) fs::remove_all(root);
                if (one.run.status != 0) {
                    std::printf("%-8s %9d  job failed with status %d\n", pages ? "pages" : "one-run", sizes[k],
                                one.run.status);
                    return 2;
                }
                const long peak = std::max(r.run.peakKb, one.run.peakKb);
                if (run == 0 || one.run.cpuSeconds < r.run.cpuSeconds) r = one;
                r.run.peakKb = peak;
            }
            const double peakMb = static_cast<double>(r.run.peakKb) / 1024;
            const double perTicket = peakMb / r.ticketMb;
            held = held && perTicket <= kMemoryPerTicket;
            char growth[96] = "";
            if (k == 0) {
                baseCpu = r.run.cpuSeconds;
            } else {
                const double jobRatio = static_cast<double>(sizes[k]) / sizes[0];
                const double timeRatio = r.run.cpuSeconds / baseCpu;
                const bool linear = timeRatio <= kTimeSlack * jobRatio;
                held = held && linear;
                std::snprintf(growth, sizeof growth, "%.1fx job: %.2fx time (goal <= %.2fx) %s", jobRatio, timeRatio,
                              kTimeSlack * jobRatio, linear ? "ok" : "OVER");
            }
            std::printf("%-8s %9d %8.2f %9.2f %10.1f %9.1f %8.2fx %s %s\n", pages ? "pages" : "one-run", sizes[k],
                        r.run.seconds, r.run.cpuSeconds, peakMb, r.ticketMb, perTicket,
                        perTicket <= kMemoryPerTicket ? "ok  " : "OVER", growth);
            std::fflush(stdout);
        }
    }
    std::printf("goals (memory <= %.0fx the ticket, %.2fx time per 1x job): %s\n", kMemoryPerTicket, kTimeSlack,
                held ? "held" : "NOT held");
    return held ? 0 : 1;
}
