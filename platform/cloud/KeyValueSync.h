#pragma once

#include "platform/base/Value.h"
#include "platform/cloud/Remote.h"

#include <functional>
#include <mutex>
#include <string>
#include <string_view>

namespace platform {

class StoreFileSystem;

/// The values that follow the account: a small file of the store answers at once, also while the
/// remote is away, and holds what the remote has not heard of; a file of the remote is where
/// all devices meet. What is set here takes its key's place there when it arrives; all other keys
/// are the remote's. Safe from any thread.
class KeyValueSync {
public:
    /// `changedElsewhere` is called, on the thread of exchange(), when that brought news.
    KeyValueSync(std::string file, StoreFileSystem& disk, Clock& clock,
                 std::function<void()> changedElsewhere);

    Value value(std::string_view key) const;
    /// None removes the key. Answers whether it is safe on the disk; while the file is not to be
    /// written (see open), it is in memory alone.
    [[nodiscard]] Failure setValue(std::string_view key, Value value);

    /// Something was set that the remote has not heard of.
    bool hasUnsent() const {
        const std::lock_guard lock(mutex_);
        return !pending_.empty();
    }

    /// From now on the file is this object's to write; what was set before goes there.
    void open();
    void close();

    /// Brings both sides together. Waits for the remote; one at a time.
    [[nodiscard]] Failure exchange(Remote& remote, CancelFlag& cancel);

    /// Where the remote has it.
    static std::string remotePath();

private:
    void load();
    Failure save() const;
    Value::Map merged(const Value::Map& from) const;
    /// The remote has these values now; `sent` is what of ours is in them.
    Failure adopt(Value::Map values, const Value::Map& sent);

    const std::string file_;
    StoreFileSystem& disk_;
    Clock& clock_;
    const std::function<void()> changedElsewhere_;
    std::mutex exchanging_;
    mutable std::mutex mutex_;
    Value::Map values_;  // as the remote had them; guarded by mutex_, as are the two below
    Value::Map pending_; // ours that it has not heard of; a none value removes
    bool open_ = false;
};

} // namespace platform
