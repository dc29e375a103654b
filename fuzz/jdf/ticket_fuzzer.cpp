// Fuzzes the ticket reader: each input is a ticket file read by a fresh worker, whose query
// interface is then asked for what it read. The worker releases its records on destruction, so
// LeakSanitizer sees anything the reader loses.
#include <unistd.h>

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>

#include "platform/os/text.h"
#include "vorlan/JDFinterface.h"

namespace {

std::string ticketPath;

}  // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    vorlan::os::ensureUtf8Locale();
    char pattern[] = "/tmp/vorlan-ticket-fuzz-XXXXXX";
    int fd = mkstemp(pattern);
    if (fd < 0) std::abort();
    close(fd);
    ticketPath = pattern;
    std::atexit([] { std::remove(ticketPath.c_str()); });
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    FILE* file = std::fopen(ticketPath.c_str(), "wb");
    if (!file) return 0;
    std::fwrite(data, 1, size, file);
    std::fclose(file);

    JDFinterface ticket(nullptr, nullptr, nullptr);
    if (ticket.JDF_InitializeAndParseJDF(ticketPath.c_str()) == LD_OK) {
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
