#pragma once

#include <cstdio>
#include <cstdlib>
#include <dlfcn.h>

namespace simulation {

/// The C library's own function of that name, behind the one that this program puts before it.
template<class Function>
Function* realCall(const char* name) {
    void* const address = dlsym(RTLD_NEXT, name);
    if (!address) {
        std::fprintf(stderr, "simulation: the C library has no %s\n", name);
        std::abort();
    }
    return reinterpret_cast<Function*>(address);
}

} // namespace simulation

/// Defines the C library's function `name` for the whole program, libraries included. Under a name
/// of its own in the source, so that no header's attributes or `noexcept` interfere.
#define SIMULATED(result, name, ...)                                                               \
    extern "C" __attribute__((visibility("default"))) result sim_##name(__VA_ARGS__) __asm__(#name); \
    extern "C" result sim_##name(__VA_ARGS__)
