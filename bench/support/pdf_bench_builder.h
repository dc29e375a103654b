// Building blocks of the generated PDFs the PDF benchmarks run on, and their shared options.
#pragma once

#include <filesystem>
#include <functional>
#include <string>
#include <vector>

#include <qpdf/QPDF.hh>
#include <qpdf/QPDFObjectHandle.hh>

#include "child_process.h"

namespace vorlan::bench {

// "N 0 R" for an indirect object.
std::string ref(QPDFObjectHandle object);
// A type 2 function from 0..1 to CMYK 0 0 0 0 .. c1 (e.g. "[0 0.2 0.8 0]"), as a reference.
std::string tintFunction(QPDF& pdf, const char* c1);
// A type 4 function mapping two tints onto CMYK (cyan = their sum), as a reference.
std::string twoInkFunction(QPDF& pdf);
// An 8 x 8, 8-bit image XObject of `bytes` bytes in the given colour space.
QPDFObjectHandle imageXObject(QPDF& pdf, size_t bytes, QPDFObjectHandle colourSpace);
// A 10 x 10 form XObject with the given content and resources.
QPDFObjectHandle formXObject(QPDF& pdf, const std::string& content, QPDFObjectHandle resources);
// Adds `pages` A4 pages that share `resources`, page p painting content(p), and writes the file
// with Flate-compressed streams and object streams, as real files are.
void writePages(QPDF& pdf, QPDFObjectHandle resources, int pages, const std::function<std::string(int)>& content,
                const std::filesystem::path& file);

struct PdfBenchOptions {
    int pages = 500;
    int elements = 200;
    int runs = 5;
    bool keep = false;  // keep the generated files
};

// Reads --pages N, --elements N, --runs N, --keep; false (after printing the usage) otherwise.
bool parsePdfBenchOptions(int argc, char** argv, const char* program, PdfBenchOptions& options);

}  // namespace vorlan::bench
