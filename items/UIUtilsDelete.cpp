#include "items/UIUtils.h"
#include "items/VXItem.h"
#include "platform/base/Text.h"

namespace tavrin {

using platform::localizedFormat;

std::optional<std::string>
UIUtils::messageForDeletePrompt(const std::vector<platform::Url>& items) {
    if (items.size() != 1) {
        return localizedFormat(
            "%@ will be permanently deleted from Tavrin on all your devices. This action cannot be "
            "undone.",
            platform::localizedPlural(".DICT.ITEMS.%d", static_cast<long long>(items.size())));
    }
    const VXItem item(items.front());
    if (!item.localizedName() || item.localizedName()->empty())
        return std::nullopt;
    if (item.isContainer()) {
        return localizedFormat(
            "The %@ app library, and all its documents, will be permanently deleted from Tavrin on "
            "all your devices. This action cannot be undone.",
            *item.localizedName());
    }
    return localizedFormat(
        "\"%@\" will be permanently deleted from Tavrin on all your devices. This action cannot be "
        "undone.",
        *item.localizedName());
}

} // namespace tavrin
