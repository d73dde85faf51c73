// Types of 100,000 names, as a folder of that size asks for them.
#include "platform/launch/TypeRegistry.h"

#include <benchmark/benchmark.h>

#include <array>

namespace {

std::vector<std::string> givenNames() {
    constexpr std::array extensions = {".jpg", ".pdf",    ".tar.gz", ".cpp", ".docx",
                                       "",     ".xyzzy1", ".MP4",    ".txt", ".rtfd"};
    std::vector<std::string> names;
    for (std::size_t i = 0; i < 100'000; ++i)
        names.push_back("Document " + std::to_string(i) + extensions[i % extensions.size()]);
    return names;
}

void typesOfNames(benchmark::State& state) {
    const std::vector<std::string> names = givenNames();
    for (auto _ : state)
        for (const std::string& name : names)
            benchmark::DoNotOptimize(platform::TypeRegistry::identifierForFileName(name));
}
BENCHMARK(typesOfNames)->Unit(benchmark::kMillisecond);

void conformanceAndWordsOfNames(benchmark::State& state) {
    const std::vector<std::string> names = givenNames();
    for (auto _ : state)
        for (const std::string& name : names) {
            const std::string type = platform::TypeRegistry::identifierForFileName(name);
            benchmark::DoNotOptimize(
                platform::TypeRegistry::conformsTo(type, platform::types::image));
            benchmark::DoNotOptimize(platform::TypeRegistry::localizedDescription(type));
        }
}
BENCHMARK(conformanceAndWordsOfNames)->Unit(benchmark::kMillisecond);

} // namespace
