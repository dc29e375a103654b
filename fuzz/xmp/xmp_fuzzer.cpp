// Fuzzes XMP packets: the Esko ink-list reader on the bytes, then the same bytes as the catalog's
// metadata stream of a one-page PDF, scanned in Esko mode into a version description (so the ink
// names that come out of the packet also go through the description writer).
#include <qpdf/QPDF.hh>
#include <qpdf/QPDFObjectHandle.hh>
#include <qpdf/QPDFPageDocumentHelper.hh>
#include <qpdf/QPDFWriter.hh>
#include <unistd.h>

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include "pdf/xmp_inks.h"
#include "pdf/xmp_scan.h"
#include "platform/os/text.h"

namespace {

std::string pdfPath;
std::string descriptionPath;

std::string scratchFile(const char* pattern) {
    std::string path = pattern;
    int fd = mkstemp(path.data());
    if (fd < 0) std::abort();
    close(fd);
    return path;
}

void writePdfWithPacket(const std::string& packet) {
    QPDF pdf;
    pdf.emptyPDF();
    QPDFObjectHandle page = pdf.makeIndirectObject(
        QPDFObjectHandle::parse(&pdf, "<< /Type /Page /MediaBox [0 0 10 10] /Resources << >> >>"));
    page.replaceKey("/Contents", QPDFObjectHandle::newStream(&pdf, "0 0 1 1 re f"));
    QPDFPageDocumentHelper(pdf).addPage(page, false);
    QPDFObjectHandle metadata = QPDFObjectHandle::newStream(&pdf, packet);
    metadata.getDict().replaceKey("/Type", QPDFObjectHandle::newName("/Metadata"));
    metadata.getDict().replaceKey("/Subtype", QPDFObjectHandle::newName("/XML"));
    pdf.getRoot().replaceKey("/Metadata", metadata);
    QPDFWriter writer(pdf, pdfPath.c_str());
    writer.setStaticID(true);
    writer.write();
}

}  // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    vorlan::os::ensureUtf8Locale();
    pdfPath = scratchFile("/tmp/vorlan-xmp-fuzz-XXXXXX");
    descriptionPath = scratchFile("/tmp/vorlan-xmp-fuzz-desc-XXXXXX");
    std::atexit([] {
        std::remove(pdfPath.c_str());
        std::remove(descriptionPath.c_str());
    });
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const std::string packet(reinterpret_cast<const char*>(data), size);
    std::vector<XMPInk> inks;
    readXMPInks(packet.c_str(), inks);

    writePdfWithPacket(packet);
    std::remove(descriptionPath.c_str());
    scanPdfInksToDescription(pdfPath.c_str(), descriptionPath.data(), false);
    return 0;
}
