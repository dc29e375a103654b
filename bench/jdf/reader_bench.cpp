// Ticket reader speed: a generated ticket of 5,000 surfaces with 8 content objects each.
//
// Prints the time of the JDF layer's parse alone, of the whole reader (parse, run lists, layout,
// ordinal table) on the same ticket, and of the reader on a ticket ten times as large, with the
// two ratios the reader is held to: reader / parse <= 2.5, and 10x ticket / 1x ticket <= 10.5.
//
// Parse and reader are timed alike, best of N, in two heap states:
//  - fresh process (the limits apply): each run in a child process of its own, as a worker
//    reading one ticket starts, so both pay for the memory they touch first;
//  - warm heap (for information): in this process, the allocator keeping freed memory, so
//    neither pays the kernel for new pages and the numbers show the work alone.
// Without that care the two differ by accident: the reader reuses memory its previous run freed
// while the parser's freed pages go back to the kernel.
// A third line, in both heap states, times the records the job model requires for the ticket
// built alone (no XML, no numbers): one plus its ratio to the parse is the lowest reader / parse
// ratio any reader producing those records can reach with this allocator.
// Usage: reader_bench [surfaces] [repetitions] [reader]
// With "reader" only the reader runs, warm, on the 1x ticket (for a profiler).
#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <memory>
#include <string>
#include <malloc.h>
#include <sys/wait.h>
#include <unistd.h>

#include "platform/jdf/jdf.h"
#include "vorlan/LD_JDF.h"

namespace {

constexpr int kObjectsPerSurface = 8;
constexpr int kPagesPerFile = 1000;

// One signature with surfaces/2 sheets (front and back), 8 placed pages per surface, and a
// run list of one partition per 1,000 pages.
void writeTicket(const std::string& path, int surfaces) {
    std::ofstream out(path);
    int pages = surfaces * kObjectsPerSurface;
    out << R"(<?xml version="1.0" encoding="UTF-8"?>
<JDF xmlns="http://www.CIP4.org/JDFSchema_1_1" ID="n1" JobPartID="p1" Type="Imposition" Status="Waiting" Version="1.3">
<ResourcePool>
<RunList ID="RL" Class="Parameter" Status="Available" PartIDKeys="Run">
)";
    for (int run = 0; run * kPagesPerFile < pages; ++run)
        out << R"(<RunList Run=")" << run << R"(" NPage=")" << kPagesPerFile
            << R"("><LayoutElement><FileSpec URL="file:///jobs/part)" << run
            << R"(.pdf" MimeType="application/pdf"/></LayoutElement></RunList>)" << '\n';
    out << R"(</RunList>
<Layout ID="L" Class="Parameter" Status="Available"><Signature Name="Sig1">
)";
    int ord = 0;
    for (int sheet = 0; sheet < surfaces / 2; ++sheet) {
        out << R"(<Sheet Name="Sheet)" << sheet << R"(">)";
        for (const char* side : {"Front", "Back"}) {
            out << R"(<Surface Side=")" << side << R"(" SurfaceContentsBox="0 0 2551.18 1814.17">)";
            for (int k = 0; k < kObjectsPerSurface; ++k, ++ord)
                out << R"(<ContentObject CTM="1 0 0 1 )" << 30 + 600 * (k % 4) << ' ' << 20 + 850 * (k / 4)
                    << R"(" ClipBox="0 0 595.28 841.89" TrimSize="595.28 841.89" Ord=")" << ord << R"("/>)";
            out << "</Surface>";
        }
        out << "</Sheet>\n";
    }
    out << R"(</Signature></Layout>
</ResourcePool>
<ResourceLinkPool><RunListLink rRef="RL" Usage="Input" ProcessUsage="Document"/><LayoutLink rRef="L" Usage="Input"/></ResourceLinkPool>
</JDF>
)";
}

enum class Heap { Fresh, Warm };

// Time of run(state) on a state from make(); making and releasing the state stay outside the
// clock. Fresh: in a child process, which reports the time through a pipe and exits.
template <typename Make, typename Run>
double timedOnce(Heap heap, Make make, Run run) {
    auto measure = [&] {
        auto state = make();
        auto start = std::chrono::steady_clock::now();
        run(*state);
        return std::chrono::duration<double, std::milli>(std::chrono::steady_clock::now() - start).count();
    };
    if (heap == Heap::Warm) return measure();
    int fds[2];
    if (pipe(fds) != 0) std::abort();
    std::fflush(nullptr);
    pid_t child = fork();
    if (child < 0) std::abort();
    if (child == 0) {
        close(fds[0]);
        double ms = measure();
        _exit(write(fds[1], &ms, sizeof ms) == static_cast<ssize_t>(sizeof ms) ? 0 : 1);
    }
    close(fds[1]);
    double ms = -1;
    bool got = read(fds[0], &ms, sizeof ms) == static_cast<ssize_t>(sizeof ms);
    close(fds[0]);
    int status = 0;
    waitpid(child, &status, 0);
    if (!got || !WIFEXITED(status) || WEXITSTATUS(status) != 0) std::abort();
    return ms;
}

