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
        test::System::Line line{std::vector<double>(variables, 0), double(roll(-6, 12)),
                                strength()};
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

/// A system that changes all the time, and the same system told to a new solver.
class Churn {
public:
    Churn(Dice& dice, std::size_t variables)
        : dice_(dice), kinds_(dice.system(variables, 0).kinds), fed_(kinds_) {}

    void change() {
        const int what = lines_.empty() ? 0 : dice_.roll(0, 9);
        const auto at = static_cast<std::size_t>(
            lines_.empty() ? 0 : dice_.roll(0, static_cast<int>(lines_.size()) - 1));
        if (what < 4) {
            lines_.push_back(dice_.line(kinds_.size()));
            ages_.push_back(++age_);
            rows_.push_back(fed_.add(lines_.back(), age_));
        } else if (what < 6) {
            fed_.solver.removeRow(rows_[at]);
            lines_.erase(lines_.begin() + static_cast<std::ptrdiff_t>(at));
            ages_.erase(ages_.begin() + static_cast<std::ptrdiff_t>(at));
            rows_.erase(rows_.begin() + static_cast<std::ptrdiff_t>(at));
        } else if (what < 9) {
            lines_[at].constant = dice_.roll(-6, 12);
            fed_.solver.setConstant(rows_[at], lines_[at].constant);
        } else {
            lines_[at].strength = dice_.strength();
            fed_.solver.setStrength(rows_[at], lines_[at].strength);
        }
    }
    std::vector<double> solved() {
        fed_.solver.solve();
        return fed_.values();
    }
    std::vector<double> solvedAfresh() const {
        Fed fresh(kinds_);
        for (std::size_t i = 0; i < lines_.size(); ++i)
            fresh.add(lines_[i], ages_[i]);
        fresh.solver.solve();
        return fresh.values();
    }
    std::size_t exchanges() const { return fed_.solver.exchanges(); }

private:
    Dice& dice_;
    std::vector<Solver::Kind> kinds_;
    Fed fed_;
    std::vector<test::System::Line> lines_;
    std::vector<std::uint64_t> ages_;
    std::vector<Row> rows_;
    std::uint64_t age_ = 0;
};

TEST(Solver, AnswersTheSameHoweverItCameThere) {
    Dice dice(2);
    for (int round = 0; round < 300; ++round) {
        Churn churn(dice, static_cast<std::size_t>(dice.roll(2, 12)));
        for (int step = 0; step < 40; ++step) {
            for (int change = dice.roll(1, 4); change > 0; --change)
                churn.change();
            const auto values = churn.solved();
            const auto fresh = churn.solvedAfresh();
            for (std::size_t v = 0; v < values.size(); ++v)
                ASSERT_NEAR(values[v], fresh[v], 1e-6) << "round " << round << ", step " << step;
        }
    }
}

TEST(Solver, EndsOnAnySoup) {
    Dice dice(3);
    for (int round = 0; round < 10000; ++round) {
        auto system = dice.system(static_cast<std::size_t>(dice.roll(1, 12)),
                                  static_cast<std::size_t>(dice.roll(0, 30)));
        for (auto& line : system.lines) {
            if (dice.roll(0, 1))
                line.strength.below = static_cast<float>(dice.roll(0, 1000));
            if (dice.roll(0, 9) == 0)
                line.constant = dice.pick<double>({NAN, INFINITY, -INFINITY, 1e300, 1e-300});
            if (dice.roll(0, 9) == 0)
                line.coefficients[0] = dice.pick<double>({NAN, INFINITY, 1e300, 1e-9, 1000});
        }
        for (const double value : Fed(system).values())
            ASSERT_TRUE(std::isfinite(value)) << "round " << round;
    }
}

} // namespace
