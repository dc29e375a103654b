// Proofs of every version of a ticket.
#include "pdf/proofs.h"

#include <cstdio>
#include <exception>
#include <filesystem>
#include <set>
#include <string>
#include <system_error>
#include <vector>

#include "pdf/pdf_session.h"
#include "pdf/proof_ticket.h"
#include "pdf/proof_writer.h"

namespace vorlan::pdf {
namespace {

LDError resultOf(ProofFailure failure) {
    switch (failure) {
        case ProofFailure::None: return LD_OK;
        case ProofFailure::MissingFile: return LD_FILE_NOT_FOUND;
        case ProofFailure::MissingPage: return LD_REFERENCE_OUT_OF_RANGE;
        case ProofFailure::UnreadableFile:
        case ProofFailure::CannotWrite: return LD_FAILED;
    }
    return LD_FAILED;
}

// The file name, made distinct from those taken already ("<name>_2.pdf", ...).
std::string distinctName(const ProofVersion& version, std::set<std::string>& taken) {
    const std::string stem = version.fileName.substr(0, version.fileName.size() - 4);
    std::string name = version.fileName;
    for (int n = 2; !taken.insert(name).second; ++n) name = stem + "_" + std::to_string(n) + ".pdf";
    return name;
}

void reportVersion(ProofCallback report, void* userData, const ProofVersion& version, const std::string& path,
                   LDError result, const std::string& message) {
    if (!report) return;
    VorlanProofVersion entry;
    entry.version = version.name.c_str();
    entry.path = path.c_str();
    entry.pages = static_cast<int>(version.pages.size());
    entry.result = result;
    entry.message = message.c_str();
    report(&entry, userData);
}

}  // namespace

int writeProofs(const char* ticketPath, const char* outputFolder, ProofCallback report, void* userData) {
    try {
        PdfSession session;
        if (session.result() != 0) return LD_FAILED;
        if (!outputFolder || !*outputFolder) return LD_INVALID_INPUT;
        std::vector<ProofVersion> versions;
        const LDError read = readProofPlan(ticketPath, versions);
        if (read != LD_OK) return read;
        std::error_code ec;
        std::filesystem::create_directories(outputFolder, ec);
        int result = LD_OK;
        std::set<std::string> taken;
        for (const ProofVersion& version : versions) {
            const std::string path = (std::filesystem::path(outputFolder) / distinctName(version, taken)).string();
            std::string message;
            const LDError written = resultOf(writeProof(version, path, &message));
            if (written != LD_OK) std::fprintf(stderr, "Proof of version %s not written: %s\n", version.name.c_str(),
                                               message.c_str());
            if (result == LD_OK) result = written;
            reportVersion(report, userData, version, path, written, message);
        }
        return result;
    } catch (...) {  // nothing thrown below may reach the host
        return LD_FAILED;
    }
}

}  // namespace vorlan::pdf
