#pragma once

#include <bit>
#include <cstddef>
#include <cstdint>
#include <vector>

namespace platform::layout {

/// A vector of which few elements are not zero: its walks skip the rest, 64 at a step, and may add
/// elements ahead of them.
class SlotVector {
public:
    void resize(std::size_t size) {
        values_.resize(size, 0);
        marks_.resize((size + 63) / 64, 0);
    }
    double operator[](std::size_t slot) const { return values_[slot]; }
    void add(std::size_t slot, double amount) {
        values_[slot] += amount;
        mark(slot);
    }
    void set(std::size_t slot, double value) {
        values_[slot] = value;
        mark(slot);
    }
    void clear() {
        ascending([this](std::size_t slot, double) { values_[slot] = 0; });
        for (std::uint64_t& word : marks_)
            word = 0;
    }

    /// visit(slot, value) from the first element on.
    template<class Visit>
    void ascending(Visit visit) {
        for (std::size_t word = 0; word < marks_.size(); ++word) {
            std::uint64_t ahead = ~std::uint64_t{0};
            while (const std::uint64_t rest = marks_[word] & ahead) {
                const auto bit = static_cast<unsigned>(std::countr_zero(rest));
                const std::size_t slot = word * 64 + bit;
                ahead = bit == 63 ? 0 : ~std::uint64_t{0} << (bit + 1);
                visit(slot, values_[slot]);
            }
        }
    }
    /// visit(slot, value) from the last element on.
    template<class Visit>
    void descending(Visit visit) {
        for (std::size_t word = marks_.size(); word-- > 0;) {
            std::uint64_t ahead = ~std::uint64_t{0};
            while (const std::uint64_t rest = marks_[word] & ahead) {
                const auto bit = 63U - static_cast<unsigned>(std::countl_zero(rest));
                const std::size_t slot = word * 64 + bit;
                ahead = (std::uint64_t{1} << bit) - 1;
                visit(slot, values_[slot]);
            }
        }
    }

private:
    void mark(std::size_t slot) { marks_[slot / 64] |= std::uint64_t{1} << (slot % 64); }

    std::vector<double> values_;
    std::vector<std::uint64_t> marks_;
};

} // namespace platform::layout
