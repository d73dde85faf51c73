#include "platform/ui/layout/Solver.h"

#include "tests/layout/BestByTrial.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <random>

using namespace platform::layout;

namespace {

constexpr Strength mustEqual{required, required};

/// Random systems with small whole numbers: full of ties, redundancy and contradiction.
class Dice {
public:
    explicit Dice(unsigned seed) : engine_(seed) {}
    int roll(int from, int to) { return std::uniform_int_distribution<int>(from, to)(engine_); }
    template<class T>
    T pick(const std::vector<T>& from) {
        return from[static_cast<std::size_t>(roll(0, static_cast<int>(from.size()) - 1))];
    }

    Strength strength() {
        const float priority = pick<float>({required, required, 750, 500, 250});
        switch (roll(0, 3)) {
        case 0:
            return {priority, 0};
        case 1:
            return {0, priority};
        case 2:
            return {750, 250};
        default:
            return {priority, priority};
        }
    }
    test::System::Line line(std::size_t variables) {
        test::System::Line line{std::vector<double>(variables, 0), double(roll(-6, 12)), strength()};
        for (double& coefficient : line.coefficients)
            coefficient = pick<double>({0, 0, 1, 1, -1, -1, 0.5, 2});
        return line;
    }
    test::System system(std::size_t variables, std::size_t lines) {
        test::System system;
        for (std::size_t v = 0; v < variables; ++v)
            system.kinds.push_back(roll(0, 1) ? Solver::Kind::size : Solver::Kind::position);
        while (system.lines.size() < lines)
            system.lines.push_back(line(variables));
        return system;
    }

private:
    std::mt19937 engine_;
};

/// A solver fed with a System's lines.
struct Fed {
    explicit Fed(const std::vector<Solver::Kind>& kinds) {
        for (const Solver::Kind kind : kinds)
            variables.push_back(solver.addVariable(kind));
    }
    explicit Fed(const test::System& system) : Fed(system.kinds) {
        for (std::size_t i = 0; i < system.lines.size(); ++i)
            rows.push_back(add(system.lines[i], i + 1));
        solver.solve();
    }
    Row add(const test::System::Line& line, std::uint64_t age) {
        std::vector<Term> terms;
        for (std::size_t v = 0; v < variables.size(); ++v)
            terms.push_back({variables[v], line.coefficients[v]});
        return solver.addRow(terms, line.constant, line.strength, age);
    }
    std::vector<double> values() const {
        std::vector<double> values;
        for (const Variable variable : variables)
            values.push_back(solver.value(variable));
        return values;
    }

    Solver solver;
    std::vector<Variable> variables;
    std::vector<Row> rows;
};

TEST(Solver, FindsTheLeastViolationAtEveryPriority) {
    Dice dice(1);
    for (int round = 0; round < 3000; ++round) {
        const auto system = dice.system(static_cast<std::size_t>(dice.roll(1, 3)),
                                        static_cast<std::size_t>(dice.roll(1, 7)));
        const auto givesWay = test::requirementsThatGiveWay(system);
        const Fed fed(system);
        std::vector<bool> gaveWay(system.lines.size(), false);
        for (const auto& conflict : fed.solver.conflicts())
            gaveWay[static_cast<std::size_t>(
                std::find(fed.rows.begin(), fed.rows.end(), conflict.row) - fed.rows.begin())] =
                true;
        ASSERT_EQ(gaveWay, givesWay) << "round " << round;
        const auto cost = test::costOf(system, givesWay, fed.values());
        const auto least = test::leastCost(system, givesWay);
        ASSERT_FALSE(fed.solver.isCutShort());
        ASSERT_FALSE(test::isLess(cost, least) || test::isLess(least, cost))
            << "round " << round << ": " << ::testing::PrintToString(cost) << " instead of "
            << ::testing::PrintToString(least);
    }
}

} // namespace
