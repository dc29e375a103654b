// Initialisation count of the JDF layer.
#include "platform/jdf/platform_utils.h"

#include <atomic>

namespace JDF {
namespace {
std::atomic<int> g_depth{0};
}

void PlatformUtils::Initialize() { ++g_depth; }

void PlatformUtils::Terminate() {
    int d = g_depth.load();
    while (d > 0 && !g_depth.compare_exchange_weak(d, d - 1)) {
    }
}

bool PlatformUtils::IsInitialized() { return g_depth.load() > 0; }

}  // namespace JDF
