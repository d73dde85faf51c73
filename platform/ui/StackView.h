#pragma once

#include "platform/ui/View.h"

namespace platform {

enum class StackDistribution { fill, fillEqually };
enum class StackAlignment { fill, leading, center, trailing };

/// Lines its arranged views up along an axis by constraints that it makes and keeps: edge to edge
/// with the spacing between them, the first and the last at its own edges. Across the axis, an
/// alignment other than fill yields to what is required of a view. A hidden arranged view takes no
/// room and no spacing. Arranged views are laid out by constraints.
class StackView : public View {
public:
    explicit StackView(Rect frame = {});
    explicit StackView(const std::vector<std::shared_ptr<View>>& arranged);
    ~StackView() override;

    const std::vector<std::shared_ptr<View>>& arrangedSubviews() const;
    /// At the end of the row, also when it stands in it already.
    void addArrangedSubview(const std::shared_ptr<View>& view);
    /// Takes the view out of the row and out of the tree.
    void removeArrangedSubview(const std::shared_ptr<View>& view);

    Axis axis() const;
    void setAxis(Axis axis);
    StackDistribution distribution() const;
    void setDistribution(StackDistribution distribution);
    StackAlignment alignment() const;
    void setAlignment(StackAlignment alignment);
    double spacing() const;
    void setSpacing(double spacing);

private:
    friend void stackChildChangedHidden(View& child);
    friend void stackChildLeft(View& formerParent, View& child);
    void arrange();

    struct Arrangement;
    std::unique_ptr<Arrangement> arrangement_;
};

} // namespace platform
