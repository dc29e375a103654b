// vorlan proof: a proof PDF per version of a ticket, for people to check before it prints.
#include <cstdio>
#include <string>
#include <vector>

#include "commands.h"
#include "vorlan/vorlan.h"

namespace vorlan::cli {
namespace {

struct ProofEntry {
    std::string version, path, message;
    int pages = 0;
    int result = 0;
};

void collect(const VorlanProofVersion* version, void* userData) {
    static_cast<std::vector<ProofEntry>*>(userData)->push_back(
        {version->version, version->path, version->message, version->pages, version->result});
}

}  // namespace

int runProof(Args args) {
    const bool json = takeFlag(args, "--json");
    if (wantsHelp(args) || args.size() != 2) {
        std::fputs("usage: vorlan proof [--json] TICKET_JDF OUTDIR\n\n"
                   "Writes OUTDIR/<version>.pdf for every version of a ticket this library wrote (\"Default\"\n"
                   "for surfaces and runs without a version): one page per printed surface in sheet order,\n"
                   "die sheets included, each the sheet's media size, showing every placed object through\n"
                   "its CTM and ClipBox with the layers its ordinal switches off left out, and a label naming\n"
                   "version, copies, sheet, side and content type. A ticket without a layout gets one page per\n"
                   "run-list page. The job's files are only read. A version whose PDF or page is missing is\n"
                   "not written (one line on standard error says why); the others are. The exit status is\n"
                   "the first failure's result code.\n",
                   wantsHelp(args) ? stdout : stderr);
        return wantsHelp(args) ? 0 : 2;
    }
    std::vector<ProofEntry> entries;
    int result = 0;
    {
        StdoutToStderr toStderr(json);  // the reader's timing line
        result = vorlan_proof_ticket(args[0].c_str(), args[1].c_str(), collect, &entries);
    }
    Report r(json);
    r.beginObject();
    r.field("ticket", args[0]);
    r.beginArray("versions");
    for (const ProofEntry& e : entries) {
        r.beginObject("version");
        r.field("name", e.version);
        r.field("path", e.path);
        r.field("pages", static_cast<long long>(e.pages));
        r.flag("written", e.result == 0);
        r.field("result", static_cast<long long>(e.result));
        if (!e.message.empty()) r.field("message", e.message);
        r.end();
    }
    r.end();
    r.result(result);
    r.end();
    return exitStatus(result);
}

}  // namespace vorlan::cli
