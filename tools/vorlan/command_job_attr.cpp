// vorlan job-attr: reads or sets a job attribute in the local job store.
#include <cstdio>
#include <cstdlib>
#include <string>

#include "commands.h"
#include "host_api.h"

namespace vorlan::cli {

int runJobAttr(Args args) {
    if (wantsHelp(args) || args.size() < 2 || args.size() > 3) {
        std::fputs("usage: vorlan job-attr JOB NAME [VALUE]\n\n"
                   "Prints the attribute NAME of job number JOB, or sets it to VALUE.\n"
                   "The store folder is $VORLAN_JOB_STORE (default $XDG_STATE_HOME/vorlan/jobs,\n"
                   "then ~/.local/state/vorlan/jobs). Exit status 0, 1 when the attribute is not set,\n"
                   "2 for bad arguments or an unusable store.\n",
                   wantsHelp(args) ? stdout : stderr);
        return wantsHelp(args) ? 0 : 2;
    }
    char* end = nullptr;
    long long job = std::strtoll(args[0].c_str(), &end, 10);
    if (!end || *end != '\0' || args[0].empty()) {
        std::fprintf(stderr, "vorlan: job number expected, got '%s'\n", args[0].c_str());
        return 2;
    }
    jobstore::JobAttributeStore store(jobstore::JobAttributeStore::defaultFolder());
    if (!store.open()) {
        std::fprintf(stderr, "vorlan: cannot open the job store at %s\n", store.folder().c_str());
        return 2;
    }
    if (args.size() == 3) {
        if (!store.set(job, args[1], args[2])) {
            std::fprintf(stderr, "vorlan: cannot write to the job store at %s\n", store.folder().c_str());
            return 2;
        }
        return 0;
    }
    auto value = store.get(job, args[1]);
    if (!value) {
        std::fprintf(stderr, "vorlan: job %lld has no attribute '%s'\n", job, args[1].c_str());
        return 1;
    }
    std::puts(value->c_str());
    return 0;
}

}  // namespace vorlan::cli
