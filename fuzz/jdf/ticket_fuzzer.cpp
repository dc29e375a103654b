// Fuzzes the ticket reader: each input is a ticket file read by a fresh worker, whose query
// interface is then asked for what it read. The worker releases its records on destruction, so
// LeakSanitizer sees anything the reader loses.
#include <cstdint>

#include "platform/os/text.h"
#include "scratch_file.h"
#include "vorlan/JDFinterface.h"

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    vorlan::os::ensureUtf8Locale();
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    static const vorlan::fuzz::ScratchFile ticketFile("vorlan-ticket-fuzz");
    if (!ticketFile.write(data, size)) return 0;

    JDFinterface ticket(nullptr, nullptr, nullptr);
    if (ticket.JDF_InitializeAndParseJDF(ticketFile.path()) == LD_OK) {
        ticket.JDF_GetAllContentPDFs();
        ticket.JDF_GetAllContentRuns();
        const long ordinals = ticket.JDF_GetMaxOrdinalNumber();
        for (long ordinal = 0; ordinal <= ordinals && ordinal < 64; ++ordinal) {
            ticket.JDF_GetLogicalContentPageByOrdinalNumber(ordinal);
            ticket.JDF_GetLogicalMarkPageByOrdinalNumber(ordinal);
        }
        ticket.JDF_GetNumberOfSurfaces();
    }
    return 0;
}
