#pragma once

#include "platform/base/Date.h"
#include "platform/base/DateFormat.h"
#include "platform/base/OperationQueue.h"
#include "platform/base/Url.h"
#include "platform/base/Value.h"
#include "platform/cloud/ItemAttributes.h"
#include "platform/ui/Image.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace tavrin {

/// The record of one file or folder of the store: a URL and a snapshot of what the screens need of
/// it. Read once, synchronously, under a coordinated read that never waits for content; changes
/// only when told to (setUrl, cacheValues, a setter). Used by one thread at a time.
class VXItem {
public:
    using Text = std::optional<std::string>;

    /// Refused: an item has a URL, or says that it has none. Throws std::invalid_argument.
    VXItem();
    explicit VXItem(std::optional<platform::Url> url);

    /// Reads everything again.
    void cacheValues();
    /// The state of an item without a URL; `url` and `canPreview` stay as they are.
    void clearValues();

    const std::optional<platform::Url>& url() const { return url_; }
    /// Refreshes the record unless the URL is equal to the current one.
    void setUrl(std::optional<platform::Url> url);
    /// The URL actually read: the target of a bookmark, else the URL itself.
    const std::optional<platform::Url>& resolvedURL() const { return resolvedUrl_; }
    void setResolvedURL(std::optional<platform::Url> url) { resolvedUrl_ = std::move(url); }

    const Text& localizedName() const { return localizedName_; }
    void setLocalizedName(Text name) { localizedName_ = std::move(name); }
    const Text& typeIdentifier() const { return typeIdentifier_; }
    void setTypeIdentifier(Text identifier) { typeIdentifier_ = std::move(identifier); }
    const Text& localizedTypeDescription() const { return localizedTypeDescription_; }
    void setLocalizedTypeDescription(Text text) { localizedTypeDescription_ = std::move(text); }
    /// In bytes.
    std::optional<std::uint64_t> fileSize() const { return fileSize_; }
    void setFileSize(std::optional<std::uint64_t> size) { fileSize_ = size; }
    const Text& friendlyFileSize() const { return friendlyFileSize_; }
    void setFriendlyFileSize(Text text) { friendlyFileSize_ = std::move(text); }

    std::optional<platform::Date> creationDate() const { return creationDate_; }
    void setCreationDate(std::optional<platform::Date> date) { creationDate_ = date; }
    std::optional<platform::Date> contentModificationDate() const { return modificationDate_; }
    void setContentModificationDate(std::optional<platform::Date> date) {
        modificationDate_ = date;
    }
    /// In the user's language, with the time in short style; none when there is no such date.
    Text friendlyCreationDate(platform::DateStyle style) const;
    Text friendlyContentModificationDate(platform::DateStyle style) const;
    static Text friendlyDate(const std::optional<platform::Date>& date, platform::DateStyle style);

    const std::optional<platform::Url>& parentDirectoryURL() const { return parentDirectoryUrl_; }
    void setParentDirectoryURL(std::optional<platform::Url> url) {
        parentDirectoryUrl_ = std::move(url);
    }

    /// The documents root of a container.
    bool isContainer() const { return isContainer_; }
    void setIsContainer(bool value) { isContainer_ = value; }
    /// False for a package.
    bool isDirectory() const { return isDirectory_; }
    void setIsDirectory(bool value) { isDirectory_ = value; }
    /// A directory shown as one document.
    bool isPackage() const { return isPackage_; }
    bool hasHiddenExtension() const { return hasHiddenExtension_; }
    void setHasHiddenExtension(bool value) { hasHiddenExtension_ = value; }
    bool canPreview() const { return canPreview_; }
    bool renameable() const { return renameable_; }
    void setRenameable(bool value) { renameable_ = value; }
    /// An external document reference that led to another URL.
    bool isBookmark() const { return isBookmark_; }
    void setIsBookmark(bool value) { isBookmark_ = value; }

    /// Tag names; none when the item has none.
    const std::optional<std::vector<std::string>>& tags() const { return tags_; }
    void setTags(std::optional<std::vector<std::string>> tags) { tags_ = std::move(tags); }
    /// Where the bytes, or the placeholder, of the document lie.
    const std::optional<platform::Url>& promiseURL() const { return promiseUrl_; }
    void setPromiseURL(std::optional<platform::Url> url) { promiseUrl_ = std::move(url); }
    bool isPromise() const;
    bool isDownloaded() const { return isDownloaded_; }
    void setIsDownloaded(bool value) { isDownloaded_ = value; }

    /// Loaded by the first call after a refresh; empty when there is none. Not tried again before
    /// the next refresh.
    const platform::Image& thumbnail();
    void setThumbnail(const platform::Image& image) { thumbnail_ = image; }
    bool thumbnailFetched() const { return thumbnailFetched_; }
    void setThumbnailFetched(bool value) { thumbnailFetched_ = value; }
    /// Takes the picture of 1024 pixels out of a thumbnail dictionary, where there is one.
    void updateThumbnailImage(const platform::Value& dictionary);
    bool canGenerateThumbnail() const { return false; }
    /// Calls back at once with an empty picture.
    void generateThumbnail(const std::function<void(const platform::Image&)>& completion);
    /// For making thumbnails, at background priority.
    static platform::OperationQueue& getThumbnailQueue();

private:
    void readAttributes(const platform::Url& read);
    void takeAttributes(const platform::Url& read, const platform::ResourceValues& values);

    std::optional<platform::Url> url_;
    std::optional<platform::Url> resolvedUrl_;
    Text localizedName_;
    Text typeIdentifier_;
    Text localizedTypeDescription_;
    std::optional<std::uint64_t> fileSize_;
    Text friendlyFileSize_;
    std::optional<platform::Date> creationDate_;
    std::optional<platform::Date> modificationDate_;
    std::optional<platform::Url> parentDirectoryUrl_;
    std::optional<std::vector<std::string>> tags_;
    std::optional<platform::Url> promiseUrl_;
    platform::Image thumbnail_;
    bool isContainer_ = false;
    bool isDirectory_ = false;
    bool isPackage_ = false;
    bool hasHiddenExtension_ = true;
    bool canPreview_ = false;
    bool renameable_ = true;
    bool isBookmark_ = false;
    bool isDownloaded_ = false;
    bool thumbnailFetched_ = false;
};

} // namespace tavrin
