#pragma once

#include "platform/documents/CenteredColumn.h"
#include "platform/launch/DocumentIcons.h"

#include <functional>
#include <memory>
#include <string>

namespace platform {

/// The preview's screen: the document, or a page in place of it, with what floats above: where one
/// is, and the two zoom buttons.
class PreviewView : public View {
public:
    PreviewView();

    /// None takes it out of the tree.
    void setDocument(std::shared_ptr<View> document);
    /// Called with the factor of one press; empty hides the buttons.
    void setZoom(std::function<void(double factor)> zoom);
    /// "" for nothing.
    void setPlace(const std::string& place);
    const std::string& place() const { return place_->text(); }

    struct Page {
        Image picture;
        std::string title;
        /// Lines of what is known of it, and of what can be done.
        std::string facts;
        std::string message;
        /// Offers other programs, beside the view that it gets; none where there is nothing to
        /// open.
        std::function<void(const std::shared_ptr<View>& beside)> open = {};
    };
    void showPage(const Page& page);
    void showDocument();
    void showLoading();
    bool showsPage() const { return !page_->isHidden(); }
    std::string pageText() const;

protected:
    void layoutSubviews() override;

private:
    std::shared_ptr<View> document_;
    std::shared_ptr<CenteredColumn> page_;
    std::shared_ptr<ImageView> picture_;
    std::shared_ptr<Label> title_;
    std::shared_ptr<Label> facts_;
    std::shared_ptr<Label> message_;
    std::shared_ptr<Button> open_;
    std::shared_ptr<Label> loading_;
    std::shared_ptr<View> placeGround_;
    std::shared_ptr<Label> place_;
    std::shared_ptr<View> zoomGround_;
    std::shared_ptr<View> zoomFace_;
    std::shared_ptr<Button> larger_;
    std::shared_ptr<Button> smaller_;
    std::function<void(double)> zoom_;
    std::function<void(const std::shared_ptr<View>&)> openElsewhere_;
};

} // namespace platform
