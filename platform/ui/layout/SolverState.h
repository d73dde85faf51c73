#pragma once

#include "platform/ui/layout/BasisFactor.h"
#include "platform/ui/layout/SlotVector.h"
#include "platform/ui/layout/SolverRecords.h"

#include <optional>

namespace platform::layout {

// How the solver works, for its source files only.
//
// Every row is either tight (one a slot; their values alone say where the variables are) or loose
// (too small, too large, or just as it should be). A loose row pulls with the weight of the side
// that it has missed; the tight rows carry what the loose ones pull. The answer is the best one
// when no tight row has to carry more than its own weight. A row that does is let go: values slide
// along until a row that they meet resists more than is gained, and that one becomes tight instead.
//
// Weights have a level for every priority, compared one after the other, so that no sum of low ones
// outweighs a high one: first what is given, then what is required (and that no size is negative),
// then the priorities downward, then the ties between rows of one priority, then the wish of every
// variable to be zero.

struct Solver::State {
    /// A tight row that carries too much.
    struct Overload {
        std::size_t slot = 0;
        /// To which side the row is to move.
        int direction = 0;
        /// Which overloads to relieve first: of the higher level, and of one level those of rows
        /// that weigh nothing there. What many weak rows pull at together rarely has to yield once
        /// the weak ones did.
        std::size_t rank = 0;
        /// By how much at its level, and then among equals: what is relieved first within a rank.
        double excess = 0;
        double tieExcess = 0;
    };
    struct Pull {
        int level;
        Row row;
        double amount;
    };
    struct Meeting {
        double distance;
        /// By how much the row's value changes over a unit of distance.
        double rate;
        Row row;
    };

    State();

    // SolverUpdate.cpp
    Variable appendVariable();
    Row insertRow(std::span<const Term> terms, double constant, Strength strength,
                  std::uint64_t age);
    void touch(Variable variable);
    void prepare();
    void update();
    void moveConstants();
    bool releaseRemoved();
    void eraseRemoved();
    void collect();

    // SolverStart.cpp: a new set of tight rows, chosen and factored.
    void start();
    void collectLevels();
    void chooseTight();
    void refactor();
    void refresh();
    void findValues();
    void findForces();

    // SolverForces.cpp
    static constexpr int givenLevel = 0;
    static constexpr int requiredLevel = 1;
    static constexpr int firstPriorityLevel = 2;
    std::size_t tieLevel() const { return firstPriorityLevel + priorities.size(); }
    std::size_t levelCount() const { return tieLevel() + 2; }
    bool knowsPriority(float priority) const;
    Weight weightFor(float priority, const RowState& row) const;
    void assignWeights(Row row);
    double weightAt(const Weight& weight, std::size_t level) const;
    void changeWeights(Row row);
    void queuePull(Row row, double sign);
    void setSide(Row row, Side side);
    void chooseSide(Row row);
    void applyPulls();
    void changeForce(std::size_t slot, std::size_t level, double amount);
    void checkTouchedSlots();
    std::optional<Overload> overload(std::size_t slot) const;

    // SolverExchange.cpp
    void optimise();
    bool isCautious() const;
    std::optional<Overload> nextOverload();
    std::optional<Overload> firstOverload() const;
    bool exchange(std::size_t slot, int direction);
    void slide(std::size_t slot, int direction);
    void findRates();
    void forgetRates();
    auto laterMeeting() const;
    void findMeetings();
    std::optional<Meeting> findEntering(std::size_t slot, int direction);
    bool addResistance(const Meeting& meeting);
    bool isDownhill() const;
    void moveBy(double distance);
    void handOver(std::size_t slot, int direction, const Meeting& entering);

    // SolverConflicts.cpp
    void settleConflicts();
    void resolve();
    bool isViolated(Row row) const;
    std::vector<Row> contradiction() const;
    void giveWay(Row row, std::vector<Row> against);
    void takeBack(Row row);

    RowState& at(Row row) { return rows[static_cast<std::size_t>(row)]; }
    const RowState& at(Row row) const { return rows[static_cast<std::size_t>(row)]; }

    SparseRows matrix;
    std::vector<RowState> rows;
    std::vector<VariableState> variables;
    std::vector<Variable> freeVariables;

    BasisFactor factor;
    std::vector<Row> tight;
    /// By slot and level.
    std::vector<double> forces;
    /// From firstPriorityLevel on, the highest first. 1000 stands for the requirements that give
    /// way.
    std::vector<float> priorities;

    // What changed since the last solution.
    bool isDirty = false;
    bool needsStart = true;
    std::size_t structuralChanges = 0;
    std::vector<Row> newRows;
    std::vector<Row> removedRows;
    std::vector<Row> movedRows;
    std::vector<Variable> removedVariables;
    std::vector<Pull> pulls;

    // Work of the moment.
    SlotVector slideVector;
    SlotVector combination;
    SlotVector work;
    std::vector<double> rates;
    std::vector<bool> isRated;
    std::vector<Row> ratedRows;
    std::vector<Meeting> meetings;
    std::vector<Row> passed;
    std::vector<double> slope;
    std::vector<std::size_t> touchedSlots;
    std::vector<bool> isTouchedSlot;
    /// A heap for every rank. What no longer holds is dropped when it comes up: a newer entry says
    /// what does.
    std::vector<std::vector<Overload>> overloads;
    std::size_t idleExchanges = 0;

    /// Rows that pull with a required weight.
    std::vector<Row> suspects;
    std::vector<Conflict> conflicts;

    std::vector<Variable> touched;
    std::vector<Variable> changed;
    std::size_t exchanges = 0;
    bool isCutShort = false;
};

} // namespace platform::layout
