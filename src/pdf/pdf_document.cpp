// Opening PDF files with qpdf.
#include "pdf/pdf_document.h"

#include <qpdf/Buffer.hh>

#include <exception>

namespace vorlan::pdf {

std::unique_ptr<QPDF> openDocument(const char* path, bool allowRepair) {
    if (!path || !*path) return nullptr;
    try {
        auto pdf = std::make_unique<QPDF>();
        pdf->setSuppressWarnings(true);
        pdf->setAttemptRecovery(allowRepair);
        pdf->processFile(path);
        return pdf;
    } catch (const std::exception&) {
        return nullptr;
    }
}

std::vector<QPDFObjectHandle> documentPages(QPDF& pdf) {
    try {
        return pdf.getAllPages();
    } catch (const std::exception&) {
        return {};
    }
}

std::string documentXmp(QPDF& pdf) {
    try {
        QPDFObjectHandle metadata = pdf.getRoot().getKey("/Metadata");
        if (!metadata.isStream()) return {};
        std::shared_ptr<Buffer> data = metadata.getStreamData(qpdf_dl_generalized);
        return std::string(reinterpret_cast<const char*>(data->getBuffer()), data->getSize());
    } catch (const std::exception&) {
        return {};
    }
}

}  // namespace vorlan::pdf
