#pragma once

#include "platform/ui/layout/Solver.h"

#include <vector>

namespace test {

/// A system of rows as plain data, small enough to try every answer that could be the best.
struct System {
    struct Line {
        std::vector<double> coefficients;
        double constant = 0;
        platform::layout::Strength strength;
    };
    std::vector<platform::layout::Solver::Kind> kinds;
    /// The oldest first.
    std::vector<Line> lines;
};

/// What values leave unmet: the requirements that hold, those that give way, then the sum for every
/// priority, the highest first.
using Cost = std::vector<double>;
Cost costOf(const System& system, const std::vector<bool>& givesWay,
            const std::vector<double>& values);

/// The requirements that give way: those that do not fit the older ones.
std::vector<bool> requirementsThatGiveWay(const System& system);

/// The least cost of all values, found by trying every point where rows cross.
Cost leastCost(const System& system, const std::vector<bool>& givesWay);

bool isLess(const Cost& a, const Cost& b);

} // namespace test
