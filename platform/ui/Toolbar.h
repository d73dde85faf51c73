#pragma once

#include "platform/ui/BarButtonItem.h"
#include "platform/ui/View.h"

#include <memory>
#include <vector>

namespace platform {

/// The bar at the bottom of a navigation stack: items in reading order, flexible spaces between
/// them sharing what is left over.
class Toolbar : public View {
public:
    Toolbar();

    /// At least the theme's; more when the user's text needs it.
    static double height();

    void setItems(const std::vector<BarButtonItem::Pointer>& items);
    /// Of the items, for their coming in with a new page.
    void setItemsAlpha(double alpha);

protected:
    void layoutSubviews() override;

private:
    class Row;
    std::shared_ptr<View> hairline_;
    std::shared_ptr<Row> row_;
};

} // namespace platform
