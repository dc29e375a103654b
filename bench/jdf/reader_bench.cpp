// Ticket reader speed: a generated ticket of 5,000 surfaces with 8 content objects each.
//
// Prints the time of the JDF layer's parse alone, of the whole reader (parse, run lists, layout,
// ordinal table) on the same ticket, and of the reader on a ticket ten times as large, with the
// two ratios the reader is held to: reader / parse <= 2, and 10x ticket / 1x ticket <= 12.
// Usage: bench_jdf_reader [surfaces] [repetitions]
#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <memory>
#include <string>
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

// Best time of run(state) over the repetitions, each on a fresh state from make(). Making the
// state and releasing it after the run stay outside the clock: the measure is reading alone.
template <typename Make, typename Run>
double bestMilliseconds(int repetitions, Make make, Run run) {
    double best = 1e300;
    for (int i = 0; i < repetitions; ++i) {
        auto state = make();
        auto start = std::chrono::steady_clock::now();
        run(*state);
        double ms = std::chrono::duration<double, std::milli>(std::chrono::steady_clock::now() - start).count();
        if (ms < best) best = ms;
    }
    return best;
}

double parseOnly(const std::string& path, int repetitions) {
    return bestMilliseconds(
        repetitions, [] { return std::make_unique<JDF::JDFParser>(); },
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

double readTicket(const std::string& path, int repetitions, size_t expectedObjects) {
    QuietStdout quiet;
    return bestMilliseconds(
        repetitions, [] { return std::make_unique<LD_JDF>(); },
        [&](LD_JDF& worker) {
            LDError result = worker.JDF_InitializeAndParseJDF(path.c_str());
            if (result != LD_OK || worker.contentObjects.size() != expectedObjects ||
                worker.m_OrdinalTable.size() != expectedObjects)
                std::abort();
        });
}

}  // namespace

int main(int argc, char** argv) {
    int surfaces = argc > 1 ? std::atoi(argv[1]) : 5000;
    int repetitions = argc > 2 ? std::atoi(argv[2]) : 5;
    std::filesystem::path dir = std::filesystem::temp_directory_path() / ("vorlan_bench_jdf_" + std::to_string(getpid()));
    std::filesystem::create_directories(dir);
    std::string small = (dir / "small.jdf").string(), large = (dir / "large.jdf").string();
    writeTicket(small, surfaces);
    writeTicket(large, surfaces * 10);

    double parse = parseOnly(small, repetitions);
    double read = readTicket(small, repetitions, static_cast<size_t>(surfaces) * kObjectsPerSurface);
    double readLarge = readTicket(large, std::max(1, repetitions / 2), static_cast<size_t>(surfaces) * 10 * kObjectsPerSurface);
    std::filesystem::remove_all(dir);

    std::printf("ticket: %d surfaces x %d content objects\n", surfaces, kObjectsPerSurface);
    std::printf("JDF layer parse alone:      %9.1f ms\n", parse);
    std::printf("ticket reader:              %9.1f ms   ratio to parse %.2f (limit 2)\n", read, read / parse);
    std::printf("ticket reader, 10x ticket:  %9.1f ms   ratio to 1x %.2f (limit 12)\n", readLarge, readLarge / read);
    bool ok = read / parse <= 2.0 && readLarge / read <= 12.0;
    std::printf("%s\n", ok ? "within limits" : "OUTSIDE LIMITS");
    return ok ? 0 : 1;
}
