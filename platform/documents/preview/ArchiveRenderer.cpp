#include "platform/base/ByteCount.h"
#include "platform/base/Runtime.h"
#include "platform/base/Text.h"
#include "platform/documents/preview/ArchiveFile.h"
#include "platform/documents/preview/ContentsRenderer.h"
#include "platform/documents/preview/PreviewKinds.h"
#include "platform/launch/TypeRegistry.h"

#include <QCoreApplication>

#include <algorithm>
#include <cerrno>
#include <fcntl.h>
#include <utility>

namespace platform {
namespace {

using State = ArchiveListing::State;

/// Stands beside the program.
constexpr const char* listerName = "/tavrin-list-archive";

/// What the lister can list. Others that are called archives (disk images of many kinds, stores of
/// mail) are not among them.
constexpr std::string_view listedTypes[] = {
    "application/gzip",
    "application/vnd.android.package-archive",
    "application/vnd.debian.binary-package",
    "application/vnd.ms-cab-compressed",
    "application/vnd.rar",
    "application/x-7z-compressed",
    "application/x-archive",
    "application/x-bzip",
    "application/x-bzip-compressed-tar",
    "application/x-cd-image",
    "application/x-compress",
    "application/x-compressed-tar",
    "application/x-cpio",
    "application/x-cpio-compressed",
    "application/x-java-archive",
    "application/x-lha",
    "application/x-lz4",
    "application/x-lz4-compressed-tar",
    "application/x-lzip",
    "application/x-lzip-compressed-tar",
    "application/x-lzma",
    "application/x-lzma-compressed-tar",
    "application/x-tar",
    "application/x-tarz",
    "application/x-xz",
    "application/x-xz-compressed-tar",
    "application/x-zstd-compressed-tar",
    "application/zip",
    "application/zstd",
};
static_assert(std::is_sorted(std::begin(listedTypes), std::end(listedTypes)));

bool listsType(std::string_view identifier) {
    return std::binary_search(std::begin(listedTypes), std::end(listedTypes),
                              TypeRegistry::mimeTypeForIdentifier(identifier));
}

std::string summaryOf(const ContentsTree& tree) {
    const std::string items =
        localizedPlural(".DICT.ITEMS.%d", static_cast<long long>(tree.fileCount()));
    if (tree.totalSize() == 0)
        return items;
    return localizedFormat("%1$@, %2$@ unpacked", items,
                           byteCountText(tree.totalSize(), ByteCountStyle::file));
}

std::vector<ContentsPage::Remark> remarksOn(const ArchiveListing& listing) {
    std::vector<ContentsPage::Remark> remarks;
    if (listing.state == State::reading)
        remarks.push_back({localized("Still being read. This is what there is so far."), false});
    if (listing.state == State::damaged)
        remarks.push_back(
            {localized("The archive is damaged. This is what could be read before the damage.")});
    if (listing.state == State::cut)
        remarks.push_back({localized("There is more in this archive than is listed here.")});
    if (listing.state == State::locked || listing.tree->hasEncrypted())
        remarks.push_back({localized("Unpacking it takes a password.")});
    return remarks;
}

class ArchiveRenderer final : public ContentsRenderer {
public:
    ArchiveRenderer(MainQueue& main, PreviewReports reports)
        : ContentsRenderer(main, std::move(reports)),
          main_(main),
          lister_(
              (QCoreApplication::applicationDirPath() + QLatin1String(listerName)).toStdString()) {}

    void reload() override {
        told_ = false;
        worker_.cancel();
        worker_.run([this, &main = main_, file = file_, lister = lister_,
                     &clock = Runtime::current().clock](PreviewToken& token) -> Job {
            FileDescriptor open;
            // The archive may be moved and replaced while it is listed: its bytes stay.
            const Failure failure = readDocument(file, token, [&](const std::string& path) {
                open = FileDescriptor(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK));
                return open ? Failure() : posixError(errno, file, false);
            });
            if (failure)
                return [this, failure] { reports_.failed(*failure); };
            ArchiveFile archive(lister, std::string(stemOf(file.lastPathComponent())), clock);
            const auto listing = std::make_shared<Result<ArchiveListing>>(
                archive.list(open.get(), token, [&](ArchiveListing part) {
                    token.deliver(main, [this, part = std::move(part)] { show(part); });
                }));
            return [this, listing] { take(*listing); };
        });
    }

private:
    void take(const Result<ArchiveListing>& listing) {
        if (!listing) {
            reports_.failed(listing.error());
        } else if (listing->tree->count() > 0) {
            show(*listing);
        } else if (listing->state == State::locked) {
            reports_.failed(makeErrorWithText(
                ErrorCode::unsupportedOperation,
                localized("What is in this archive can only be seen with its password.")));
        } else if (listing->state == State::complete) {
            reports_.failed(makeErrorWithText(ErrorCode::readCorrupt,
                                              localized("There is nothing in this archive.")));
        } else {
            reports_.failed(damagedDocument(file_, listing->detail));
        }
    }

    void show(const ArchiveListing& listing) {
        page_->set(listing.tree, summaryOf(*listing.tree), remarksOn(listing));
        if (!std::exchange(told_, true))
            reports_.shown();
    }

    MainQueue& main_;
    const std::string lister_;
    /// That something can be seen, since the file was last read.
    bool told_ = false;
};

} // namespace

const PreviewKind archivePreview{
    &listsType, [](MainQueue& main, PreviewReports reports) -> std::unique_ptr<PreviewRenderer> {
        return std::make_unique<ArchiveRenderer>(main, std::move(reports));
    }};

} // namespace platform
