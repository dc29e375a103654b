// vorlan consume: runs one job the way the print server does.
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <string>
#include <vector>

#include "commands.h"
#include "vorlan/vorlan.h"

namespace fs = std::filesystem;

namespace vorlan::cli {
namespace {

constexpr const char* kHelp =
    "usage: vorlan consume [options] DATA_FILE OUTPUT_JDF\n"
    "\n"
    "Runs one job and writes the versioned ticket to OUTPUT_JDF.\n"
    "\n"
    "DATA_FILE is what the print server hands over: a bare PDF, or a job data file whose folder has\n"
    "the same name with the character before its four-character extension replaced by 'D'\n"
    "(data file jobs/job1.0001 -> job folder jobs/job1D0001 holding the JDF ticket and its PDFs).\n"
    "\n"
    "options:\n"
    "  --impinfo PATH     version description (job<N>.impinfo; N becomes the job number)\n"
    "  --job-folder DIR   folder for the job's side files (die info); default: DATA_FILE's folder\n"
    "  --page-range TEXT  All (default), Odd, Even or a page list such as \"1~3, 7\"\n"
    "  --out-dir DIR      where new PDFs the library asks for are written; default: OUTPUT_JDF's folder\n"
    "  --json             print a machine-readable summary\n";

// The print server's side of FilePathCallback: hands out fresh names in the output folder.
struct OutputNamer {
    fs::path folder;
    int counter = 0;
    std::vector<std::string> handedOut;
};

int nameNextOutputFile(char* buffer, int size, void* userData) {
    auto* namer = static_cast<OutputNamer*>(userData);
    if (!namer || !buffer || size <= 0) return 1;
    // Never hand out a name that is taken: an earlier job's output stays intact.
    std::string path;
    std::error_code ec;
    do {
        path = (namer->folder / ("vorlan-output-" + std::to_string(++namer->counter) + ".pdf")).string();
    } while (fs::exists(path, ec));
    if (path.size() + 1 > static_cast<size_t>(size)) {
        buffer[0] = '\0';
        return 1;
    }
    std::memcpy(buffer, path.c_str(), path.size() + 1);
    namer->handedOut.push_back(path);
    return 0;
}

}  // namespace

int runConsume(Args args) {
    if (wantsHelp(args)) {
        std::fputs(kHelp, stdout);
        return 0;
    }
    bool json = takeFlag(args, "--json");
    std::string impinfo = takeOption(args, "--impinfo", "");
    std::string jobFolder = takeOption(args, "--job-folder", "");
    std::string pageRange = takeOption(args, "--page-range", "All");
    std::string outDir = takeOption(args, "--out-dir", "");
    if (args.size() != 2) {
        std::fputs(kHelp, stderr);
        return 2;
    }
    const std::string& dataFile = args[0];
    std::string output = args[1];
    if (jobFolder.empty()) jobFolder = fs::path(dataFile).parent_path().string();
    if (jobFolder.empty()) jobFolder = ".";
    OutputNamer namer;
    namer.folder = outDir.empty() ? fs::path(output).parent_path() : fs::path(outDir);
    if (namer.folder.empty()) namer.folder = ".";
    std::error_code madeEc;
    fs::create_directories(namer.folder, madeEc);
    namer.folder = fs::absolute(namer.folder, madeEc);  // the ticket stores these paths as URLs

    std::vector<char> outputBuffer(output.begin(), output.end());
    outputBuffer.push_back('\0');
    int code;
    {
        StdoutToStderr quiet(json);
        code = vorlan_consume_job(dataFile.c_str(), impinfo.empty() ? nullptr : impinfo.c_str(), outputBuffer.data(),
                                  jobFolder.c_str(), pageRange.c_str(), nullptr, nameNextOutputFile, &namer);
    }

    std::error_code ec;
    bool written = fs::exists(output, ec);
    // A name handed out is not yet a file: only what the job wrote is listed.
    std::vector<std::string> outputFiles;
    for (const std::string& file : namer.handedOut)
        if (fs::exists(file, ec)) outputFiles.push_back(file);
    Report r(json);
    if (json) {
        r.beginObject();
        r.field("ticket", output);
        r.flag("ticketWritten", written);
        r.beginArray("outputFiles");
        for (const std::string& file : outputFiles) r.field("", file);
        r.end();
    } else {
        std::printf("ticket: %s (%s)\n", output.c_str(), written ? "written" : "not written");
        for (const std::string& file : outputFiles) std::printf("output file: %s\n", file.c_str());
    }
    r.result(code);
    if (json) r.end();
    return exitStatus(code);
}

}  // namespace vorlan::cli
