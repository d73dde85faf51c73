#pragma once

#include "platform/ui/Image.h"

#include <optional>
#include <string>

namespace platform {

/// The icon formats that callers ask for; the values are those of the launch service.
enum class IconFormat { list = 1, largeDocument = 12 };

/// Stands for a document of which only name and type are known. A value.
class DocumentProxy {
public:
    DocumentProxy(std::string name, std::string typeIdentifier,
                  std::optional<std::string> mimeType = {})
        : name_(std::move(name)), type_(std::move(typeIdentifier)), mime_(std::move(mimeType)) {}

    const std::string& name() const { return name_; }
    const std::string& typeIdentifier() const { return type_; }
    /// Main thread.
    Image icon(IconFormat format) const;

private:
    std::string name_;
    std::string type_;
    std::optional<std::string> mime_;
};

} // namespace platform
