// Conversion for versions, separation rewriting and a whole PDF-only job of a large generated
// PDF, each against `qpdf --linearize --recompress-flate` of the same file, side by side in one
// run. Every operation runs in a child process, so its time and peak memory are its own.
//
//   pdfconvert_bench [--pages N] [--elements N] [--runs N] [--keep]
// Targets: conversion time <= 0.62x and rewriting time <= 0.57x those of qpdf (what they took
// before their memory was cut), each with peak memory <= 1.0x qpdf's; the
// PDF-only job with a printed die cut (three variants: content, die with content, die only)
// time <= 1.0x and peak memory <= 1.5x. Time is judged by the CPU time (user + system) of each
// child, which other load on a shared machine disturbs far less than wall time; both are printed.
#include <qpdf/QPDF.hh>

#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <functional>
#include <string>
#include <vector>

#include "pdf/separation_layers.h"
#include "pdf/separation_rewrite.h"
#include "pdf_bench_builder.h"

namespace fs = std::filesystem;
using namespace vorlan::bench;

namespace {

// About a third of the elements paint in spot colours (Separation fills and strokes, DeviceN
// fills, uses of a shared spot form); the rest in process colours (fills, strokes, text, uses of
// a shared process form, an image).
std::string pageContent(int page, int elements) {
    std::string c;
    char line[160];
    for (int i = 0; i < elements; ++i) {
        const double x = (i * 7 + page) % 500, y = (i * 13) % 700;
        switch (i % 9) {
            case 0: std::snprintf(line, sizeof line, "/Gold cs 0.%d scn %.1f %.1f 20 10 re f\n", i % 10, x, y); break;
            case 3: std::snprintf(line, sizeof line, "/Silver CS 1 SCN 1 w %.1f %.1f m %.1f %.1f l S\n", x, y, x + 30, y + 5); break;
            case 6:
                if (i % 2) std::snprintf(line, sizeof line, "q 1 0 0 1 %.1f %.1f cm /SpotForm Do Q\n", x, y);
                else std::snprintf(line, sizeof line, "/Both cs 0.3 0.7 scn %.1f %.1f 15 15 re f\n", x, y);
                break;
            case 1: std::snprintf(line, sizeof line, "0.1 0.2 0.3 0.4 k %.1f %.1f 12 12 re f\n", x, y); break;
            case 2: std::snprintf(line, sizeof line, "BT /F1 9 Tf 0 g %.1f %.1f Td (Item %d) Tj ET\n", x, y, i); break;
            case 4: std::snprintf(line, sizeof line, "q 1 0 0 1 %.1f %.1f cm /ProcessForm Do Q\n", x, y); break;
            case 5: std::snprintf(line, sizeof line, "0.5 G %.1f %.1f m %.1f %.1f %.1f %.1f %.1f %.1f c S\n", x, y, x + 5, y + 9, x + 12, y + 3, x + 20, y); break;
            case 7: std::snprintf(line, sizeof line, "q 20 0 0 20 %.1f %.1f cm /Im0 Do Q\n", x, y); break;
            default: std::snprintf(line, sizeof line, "0.2 0.4 0.6 rg %.1f %.1f 8 8 re f\n", x, y); break;
        }
        c += line;
    }
    return c;
}

void generate(const fs::path& file, int pages, int elements) {
    QPDF pdf;
    pdf.emptyPDF();
    QPDFObjectHandle spaces = pdf.makeIndirectObject(QPDFObjectHandle::parse(
        &pdf, "<< /Gold [/Separation /Gold /DeviceCMYK " + tintFunction(pdf, "[0 0.2 0.8 0]") +
                  "] /Silver [/Separation /Silver /DeviceCMYK " + tintFunction(pdf, "[0 0 0 0.3]") +
                  "] /Both [/DeviceN [/Gold /Silver] /DeviceCMYK " + twoInkFunction(pdf) + "] >>"));
    QPDFObjectHandle formResources = QPDFObjectHandle::parse(&pdf, "<< /ColorSpace " + ref(spaces) + " >>");
    QPDFObjectHandle spotForm =
        formXObject(pdf, "/Gold cs 1 scn 0 0 10 10 re f /Silver cs 1 scn 2 2 5 5 re f", formResources);
    QPDFObjectHandle processForm = formXObject(pdf, "0 0 1 0 k 0 0 10 10 re f 0 g 2 2 5 5 re f", formResources);
    QPDFObjectHandle image = imageXObject(pdf, 256, QPDFObjectHandle::newName("/DeviceCMYK"));
    QPDFObjectHandle resources = pdf.makeIndirectObject(QPDFObjectHandle::parse(
        &pdf, "<< /ColorSpace " + ref(spaces) + " /XObject << /Im0 " + ref(image) + " /SpotForm " + ref(spotForm) +
                  " /ProcessForm " + ref(processForm) +
                  " >> /Font << /F1 << /Type /Font /Subtype /Type1 /BaseFont /Helvetica >> >> >>"));
    writePages(pdf, resources, pages, [&](int p) { return pageContent(p, elements); }, file);
}

using Measure = ChildRun;

Measure qpdfLinearize(const fs::path& in, const fs::path& out) {
    return runProgram({"qpdf", "--linearize", "--recompress-flate", in.string(), out.string()});
}

// A bare-PDF job without layer mode, run by the command-line host in a process of its own (as
// qpdf is), so that its peak memory is the job's alone: the first content object switches no
// separation on and the die is Silver, so the job writes three variants (Gold and Silver
// dropped; Gold dropped; Silver alone).
Measure pdfOnlyJob(const fs::path& dir, const fs::path& in) {
    const fs::path description = dir / "job1.impinfo";
    if (FILE* out = std::fopen(description.c_str(), "wb")) {
        std::fputs("<OptionalContentGroupData DefaultLayerMode=\"false\">"
                   "<OptionalLayer OCGName=\"Gold\" isSep=\"true\"/><OptionalLayer OCGName=\"Silver\" isSep=\"true\"/>"
                   "<Versions><InternalVersion><Surface><ContentObject index=\"0\" SepNameOn=\"\"/></Surface>"
                   "</InternalVersion></Versions>"
                   "<DieCut enable=\"true\"><Surface index=\"0\" dieSepInternalNames=\"Silver\"/></DieCut>"
                   "</OptionalContentGroupData>",
                   out);
        std::fclose(out);
    }
    setenv("VORLAN_JOB_STORE", (dir / "store").c_str(), 1);
    runProgram({VORLAN_CLI, "job-attr", "1", "KVPrintDieLine", "True"});
    return runProgram({VORLAN_CLI, "consume", "--impinfo", description.string(), "--job-folder", dir.string(),
                       "--out-dir", (dir / "out").string(), in.string(), (dir / "job.jdf").string()});
}

}  // namespace

