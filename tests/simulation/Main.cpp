#include "platform/base/Log.h"
#include "tests/simulation/World.h"

#include <cstdio>
#include <cstdlib>
#include <string>

// simulation [SEEDS [FIRST]]: runs so many seeds from that one on; without a number as many as
// TAVRIN_SIMULATION_SEEDS says. A failing one is printed, with its story and the way to run it
// again.

int main(int argc, char** argv) {
    const bool verbose = std::getenv("SIMULATION_VERBOSE") != nullptr;
    platform::setLogSink({[verbose](int) { return verbose; },
                          [](int, const std::string& message, const std::source_location&) {
                              std::fprintf(stderr, "%s\n", message.c_str());
                          }});
    const char* const wanted = argc > 1 ? argv[1] : std::getenv("TAVRIN_SIMULATION_SEEDS");
    const unsigned long count = wanted ? std::strtoul(wanted, nullptr, 10) : 10'000;
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
        std::printf("    again: SIMULATION_VERBOSE=1 %s 1 %lu\n", argv[0], seed);
        std::fflush(stdout);
        if (++failures == 5)
            break;
    }
    std::printf("%lu seeds from %lu on: %d failed\n", count, first, failures);
    return failures == 0 ? 0 : 1;
}
