#pragma once

#include <cstddef>
#include <functional>

namespace platform {

/// Runs `work(0)` to `work(pieces - 1)`, on this thread and on free threads of the process-wide
/// queue; returns when all are done. This thread alone would do it all, so a busy queue is no risk.
void inParallel(std::size_t pieces, const std::function<void(std::size_t piece)>& work);

/// Into how many pieces `count` things of about a microsecond each are worth splitting.
std::size_t parallelPieces(std::size_t count);

} // namespace platform
