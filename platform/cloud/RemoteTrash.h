#pragma once

#include "platform/base/Clock.h"
#include "platform/files/FileDescriptor.h"
#include "platform/files/FileManager.h"

#include <string>

namespace platform {

/// Where a folder remote keeps what was replaced or deleted: `.pelmora/trash/DAY/PATH` on the
/// remote itself. What is about to go to a place waits there too, so that an exchange of the two
/// leaves the displaced one where it belongs.
class RemoteTrash {
public:
    /// `folder` is the service folder of the remote.
    RemoteTrash(std::string folder, Clock& clock) : folder_(std::move(folder)), clock_(clock) {}

    struct Opened {
        FileDescriptor file;
        std::string path;
    };
    /// A new file in the trash, at the place where an item of that path belongs.
    Result<Opened> open(const std::string& itemPath) const;
    /// Moves the item there; answers where it lies then.
    Result<std::string> take(const std::string& from, const std::string& itemPath) const;
    /// Removes what has lain there for longer than the time that is promised.
    void expire() const;

private:
    template<class Arrive>
    Result<std::string> findPlace(const std::string& itemPath, const Arrive& arrive) const;
    std::string placeFor(const std::string& itemPath, int attempt) const;

    std::string folder_;
    Clock& clock_;
};

} // namespace platform
