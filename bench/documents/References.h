#pragma once

#include <chrono>
#include <string>

namespace platform {
class ListWidget;
}

// What the machine itself needs for what the list does; milliseconds.

using SteadyClock = std::chrono::steady_clock;

double millisecondsSince(SteadyClock::time_point start);

/// Names by getdents64, attributes by statx: what any program must at least do to show them all.
double bareReading(const std::string& folder);

/// What no list can do without: a white ground and the texts of the rows in view.
double bareFrame(platform::ListWidget& widget);

/// From a new file to the kernel's notice of it. The file is gone afterwards.
double bareChange(const std::string& folder, const std::string& file);
