#pragma once

#include <mutex>
#include <shared_mutex>
#include <string>
#include <string_view>
#include <unordered_map>

namespace platform {

/// Keeps answers by name. Safe from any thread; two threads may work out the same answer at once.
template<class Answer>
class TypeCache {
public:
    /// `make` is called without the lock.
    template<class Make>
    Answer get(std::string_view name, const Make& make) {
        {
            const std::shared_lock lock(mutex_);
            if (const auto found = answers_.find(name); found != answers_.end())
                return found->second;
        }
        const std::string key(name);
        Answer answer = make(key);
        const std::unique_lock lock(mutex_);
        if (answers_.size() >= limit)
            answers_.clear(); // names come from files: there is no end of them
        answers_.emplace(key, answer);
        return answer;
    }

private:
    static constexpr std::size_t limit = 20'000;
    struct Hash {
        using is_transparent = void;
        std::size_t operator()(std::string_view text) const {
            return std::hash<std::string_view>{}(text);
        }
    };

    std::shared_mutex mutex_;
    std::unordered_map<std::string, Answer, Hash, std::equal_to<>> answers_;
};

} // namespace platform
