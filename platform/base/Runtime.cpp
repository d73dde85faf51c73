#include "platform/base/Runtime.h"

#include <atomic>
#include <cstdio>
#include <cstdlib>

namespace platform {
namespace {

std::atomic<Runtime*> installedRuntime{nullptr};

} // namespace

Runtime& Runtime::current() {
    Runtime* const runtime = installedRuntime.load(std::memory_order_acquire);
    if (!runtime) {
        std::fputs("platform: used before it was installed\n", stderr);
        std::abort();
    }
    return *runtime;
}

bool Runtime::installed() {
    return installedRuntime.load(std::memory_order_acquire) != nullptr;
}

void Runtime::install(Runtime* runtime) {
    installedRuntime.store(runtime, std::memory_order_release);
}

} // namespace platform
