// Fuzzes the version description reader and the client-mode pruning. Each input is read twice:
// as the description of a job without ticket, and of a ticket job with two content runs and one
// mark run (so pdfIndex is checked), with the die line printed.
#include <cstdint>

#include "platform/os/text.h"
#include "vorlan/LD_JDF.h"

namespace {

void giveTicket(LD_JDF& worker) {
    for (auto* list : {&worker.contentRuns, &worker.contentRuns, &worker.markRuns}) {
        auto* pdf = new LD_PDF;
        (list == &worker.markRuns ? worker.markPDFs : worker.contentPDFs).push_back(pdf);
        auto* run = new LD_Run;
        run->pdf = pdf;
        list->push_back(run);
    }
}

void readAndPrune(const uint8_t* data, size_t size, bool hasTicket) {
    LD_JDF worker;
    if (hasTicket) giveTicket(worker);
    worker.printDieLine = hasTicket;
    const auto* bytes = reinterpret_cast<const char*>(data);
    if (worker.parseXMLBuffer(bytes, static_cast<long>(size), hasTicket, nullptr) == LD_OK)
        worker.applyClientModeChangesToXMLBufferData();
}  // the worker releases every record here; LeakSanitizer checks that nothing is left

}  // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    vorlan::os::ensureUtf8Locale();
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    readAndPrune(data, size, false);
    readAndPrune(data, size, true);
    return 0;
}
