#include "tests/layout/BestByTrial.h"

#include <algorithm>
#include <cmath>
#include <functional>
#include <optional>

namespace test {

using platform::layout::required;
using platform::layout::Solver;

namespace {

constexpr double tolerance = 1e-6;
const std::vector<float> priorities = {750, 500, 250};

struct Plane {
    std::vector<double> coefficients;
    double constant;
};

/// Every row and every variable == 0.
std::vector<Plane> planesOf(const System& system) {
    std::vector<Plane> planes;
    for (const auto& line : system.lines)
        planes.push_back({line.coefficients, line.constant});
    for (std::size_t v = 0; v < system.kinds.size(); ++v) {
        planes.push_back({std::vector<double>(system.kinds.size(), 0), 0});
        planes.back().coefficients[v] = 1;
    }
    return planes;
}

std::optional<std::vector<double>> crossing(std::vector<Plane> planes) {
    const std::size_t count = planes.size();
    for (std::size_t i = 0; i < count; ++i) {
        std::size_t best = i;
        for (std::size_t r = i + 1; r < count; ++r)
            if (std::abs(planes[r].coefficients[i]) > std::abs(planes[best].coefficients[i]))
                best = r;
        std::swap(planes[i], planes[best]);
        if (std::abs(planes[i].coefficients[i]) < 1e-9)
            return std::nullopt;
        for (std::size_t r = 0; r < count; ++r) {
            if (r == i)
                continue;
            const double share = planes[r].coefficients[i] / planes[i].coefficients[i];
            for (std::size_t v = 0; v < count; ++v)
                planes[r].coefficients[v] -= share * planes[i].coefficients[v];
            planes[r].constant -= share * planes[i].constant;
        }
    }
    std::vector<double> values;
    for (std::size_t i = 0; i < count; ++i)
        values.push_back(planes[i].constant / planes[i].coefficients[i]);
    return values;
}

void forEveryCrossing(const System& system,
                      const std::function<void(const std::vector<double>&)>& visit) {
    const auto planes = planesOf(system);
    const std::size_t count = system.kinds.size();
    std::vector<bool> chosen(planes.size(), false);
    std::fill(chosen.begin(), chosen.begin() + static_cast<std::ptrdiff_t>(count), true);
    do {
        std::vector<Plane> some;
        for (std::size_t i = 0; i < planes.size(); ++i)
            if (chosen[i])
                some.push_back(planes[i]);
        if (const auto values = crossing(some))
            visit(*values);
    } while (std::prev_permutation(chosen.begin(), chosen.end()));
}

bool isRequirement(const System::Line& line) {
    return line.strength.below == required || line.strength.above == required;
}

} // namespace

Cost costOf(const System& system, const std::vector<bool>& givesWay,
            const std::vector<double>& values) {
    Cost cost(2 + priorities.size(), 0);
    for (std::size_t v = 0; v < values.size(); ++v)
        if (system.kinds[v] == Solver::Kind::size)
            cost[0] += std::max(0.0, -values[v]);
    for (std::size_t i = 0; i < system.lines.size(); ++i) {
        const auto& line = system.lines[i];
        double residual = -line.constant;
        for (std::size_t v = 0; v < values.size(); ++v)
            residual += line.coefficients[v] * values[v];
        const float priority = residual > 0 ? line.strength.above : line.strength.below;
        if (priority == required)
            cost[givesWay[i] ? 1 : 0] += std::abs(residual);
        else if (priority > 0)
            cost[static_cast<std::size_t>(
                std::find(priorities.begin(), priorities.end(), priority) - priorities.begin() +
                2)] += std::abs(residual);
    }
    return cost;
}

bool isLess(const Cost& a, const Cost& b) {
    for (std::size_t i = 0; i < a.size(); ++i)
        if (std::abs(a[i] - b[i]) > tolerance)
            return a[i] < b[i];
    return false;
}

std::vector<bool> requirementsThatGiveWay(const System& system) {
    System accepted{system.kinds, {}};
    std::vector<bool> givesWay;
    for (const auto& line : system.lines) {
        accepted.lines.push_back(line);
        const std::vector<bool> none(accepted.lines.size(), false);
        givesWay.push_back(isRequirement(line) && leastCost(accepted, none)[0] > tolerance);
        if (givesWay.back() || !isRequirement(line))
            accepted.lines.pop_back();
    }
    return givesWay;
}

Cost leastCost(const System& system, const std::vector<bool>& givesWay) {
    std::optional<Cost> least;
    forEveryCrossing(system, [&](const std::vector<double>& values) {
        const Cost cost = costOf(system, givesWay, values);
        if (!least || isLess(cost, *least))
            least = cost;
    });
    return *least;
}

} // namespace test
