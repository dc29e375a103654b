// vorlan: a command-line host for the library, playing the print server's part.
#include <cstdio>
#include <cstring>
#include <string>

#include "cli_support.h"
#include "commands.h"
#include "host_api.h"

namespace {

void printUsage() {
    std::puts(
        "usage: vorlan <command> [arguments]\n"
        "\n"
        "commands:\n"
        "  consume     run a job: data file (+ version description) to a versioned JDF ticket\n"
        "  valid       tell whether a file is a version description\n"
        "  autoimpose  impose a ticket from an auto-impose settings file\n"
        "  scan-xmp    scan a PDF's inks into a version description\n"
        "  job-attr    read or set a job attribute in the local job store\n"
        "  inspect     print what the query interface sees of a JDF ticket\n"
        "  convert-pdf put a PDF's separations into optional-content groups\n"
        "  rewrite-seps write a PDF variant that keeps or drops listed separations\n"
        "  proof       write a proof PDF of every version of a ticket\n"
        "\n"
        "Run 'vorlan <command> --help' for a command's arguments. The exit status is the result code.");
}

}  // namespace

int main(int argc, char** argv) {
    vorlan::os::ensureUtf8Locale();
    if (argc < 2 || std::strcmp(argv[1], "--help") == 0 || std::strcmp(argv[1], "-h") == 0) {
        printUsage();
        return argc < 2 ? 2 : 0;
    }
    std::string command = argv[1];
    vorlan::cli::Args args(argv + 2, argv + argc);
    if (command == "consume") return vorlan::cli::runConsume(args);
    if (command == "valid") return vorlan::cli::runValid(args);
    if (command == "autoimpose") return vorlan::cli::runAutoimpose(args);
    if (command == "scan-xmp") return vorlan::cli::runScanXmp(args);
    if (command == "job-attr") return vorlan::cli::runJobAttr(args);
    if (command == "inspect") return vorlan::cli::runInspect(args);
    if (command == "convert-pdf") return vorlan::cli::runConvertPdf(args);
    if (command == "rewrite-seps") return vorlan::cli::runRewriteSeps(args);
    if (command == "proof") return vorlan::cli::runProof(args);
    std::fprintf(stderr, "vorlan: unknown command '%s'\n\n", command.c_str());
    printUsage();
    return 2;
}