template <typename Make, typename Run>
double bestMilliseconds(Heap heap, int repetitions, Make make, Run run) {
    double best = 1e300;
    for (int i = 0; i < repetitions; ++i) best = std::min(best, timedOnce(heap, make, run));
    return best;
}

double parseOnly(Heap heap, const std::string& path, int repetitions) {
    return bestMilliseconds(
        heap, repetitions, [] { return std::make_unique<JDF::JDFParser>(); },
        [&](JDF::JDFParser& parser) {
            if (!parser.Parse(JDF::WString(path), true, true, true, nullptr, JDF::WString(), 0, 42)) std::abort();
            if (JDF::JDFDoc(parser.GetDocument()).GetJDFRoot().isNull()) std::abort();
        });
}

// The reader prints its own timing line: stdout goes to /dev/null while it runs.
class QuietStdout {
public:
    QuietStdout() : saved_(dup(STDOUT_FILENO)) {
        std::fflush(stdout);
        if (saved_ < 0 || !std::freopen("/dev/null", "w", stdout)) std::abort();
    }
    ~QuietStdout() {
        std::fflush(stdout);
        dup2(saved_, STDOUT_FILENO);
        close(saved_);
    }

private:
    int saved_;
};

double readTicket(Heap heap, const std::string& path, int repetitions, size_t expectedObjects) {
    QuietStdout quiet;
    return bestMilliseconds(
        heap, repetitions, [] { return std::make_unique<LD_JDF>(); },
        [&](LD_JDF& worker) {
            LDError result = worker.JDF_InitializeAndParseJDF(path.c_str());
            if (result != LD_OK || worker.contentObjects.size() != expectedObjects ||
                worker.m_OrdinalTable.size() != expectedObjects)
                std::abort();
        });
}

// Releasing what the reader built: every record of the job model (the worker itself stays).
double releaseRecords(Heap heap, const std::string& path, int repetitions) {
    QuietStdout quiet;
    return bestMilliseconds(
        heap, repetitions,
        [&] {
            auto worker = std::make_unique<LD_JDF>();
            if (worker->JDF_InitializeAndParseJDF(path.c_str()) != LD_OK) std::abort();
            return worker;
        },
        [](LD_JDF& worker) { worker.releaseAllRecords(); });
}

// The records the job model requires for the same ticket, built with constant values: no XML
// read, no number parsed. Whatever the reader does, it does at least this, so this time over the
// parse time is the lowest ratio any reader on this record model can reach.
double recordsOnly(Heap heap, int surfaces, int repetitions) {
    return bestMilliseconds(
        heap, repetitions, [] { return std::make_unique<LD_JDF>(); },
        [&](LD_JDF& w) {
            auto* signature = new LD_Signature;
            w.signatures.push_back(signature);
            for (int s = 0; s < surfaces / 2; ++s) {
                auto* sheet = new LD_Sheet;
                w.sheets.push_back(sheet);
                signature->sheetList.push_back(sheet);
                LD_SetText(sheet->name, L"Sheet");
                for (LD_Surface** side : {&sheet->front, &sheet->back}) {
                    auto* surface = *side = new LD_Surface;
                    w.surfaces.push_back(surface);
                    surface->SurfaceContentsBox = new LD_Box;
                    surface->contentObjects.reserve(kObjectsPerSurface);
                    for (int k = 0; k < kObjectsPerSurface; ++k) {
                        auto* object = new LD_ContentObject;
                        w.contentObjects.push_back(object);
                        surface->contentObjects.push_back(object);
                        object->CTM->text = LD_CopyText(L"1 0 0 1 630 870");
                        object->ClipBox = new LD_Box;
                        object->ClipBox->text = LD_CopyText(L"0 0 595.28 841.89");
                        object->TrimSize = new LD_Point;
                        object->TrimSize->text = LD_CopyText(L"595.28 841.89");
                        w.contentObjectOrdinalMap.push_back({object->Ord, object->contentObjectIndex});
                        auto* row = new LD_OrdinalTableElement;
                        row->content = new LD_ContentTableElement;
                        w.m_OrdinalTable.push_back(row);
                    }
                }
            }
        });
}

