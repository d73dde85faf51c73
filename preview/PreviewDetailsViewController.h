#pragma once

#include "platform/ui/ScrollBox.h"
#include "platform/ui/StackView.h"
#include "preview/FileInfoStackView.h"
#include "preview/HairlineView.h"
#include "preview/PreviewBaseViewController.h"
#include "preview/ThumbnailImageView.h"

#include <memory>
#include <string>
#include <vector>

namespace tavrin {

/// The details screen: a large thumbnail, the name (tap to rename), the rows of information and a
/// button that opens the document in its application. Below each other in portrait, side by side in
/// landscape.
/// What does not fit at the user's text size is scrolled to.
class PreviewDetailsViewController : public PreviewBaseViewController {
public:
    using Constraints = std::vector<platform::LayoutConstraint::Pointer>;

    void loadView() override;
    void viewDidLoad() override;
    void viewWillAppear(bool animated) override;
    void viewDidLayoutSubviews() override;
    void viewWillTransitionToSize(platform::Size size,
                                  platform::TransitionCoordinator& coordinator) override;
    void refreshItem() override;
    std::shared_ptr<platform::Button> openInAppNavControllerButton() override;

    void adjustViewsForOrientation(platform::Orientation orientation);
    /// On a tablet the button stands in the screen, else in the navigation bar.
    bool shouldDisplayOpenInAppButtonInView() const;
    void filenameWasTapped();

    static std::shared_ptr<platform::StackView>
    buildVerticalStackWithSubviews(const std::vector<std::shared_ptr<platform::View>>& views,
                                   double spacing);
    static void stretchSubview(platform::View& subview, platform::View& withinView);
    static Constraints stretchSubviewWidth(platform::View& subview, platform::View& withinView);

    const std::shared_ptr<ThumbnailImageView>& thumbnailView() const { return thumbnailView_; }
    const std::shared_ptr<platform::Label>& filenameTextField() const { return filenameTextField_; }
    const std::shared_ptr<FileInfoStackView>& fileInfoView() const { return fileInfoView_; }
    const std::string& originalFilename() const { return originalFilename_; }
    const std::shared_ptr<platform::StackView>& mainStackView() const { return mainStackView_; }
    const std::shared_ptr<platform::StackView>& fileDetailsView() const { return fileDetailsView_; }
    const std::vector<std::shared_ptr<HairlineView>>& hairlineViews() const {
        return hairlineViews_;
    }
    const std::shared_ptr<platform::Button>& openInAppButton() const { return openInAppButton_; }

private:
    void makeOpenInAppButton();
    void setupViewsAndConstraints();
    void buildNameBlock();
    void buildDetails();
    void activateFixedConstraints();
    void setupVerticalConstraints();
    void setupHorizontalConstraints();
    std::shared_ptr<HairlineView> addHairline();
    void drawOnScreen(HairlineView& line);

    std::shared_ptr<platform::ScrollBox> scrollBox_;
    /// As high as the screen, or as what is on it; holds the wrapper view.
    std::shared_ptr<platform::View> page_;
    std::shared_ptr<ThumbnailImageView> thumbnailView_;
    std::shared_ptr<platform::Label> filenameTextField_;
    std::shared_ptr<FileInfoStackView> fileInfoView_;
    std::string originalFilename_;
    platform::LayoutConstraint::Pointer filenameTextFieldFullWidthConstraint_;
    std::shared_ptr<platform::StackView> mainStackView_;
    Constraints verticalConstraints_;
    Constraints horizontalConstraints_;
    std::shared_ptr<platform::StackView> filenameStackView_;
    std::shared_ptr<platform::StackView> fileDetailsView_;
    std::vector<std::shared_ptr<HairlineView>> hairlineViews_;
    std::shared_ptr<platform::Button> openInAppButton_;
};

} // namespace tavrin
