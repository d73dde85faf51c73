#pragma once

#include "platform/documents/list/StatusPage.h"
#include "platform/documents/model/RowModel.h"

#include <functional>
#include <memory>

namespace platform {

class ListClient;
class ListWidget;

/// A list as a view: its rows, the control that may stand above the first one and scrolls with
/// them, and the page that takes their place.
class ListView : public View {
public:
    ListView(std::shared_ptr<RowModel> model, ListClient& client);
    ~ListView() override;

    ListWidget& widget() const { return *widget_; }
    /// A control of that height above the rows; none takes it away.
    void setHeader(std::shared_ptr<View> header, double height);
    /// Rows that are to come. Not together with a page.
    void setShowsPlaceholders(bool shown);
    /// None shows the rows again.
    void setPage(const std::optional<StatusPage::Content>& content,
                 std::function<void()> action = {});
    const StatusPage* page() const;
    /// A view that covers `rect`, for what points at it.
    std::shared_ptr<View> anchorAt(Rect rect);
    void didScroll();
    void takeFocus();
    /// The client is going.
    void leaveClient();

protected:
    void layoutSubviews() override;

private:
    ListWidget* widget_;
    std::shared_ptr<View> rows_;
    std::shared_ptr<View> header_;
    double headerHeight_ = 0;
    std::shared_ptr<StatusPage> page_;
    std::shared_ptr<View> anchor_;
};

} // namespace platform
