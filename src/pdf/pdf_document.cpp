// Opening PDF files with qpdf.
#include "pdf/pdf_document.h"

#include <qpdf/Buffer.hh>
#include <qpdf/QPDFExc.hh>
#include <qpdf/QPDFSystemError.hh>

#include <exception>

namespace vorlan::pdf {

std::unique_ptr<QPDF> openDocument(const char* path, bool allowRepair, PdfFailure* why) {
    const PdfFailure damaged = allowRepair ? PdfFailure::DamagedBeyondRepair : PdfFailure::Damaged;
    PdfFailure failure = PdfFailure::CannotOpen;
    if (path && *path) {
        try {
            auto pdf = std::make_unique<QPDF>();
            pdf->setSuppressWarnings(true);
            pdf->setAttemptRecovery(allowRepair);
            pdf->processFile(path);  // the empty user password
            if (why) *why = PdfFailure::None;
            return pdf;
        } catch (const QPDFSystemError&) {
            failure = PdfFailure::CannotOpen;
        } catch (const QPDFExc& e) {
            switch (e.getErrorCode()) {
                case qpdf_e_password: failure = PdfFailure::PasswordProtected; break;
                case qpdf_e_system:
                case qpdf_e_unsupported: failure = PdfFailure::CannotOpen; break;
                default: failure = damaged; break;
            }
        } catch (const std::exception&) {
            failure = damaged;
        }
    }
    if (why) *why = failure;
    return nullptr;
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
