// vorlan convert-pdf and rewrite-seps: the two PDF operations of versioned jobs on one file.
#include <cstdio>
#include <string>
#include <vector>

#include "commands.h"
#include "host_api.h"

using vorlan::pdf::PdfFailure;

namespace vorlan::cli {
namespace {

std::vector<std::string> splitList(const std::string& text) {
    return vorlan::os::splitList<char>(text, ",");
}

std::vector<const char*> pointers(const std::vector<std::string>& names) {
    std::vector<const char*> out;
    for (const std::string& n : names) out.push_back(n.c_str());
    return out;
}

// The summary; a refusal carries its reason (the library has already written its line to
// standard error).
int finish(int result, bool json, const char* operation, const std::string& output, PdfFailure failure,
           const std::string& input) {
    const bool refused = result != 0 && failure != PdfFailure::None;
    if (!json) {
        std::printf("%s: %s (%s)%s%s\n", operation, result == 0 ? "written" : "failed", output.c_str(),
                    refused ? ": " : "", refused ? vorlan::pdf::failureName(failure) : "");
        return result;
    }
    Report r(json);
    r.beginObject();
    r.field("result", static_cast<long long>(result));
    r.field("operation", std::string(operation));
    r.field("output", output);
    r.flag("written", result == 0);
    if (refused) {
        r.field("reason", std::string(vorlan::pdf::failureName(failure)));
        r.field("message", vorlan::pdf::failureMessage(failure, failure == PdfFailure::CannotWrite ? output : input));
    }
    r.end();
    return result;
}

}  // namespace

int runConvertPdf(Args args) {
    const bool json = takeFlag(args, "--json");
    const std::vector<std::string> seps = splitList(takeOption(args, "--seps", ""));
    const std::vector<std::string> layers = splitList(takeOption(args, "--layers", ""));
    if (wantsHelp(args) || args.size() != 2) {
        std::fputs("usage: vorlan convert-pdf [--seps A,B] [--layers X,Y] [--json] IN OUT\n\n"
                   "Writes OUT: IN with every element that paints with a listed separation in an optional-\n"
                   "content group of that name, and all other content not already under optional content in\n"
                   "the group \"KVVersionSpecialOCGName\"; the new groups start OFF. --layers names the PDF's\n"
                   "own layers; without it, content already in layers is grouped as well and the layer order\n"
                   "lists only the new groups. Exit status 0 when OUT was written, else 1, and the reason\n"
                   "(also in --json) on standard error.\n",
                   wantsHelp(args) ? stdout : stderr);
        return wantsHelp(args) ? 0 : 2;
    }
    std::vector<const char*> s = pointers(seps), l = pointers(layers);
    PdfFailure failure = PdfFailure::None;
    const int result = vorlan::pdf::convertPDF(nullptr, args[0].c_str(), args[1].c_str(), s.data(), l.data(),
                                               static_cast<int>(s.size()), static_cast<int>(l.size()), &failure);
    return finish(result, json, "convert-pdf", args[1], failure, args[0]);
}

int runRewriteSeps(Args args) {
    const bool json = takeFlag(args, "--json");
    const std::string keep = takeOption(args, "--keep", "\x01");
    const std::string drop = takeOption(args, "--drop", "\x01");
    const bool keepListed = keep != "\x01";
    if (wantsHelp(args) || args.size() != 2 || keepListed == (drop != "\x01")) {
        std::fputs("usage: vorlan rewrite-seps (--keep A,B | --drop A,B) [--json] IN OUT\n\n"
                   "Writes OUT: IN with separations replaced by the colorant None. --drop: the listed\n"
                   "separations print nothing, everything else stays. --keep: only the listed separations\n"
                   "print; other separations, process colours and process-colour images are taken out.\n"
                   "Names are compared exactly. Exit status 0 when OUT was written, else 1, and the reason\n"
                   "(also in --json) on standard error.\n",
                   wantsHelp(args) ? stdout : stderr);
        return wantsHelp(args) ? 0 : 2;
    }
    const std::vector<std::string> list = splitList(keepListed ? keep : drop);
    PdfFailure failure = PdfFailure::None;
    const int result =
        vorlan::pdf::rewriteSeparations(nullptr, args[0].c_str(), args[1].c_str(), list, keepListed, &failure);
    return finish(result, json, "rewrite-seps", args[1], failure, args[0]);
}

}  // namespace vorlan::cli
