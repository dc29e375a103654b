// The auto-imposition entry: settings, the job server's progress flag, the ticket rewrite.
#include "autoimpose/auto_imposition.h"

#include "entry/job_attributes.h"
#include "platform/jdf/platform_utils.h"
#include "vorlan/LD_JDF.h"

namespace vorlan::autoimpose {

bool imposeTicket(AutoImpositionSettings& settings, ImpositionChanges* changes) {
    try {
        readAutoImpositionSettings(settings);
        deriveImpositionPolicies(settings);
        if (settings.jdfPath.empty()) return false;
        // The engine numbers a variable-data job's records itself: the server must not track them.
        if (settings.variableData()) setJobAttributeOf(settings.jobnum, "ignore_record_ progress", "1");
        ImpositionChanges ignored;
        JDF::PlatformUtils::Initialize();
        const bool rewritten = rewriteTicket(settings, changes ? *changes : ignored);
        JDF::PlatformUtils::Terminate();
        return rewritten;
    } catch (...) {
        return false;
    }
}

}  // namespace vorlan::autoimpose

LDError LD_JDF::JDF_AutoImposition(const char* settingsPath, const char* jdfPath) {
    vorlan::autoimpose::AutoImpositionSettings settings;
    try {
        settings.settingsPath = settingsPath ? settingsPath : "";
        settings.jdfPath = jdfPath ? jdfPath : "";
    } catch (...) {
        return exitWith(LD_FAILED);
    }
    return exitWith(vorlan::autoimpose::imposeTicket(settings, nullptr) ? LD_OK : LD_FAILED);
}
