#pragma once

#include "platform/ui/View.h"

namespace tavrin {

/// A separator that is one physical pixel high.
class HairlineView : public platform::View {
public:
    HairlineView();

private:
    double _hairline() const;
};

} // namespace tavrin
