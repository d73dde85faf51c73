#pragma once

#include "items/VXItem.h"
#include "platform/files/Progress.h"
#include "platform/ui/Controls.h"
#include "platform/ui/StackView.h"
#include "preview/RoundProgressView.h"

#include <cstdint>
#include <memory>
#include <optional>
#include <string>

namespace tavrin {

class DownloadView;

class DownloadViewDelegate {
public:
    virtual ~DownloadViewDelegate() = default;
    virtual void downloadViewDidPressStartDownload(DownloadView& view,
                                                   const std::optional<platform::Url>& url) = 0;
    virtual void downloadViewDidPressCancelDownload(DownloadView& view,
                                                    const std::optional<platform::Url>& url) = 0;
};

/// The download widget: name, size, and either the buttons that start a download or its progress
/// and the button that cancels it. Main thread.
class DownloadView : public platform::StackView {
public:
    explicit DownloadView(platform::Rect frame = {});

    void setDelegate(std::weak_ptr<DownloadViewDelegate> delegate) {
        delegate_ = std::move(delegate);
    }
    const std::shared_ptr<VXItem>& item() const { return item_; }
    /// Shows the item, idle.
    void setItem(const std::shared_ptr<VXItem>& item);
    bool downloading() const { return downloading_; }
    void setDownloading(bool downloading);
    /// Ignored while idle, and while the total is unknown.
    void updateProgress(const platform::Progress& progress);
    /// What the cloud and Download buttons do.
    void startDownloading();
    /// What the Cancel Download button does.
    void cancelDownloading();

    std::string downloadButtonTitle() const;
    std::string zeroProgressMsg() const;
    static std::string progressMsgWithBytesCompleted(std::int64_t completed, std::int64_t ofTotal);

    const std::shared_ptr<platform::Label>& filenameLabel() const { return filenameLabel_; }
    const std::shared_ptr<platform::Label>& sizeLabel() const { return sizeLabel_; }
    const std::shared_ptr<RoundProgressView>& roundProgressView() const {
        return roundProgressView_;
    }
    const std::shared_ptr<platform::Button>& cloudButton() const { return cloudButton_; }
    const std::shared_ptr<platform::Button>& downloadButton() const { return downloadButton_; }
    const std::shared_ptr<platform::Button>& cancelButton() const { return cancelButton_; }

private:
    void buildLabels();
    void buildPie();
    void buildButtons();
    void arrange();

    std::weak_ptr<DownloadViewDelegate> delegate_;
    std::shared_ptr<VXItem> item_;
    bool downloading_ = false;
    std::shared_ptr<platform::Label> filenameLabel_;
    std::shared_ptr<platform::Label> sizeLabel_;
    std::shared_ptr<RoundProgressView> roundProgressView_;
    std::shared_ptr<platform::Button> cloudButton_;
    std::shared_ptr<platform::Button> downloadButton_;
    std::shared_ptr<platform::Button> cancelButton_;
};

} // namespace tavrin
