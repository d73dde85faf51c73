#pragma once

#include "platform/ui/View.h"

#include <functional>

namespace platform {

/// The way to the search, drawn as the field in which it will take place.
class SearchPill : public View {
public:
    explicit SearchPill(std::function<void()> tapped);
    static double heightWithMargins();
    /// Pale, and no way anywhere, while documents are being selected.
    void setUsable(bool usable);

protected:
    void layoutSubviews() override;

private:
    std::shared_ptr<View> pill_;
    std::shared_ptr<View> glass_;
    std::shared_ptr<View> label_;
};

} // namespace platform
