#pragma once

#include "platform/ui/View.h"

namespace tavrin {

/// A simple progress pie, drawn directly, with a clear background. Main thread.
class PieProgressIndicatorView : public platform::View {
public:
    explicit PieProgressIndicatorView(platform::Rect frame = {});

    /// From 0 to 1.
    float progress() const { return progress_; }
    void setProgress(float progress);

protected:
    void draw(platform::Canvas& canvas) override;

private:
    float progress_ = 0;
};

} // namespace tavrin
