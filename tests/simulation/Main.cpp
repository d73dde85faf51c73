#include "platform/base/Log.h"
#include "tests/simulation/World.h"

#include <cstdio>
#include <cstdlib>
#include <string>

// simulation [SEEDS [FIRST]]: runs so many seeds from that one on. A failing one is printed, with
// its story, and run again by "simulation 1 SEED".

int main(int argc, char** argv) {
    const bool verbose = std::getenv("SIMULATION_VERBOSE") != nullptr;
    platform::setLogSink({[verbose](int) { return verbose; },
                          [](int, const std::string& message, const std::source_location&) {
                              std::fprintf(stderr, "%s\n", message.c_str());
                          }});
    const unsigned long count = argc > 1 ? std::strtoul(argv[1], nullptr, 10) : 500;
    const unsigned long first = argc > 2 ? std::strtoul(argv[2], nullptr, 10) : 1;
    int failures = 0;
    for (unsigned long seed = first; seed < first + count; ++seed) {
        simulation::World world(seed);
        const std::optional<std::string> fault = world.run();
        if (!fault)
            continue;
        std::printf("seed %lu: %s\n", seed, fault->c_str());
        for (const std::string& line : world.story())
            std::printf("    %s\n", line.c_str());
        if (++failures == 5)
            break;
    }
    std::printf("%lu seeds from %lu on: %d failed\n", count, first, failures);
    return failures == 0 ? 0 : 1;
}
