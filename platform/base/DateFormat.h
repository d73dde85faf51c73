#pragma once

#include "platform/base/Date.h"

#include <string>

namespace platform {

/// How much of a date is written; the values are those by which callers know the styles.
enum class DateStyle : unsigned { none = 0, shortStyle = 1, medium = 2, longStyle = 3, full = 4 };

/// The date in the user's language, locale and time zone, with the time in its short form.
std::string localizedDateText(Date date, DateStyle dateStyle);
/// The date alone.
std::string localizedDayText(Date date, DateStyle dateStyle);

} // namespace platform
