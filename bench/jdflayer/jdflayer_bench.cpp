// Parse + write of a large generated ticket through the JDF layer, against plain pugixml
// load + save of the same file. Each measurement runs in a fresh child process (this program
// re-executed), so its peak resident memory (ru_maxrss) is its own.
//
//   jdflayer_bench [--size-mb N] [--runs N] [--keep]
// Targets: time ≤ 1.3× and peak memory ≤ 1.5× of plain pugixml.
#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <string>
#include <vector>

#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <pugixml.hpp>

#include "platform/jdf/jdf.h"

namespace fs = std::filesystem;

namespace {

// A nested layout of many sheets and a Run-partitioned run list, streamed to disk.
void generateTicket(const fs::path& file, double sizeMb) {
    FILE* f = std::fopen(file.c_str(), "wb");
    if (!f) {
        std::perror("generate");
        std::exit(2);
    }
    std::fprintf(f, "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
                    "<JDF xmlns=\"http://www.CIP4.org/JDFSchema_1_1\" xmlns:KAV_tkt=\"http://www.vorlan.org/JDF/ticket/1.0\" "
                    "ID=\"n1\" JobPartID=\"n1\" Type=\"Combined\" Types=\"Imposition Interpreting Rendering DigitalPrinting\" "
                    "Status=\"Ready\" Version=\"1.3\">\n<ResourcePool>\n"
                    "<Layout ID=\"r1\" Class=\"Parameter\" Status=\"Available\"><Signature Name=\"S1\">\n");
    const long target = static_cast<long>(sizeMb * 1024 * 1024);
    int sheet = 0;
    while (std::ftell(f) < target * 3 / 4) {
        std::fprintf(f, "<Sheet Name=\"Sheet %d\"><Media Dimension=\"612 792\"/>\n", sheet);
        for (const char* side : {"Front", "Back"}) {
            std::fprintf(f, "<Surface Side=\"%s\" SurfaceContentsBox=\"0 0 612 792\" KAV_tkt:VersionName=\"V%d\">\n",
                         side, sheet % 7);
            for (int o = 0; o < 4; ++o)
                std::fprintf(f, "<ContentObject CTM=\"1 0 0 1 %d.5 %d.25\" ClipBox=\"0 0 306 396\" Ord=\"%d\" "
                                "TrimSize=\"306 396\" TrimCTM=\"1 0 0 1 0 0\"/>\n",
                             o * 306, o * 198, sheet * 8 + o);
            std::fprintf(f, "<MarkObject CTM=\"1 0 0 1 0 0\" Ord=\"0\"/></Surface>\n");
        }
        std::fprintf(f, "</Sheet>\n");
        ++sheet;
    }
    std::fprintf(f, "</Signature></Layout>\n<RunList ID=\"r2\" Class=\"Parameter\" Status=\"Available\" PartIDKeys=\"Run\">\n");
    for (int run = 0; std::ftell(f) < target; ++run)
        std::fprintf(f, "<RunList Run=\"%d\" Pages=\"%d\"><LayoutElement IsTrapped=\"false\"><FileSpec "
                        "URL=\"file:///jobs/job%d/content%%20file.pdf\" MimeType=\"application/pdf\"/></LayoutElement>"
                        "</RunList>\n",
                     run, run, run % 13);
    std::fprintf(f, "</RunList>\n</ResourcePool>\n<ResourceLinkPool><LayoutLink rRef=\"r1\" Usage=\"Input\"/>"
                    "<RunListLink rRef=\"r2\" Usage=\"Input\" ProcessUsage=\"Document\"/></ResourceLinkPool>\n</JDF>\n");
    std::fclose(f);
}

// One measured operation in this (child) process; prints its milliseconds to stdout.
int runSide(const std::string& side, const char* in, const char* out) {
    auto start = std::chrono::steady_clock::now();
    bool ok;
    if (side == "layer") {
        JDF::JDFParser parser;
        ok = parser.Parse(JDF::WString(in), true, true, true, nullptr, JDF::WString(), 0, 42);
        JDF::JDFDoc doc(parser.GetDocument());
        ok = ok && !doc.GetJDFRoot().isNull() && doc.Write2File(JDF::WString(out));
    } else {
        pugi::xml_document doc;
        ok = doc.load_file(in) && doc.save_file(out);
    }
    double ms = std::chrono::duration<double, std::milli>(std::chrono::steady_clock::now() - start).count();
    std::printf("%.3f\n", ms);
    return ok ? 0 : 1;
}

struct Sample {
    double ms;       // wall time of the operation, measured in the child
    double cpuMs;    // user + system time of the whole child (start-up included)
    long maxRssKb;
};

Sample measure(const std::string& self, const std::string& side, const fs::path& in, const fs::path& out) {
    int fds[2];
    if (pipe(fds) != 0) std::exit(2);
    pid_t pid = fork();
    if (pid == 0) {
        dup2(fds[1], STDOUT_FILENO);
        close(fds[0]);
        close(fds[1]);
        execl(self.c_str(), self.c_str(), "--child", side.c_str(), in.c_str(), out.c_str(), static_cast<char*>(nullptr));
        _exit(127);
    }
    close(fds[1]);
    char buf[64] = {};
    ssize_t n = read(fds[0], buf, sizeof buf - 1);
    close(fds[0]);
    int status = 0;
    struct rusage ru {};
    wait4(pid, &status, 0, &ru);
    if (n <= 0 || !WIFEXITED(status) || WEXITSTATUS(status) != 0) {
        std::fprintf(stderr, "%s run failed\n", side.c_str());
        std::exit(1);
    }
    double cpu = (ru.ru_utime.tv_sec + ru.ru_stime.tv_sec) * 1e3 + (ru.ru_utime.tv_usec + ru.ru_stime.tv_usec) / 1e3;
    return {std::atof(buf), cpu, ru.ru_maxrss};
}

double median(std::vector<double> v) {
    std::sort(v.begin(), v.end());
    return v[v.size() / 2];
}

}  // namespace

