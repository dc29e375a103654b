#include "pdf_bench_builder.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <cstring>

#include <qpdf/QPDFPageDocumentHelper.hh>
#include <qpdf/QPDFWriter.hh>

namespace vorlan::bench {

std::string ref(QPDFObjectHandle object) { return std::to_string(object.getObjectID()) + " 0 R"; }

std::string tintFunction(QPDF& pdf, const char* c1) {
    return ref(pdf.makeIndirectObject(QPDFObjectHandle::parse(
        std::string("<< /FunctionType 2 /Domain [0 1] /C0 [0 0 0 0] /C1 ") + c1 + " /N 1 >>")));
}

std::string twoInkFunction(QPDF& pdf) {
    QPDFObjectHandle sum = QPDFObjectHandle::newStream(&pdf, "{ add 0 0 0 4 -1 roll dup 1 gt {pop 1} if }");
    sum.getDict().replaceKey("/FunctionType", QPDFObjectHandle::newInteger(4));
    sum.getDict().replaceKey("/Domain", QPDFObjectHandle::parse("[0 1 0 1]"));
    sum.getDict().replaceKey("/Range", QPDFObjectHandle::parse("[0 1 0 1 0 1 0 1]"));
    return ref(sum);
}

QPDFObjectHandle imageXObject(QPDF& pdf, size_t bytes, QPDFObjectHandle colourSpace) {
    QPDFObjectHandle image = QPDFObjectHandle::newStream(&pdf, std::string(bytes, '\x40'));
    QPDFObjectHandle dict = image.getDict();
    dict.replaceKey("/Type", QPDFObjectHandle::newName("/XObject"));
    dict.replaceKey("/Subtype", QPDFObjectHandle::newName("/Image"));
    dict.replaceKey("/Width", QPDFObjectHandle::newInteger(8));
    dict.replaceKey("/Height", QPDFObjectHandle::newInteger(8));
    dict.replaceKey("/BitsPerComponent", QPDFObjectHandle::newInteger(8));
    dict.replaceKey("/ColorSpace", colourSpace);
    return image;
}

QPDFObjectHandle formXObject(QPDF& pdf, const std::string& content, QPDFObjectHandle resources) {
    QPDFObjectHandle form = QPDFObjectHandle::newStream(&pdf, content);
    QPDFObjectHandle dict = form.getDict();
    dict.replaceKey("/Type", QPDFObjectHandle::newName("/XObject"));
    dict.replaceKey("/Subtype", QPDFObjectHandle::newName("/Form"));
    dict.replaceKey("/BBox", QPDFObjectHandle::parse("[0 0 10 10]"));
    dict.replaceKey("/Resources", resources);
    return form;
}

void writePages(QPDF& pdf, QPDFObjectHandle resources, int pages, const std::function<std::string(int)>& content,
                const std::filesystem::path& file) {
    QPDFPageDocumentHelper helper(pdf);
    for (int p = 0; p < pages; ++p) {
        QPDFObjectHandle page = pdf.makeIndirectObject(QPDFObjectHandle::parse(
            &pdf, "<< /Type /Page /MediaBox [0 0 595 842] /Resources " + ref(resources) + " >>"));
        page.replaceKey("/Contents", QPDFObjectHandle::newStream(&pdf, content(p)));
        helper.addPage(page, false);
    }
    QPDFWriter writer(pdf, file.c_str());
    writer.setStaticID(true);
    writer.setCompressStreams(true);
    writer.setObjectStreamMode(qpdf_o_generate);
    writer.write();
}

bool parsePdfBenchOptions(int argc, char** argv, const char* program, PdfBenchOptions& options) {
    for (int i = 1; i < argc; ++i) {
        auto next = [&] { return i + 1 < argc ? std::atoi(argv[++i]) : 0; };
        if (!std::strcmp(argv[i], "--pages")) options.pages = next();
        else if (!std::strcmp(argv[i], "--elements")) options.elements = next();
        else if (!std::strcmp(argv[i], "--runs")) options.runs = std::max(1, next());
        else if (!std::strcmp(argv[i], "--keep")) options.keep = true;
        else {
            std::fprintf(stderr, "usage: %s [--pages N] [--elements N] [--runs N] [--keep]\n", program);
            return false;
        }
    }
    return true;
}

}  // namespace vorlan::bench
