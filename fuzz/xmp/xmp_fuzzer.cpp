// Fuzzes XMP packets: the Esko ink-list reader on the bytes, then the same bytes as the catalog's
// metadata stream of a one-page PDF, scanned in Esko mode into a version description (so the ink
// names that come out of the packet also go through the description writer).
#include <qpdf/QPDF.hh>
#include <qpdf/QPDFObjectHandle.hh>
#include <qpdf/QPDFPageDocumentHelper.hh>
#include <qpdf/QPDFWriter.hh>
#include <cstdint>
#include <cstdio>
#include <string>
#include <vector>

#include "pdf/xmp_inks.h"
#include "pdf/xmp_scan.h"
#include "platform/os/text.h"
#include "scratch_file.h"

namespace {

void writePdfWithPacket(const std::string& packet, const char* pdfPath) {
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
    QPDFWriter writer(pdf, pdfPath);
    writer.setStaticID(true);
    writer.write();
}

}  // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    vorlan::os::ensureUtf8Locale();
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    static const vorlan::fuzz::ScratchFile pdfFile("vorlan-xmp-fuzz");
    static vorlan::fuzz::ScratchFile descriptionFile("vorlan-xmp-fuzz-description");
    const std::string packet(reinterpret_cast<const char*>(data), size);
    std::vector<XMPInk> inks;
    readXMPInks(packet.c_str(), inks);

    writePdfWithPacket(packet, pdfFile.path());
    std::remove(descriptionFile.path());
    scanPdfInksToDescription(pdfFile.path(), descriptionFile.mutablePath().data(), false);
    return 0;
}