struct Times {
    double parse, read, readLarge, release, releaseLarge;
};

Times measure(Heap heap, const std::string& small, const std::string& large, size_t objects, int repetitions) {
    Times t{};
    t.parse = parseOnly(heap, small, repetitions);
    t.read = readTicket(heap, small, repetitions, objects);
    t.readLarge = readTicket(heap, large, std::max(1, repetitions / 2), objects * 10);
    t.release = releaseRecords(heap, small, repetitions);
    t.releaseLarge = releaseRecords(heap, large, std::max(1, repetitions / 2));
    return t;
}

void print(const char* title, const Times& t) {
    std::printf("%s\n", title);
    std::printf("  JDF layer parse alone:      %9.1f ms\n", t.parse);
    std::printf("  ticket reader:              %9.1f ms   ratio to parse %.2f\n", t.read, t.read / t.parse);
    std::printf("  ticket reader, 10x ticket:  %9.1f ms   ratio to 1x %.2f\n", t.readLarge, t.readLarge / t.read);
    std::printf("  release of the records:     %9.1f ms\n", t.release);
    std::printf("  release, 10x ticket:        %9.1f ms   ratio to 1x %.2f\n", t.releaseLarge, t.releaseLarge / t.release);
}

// The allocator keeps what is freed (no trimming, no separate mappings) from here on.
void keepFreedMemory() {
    mallopt(M_MMAP_THRESHOLD, 1 << 30);
    mallopt(M_TRIM_THRESHOLD, 1 << 30);
}

}  // namespace

int main(int argc, char** argv) {
    int surfaces = argc > 1 ? std::atoi(argv[1]) : 5000;
    int repetitions = argc > 2 ? std::atoi(argv[2]) : 5;
    size_t objects = static_cast<size_t>(surfaces) * kObjectsPerSurface;
    std::filesystem::path dir = std::filesystem::temp_directory_path() / ("vorlan_bench_jdf_" + std::to_string(getpid()));
    std::filesystem::create_directories(dir);
    std::string small = (dir / "small.jdf").string(), large = (dir / "large.jdf").string();
    writeTicket(small, surfaces);
    if (argc > 3 && std::string(argv[3]) == "reader") {
        keepFreedMemory();
        double read = readTicket(Heap::Warm, small, repetitions, objects);
        std::filesystem::remove_all(dir);
        std::printf("ticket reader (warm heap): %.1f ms\n", read);
        return 0;
    }
    writeTicket(large, surfaces * 10);
    // One small reading first, in this process: what the library sets up once per process is
    // then set up in every child, as it is in a worker that has read tickets before.
    std::string tiny = (dir / "tiny.jdf").string();
    writeTicket(tiny, 250);  // the run list's 1,000-page files, filled
    readTicket(Heap::Warm, tiny, 1, 250 * kObjectsPerSurface);

    Times fresh = measure(Heap::Fresh, small, large, objects, repetitions);
    double floorFresh = recordsOnly(Heap::Fresh, surfaces, repetitions);
    keepFreedMemory();
    Times warm = measure(Heap::Warm, small, large, objects, repetitions);
    double floorWarm = recordsOnly(Heap::Warm, surfaces, repetitions);
    std::filesystem::remove_all(dir);

    std::printf("ticket: %d surfaces x %d content objects, best of %d\n", surfaces, kObjectsPerSurface, repetitions);
    print("fresh process (limits: reader / parse <= 2.5, 10x / 1x <= 10.5 for reading and release):", fresh);
    print("warm heap (for information):", warm);
    std::printf("records the model requires, built alone (no XML, no numbers):\n");
    std::printf("  fresh process %9.1f ms = %.2f x parse;  warm heap %9.1f ms = %.2f x parse\n", floorFresh,
                floorFresh / fresh.parse, floorWarm, floorWarm / warm.parse);
    std::printf("  lowest reader / parse any reader on this model can reach: fresh %.2f, warm %.2f\n",
                1 + floorFresh / fresh.parse, 1 + floorWarm / warm.parse);
    bool ok = fresh.read / fresh.parse <= 2.5 && fresh.readLarge / fresh.read <= 10.5 &&
              fresh.releaseLarge / fresh.release <= 10.5;
    std::printf("%s\n", ok ? "within limits" : "OUTSIDE LIMITS");
    return ok ? 0 : 1;
}
