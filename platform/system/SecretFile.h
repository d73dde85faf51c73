#pragma once

#include "platform/base/Result.h"

#include <mutex>
#include <optional>
#include <string>

namespace platform {

/// Secrets in one small file: mode 0600, written whole or not at all. Safe from any thread.
class SecretFile {
public:
    explicit SecretFile(std::string path) : path_(std::move(path)) {}

    /// A file that others may read is closed to them first.
    Result<std::optional<std::string>> lookUp(const std::string& account);
    [[nodiscard]] Failure store(const std::string& account, const std::string& secret);
    /// The file goes with its last secret.
    [[nodiscard]] Failure remove(const std::string& account);

private:
    const std::string path_;
    std::mutex mutex_;
};

} // namespace platform
