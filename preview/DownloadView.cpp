#include "preview/DownloadView.h"

#include "app/VXLogging.h"
#include "platform/base/ByteCount.h"
#include "platform/base/Text.h"

#include <algorithm>

namespace tavrin {
namespace {

using platform::Axis;
using platform::Button;
using platform::ButtonType;
using platform::layoutRequired;
using platform::localized;

constexpr double barSpacing = 8;
constexpr double pieSide = 32;
constexpr int grayPie = 1;

void keepSize(platform::View& view, platform::Size size) {
    using platform::LayoutAttribute;
    using platform::LayoutConstraint;
    using platform::LayoutRelation;
    LayoutConstraint::activate({LayoutConstraint::constant(view, LayoutAttribute::width,
                                                           LayoutRelation::equal, size.width),
                                LayoutConstraint::constant(view, LayoutAttribute::height,
                                                           LayoutRelation::equal, size.height)});
}

void neitherGrowsNorShrinks(platform::View& view, Axis axis) {
    view.setContentHuggingPriority(layoutRequired, axis);
    view.setCompressionResistancePriority(layoutRequired, axis);
}

} // namespace

DownloadView::DownloadView(platform::Rect frame) : StackView(frame) {
    setLaidOutByConstraints(true);
    setAxis(Axis::vertical);
    setDistribution(platform::StackDistribution::fill);
    setAlignment(platform::StackAlignment::center);
    setSpacing(barSpacing);
    buildLabels();
    buildPie();
    buildButtons();
    arrange();
}

void DownloadView::buildLabels() {
    filenameLabel_ = std::make_shared<platform::Label>();
    filenameLabel_->setLineBreak(platform::LineBreak::elideMiddle);
    sizeLabel_ = std::make_shared<platform::Label>();
}

void DownloadView::buildPie() {
    roundProgressView_ =
        std::make_shared<RoundProgressView>(platform::Rect{0, 0, pieSide, pieSide}, grayPie);
    for (const Axis axis : {Axis::horizontal, Axis::vertical})
        neitherGrowsNorShrinks(*roundProgressView_, axis);
    keepSize(*roundProgressView_, roundProgressView_->bounds().size());
}

void DownloadView::buildButtons() {
    cloudButton_ = std::make_shared<Button>(ButtonType::custom);
    cloudButton_->setImage(platform::Image::named("Cloudload"));
    cloudButton_->setAccessibleName(localized("Download"));
    for (const Axis axis : {Axis::horizontal, Axis::vertical})
        neitherGrowsNorShrinks(*cloudButton_, axis);
    keepSize(*cloudButton_, roundProgressView_->bounds().size());
    downloadButton_ = std::make_shared<Button>(ButtonType::system);
    downloadButton_->setTitle(downloadButtonTitle());
    cancelButton_ = std::make_shared<Button>(ButtonType::system);
    cancelButton_->setTitle(localized("Cancel Download"));
    cancelButton_->setHidden(true);
    for (const auto& button : {downloadButton_, cancelButton_})
        button->setTitleWraps(true);

    const auto touch = platform::ControlEvent::touchUpInside;
    for (const auto& button : {cloudButton_, downloadButton_})
        button->addAction(touch, [this] { startDownloading(); });
    cancelButton_->addAction(touch, [this] { cancelDownloading(); });
}

void DownloadView::arrange() {
    const std::vector<std::shared_ptr<platform::View>> rows = {filenameLabel_,     sizeLabel_,
                                                               roundProgressView_, cloudButton_,
                                                               downloadButton_,    cancelButton_};
    for (const std::shared_ptr<platform::View>& row : rows) {
        row->setLaidOutByConstraints(true);
        neitherGrowsNorShrinks(*row, Axis::vertical);
        addArrangedSubview(row);
    }
    neitherGrowsNorShrinks(*this, Axis::vertical);
}

void DownloadView::setItem(const std::shared_ptr<VXItem>& item) {
    item_ = item;
    filenameLabel_->setText(item ? item->localizedName().value_or("") : "");
    sizeLabel_->setText(item ? item->friendlyFileSize().value_or("") : "");
    downloadButton_->setTitle(downloadButtonTitle());
    setDownloading(false);
}

std::string DownloadView::downloadButtonTitle() const {
    return localized(!item_ || item_->canPreview() ? "Download to View" : "Download");
}

std::string DownloadView::progressMsgWithBytesCompleted(std::int64_t completed,
                                                        std::int64_t ofTotal) {
    const auto text = [](std::int64_t bytes) {
        return platform::byteCountText(static_cast<std::uint64_t>(std::max<std::int64_t>(bytes, 0)),
                                       platform::ByteCountStyle::file);
    };
    return platform::localizedFormat("%1$@ of %2$@", text(completed), text(ofTotal));
}

std::string DownloadView::zeroProgressMsg() const {
    if (!item_ || !item_->fileSize())
        return localized("Loading…");
    return progressMsgWithBytesCompleted(0, static_cast<std::int64_t>(*item_->fileSize()));
}

void DownloadView::setDownloading(bool downloading) {
    downloading_ = downloading;
    cloudButton_->setHidden(downloading);
    downloadButton_->setHidden(downloading);
    cancelButton_->setHidden(!downloading);
    roundProgressView_->setHidden(!downloading);
    if (downloading) {
        sizeLabel_->setText(zeroProgressMsg());
        return;
    }
    roundProgressView_->resetProgress();
    sizeLabel_->setText(item_ ? item_->friendlyFileSize().value_or("") : "");
}

void DownloadView::updateProgress(const platform::Progress& progress) {
    if (!downloading_) {
        VXLOG(vxWarning, "Received progress when not downloading");
        return;
    }
    if (progress.totalUnitCount() <= 0)
        return;
    roundProgressView_->setProgress(static_cast<float>(progress.fractionCompleted()));
    sizeLabel_->setText(
        progressMsgWithBytesCompleted(progress.completedUnitCount(), progress.totalUnitCount()));
}

void DownloadView::startDownloading() {
    VXLOG(vxInfo, "Pressed Start download...");
    if (const auto delegate = delegate_.lock())
        delegate->downloadViewDidPressStartDownload(*this, item_ ? item_->url() : std::nullopt);
}

void DownloadView::cancelDownloading() {
    VXLOG(vxInfo, "Pressed Cancel download...");
    roundProgressView_->resetProgress();
    if (const auto delegate = delegate_.lock())
        delegate->downloadViewDidPressCancelDownload(*this, item_ ? item_->url() : std::nullopt);
}

} // namespace tavrin
