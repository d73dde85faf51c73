#include "platform/cloud/AttributeReading.h"

#include "platform/cloud/Sidecar.h"
#include "platform/files/PathText.h"
#include "platform/launch/ThumbnailCache.h"
#include "platform/launch/TypeRegistry.h"

#include <sys/xattr.h>

namespace platform {
namespace {

/// Present, with any value, on an item whose extension its maker wants hidden.
constexpr const char* hiddenExtensionAttribute = "user.pelmora.hidden-extension";

/// What both kinds of item have in common.
struct Subject {
    explicit Subject(const Url& theUrl)
        : url(theUrl), name(theUrl.lastPathComponent()), localizedName(name) {}
    const Url& url;
    std::string_view name;
    std::string_view localizedName;
    bool isDirectory = false;
    bool isPackage = false;
    bool hiddenExtension = false;
    std::uint64_t size = 0;
    std::optional<Date> created;
    Date modified;
    SharedRole role = SharedRole::none;
    std::string_view downloadingStatus;
    std::string type;
    bool isPromised = false;
};

/// Looked up once for the two attributes that need it.
const std::string& typeOf(Subject& subject) {
    if (subject.type.empty())
        subject.type = subject.isDirectory && !subject.isPackage
                           ? std::string(types::folder)
                           : TypeRegistry::identifierForFileName(subject.name);
    return subject.type;
}

Value typeDescription(Subject& subject) {
    std::optional<std::string> words = TypeRegistry::localizedDescription(typeOf(subject));
    return words ? Value(std::move(*words)) : Value();
}

Value roleValue(SharedRole role) {
    if (role == SharedRole::none)
        return {};
    return role == SharedRole::owner ? sharedRoleOwner : sharedRoleParticipant;
}

/// Of a promise, whatever was made while its content was here; nothing larger can be made now.
Value thumbnailsOf(const Subject& subject) {
    if (subject.isDirectory)
        return {};
    const ThumbnailCache cache = ThumbnailCache::current();
    std::optional<Bytes> picture =
        subject.isPromised ? cache.findLargest(subject.url, subject.modified)
                           : cache.find(subject.url, subject.modified, ThumbnailSize::xxLarge);
    if (!picture)
        return {};
    return Value::Map{{std::string(thumbnailSize1024), *std::move(picture)}};
}

Value valueOf(Subject& subject, ResourceKey key) {
    switch (key) {
    case ResourceKey::name:
        return subject.name;
    case ResourceKey::localizedName:
        return subject.localizedName;
    case ResourceKey::typeIdentifier:
        return typeOf(subject);
    case ResourceKey::localizedTypeDescription:
        return typeDescription(subject);
    case ResourceKey::fileSize:
        return subject.isDirectory ? Value() : Value(static_cast<std::int64_t>(subject.size));
    case ResourceKey::creationDate:
        return subject.created ? Value(*subject.created) : Value();
    case ResourceKey::contentModificationDate:
        return subject.modified;
    case ResourceKey::isDirectory:
        return subject.isDirectory;
    case ResourceKey::isPackage:
        return subject.isPackage;
    case ResourceKey::hasHiddenExtension:
        return subject.hiddenExtension;
    case ResourceKey::parentDirectoryUrl: {
        std::optional<Url> parent = subject.url.deletingLastPathComponent();
        return parent ? Value(std::move(*parent)) : Value();
    }
    case ResourceKey::isShared:
        return subject.role != SharedRole::none;
    case ResourceKey::sharedItemRole:
        return roleValue(subject.role);
    case ResourceKey::downloadingStatus:
        return subject.downloadingStatus.empty() ? Value() : Value(subject.downloadingStatus);
    case ResourceKey::thumbnailDictionary:
        return thumbnailsOf(subject);
    }
    return {};
}

ResourceValues valuesOf(Subject& subject, ResourceKeys keys) {
    ResourceValues values;
    for (const ResourceKey key : keys)
        values.set(key, valueOf(subject, key));
    return values;
}

bool asksFor(ResourceKeys keys, ResourceKey key) {
    for (const ResourceKey each : keys)
        if (each == key)
            return true;
    return false;
}

/// The name of the container whose folder, or documents root, this is.
const ContainerSet::Entry* containerAt(const StoreView& view, std::string_view path) {
    const std::optional<std::string_view> relative = view.relative(path);
    if (!relative || relative->empty())
        return nullptr;
    const ContainerSet::Entry* const entry = view.containers->holding(*relative);
    return entry && (entry->documents == *relative || entry->folder == *relative) ? entry : nullptr;
}

SharedRole roleOf(const StoreView& view, const FileIdentity& identity) {
    if (view.roles->empty())
        return SharedRole::none;
    const auto found = view.roles->find(identity);
    return found == view.roles->end() ? SharedRole::none : found->second;
}

void addStoreState(Subject& subject, const FileAttributes& attributes, const StoreView& view) {
    subject.role = roleOf(view, attributes.identity);
    const bool missing = subject.isPackage && containsPromise(subject.url.path(), view.mark);
    subject.downloadingStatus = missing ? downloadingStatusNotDownloaded : downloadingStatusCurrent;
    if (subject.isDirectory)
        if (const ContainerSet::Entry* const entry = containerAt(view, subject.url.path()))
            subject.localizedName = entry->container->localizedName();
}

} // namespace

ResourceValues readLocalAttributes(const Url& url, const FileAttributes& attributes,
                                   const StoreView* view, ResourceKeys keys) {
    Subject subject(url);
    subject.isDirectory = attributes.kind == FileKind::directory;
    subject.isPackage = subject.isDirectory && TypeRegistry::isPackageName(subject.name);
    if (asksFor(keys, ResourceKey::hasHiddenExtension) &&
        ::getxattr(PathText(url.path()).c_str(), hiddenExtensionAttribute, nullptr, 0) >= 0) {
        subject.hiddenExtension = true;
        subject.localizedName = stemOf(subject.name);
    }
    subject.size = attributes.size;
    if (attributes.created.nanoseconds != 0)
        subject.created = attributes.created;
    subject.modified = attributes.modified;
    if (view)
        addStoreState(subject, attributes, *view);
    return valuesOf(subject, keys);
}

ResourceValues readPromisedAttributes(const Url& url, const RemoteRow& remote, ResourceKeys keys) {
    Subject subject(url);
    subject.size = remote.size;
    subject.created = remote.created;
    subject.modified = remote.modified;
    subject.role = remote.role;
    subject.downloadingStatus = downloadingStatusNotDownloaded;
    subject.isPromised = true;
    return valuesOf(subject, keys);
}

bool isPackageFolder(const Url& url) {
    return TypeRegistry::isPackageName(url.lastPathComponent());
}

} // namespace platform
