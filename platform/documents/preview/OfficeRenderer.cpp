#include "platform/base/Identity.h"
#include "platform/base/Runtime.h"
#include "platform/documents/DisplayName.h"
#include "platform/documents/preview/OfficeConverter.h"
#include "platform/documents/preview/PreviewKinds.h"

#include <unistd.h>
#include <utility>

namespace platform {
namespace {

std::string cacheFolder() {
    return Runtime::current().folders.cache + '/' + std::string(applicationIdentifier) +
           "/office-pages";
}

/// The folder of one preview; of the worker's queue alone.
struct OfficeWork {
    std::string folder;

    std::string shownFile() const { return folder + "/shown.pdf"; }
    /// Puts the pages where the page renderer reads them: a name of their own for them, so that
    /// they stay when the cache throws them away.
    Failure show(const std::string& cached) const {
        const std::string next = folder + "/next.pdf";
        ::unlink(next.c_str());
        if (::link(cached.c_str(), next.c_str()) != 0)
            if (Failure failure = FileManager::copyFile(Url::file(cached), Url::file(next)))
                return failure;
        return ::rename(next.c_str(), shownFile().c_str()) == 0
                   ? Failure()
                   : posixError(errno, Url::file(next), true);
    }
    void remove() {
        if (!folder.empty())
            (void)FileManager::removeItem(Url::file(std::exchange(folder, {}), true));
    }
};

/// Shows the pages that an office program makes of a document.
class OfficeRenderer final : public PreviewRenderer {
public:
    OfficeRenderer(MainQueue& main, PreviewReports reports)
        : reports_(std::move(reports)),
          cache_(cacheFolder()),
          pages_(pdfPreview.make(main, {[this] { pagesShown(); },
                                        [this](const Error& error) { pagesFailed(error); },
                                        reports_.moved})),
          worker_(main) {
        worker_.setLastJob([work = work_] { work->remove(); });
    }

    std::shared_ptr<View> view() override { return pages_->view(); }

    void load(const Url& file) override {
        file_ = file;
        reload();
    }

    void reload() override {
        worker_.cancel();
        const std::string program = officeProgram().value_or("soffice");
        worker_.run([this, file = file_, work = work_, cache = cache_, program,
                     &clock = Runtime::current().clock](PreviewToken& token) -> Job {
            const auto pages = std::make_shared<Result<std::string>>(
                makePages(file, *work, OfficeConverter(program, cache, clock), token));
            return [this, pages, shown = work->shownFile()] { take(*pages, shown); };
        });
    }

    std::optional<std::function<void(double)>> zoom() override { return pages_->zoom(); }

private:
    static Result<std::string> makePages(const Url& file, OfficeWork& work,
                                         OfficeConverter converter, PreviewToken& token) {
        if (work.folder.empty()) {
            Result<std::string> folder = converter.cache().makeWorkFolder();
            if (!folder)
                return folder.error();
            work.folder = std::move(*folder);
        }
        Result<std::string> cached = converter.convert(file, work.folder, token);
        if (cached)
            if (const Failure failure = work.show(*cached))
                return *failure;
        return cached;
    }

    void take(const Result<std::string>& pages, const std::string& shown) {
        if (!pages) {
            reports_.failed(pages.error());
            return;
        }
        cached_ = *pages;
        if (std::exchange(loaded_, true))
            pages_->reload();
        else
            pages_->load(Url::file(shown));
        pages_->view()->setAccessibleName(displayName(file_.lastPathComponent()));
    }

    void pagesShown() { reports_.shown(); }

    /// Pages that cannot be read are no pages: the next look makes others.
    void pagesFailed(const Error&) {
        cache_.remove(cached_);
        reports_.failed(damagedDocument(file_));
    }

    PreviewReports reports_;
    const OfficeCache cache_;
    const std::shared_ptr<OfficeWork> work_ = std::make_shared<OfficeWork>();
    Url file_;
    std::string cached_;
    bool loaded_ = false;
    std::unique_ptr<PreviewRenderer> pages_;
    PreviewWorker worker_;
};

} // namespace

const PreviewKind officePreview{
    [](std::string_view identifier) {
        return isOfficeType(identifier) && officeProgram().has_value();
    },
    [](MainQueue& main, PreviewReports reports) -> std::unique_ptr<PreviewRenderer> {
        return std::make_unique<OfficeRenderer>(main, std::move(reports));
    }};

} // namespace platform
