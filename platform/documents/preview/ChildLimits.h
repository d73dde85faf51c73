#pragma once

#include <cstddef>

namespace platform {

/// For programs that read what comes from anywhere: bounds the memory in bytes and the work in
/// seconds that this process may use, takes its right to write files, and ends it when the one that
/// started it goes. Called first.
void limitThisProcess(std::size_t memory, unsigned work);

} // namespace platform
