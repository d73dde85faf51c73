#pragma once

namespace platform {

/// Marks the calling thread as running somebody's progress callback. What is called from there must
/// not wait for the callbacks of other threads: two that end each other would wait for ever.
class ProgressCallbackScope {
public:
    ProgressCallbackScope() { ++depth; }
    ~ProgressCallbackScope() { --depth; }
    ProgressCallbackScope(const ProgressCallbackScope&) = delete;
    ProgressCallbackScope& operator=(const ProgressCallbackScope&) = delete;

    static bool active() { return depth > 0; }

private:
    static inline thread_local int depth = 0;
};

} // namespace platform
