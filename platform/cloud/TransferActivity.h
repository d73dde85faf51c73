#pragma once

#include <atomic>
#include <cstdint>
#include <functional>
#include <map>
#include <mutex>
#include <string>
#include <vector>

namespace platform {

/// One content on its way, as people may see it.
struct TransferInfo {
    /// Relative to the store.
    std::string path;
    /// To the account; else from it.
    bool up = false;
    std::uint64_t done = 0;
    std::uint64_t total = 0;
};

/// What is being sent and received, across all threads that do it. Outlives its entries.
class TransferActivity {
public:
    /// Called on the thread that begins or ends a transfer; must be short. Before the first one.
    void setListener(std::function<void()> listener) { changed_ = std::move(listener); }
    /// In the order in which they began.
    std::vector<TransferInfo> now() const;

    /// One transfer, from its making to its end. Without an activity it does nothing.
    class Entry {
    public:
        Entry(TransferActivity* activity, std::string path, bool up, std::uint64_t total);
        ~Entry();
        Entry(const Entry&) = delete;
        Entry& operator=(const Entry&) = delete;
        /// Begun anew, it counts from there.
        void setDone(std::uint64_t done) { done_.store(done, std::memory_order_relaxed); }

    private:
        friend class TransferActivity;
        TransferActivity* const activity_;
        const std::string path_;
        const bool up_;
        const std::uint64_t total_;
        std::atomic<std::uint64_t> done_{0};
        std::uint64_t number_ = 0;
    };

private:
    std::function<void()> changed_;
    mutable std::mutex mutex_;
    std::map<std::uint64_t, const Entry*> entries_; // guarded by mutex_, as is the next
    std::uint64_t next_ = 0;
};

} // namespace platform
