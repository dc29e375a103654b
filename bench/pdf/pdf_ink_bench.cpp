// Page-ink scan of a large generated PDF against `qpdf --check` of the same file (which also
// decodes and parses every content stream), side by side in one run.
//
//   pdf_ink_bench [--pages N] [--elements N] [--runs N] [--keep]
// Target: the scan takes at most 1.5x the time of qpdf --check.
#include <qpdf/QPDF.hh>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <string>
#include <vector>

#include "pdf/page_geometry.h"
#include "pdf_bench_builder.h"

namespace fs = std::filesystem;
using Clock = std::chrono::steady_clock;
using namespace vorlan::bench;

namespace {

// One page's worth of painting: fills, strokes, text, images and form uses in spot, DeviceN and
// process colours, each element choosing its colour first.
std::string pageContent(int page, int elements) {
    std::string c;
    char line[160];
    for (int i = 0; i < elements; ++i) {
        const double x = (i * 7 + page) % 500, y = (i * 13) % 700;
        switch (i % 8) {
            case 0: std::snprintf(line, sizeof line, "/CS0 cs 0.%d scn %.1f %.1f 20 10 re f\n", i % 10, x, y); break;
            case 1: std::snprintf(line, sizeof line, "/CS1 CS 1 SCN 1 w %.1f %.1f m %.1f %.1f l S\n", x, y, x + 30, y + 5); break;
            case 2: std::snprintf(line, sizeof line, "/CS2 cs 0.3 0.7 scn %.1f %.1f 15 15 re f\n", x, y); break;
            case 3: std::snprintf(line, sizeof line, "BT /F1 9 Tf /CS0 cs 1 scn %.1f %.1f Td (Item %d) Tj ET\n", x, y, i); break;
            case 4: std::snprintf(line, sizeof line, "q 20 0 0 20 %.1f %.1f cm /Im0 Do Q\n", x, y); break;
            case 5: std::snprintf(line, sizeof line, "0.1 0.2 0.3 0.4 k %.1f %.1f 12 12 re f\n", x, y); break;
            case 6: std::snprintf(line, sizeof line, "q 1 0 0 1 %.1f %.1f cm /Fm0 Do Q\n", x, y); break;
            default: std::snprintf(line, sizeof line, "0.5 G %.1f %.1f m %.1f %.1f %.1f %.1f %.1f %.1f c S\n", x, y, x + 5, y + 9, x + 12, y + 3, x + 20, y); break;
        }
        c += line;
    }
    return c;
}

void generate(const fs::path& file, int pages, int elements) {
    QPDF pdf;
    pdf.emptyPDF();
    QPDFObjectHandle spaces = pdf.makeIndirectObject(QPDFObjectHandle::parse(
        &pdf, "<< /CS0 [/Separation /Gold /DeviceCMYK " + tintFunction(pdf, "[0 0.2 0.8 0]") +
                  "] /CS1 [/Separation /Varnish /DeviceCMYK " + tintFunction(pdf, "[0 0 0 0.1]") +
                  "] /CS2 [/DeviceN [/Die /Crease] /DeviceCMYK " + twoInkFunction(pdf) + "] >>"));
    QPDFObjectHandle image = imageXObject(
        pdf, 64,
        QPDFObjectHandle::parse(&pdf, "[/Separation /ImageSpot /DeviceCMYK " + tintFunction(pdf, "[0.5 0 0 0]") + "]"));
    QPDFObjectHandle form = formXObject(pdf, "/CS1 cs 1 scn 0 0 10 10 re f 0 g 2 2 5 5 re f",
                                        QPDFObjectHandle::parse(&pdf, "<< /ColorSpace " + ref(spaces) + " >>"));
    QPDFObjectHandle resources = pdf.makeIndirectObject(QPDFObjectHandle::parse(
        &pdf, "<< /ColorSpace " + ref(spaces) + " /XObject << /Im0 " + ref(image) + " /Fm0 " + ref(form) +
                  " >> /Font << /F1 << /Type /Font /Subtype /Type1 /BaseFont /Helvetica >> >> >>"));
    writePages(pdf, resources, pages, [&](int p) { return pageContent(p, elements); }, file);
}

double seconds(Clock::time_point a, Clock::time_point b) {
    return std::chrono::duration<double>(b - a).count();
}

double timeQpdfCheck(const fs::path& file) {
    const std::string cmd = "qpdf --check '" + file.string() + "' >/dev/null 2>&1";
    auto start = Clock::now();
    int rc = std::system(cmd.c_str());
    auto end = Clock::now();
    if (rc != 0) std::fprintf(stderr, "qpdf --check failed (%d)\n", rc);
    return seconds(start, end);
}

double timeInkScan(const fs::path& file, size_t& inkCount) {
    std::vector<std::string> inks;
    auto start = Clock::now();
    scanPDFPageInks(file.c_str(), inks);
    auto end = Clock::now();
    inkCount = inks.size();
    return seconds(start, end);
}

}  // namespace

int main(int argc, char** argv) {
    PdfBenchOptions options;
    if (!parsePdfBenchOptions(argc, argv, "pdf_ink_bench", options)) return 2;
    const int pages = options.pages, elements = options.elements, runs = options.runs;
    const bool keep = options.keep;
    const fs::path file = fs::temp_directory_path() / ("vorlan-ink-bench-" + std::to_string(getpid()) + ".pdf");
    auto genStart = Clock::now();
    generate(file, pages, elements);
    std::printf("generated %s: %d pages x %d elements, %.1f MB in %.2f s\n", file.c_str(), pages, elements,
                fs::file_size(file) / 1e6, seconds(genStart, Clock::now()));

    std::vector<double> check, scan;
    size_t inkCount = 0;
    timeQpdfCheck(file);  // warm the file cache
    for (int r = 0; r < runs; ++r) {  // interleaved, so both see the same machine load
        check.push_back(timeQpdfCheck(file));
        scan.push_back(timeInkScan(file, inkCount));
    }
    std::sort(check.begin(), check.end());
    std::sort(scan.begin(), scan.end());
    const double checkMedian = check[check.size() / 2], scanMedian = scan[scan.size() / 2];
    std::printf("%-28s %10s %10s\n", "", "median s", "best s");
    std::printf("%-28s %10.3f %10.3f\n", "qpdf --check", checkMedian, check.front());
    std::printf("%-28s %10.3f %10.3f   (%zu page inks)\n", "page-ink scan", scanMedian, scan.front(), inkCount);
    const double ratio = scanMedian / checkMedian;
    std::printf("ratio scan / check: %.2f (target <= 1.50) %s\n", ratio, ratio <= 1.5 ? "ok" : "OVER");
    if (!keep) fs::remove(file);
    return ratio <= 1.5 ? 0 : 1;
}
