#include "items/VXItem.h"

#include "app/VXLogging.h"
#include "items/FileUtils.h"
#include "items/UrlExtensions.h"
#include "platform/Platform.h"
#include "platform/base/ByteCount.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/documents/PlatformPreviewController.h"
#include "platform/files/FileCoordinator.h"
#include "platform/launch/TypeRegistry.h"

#include <array>
#include <stdexcept>

namespace tavrin {
namespace {

using platform::Platform;
using platform::ResourceKey;
using platform::Url;
using platform::Value;

/// The attributes of a snapshot, in the order in which they are asked for.
platform::ResourceKeys itemResourceKeys() {
    static constexpr std::array<ResourceKey, 14> keys = {
        ResourceKey::name,
        ResourceKey::localizedName,
        ResourceKey::typeIdentifier,
        ResourceKey::localizedTypeDescription,
        ResourceKey::fileSize,
        ResourceKey::creationDate,
        ResourceKey::contentModificationDate,
        ResourceKey::isDirectory,
        ResourceKey::isPackage,
        ResourceKey::hasHiddenExtension,
        ResourceKey::parentDirectoryUrl,
        ResourceKey::isShared,
        ResourceKey::sharedItemRole,
        ResourceKey::downloadingStatus,
    };
    return keys;
}

VXItem::Text textOf(const Value& value) {
    return value.text() ? VXItem::Text(*value.text()) : std::nullopt;
}

bool isTrue(const Value& value) {
    return value.boolean().value_or(false);
}

bool isText(const Value& value, std::string_view text) {
    return value.text() && *value.text() == text;
}

/// Access that a store may grant for as long as the object lives.
class ScopedAccess {
public:
    explicit ScopedAccess(const Url& url)
        : url_(url), granted_(Platform::current().documents().startAccessing(url)) {}
    ~ScopedAccess() {
        if (granted_)
            Platform::current().documents().stopAccessing(url_);
    }
    ScopedAccess(const ScopedAccess&) = delete;
    ScopedAccess& operator=(const ScopedAccess&) = delete;

private:
    const Url& url_;
    bool granted_;
};

} // namespace

VXItem::VXItem() {
    throw std::invalid_argument(platform::format("Don't call %@.", "-[VXItem init]"));
}

VXItem::VXItem(std::optional<Url> url) : url_(std::move(url)) {
    cacheValues();
}

void VXItem::setUrl(std::optional<Url> url) {
    if (url == url_)
        return;
    url_ = std::move(url);
    cacheValues();
}

void VXItem::clearValues() {
    resolvedUrl_.reset();
    localizedName_.reset();
    typeIdentifier_.reset();
    localizedTypeDescription_.reset();
    fileSize_.reset();
    friendlyFileSize_.reset();
    creationDate_.reset();
    modificationDate_.reset();
    parentDirectoryUrl_.reset();
    tags_.reset();
    promiseUrl_.reset();
    thumbnail_ = {};
    isContainer_ = false;
    isDirectory_ = false;
    isPackage_ = false;
    isBookmark_ = false;
    isDownloaded_ = false;
    thumbnailFetched_ = false;
    hasHiddenExtension_ = true;
    renameable_ = true;
}

void VXItem::cacheValues() {
    clearValues();
    if (!url_)
        return;
    const std::optional<Url> target = tavrin_URLByResolvingBookmark(*url_);
    isBookmark_ = target.has_value();
    const Url resolved = target.value_or(*url_);
    resolvedUrl_ = resolved;
    promiseUrl_ = Platform::current().documents().physicalURL(resolved);

    const ScopedAccess access(resolved);
    platform::FileCoordinator coordinator;
    // A coordination that is refused leaves the record cleared; nobody is told.
    (void)coordinator.coordinateReading(
        resolved, platform::ReadingOptions::immediatelyAvailableMetadataOnly,
        [this, &resolved](const Url& read) {
            readAttributes(read);
            canPreview_ = platform::PlatformPreviewController::canPreview(resolved);
            if (std::vector<std::string> names = Platform::current().documents().tags(resolved);
                !names.empty())
                tags_ = std::move(names);
        });
}

void VXItem::readAttributes(const Url& read) {
    platform::Result<platform::ResourceValues> values =
        Platform::current().documents().promisedItemAttributes(read, itemResourceKeys());
    if (!values) {
        VXLOG(vxWarning, "promisedItemResourceValuesForKeys failed on %@", read);
        values = Platform::current().documents().plainAttributes(read, itemResourceKeys());
    }
    if (values)
        takeAttributes(read, *values);
}

void VXItem::takeAttributes(const Url& read, const platform::ResourceValues& values) {
    localizedName_ = textOf(values[ResourceKey::localizedName]);
    if (!localizedName_)
        localizedName_ = textOf(values[ResourceKey::name]);
    typeIdentifier_ = textOf(values[ResourceKey::typeIdentifier]);
    localizedTypeDescription_ = textOf(values[ResourceKey::localizedTypeDescription]);
    if (typeIdentifier_)
        if (Text described = platform::TypeRegistry::localizedDescription(*typeIdentifier_))
            localizedTypeDescription_ = std::move(described);
    if (const std::optional<std::int64_t> size = values[ResourceKey::fileSize].integer()) {
        fileSize_ = static_cast<std::uint64_t>(*size);
        friendlyFileSize_ = platform::byteCountText(*fileSize_, platform::ByteCountStyle::file);
    }
    creationDate_ = values[ResourceKey::creationDate].date();
    modificationDate_ = values[ResourceKey::contentModificationDate].date();
    if (const Url* parent = values[ResourceKey::parentDirectoryUrl].url())
        parentDirectoryUrl_ = *parent;
    isPackage_ = isTrue(values[ResourceKey::isPackage]);
    isDirectory_ = isTrue(values[ResourceKey::isDirectory]) && !isPackage_;
    hasHiddenExtension_ = isTrue(values[ResourceKey::hasHiddenExtension]);

    isContainer_ = Platform::current().documents().isDocumentsContainer(read);
    if (isContainer_) {
        renameable_ = false;
        if (const auto container = Platform::current().documents().containerForItemAtURL(read);
            container && *container)
            localizedName_ = (*container)->localizedName();
    } else {
        renameable_ =
            !(isTrue(values[ResourceKey::isShared]) &&
              isText(values[ResourceKey::sharedItemRole], platform::sharedRoleParticipant));
    }
    const Value& status = values[ResourceKey::downloadingStatus];
    isDownloaded_ = !status.isNone() && !isText(status, platform::downloadingStatusNotDownloaded);
}

bool VXItem::isPromise() const {
    return promiseUrl_ && promiseUrl_ != resolvedUrl_;
}

VXItem::Text VXItem::friendlyDate(const std::optional<platform::Date>& date,
                                  platform::DateStyle style) {
    return date ? Text(platform::localizedDateText(*date, style)) : std::nullopt;
}

VXItem::Text VXItem::friendlyCreationDate(platform::DateStyle style) const {
    return friendlyDate(creationDate_, style);
}

VXItem::Text VXItem::friendlyContentModificationDate(platform::DateStyle style) const {
    return friendlyDate(modificationDate_, style);
}

const platform::Image& VXItem::thumbnail() {
    if (!thumbnailFetched_ && resolvedUrl_) {
        thumbnailFetched_ = true;
        const ScopedAccess access(*resolvedUrl_);
        platform::FileCoordinator coordinator;
        (void)coordinator.coordinateReading(
            *resolvedUrl_, platform::ReadingOptions::immediatelyAvailableMetadataOnly,
            [this](const Url& read) {
                updateThumbnailImage(
                    FileUtils::getResourceValue(ResourceKey::thumbnailDictionary, read));
            });
    }
    thumbnailFetched_ = true;
    return thumbnail_;
}

void VXItem::updateThumbnailImage(const Value& dictionary) {
    const Value::Map* entries = dictionary.map();
    if (!entries)
        return;
    VXLOG(vxDebug, "URL Thumbs: %@", dictionary);
    const auto found = entries->find(platform::thumbnailSize1024);
    if (found == entries->end() || !found->second.bytes())
        return;
    if (platform::Image image = platform::Image::decoded(*found->second.bytes()); !image.empty())
        thumbnail_ = std::move(image);
}

void VXItem::generateThumbnail(const std::function<void(const platform::Image&)>& completion) {
    completion({});
}

platform::OperationQueue& VXItem::getThumbnailQueue() {
    static auto* const queue = // lives as long as the process
        new platform::OperationQueue("thumbnailQueue", 2, platform::WorkPriority::background);
    return *queue;
}

} // namespace tavrin
