#pragma once

#include "app/VXLogging.h"
#include "platform/base/Format.h"
#include "platform/cloud/CloudDocumentService.h"
#include "preview/GlimpseItemController.h"
#include "preview/PreviewDetailsViewController.h"
#include "preview/PreviewDownloadViewController.h"
#include "preview/PreviewItemManager.h"
#include "services/NetworkWatcher.h"
#include "tests/product/ProductFixture.h"

#include <filesystem>
#include <fstream>

namespace test {

/// The program, opened at Documents, and what a person previews there.
struct PreviewTest : ProductTest {
    ~PreviewTest() override { tavrin::VXSetLogLevel(tavrin::vxInfo); }
    /// The log is written down to its last line from now on.
    static void givenWholeLog() { tavrin::VXSetLogLevel(tavrin::vxDebug); }
    /// A document of so many bytes that is in the cloud only. Takes no room on the disk.
    void givenPromise(const std::string& name, std::uintmax_t bytes) {
        givenRemote(name, "");
        std::filesystem::resize_file(remoteFile(name), bytes);
    }
    std::string remoteFile(const std::string& name) const { return remote + "/Documents/" + name; }
    void start(platform::Size size = phone) {
        signIn();
        launch(size);
        open("Documents");
        ASSERT_TRUE(untilNetwork(tavrin::networkWiFi));
    }
    bool untilNetwork(tavrin::NetworkState state) {
        const auto& watcher = tavrin::NetworkWatcher::sharedNetworkWatcher();
        return whileTimePasses([&] { return watcher->networkState() == state; }, 0ms);
    }
    void preview(const std::string& name, int mode = tavrin::fullPreviewMode) {
        nav().showPreview(std::make_shared<tavrin::VXItem>(url(name)), mode);
        advance(1s);
    }
    void back() {
        nav().popViewController(false);
        advance(1s);
    }
    tavrin::PreviewItemManager& manager() const { return *nav().itemManager(); }
    template<class Screen>
    std::shared_ptr<Screen> top() const {
        return std::dynamic_pointer_cast<Screen>(nav().topViewController());
    }
    std::shared_ptr<tavrin::PreviewDownloadViewController> download() const {
        return top<tavrin::PreviewDownloadViewController>();
    }
    std::shared_ptr<tavrin::PreviewDetailsViewController> details() const {
        return top<tavrin::PreviewDetailsViewController>();
    }
    bool showsFullPreview() const { return top<tavrin::GlimpseItemController>() != nullptr; }
    bool untilFullPreview() {
        return until([this] { return showsFullPreview(); });
    }
    /// Waits for what comes by other threads and the clock together, a slowed download above all;
    /// with a step of 0, for what comes at this very moment of the clock.
    bool whileTimePasses(const std::function<bool()>& condition, platform::Duration step = 16ms) {
        const auto deadline = std::chrono::steady_clock::now() + 20s;
        while (!condition() && std::chrono::steady_clock::now() < deadline)
            advance(step);
        return condition();
    }
    /// Nothing is under way on the queue of downloads, and what it reported was dealt with.
    void downloadsEnd() {
        const auto queue = manager().downloadQueue();
        queue->sync([] {});
        settle();
    }
    bool isPromise(const std::string& name) const {
        return documents().isPromised(url(name)) && !std::filesystem::exists(path(name));
    }
    /// Files of downloads that did not end.
    std::size_t partialFiles() const {
        std::size_t files = 0;
        for (const auto& entry :
             std::filesystem::recursive_directory_iterator(home / "data/pelmora"))
            files += entry.path().parent_path().filename() == "staging" ? 1 : 0;
        return files;
    }
    /// The document's URL as the log writes it.
    std::string told(const std::string& name) const { return platform::format("%@", url(name)); }
    static std::size_t timesLogged(const std::string& line) {
        const std::vector<std::string> lines = logLines();
        return static_cast<std::size_t>(std::ranges::count(lines, line));
    }
    bool untilLogged(const std::string& line) {
        return whileTimePasses([&] { return logged(line); });
    }
};

} // namespace test
