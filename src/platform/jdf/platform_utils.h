// Process-wide set-up of the JDF layer. pugixml needs none, so Initialize/Terminate only count
// nesting; they are kept because callers bracket each job with them. Neither throws.
#pragma once

namespace JDF {

class PlatformUtils {
public:
    static void Initialize();
    static void Terminate();
    // True between Initialize and the matching Terminate.
    static bool IsInitialized();
};

}  // namespace JDF
