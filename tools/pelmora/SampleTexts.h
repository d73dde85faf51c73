#pragma once

#include <cstdint>
#include <string>

namespace pelmora {

/// Running text of so many sentences, always the same for the same seed.
std::string prose(unsigned seed, int sentences);
/// A ship's log: lines of text, cut to exactly `size` bytes.
std::string logOfSize(std::uint64_t size);
/// A year's household budget as a table of comma-separated values.
std::string budgetCsv(int year);

} // namespace pelmora