int main(int argc, char** argv) {
    PdfBenchOptions options;
    if (!parsePdfBenchOptions(argc, argv, "pdfconvert_bench", options)) return 2;
    const int pages = options.pages, elements = options.elements, runs = options.runs;
    const bool keep = options.keep;
    const fs::path dir = fs::temp_directory_path() / ("vorlan-convert-bench-" + std::to_string(getpid()));
    fs::create_directories(dir);
    const fs::path in = dir / "in.pdf";
    // Generated in a child: the measured children are forked from this process and start with its
    // resident pages, which must not include the generator's heap.
    if (runInChild([&] { generate(in, pages, elements); return 0; }).status != 0) {
        std::fprintf(stderr, "pdfconvert_bench: could not generate %s\n", in.c_str());
        return 1;
    }
    std::printf("generated %s: %d pages x %d elements, %.1f MB\n", in.c_str(), pages, elements,
                static_cast<double>(fs::file_size(in)) / 1e6);

    const char* seps[] = {"Gold", "Silver"};
    const std::vector<std::string> keepList = {"Gold"};
    std::vector<double> tq, tc, tr, tj, cq, cc, cr, cj, mq, mc, mr, mj;
    qpdfLinearize(in, dir / "warm.pdf");  // file cache
    for (int r = 0; r < runs; ++r) {  // interleaved, so all see the same machine load
        Measure q = qpdfLinearize(in, dir / "qpdf.pdf");
        Measure c = runInChild([&] {
            return vorlan::pdf::convertPDF(nullptr, in.c_str(), (dir / "converted.pdf").c_str(), seps, nullptr, 2, 0);
        });
        Measure w = runInChild([&] {
            return vorlan::pdf::rewriteSeparations(nullptr, in.c_str(), (dir / "rewritten.pdf").c_str(), keepList, true);
        });
        Measure j = pdfOnlyJob(dir, in);
        if (q.status || c.status || w.status || j.status)
            std::fprintf(stderr, "a run failed: qpdf %d, conversion %d, rewriting %d, PDF-only job %d\n", q.status,
                         c.status, w.status, j.status);
        tj.push_back(j.seconds), cj.push_back(j.cpuSeconds), mj.push_back(static_cast<double>(j.peakKb));
        tq.push_back(q.seconds), tc.push_back(c.seconds), tr.push_back(w.seconds);
        cq.push_back(q.cpuSeconds), cc.push_back(c.cpuSeconds), cr.push_back(w.cpuSeconds);
        mq.push_back(static_cast<double>(q.peakKb)), mc.push_back(static_cast<double>(c.peakKb)),
            mr.push_back(static_cast<double>(w.peakKb));
    }
    const double q = median(cq), c = median(cc), w = median(cr);
    const double qm = median(mq), cm = median(mc), wm = median(mr);
    const double j = median(cj), jm = median(mj);
    std::printf("%-40s %9s %9s %9s\n", "", "cpu s", "wall s", "peak MB");
    std::printf("%-40s %9.3f %9.3f %9.1f\n", "qpdf --linearize --recompress-flate", q, median(tq), qm / 1024);
    std::printf("%-40s %9.3f %9.3f %9.1f\n", "conversion (Gold, Silver into groups)", c, median(tc), cm / 1024);
    std::printf("%-40s %9.3f %9.3f %9.1f\n", "rewriting (keep-listed Gold)", w, median(tr), wm / 1024);
    std::printf("%-40s %9.3f %9.3f %9.1f\n", "PDF-only job, die printed (3 variants)", j, median(tj), jm / 1024);
    const bool jobOk = j / q <= 1.0 && jm / qm <= 1.5;
    std::printf("PDF-only job: time %.2fx (wall %.2fx), memory %.2fx (targets <= 1.00x, <= 1.50x) %s\n", j / q,
                median(tj) / median(tq), jm / qm, jobOk ? "ok" : "OVER");
    const bool conversionOk = c / q <= 0.62 && w / q <= 0.57 && cm / qm <= 1.0 && wm / qm <= 1.0;
    std::printf("conversion: time %.2fx (wall %.2fx), memory %.2fx; rewriting: time %.2fx (wall %.2fx), memory %.2fx "
                "(targets: time <= 0.62x and <= 0.57x, memory <= 1.00x) %s\n",
                c / q, median(tc) / median(tq), cm / qm, w / q, median(tr) / median(tq), wm / qm, conversionOk ? "ok" : "OVER");
    if (!keep) fs::remove_all(dir);
    return conversionOk && jobOk ? 0 : 1;
}
