#pragma once

#include <cstdint>
#include <span>
#include <vector>

namespace simulation {

/// All chance of a run, from one number: the same seed answers the same for ever, on every machine.
class Luck {
public:
    explicit Luck(std::uint64_t seed = 0) : state_(seed) {}

    std::uint64_t next() {
        std::uint64_t mixed = (state_ += 0x9E3779B97F4A7C15ULL);
        mixed = (mixed ^ (mixed >> 30U)) * 0xBF58476D1CE4E5B9ULL;
        mixed = (mixed ^ (mixed >> 27U)) * 0x94D049BB133111EBULL;
        return mixed ^ (mixed >> 31U);
    }
    /// 0 to `count` - 1; 0 for 0.
    std::uint64_t below(std::uint64_t count) { return count == 0 ? 0 : next() % count; }
    std::int64_t between(std::int64_t low, std::int64_t high) {
        return low + static_cast<std::int64_t>(below(static_cast<std::uint64_t>(high - low + 1)));
    }
    /// True so many times in a thousand.
    bool perMille(unsigned count) { return count > 0 && below(1000) < count; }
    bool percent(unsigned count) { return count > 0 && below(100) < count; }
    template<class T>
    const T& of(const std::vector<T>& all) {
        return all[below(all.size())];
    }
    Luck split() { return Luck(next()); }

private:
    std::uint64_t state_;
};

/// A number that says nothing about `a` and `b` but is always the same for both.
inline std::uint64_t mixed(std::uint64_t a, std::uint64_t b) {
    return Luck(a * 0xD6E8FEB86659FD93ULL ^ b).next();
}

} // namespace simulation
