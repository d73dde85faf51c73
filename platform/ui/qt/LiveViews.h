#pragma once

#include "platform/ui/View.h"

#include <unordered_set>

namespace platform {

/// Every view there is. A screen that the product keeps for the whole process outlives the
/// application; its widgets must not, so the application takes them away when it ends.
std::unordered_set<View::Impl*>& liveViews();
void destroyWidgetsOfLiveViews();

} // namespace platform
