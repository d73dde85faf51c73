#pragma once

#include "platform/ui/Controls.h"

#include <memory>
#include <string_view>

namespace tavrin {

/// A row of file information: a grey name and its value. Main thread.
class FileInfoCell : public platform::View {
public:
    explicit FileInfoCell(std::string_view name = {}, std::string_view value = {},
                          int maxLines = 1);

    static platform::Font font();
    const std::shared_ptr<platform::Label>& nameLabel() const { return nameLabel_; }
    const std::shared_ptr<platform::Label>& valueLabel() const { return valueLabel_; }

private:
    std::shared_ptr<platform::Label> nameLabel_;
    std::shared_ptr<platform::Label> valueLabel_;
};

} // namespace tavrin
