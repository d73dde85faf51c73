#pragma once

#include "platform/documents/CenteredColumn.h"

#include <functional>
#include <memory>
#include <string_view>

namespace platform {

/// What stands in the middle of a screen that has nothing else to show: a quiet drawing, a line,
/// what can be done, and perhaps a button for it.
class StatusPage : public CenteredColumn {
public:
    enum class Drawing { emptyFolder, nothingFound, problem };
    struct Content {
        Drawing drawing = Drawing::emptyFolder;
        std::string title;
        std::string message;
        /// "" for no button.
        std::string button;
    };

    StatusPage();
    void setContent(const Content& content, std::function<void()> action = {});
    const std::string& title() const { return title_->text(); }
    const std::string& message() const { return message_->text(); }

private:
    class Picture;
    std::shared_ptr<Picture> picture_;
    std::shared_ptr<Label> title_;
    std::shared_ptr<Label> message_;
    std::shared_ptr<Button> button_;
    std::function<void()> action_;
};

} // namespace platform
