#pragma once

#include "platform/documents/preview/MediaMessages.h"
#include "platform/files/FileDescriptor.h"
#include "platform/system/ProgramStart.h"

#include <QImage>

#include <functional>
#include <memory>
#include <string>

class QSocketNotifier;

namespace platform {

/// A player that was started for a file; it may be handed from one thread to another.
struct MediaChild {
    StartedProgram program;
    FileDescriptor socket;

    /// Ends it and waits for its end, which comes at once.
    ~MediaChild();
};
/// None when the player is not there.
std::shared_ptr<MediaChild> startPlayer(const std::string& program, int file);

/// Speaks with a player. Belongs to the main thread; never waits for it.
class MediaProcess {
public:
    struct Events {
        std::function<void(MediaEvent event, std::int64_t value, const std::string& text)> told;
        std::function<void(MediaEvent event, QImage image)> drawn;
        /// It ended without being asked to.
        std::function<void()> gone;
    };
    MediaProcess(std::shared_ptr<MediaChild> child, Events events);
    ~MediaProcess();

    void wish(MediaWish wish, std::int64_t value = 0);

private:
    void read();
    /// Hands on what is whole of what was read; false when it makes no sense.
    bool handOn();
    void handOn(const MediaHead& head, const char* bytes);

    std::shared_ptr<MediaChild> child_;
    Events events_;
    std::unique_ptr<QSocketNotifier> notifier_;
    std::string pending_;
};

} // namespace platform
