// Set-up of the JDF layer. pugixml needs none and the layer keeps no process-wide state, so
// Initialize and Terminate do nothing; they are kept because callers bracket each job with them.
// Neither throws.
#pragma once

namespace JDF {

class PlatformUtils {
public:
    static void Initialize() {}
    static void Terminate() {}
};

}  // namespace JDF
