#pragma once

#include "platform/ui/layout/ConstraintImpl.h"
#include "platform/ui/layout/LayoutEngine.h"
#include "platform/ui/layout/Solver.h"

#include <array>

namespace platform {

/// The engine's page about an item.
///
/// Horizontal places are measured from the leading edge of the parent, so that a layout and its
/// mirror image are one and the same system of rows; frames are mirrored when they are handed out.
/// Places are relative to the parent: what happens inside a view depends on its size alone.
struct LayoutRecord {
    static constexpr layout::Row noRow = -1;
    /// One axis: from the parent's leading (top) edge to the item's, and the item's size.
    struct Span {
        layout::Variable offset = -1;
        layout::Variable size = -1;
        /// What holds the item whose frame is given, and what its content asks for otherwise.
        layout::Row givenOffset = noRow;
        layout::Row givenSize = noRow;
        layout::Row content = noRow;
    };
    Span& span(Axis axis) { return spans[static_cast<std::size_t>(axis)]; }
    const Span& span(Axis axis) const { return spans[static_cast<std::size_t>(axis)]; }

    std::shared_ptr<LayoutLink> link;
    LayoutItem* item = nullptr;
    LayoutRecord* parent = nullptr;
    std::vector<LayoutRecord*> children;
    std::size_t index = 0;
    std::size_t depth = 0;
    std::uint64_t serial = 0;
    std::array<Span, 2> spans;

    /// The frame is given, by hand or as the root's.
    bool isGiven = false;
    /// Waits for the next solve: to be read again, to be asked for its height, to be placed.
    bool isChanged = false;
    bool isResized = false;
    bool isMoved = false;
    bool mustHandOut = false;
    /// The width for which the content gave its height last; negative when it has to be asked
    /// again. Until then, its last height is the best guess.
    double askedWidth = -1;
    double wrappedHeight = -1;
    /// Left and top edge within the nearest ancestor whose frame is given (itself included), and
    /// the width, before rounding.
    Point origin;
    double width = 0;
    std::uint64_t placedIn = 0;
    Rect handedOut;
};

struct LayoutEngine::State {
    explicit State(LayoutEngine& self) : engine(self) {}

    // LayoutEngine.cpp
    void markDirty();
    void wantRead(LayoutRecord& record);
    void wantRow(const LayoutConstraint::Pointer& constraint);
    void dropRow(LayoutConstraint::Impl& constraint);

    // EngineRows.cpp
    void readItem(LayoutRecord& record);
    void readGiven(LayoutRecord& record);
    void readContent(LayoutRecord& record, Axis axis, double natural);
    void hold(layout::Row& row, std::initializer_list<layout::Term> terms, double constant,
              layout::Strength strength, std::uint64_t age);
    void release(layout::Row& row);
    void releaseOwnRows(LayoutRecord& record);
    void addRow(LayoutConstraint& constraint);
    void appendEnd(const LayoutRecord& record, LayoutAttribute attribute,
                   const LayoutRecord* within, bool isReadingDirection, double factor);
    void rebuildRows();

    // EngineFrames.cpp
    void readPending();
    void solveRows();
    void noteChanged();
    bool askHeights();
    void reportConflicts();
    void collectFrames();
    void place(LayoutRecord& record);
    void placeSolved(LayoutRecord& record);
    double toPixel(double value) const;
    void handOut();

    double value(layout::Variable variable) const { return solver.value(variable); }

    LayoutEngine& engine;
    layout::Solver solver;
    std::vector<std::unique_ptr<LayoutRecord>> records;
    /// By variable and by row; a row of an item has no constraint.
    std::vector<LayoutRecord*> owners;
    std::vector<LayoutConstraint*> constraints;

    Size rootSize;
    double pixelsPerPoint = 1;
    bool isRightToLeft = false;
    bool isDirty = false;
    bool isSolving = false;
    std::function<void()> dirtied;
    std::uint64_t serials = 0;
    std::uint64_t passes = 0;

    // Links and pointers, because items and constraints may go before they are looked at.
    std::vector<std::shared_ptr<LayoutLink>> changedItems;
    std::vector<std::shared_ptr<LayoutLink>> resizedItems;
    std::vector<std::shared_ptr<LayoutLink>> movedItems;
    std::vector<LayoutConstraint::Pointer> pendingConstraints;
    std::vector<std::weak_ptr<LayoutConstraint>> reportedConflicts;
    std::vector<layout::Term> terms;
    std::vector<std::pair<std::shared_ptr<LayoutLink>, Rect>> frames;
};

} // namespace platform
