#pragma once

#include "platform/ui/Color.h"

#include <optional>

namespace tavrin {

/// How two colours are joined. The last four are accepted and change nothing.
enum class CompositingFilter {
    normal,
    sourceOver,
    multiply,
    screen,
    overlay,
    darken,
    lighten,
    colorDodge,
    colorBurn,
    plusLighter,
    plusDarker,
};

/// `under` with `top` painted over it.
platform::Color _colorBlendedWithColor(const platform::Color& under,
                                       const std::optional<platform::Color>& top);
/// The blend in the given mode; a mode that is not known, or a clear `top`, leaves `under` as it
/// is.
platform::Color _colorBlendedWithColor(const platform::Color& under,
                                       const std::optional<platform::Color>& top,
                                       std::optional<CompositingFilter> compositingFilter);

} // namespace tavrin
