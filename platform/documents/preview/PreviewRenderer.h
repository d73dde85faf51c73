#pragma once

#include "platform/base/Error.h"
#include "platform/base/MainQueue.h"
#include "platform/base/Url.h"
#include "platform/ui/View.h"

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

namespace platform {

/// What a renderer tells the preview that shows it. Called on the main thread; not any more once
/// the renderer is gone.
struct PreviewReports {
    /// The first of the document can be seen.
    std::function<void()> shown;
    /// It cannot be shown; the error's description names the cause for the user.
    std::function<void(const Error& error)> failed;
    /// Where in the document one is ("3 of 12"); "" for nothing to tell.
    std::function<void(const std::string& place)> moved;
};

/// Shows documents of one kind. Made for one document, on the main thread; reads and decodes on a
/// queue of its own, and gives that up when it is destroyed.
class PreviewRenderer {
public:
    virtual ~PreviewRenderer() = default;
    /// Has left the tree when the renderer is destroyed.
    virtual std::shared_ptr<View> view() = 0;
    /// Starts to read the file; called once. Reports come later.
    virtual void load(const Url& file) = 0;
    /// The file has changed: reads it again and stays at the same place as far as that is there.
    virtual void reload() = 0;
    /// Larger or smaller by a factor, around the middle; none when that means nothing.
    virtual std::optional<std::function<void(double factor)>> zoom() { return std::nullopt; }
};

/// A kind of document. A new one is a file that defines one of these and a line in
/// PreviewKinds.cpp.
struct PreviewKind {
    /// Whether it shows files of the type; by the identifier alone.
    bool (*shows)(std::string_view typeIdentifier);
    std::unique_ptr<PreviewRenderer> (*make)(MainQueue& main, PreviewReports reports);
};

/// The kind that shows the type best; none when no kind does.
const PreviewKind* previewKindFor(std::string_view typeIdentifier);

} // namespace platform
