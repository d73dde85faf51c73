#include "app/VXLogging.h"
#include "items/FileUtils.h"
#include "platform/Platform.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/files/FileCoordinator.h"
#include "platform/files/FileManager.h"

namespace tavrin {
namespace {

using platform::Failure;
using platform::FileCoordinator;
using platform::FileManager;
using platform::Platform;
using platform::Url;
using platform::WritingOptions;

/// Error 3328 for a file onto a folder or a folder onto a file; none when the kinds agree or either
/// side is not there.
Failure kindsClash(const Url& source, const Url& destination) {
    if (FileUtils::isFile(source) && FileUtils::isDir(destination)) {
        VXLOG(vxError, "Move: must move a file to a file (dest is a dir)");
        return platform::makeError(platform::ErrorCode::unsupportedOperation);
    }
    if (FileUtils::isDir(source) && FileUtils::isFile(destination)) {
        VXLOG(vxError, "Move: must move a dir to a dir (dest is a file)");
        return platform::makeError(platform::ErrorCode::unsupportedOperation);
    }
    return std::nullopt;
}

Failure coordinatedMove(const Url& source, const Url& destination) {
    FileCoordinator coordinator;
    Failure moving;
    Failure coordination = coordinator.coordinateWriting(
        source, WritingOptions::forMoving, destination, WritingOptions::forReplacing,
        [&](const Url& from, const Url& to) {
            coordinator.itemAtURLWillMoveToURL(from, to);
            VXLOG(vxDebug, "Moving src2:  '%@'", from);
            VXLOG(vxDebug, "Moving dest2: '%@'", to);
            moving = Platform::current().documents().moveItem(from, to);
            if (moving) {
                VXLOG(vxWarning, "Dossa Move failed: %@", *moving);
                return;
            }
            VXLOG(vxInfo, "Move successful");
            coordinator.itemAtURLDidMoveToURL(from, to);
        });
    return coordination ? coordination : moving;
}

} // namespace

Failure FileUtils::mkdir(const Url& folder) {
    VXLOG(vxDebug, "Creating directory: '%@'", folder);
    FileCoordinator coordinator;
    Failure making;
    Failure result = coordinator.coordinateWriting(
        folder, WritingOptions::forReplacing, [&making](const Url& url) {
            making = FileManager::createDirectory(url, true);
            if (making)
                VXLOG(vxError, "failed to create directory:'%@': %@", url, *making);
            else
                VXLOG(vxInfo, "Created directory: '%@'", url);
        });
    if (!result)
        result = making;
    VXLOG(vxDebug, "Coordinated Write returned %@", result);
    return result;
}

Failure FileUtils::remove(const Url& item) {
    VXLOG(vxDebug, "Removing item: '%@'", item);
    FileCoordinator coordinator;
    Failure removing;
    Failure result = coordinator.coordinateWriting(
        item, WritingOptions::forDeleting, [&removing](const Url& url) {
            removing = Platform::current().documents().removeItem(url);
            if (removing)
                VXLOG(vxError, "failed to delete item:'%@': %@", url, *removing);
            else
                VXLOG(vxInfo, "Deleted item: '%@'", url);
        });
    if (!result)
        result = removing;
    VXLOG(vxInfo, "Coordinated Write returned %@", result);
    return result;
}

Failure FileUtils::move(const Url& source, const Url& to) {
    VXLOG(vxDebug, "Moving src1:  '%@'", source);
    VXLOG(vxDebug, "Moving dest1: '%@'", to);
    if (source.path() == to.path()) {
        VXLOG(vxDebug, "Move: src and dest are the same");
        return std::nullopt;
    }
    if (!exists(source))
        VXLOG(vxInfo, "Move: source filename does not exist, must be a fault.");
    if (Failure clash = kindsClash(source, to))
        return clash;
    Url destination = to;
    if (isTaken(to)) {
        destination = generateUniquePath(to);
        VXLOG(vxDebug, "Avail  dest1: '%@'", destination);
    }
    Failure result = coordinatedMove(source, destination);
    if (result)
        VXLOG(vxWarning, "Move failed: %@", *result);
    return result;
}

void FileUtils::evictDocument(const Url& document) {
    if (const Failure failure = Platform::current().documents().evictItem(document))
        VXLOG(vxWarning, "Evict error: %@", *failure);
}

} // namespace tavrin
