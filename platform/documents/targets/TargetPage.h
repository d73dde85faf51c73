#pragma once

#include "platform/documents/list/ListView.h"
#include "platform/ui/Controls.h"

#include <memory>
#include <string>

namespace platform {

/// What a screen of the chooser looks like: what is to be moved, the list, and the reason why it
/// cannot go there.
class TargetPage : public View {
public:
    TargetPage(const std::string& moved, std::shared_ptr<ListView> list);

    /// "" takes the line away.
    void setReason(const std::string& reason);
    const std::string& reason() const { return reasonText_->text(); }

protected:
    void layoutSubviews() override;

private:
    /// A strip of text with a picture and a hairline, as high as its text.
    struct Strip {
        std::shared_ptr<View> ground;
        std::shared_ptr<ImageView> picture;
        std::shared_ptr<View> line;
    };
    Strip addStrip(SystemImage picture, Color color, const std::shared_ptr<Label>& text);
    double heightOf(const Label& text, double width) const;
    void placeStrip(const Strip& strip, Label& text, Rect frame, double lineY) const;

    std::shared_ptr<ListView> list_;
    std::shared_ptr<Label> movedText_;
    std::shared_ptr<Label> reasonText_;
    Strip moved_;
    Strip reason_;
};

} // namespace platform