int main(int argc, char** argv) {
    if (argc == 5 && std::strcmp(argv[1], "--child") == 0) return runSide(argv[2], argv[3], argv[4]);
    double sizeMb = 24;
    int runs = 5;
    bool keep = false;
    for (int i = 1; i < argc; ++i) {
        if (!std::strcmp(argv[i], "--size-mb") && i + 1 < argc) sizeMb = std::atof(argv[++i]);
        else if (!std::strcmp(argv[i], "--runs") && i + 1 < argc) runs = std::max(1, std::atoi(argv[++i]));
        else if (!std::strcmp(argv[i], "--keep")) keep = true;
        else {
            std::fprintf(stderr, "usage: %s [--size-mb N] [--runs N] [--keep]\n", argv[0]);
            return 2;
        }
    }
    std::string self = fs::read_symlink("/proc/self/exe").string();
    fs::path dir = fs::temp_directory_path() / ("jdflayer_bench_" + std::to_string(getpid()));
    fs::create_directories(dir);
    fs::path in = dir / "big.jdf";
    generateTicket(in, sizeMb);
    std::printf("ticket: %.1f MB, %d runs per side (median)\n", fs::file_size(in) / 1048576.0, runs);

    std::vector<double> layerMs, plainMs, layerCpu, plainCpu, layerKb, plainKb;
    measure(self, "pugixml", in, dir / "warm.jdf");  // warm the page cache
    for (int r = 0; r < runs; ++r) {
        Sample p = measure(self, "pugixml", in, dir / "plain.jdf");
        Sample l = measure(self, "layer", in, dir / "layer.jdf");
        plainMs.push_back(p.ms);
        plainCpu.push_back(p.cpuMs);
        layerCpu.push_back(l.cpuMs);
        plainKb.push_back(static_cast<double>(p.maxRssKb));
        layerMs.push_back(l.ms);
        layerKb.push_back(static_cast<double>(l.maxRssKb));
    }
    double tRatio = median(layerMs) / median(plainMs);
    double mRatio = median(layerKb) / median(plainKb);
    double cRatio = median(layerCpu) / median(plainCpu);
    std::printf("%-28s %10s %10s %14s\n", "", "time (ms)", "CPU (ms)", "peak RSS (MB)");
    std::printf("%-28s %10.1f %10.1f %14.1f\n", "pugixml load_file+save_file", median(plainMs), median(plainCpu),
                median(plainKb) / 1024);
    std::printf("%-28s %10.1f %10.1f %14.1f\n", "JDF layer Parse+Write2File", median(layerMs), median(layerCpu),
                median(layerKb) / 1024);
    std::printf("ratio: time %.2fx (CPU %.2fx; target <= 1.30x), peak memory %.2fx (target <= 1.50x) -> %s\n", tRatio,
                cRatio, mRatio, tRatio <= 1.3 && mRatio <= 1.5 ? "targets met" : "TARGET MISSED");
    if (!keep) fs::remove_all(dir);
    return 0;
}
