#pragma once

#include "platform/files/FileManager.h"
#include "platform/system/PreferencesStore.h"

#include <optional>

namespace platform {

/// The one file to which a domain's four parts map.
std::string preferencesPath(const std::string& configFolder, const PreferencesDomain& domain);

/// One file of preferences: a JSON object. Not thread-safe.
class PreferencesFile {
public:
    enum class Content { read, unchanged, missing, damaged, unreadable };

    explicit PreferencesFile(std::string path) : path_(std::move(path)) {}

    /// Reads the file unless it is the one that was read last.
    Content read(Value::Map& out);
    /// Writes the file whole or not at all, making its folder when that is missing.
    bool write(const Value::Map& values);
    /// Gives a damaged file another name, "….damaged", so that nobody loses it.
    bool setAside();
    const std::string& path() const { return path_; }

private:
    std::string path_;
    std::optional<FileAttributes> known_;
};

/// Keeps other processes (and stores) from changing the file at the same time.
class PreferencesLock {
public:
    explicit PreferencesLock(const std::string& path);
    ~PreferencesLock();
    PreferencesLock(const PreferencesLock&) = delete;
    PreferencesLock& operator=(const PreferencesLock&) = delete;
    explicit operator bool() const { return descriptor_ >= 0; }

private:
    int descriptor_ = -1;
};

} // namespace platform
