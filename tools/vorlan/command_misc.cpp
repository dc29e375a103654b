// vorlan valid, autoimpose and scan-xmp.
#include <cstdio>
#include <filesystem>
#include <string>
#include <vector>

#include "host_api.h"
#include "commands.h"
#include "vorlan/vorlan.h"

namespace vorlan::cli {

int runValid(Args args) {
    if (wantsHelp(args) || args.size() != 1) {
        std::fputs("usage: vorlan valid FILE\n\nPrints 'valid' when FILE is a well-formed version description\n"
                   "(root element OptionalContentGroupData), else 'not valid'. Exit status 0 or 1.\n",
                   args.size() == 1 ? stdout : stderr);
        return wantsHelp(args) ? 0 : 2;
    }
    bool valid = vorlan_is_valid_job(args[0].c_str());
    std::puts(valid ? "valid" : "not valid");
    return valid ? 0 : 1;
}

namespace {

void reportChanges(Report& r, const autoimpose::ImpositionChanges& c) {
    r.beginObject("changes");
    r.flag("renderingParamsAdded", c.renderingParamsAdded);
    r.flag("deliveryOptions", c.deliveryOptions);
    r.field("markPages", static_cast<long long>(c.markPages));
    r.field("labelPages", static_cast<long long>(c.labelPages));
    r.flag("marksRunList", c.marksRunList);
    r.field("documentRuns", static_cast<long long>(c.documentRuns));
    r.field("markObjects", static_cast<long long>(c.markObjects));
    r.field("labelObjects", static_cast<long long>(c.labelObjects));
    r.field("renumberedObjects", static_cast<long long>(c.renumberedObjects));
    r.field("sidesSet", static_cast<long long>(c.sidesSet));
    r.field("trimSizes", static_cast<long long>(c.trimSizes));
    r.field("fitPolicies", static_cast<long long>(c.fitPolicies));
    r.field("stacks", static_cast<long long>(c.stacks));
    r.field("stackedObjects", static_cast<long long>(c.stackedObjects));
    r.field("sheetRangeParts", static_cast<long long>(c.sheetRangeParts));
    r.end();
}

}  // namespace

int runAutoimpose(Args args) {
    bool json = takeFlag(args, "--json");
    if (wantsHelp(args) || args.size() != 2) {
        std::fputs("usage: vorlan autoimpose [--json] SETTINGS_XML TICKET_JDF\n\n"
                   "Rewrites TICKET_JDF in place into an imposed layout from the auto-impose settings and\n"
                   "prints what changed. On failure the ticket is left as it was. Exit status: the result\n"
                   "code (0 rewritten, 1 failed).\n",
                   wantsHelp(args) ? stdout : stderr);
        return wantsHelp(args) ? 0 : 2;
    }
    autoimpose::AutoImpositionSettings settings;
    settings.settingsPath = args[0];
    settings.jdfPath = args[1];
    autoimpose::ImpositionChanges changes;
    bool rewritten;
    {
        StdoutToStderr quiet(json);
        rewritten = autoimpose::imposeTicket(settings, &changes);
    }
    Report r(json);
    r.beginObject();
    r.field("ticket", args[1]);
    r.flag("rewritten", rewritten);
    if (rewritten) reportChanges(r, changes);
    r.result(rewritten ? LD_OK : LD_FAILED);
    r.end();
    return rewritten ? LD_OK : LD_FAILED;
}

int runScanXmp(Args args) {
    bool json = takeFlag(args, "--json");
    bool dieLibrary = takeFlag(args, "--die-library");
    if (wantsHelp(args) || args.size() != 2) {
        std::fputs("usage: vorlan scan-xmp [--die-library] [--json] PDF OUTPUT_DESCRIPTION\n\n"
                   "Writes a version description from the PDF's inks: by default from the Esko technical\n"
                   "inks of its XMP ink list; with --die-library by matching its pages against the die library.\n"
                   "Exit status: 1 after the Esko mode, 2 after the die-library mode; check whether the\n"
                   "description was written.\n",
                   wantsHelp(args) ? stdout : stderr);
        return wantsHelp(args) ? 0 : 2;
    }
    std::vector<char> output(args[1].begin(), args[1].end());
    output.push_back('\0');
    // The scan's result says which mode ran (1 Esko inks, 2 die library), not whether a
    // description came out of it: tell the operator whether the file was written.
    int code = vorlan_scan_xmp(args[0].c_str(), output.data(), dieLibrary ? "True" : "False");
    std::error_code ec;
    bool written = std::filesystem::exists(args[1], ec);
    const char* mode = code == 2 ? "die library" : "Esko technical inks";
    if (json)
        std::printf("{\"result\": %d, \"mode\": %s, \"description\": %s, \"written\": %s}\n", code,
                    jsonString(mode).c_str(), jsonString(args[1]).c_str(), written ? "true" : "false");
    else
        std::printf("result: %d (%s scan ran); description %s: %s\n", code, mode, written ? "written" : "not written",
                    args[1].c_str());
    return code;
}

}  // namespace vorlan::cli
