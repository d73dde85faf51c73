#include "preview/PreviewDetailsViewController.h"

#include "browse/LaunchUtils.h"
#include "items/FilenamePrompt.h"
#include "items/UIUtils.h"
#include "platform/Platform.h"
#include "platform/base/Text.h"
#include "preview/ConstraintUtils.h"
#include "preview/PreviewItemManager.h"

#include <algorithm>

namespace tavrin {
namespace {

using platform::Axis;
using platform::LayoutAttribute;
using platform::LayoutConstraint;
using platform::LayoutRelation;
using platform::layoutRequired;
using platform::Orientation;
using platform::View;

constexpr double blockSpacing = 15;
constexpr double nameSpacing = 7;
constexpr double sideInset = 8;
constexpr double titlePoints = 24;
constexpr double nameHeightInLines = 1.2;
constexpr platform::LayoutPriority almostRequired = 999;

platform::Font titleFont() {
    return platform::Font::withSize(platform::TextStyle::title2, titlePoints);
}

void resistsCompression(View& view) {
    for (const Axis axis : {Axis::horizontal, Axis::vertical})
        view.setCompressionResistancePriority(layoutRequired, axis);
}

/// Keeps a view within its column, a little off the edges. The end that may reach beyond the column
/// must not: a view shows only what is within its parent, and the last letters would be cut.
PreviewDetailsViewController::Constraints insetWithin(View& view, View& column) {
    return {LayoutConstraint::make(view, LayoutAttribute::leading, LayoutRelation::greaterOrEqual,
                                   &column, LayoutAttribute::leading, 1, sideInset),
            LayoutConstraint::make(view, LayoutAttribute::trailing, LayoutRelation::lessOrEqual,
                                   &column, LayoutAttribute::trailing, 1, sideInset),
            LayoutConstraint::make(view, LayoutAttribute::trailing, LayoutRelation::lessOrEqual,
                                   &column, LayoutAttribute::trailing)};
}

void append(PreviewDetailsViewController::Constraints& all,
            PreviewDetailsViewController::Constraints more) {
    all.insert(all.end(), more.begin(), more.end());
}

} // namespace

void PreviewDetailsViewController::loadView() {
    PreviewBaseViewController::loadView();
    page_ = std::make_shared<View>();
    page_->addSubview(wrapperView());
    scrollBox_ = std::make_shared<platform::ScrollBox>(page_);
    view()->addSubview(scrollBox_);
}

void PreviewDetailsViewController::viewDidLoad() {
    PreviewBaseViewController::viewDidLoad();
    makeOpenInAppButton();
    setupViewsAndConstraints();
}

void PreviewDetailsViewController::viewWillAppear(bool animated) {
    PreviewBaseViewController::viewWillAppear(animated);
    // Rows that need more room than there is push the lower end out of the screen.
    if (parentBottomConstraint())
        parentBottomConstraint()->setPriority(almostRequired);
}

void PreviewDetailsViewController::viewDidLayoutSubviews() {
    PreviewBaseViewController::viewDidLayoutSubviews();
    const platform::Rect all = view()->bounds();
    const double below = parentBottomConstraint() ? -parentBottomConstraint()->constant() : 0;
    scrollBox_->setFrame(all);
    scrollBox_->setContentHeight(std::max(all.height, wrapperView()->frame().maxY() + below));
}

void PreviewDetailsViewController::makeOpenInAppButton() {
    const auto manager = itemManager();
    const auto item = manager ? manager->item() : nullptr;
    if (!item || !item->url())
        return;
    const auto name = LaunchUtils::defaultAppNameForDocument(*item->url(), true);
    if (!name)
        return;
    openInAppButton_ = std::make_shared<platform::Button>(platform::ButtonType::system);
    openInAppButton_->setTitle(platform::localizedFormat("Open in “%@”", *name));
}

bool PreviewDetailsViewController::shouldDisplayOpenInAppButtonInView() const {
    return openInAppButton_ && UIUtils::tabloMode();
}

std::shared_ptr<platform::Button> PreviewDetailsViewController::openInAppNavControllerButton() {
    return shouldDisplayOpenInAppButtonInView() ? nullptr : openInAppButton_;
}

std::shared_ptr<platform::StackView> PreviewDetailsViewController::buildVerticalStackWithSubviews(
    const std::vector<std::shared_ptr<View>>& views, double spacing) {
    auto stack = std::make_shared<platform::StackView>(views);
    stack->setAxis(Axis::vertical);
    stack->setDistribution(platform::StackDistribution::fill);
    stack->setAlignment(platform::StackAlignment::center);
    stack->setLaidOutByConstraints(true);
    stack->setSpacing(spacing);
    stack->setContentHuggingPriority(layoutRequired, Axis::vertical);
    return stack;
}

void PreviewDetailsViewController::stretchSubview(View& subview, View& withinView) {
    LayoutConstraint::activate(ConstraintUtils::stretchSubviewConstraints(subview, withinView));
}

PreviewDetailsViewController::Constraints
PreviewDetailsViewController::stretchSubviewWidth(View& subview, View& withinView) {
    return {LayoutConstraint::equal(subview, LayoutAttribute::centerX, withinView,
                                    LayoutAttribute::centerX),
            LayoutConstraint::equal(subview, LayoutAttribute::leading, withinView,
                                    LayoutAttribute::leading)};
}

std::shared_ptr<HairlineView> PreviewDetailsViewController::addHairline() {
    hairlineViews_.push_back(std::make_shared<HairlineView>());
    return hairlineViews_.back();
}

/// The lines reach beyond the columns that hold them, and a view shows only what is within its
/// parent. So the page itself draws each where it lies.
void PreviewDetailsViewController::drawOnScreen(HairlineView& line) {
    const auto drawn = std::make_shared<View>();
    drawn->setBackgroundColor(line.backgroundColor());
    drawn->setLaidOutByConstraints(true);
    line.setBackgroundColor(platform::Color::clear);
    page_->insertSubview(drawn, 0);
    Constraints same;
    for (const LayoutAttribute edge : {LayoutAttribute::leading, LayoutAttribute::trailing,
                                       LayoutAttribute::top, LayoutAttribute::bottom})
        same.push_back(LayoutConstraint::equal(*drawn, edge, line, edge));
    LayoutConstraint::activate(same);
}

void PreviewDetailsViewController::setupViewsAndConstraints() {
    thumbnailView_ = std::make_shared<ThumbnailImageView>();
    for (const Axis axis : {Axis::horizontal, Axis::vertical})
        thumbnailView_->setContentHuggingPriority(takesSpareRoom, axis);
    resistsCompression(*thumbnailView_);
    buildNameBlock();
    buildDetails();
    mainStackView_ =
        buildVerticalStackWithSubviews({thumbnailView_, fileDetailsView_}, blockSpacing);
    wrapperView()->addSubview(mainStackView_);
    stretchSubview(*mainStackView_, *wrapperView());
    for (const std::shared_ptr<HairlineView>& line : hairlineViews_)
        drawOnScreen(*line);
    activateFixedConstraints();
    setupVerticalConstraints();
    setupHorizontalConstraints();
    adjustViewsForOrientation(currentPseudoOrientation());
}

void PreviewDetailsViewController::buildNameBlock() {
    filenameTextField_ = std::make_shared<platform::Label>();
    filenameTextField_->setLaidOutByConstraints(true);
    resistsCompression(*filenameTextField_);
    filenameTextField_->setContentHuggingPriority(0, Axis::horizontal);
    filenameTextField_->setLineBreak(platform::LineBreak::elideMiddle);
    filenameTextField_->setFont(titleFont());
    filenameTextField_->setUserInteractionEnabled(true);
    filenameTextField_->addTapHandler([weak = weak_from_this()] {
        if (const auto self = std::static_pointer_cast<PreviewDetailsViewController>(weak.lock()))
            self->filenameWasTapped();
    });
    const auto above = addHairline();
    const auto below = addHairline();
    filenameStackView_ =
        buildVerticalStackWithSubviews({above, filenameTextField_, below}, nameSpacing);
}

void PreviewDetailsViewController::buildDetails() {
    fileInfoView_ = std::make_shared<FileInfoStackView>();
    fileInfoView_->setAxis(Axis::vertical);
    std::vector<std::shared_ptr<View>> blocks = {filenameStackView_, fileInfoView_};
    if (shouldDisplayOpenInAppButtonInView()) {
        blocks.push_back(addHairline());
        openInAppButton_->setLaidOutByConstraints(true);
        openInAppButton_->setTitleFont(titleFont());
        openInAppButton_->addAction(
            platform::ControlEvent::touchUpInside, [weak = weak_from_this()] {
                if (const auto self =
                        std::static_pointer_cast<PreviewDetailsViewController>(weak.lock()))
                    self->openInDefaultApp();
            });
        resistsCompression(*openInAppButton_);
        blocks.push_back(openInAppButton_);
    }
    fileDetailsView_ = buildVerticalStackWithSubviews(blocks, blockSpacing);
}

void PreviewDetailsViewController::activateFixedConstraints() {
    filenameTextFieldFullWidthConstraint_ =
        LayoutConstraint::equal(*filenameTextField_, LayoutAttribute::width,
                                *hairlineViews_.front(), LayoutAttribute::width);
    // The lines are wider than the column that the name must keep to.
    filenameTextFieldFullWidthConstraint_->setPriority(almostRequired);
    const auto nameHeight =
        static_cast<float>(nameHeightInLines * filenameTextField_->font().lineHeight());
    Constraints fixed = {filenameTextFieldFullWidthConstraint_,
                         LayoutConstraint::constant(*filenameTextField_, LayoutAttribute::height,
                                                    LayoutRelation::equal, nameHeight)};
    append(fixed, insetWithin(*filenameTextField_, *fileDetailsView_));
    append(fixed, insetWithin(*fileInfoView_, *fileDetailsView_));
    if (shouldDisplayOpenInAppButtonInView())
        append(fixed, insetWithin(*openInAppButton_, *fileDetailsView_));
    LayoutConstraint::activate(fixed);
}

void PreviewDetailsViewController::setupVerticalConstraints() {
    verticalConstraints_ = stretchSubviewWidth(*fileDetailsView_, *mainStackView_);
    for (const std::shared_ptr<HairlineView>& line : hairlineViews_)
        append(verticalConstraints_, stretchSubviewWidth(*line, *view()));
}

void PreviewDetailsViewController::setupHorizontalConstraints() {
    horizontalConstraints_ = {LayoutConstraint::equal(*fileDetailsView_, LayoutAttribute::centerY,
                                                      *mainStackView_, LayoutAttribute::centerY),
                              LayoutConstraint::make(*fileDetailsView_, LayoutAttribute::height,
                                                     LayoutRelation::lessOrEqual,
                                                     mainStackView_.get(),
                                                     LayoutAttribute::height)};
    for (const std::shared_ptr<HairlineView>& line : hairlineViews_)
        append(horizontalConstraints_,
               {LayoutConstraint::equal(*line, LayoutAttribute::leading, *fileDetailsView_,
                                        LayoutAttribute::leading),
                LayoutConstraint::equal(*line, LayoutAttribute::trailing, *view(),
                                        LayoutAttribute::trailing)});
}

void PreviewDetailsViewController::adjustViewsForOrientation(Orientation orientation) {
    using platform::StackAlignment;
    using platform::StackDistribution;
    const bool landscape =
        orientation == Orientation::landscapeLeft || orientation == Orientation::landscapeRight;
    mainStackView_->setAxis(landscape ? Axis::horizontal : Axis::vertical);
    mainStackView_->setDistribution(landscape ? StackDistribution::fillEqually
                                              : StackDistribution::fill);
    const StackAlignment alignment = landscape ? StackAlignment::leading : StackAlignment::center;
    fileDetailsView_->setAlignment(alignment);
    filenameStackView_->setAlignment(alignment);
    filenameTextField_->setTextAlignment(landscape ? platform::TextAlignment::natural
                                                   : platform::TextAlignment::center);
    LayoutConstraint::deactivate(landscape ? verticalConstraints_ : horizontalConstraints_);
    LayoutConstraint::activate(landscape ? horizontalConstraints_ : verticalConstraints_);
}

void PreviewDetailsViewController::viewWillTransitionToSize(
    platform::Size size, platform::TransitionCoordinator& coordinator) {
    PreviewBaseViewController::viewWillTransitionToSize(size, coordinator);
    if (!isViewLoaded())
        return;
    fileDetailsView_->invalidateIntrinsicContentSize();
    platform::Platform::current().mainQueue().async([weak = weak_from_this(), size] {
        const auto self = std::static_pointer_cast<PreviewDetailsViewController>(weak.lock());
        if (!self)
            return;
        self->adjustViewsForOrientation(platform::orientationForSize(size.width, size.height));
        self->configureMargins();
        self->refreshItem();
    });
}

void PreviewDetailsViewController::refreshItem() {
    PreviewBaseViewController::refreshItem();
    const auto manager = itemManager();
    const auto item = manager ? manager->item() : nullptr;
    originalFilename_ = item ? item->localizedName().value_or("") : "";
    if (!isViewLoaded()) // it is shown when a search has made way for it
        return;
    fileInfoView_->setItem(item);
    filenameTextField_->setText(originalFilename_);
    thumbnailView_->setItem(item);
}

void PreviewDetailsViewController::filenameWasTapped() {
    const auto manager = itemManager();
    const auto item = manager ? manager->item() : nullptr;
    if (!item || !item->renameable() || !item->url())
        return;
    const auto prompt =
        RenamePrompt::newWithFilename(item->localizedName(),
                                      [url = *item->url()](const std::optional<std::string>& name,
                                                           bool& dismiss) -> FilenamePrompt::Text {
                                          if (!name || name->empty())
                                              return std::nullopt;
                                          const platform::Failure failure =
                                              UIUtils::renameItemAtURL(url, *name);
                                          dismiss = !failure;
                                          return UIUtils::bestMessage(failure);
                                      });
    presentViewController(prompt->alert(), true);
}

} // namespace tavrin
