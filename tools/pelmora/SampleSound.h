#pragma once

#include <string>

namespace pelmora {

/// A short tune on a plucked string: 16 bits, mono, 22,050 samples a second.
std::string tuneWav();

} // namespace pelmora
