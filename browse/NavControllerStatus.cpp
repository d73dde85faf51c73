#include "app/VXLogging.h"
#include "browse/NavController.h"
#include "platform/Platform.h"
#include "platform/base/ByteCount.h"
#include "platform/base/Text.h"

namespace tavrin {

std::string NavController::toolbarStatusText(std::size_t itemCount) const {
    const std::string items =
        platform::localizedPlural(".DICT.ITEMS.%d", static_cast<long long>(itemCount));
    return okToShowQuota() ? platform::localizedFormat("%1$@, %2$@", items, quotaAvailableString())
                           : items;
}

std::string NavController::quotaAvailableString() const {
    using platform::ByteCountStyle;
    using platform::byteCountText;
    const std::string text = byteCountText(quotaBytes_, ByteCountStyle::binary);
    const std::string number = byteCountText(quotaBytes_, ByteCountStyle::binary, false);
    return platform::localizedPluralText(".DICT.AVAILABLE.%g",
                                         platform::localizedNumberValue(number), text);
}

void NavController::quotaFetcherDidUpdateValue(QuotaFetcher& /*fetcher*/, std::uint64_t freeBytes) {
    quotaBytes_ = freeBytes;
    lastQuotaFetch_ = platform::Platform::current().clock().now();
    VXLOG(vxDebug, "updated quota at %@: %@ bytes avail", *lastQuotaFetch_, quotaBytes_);
    updateStatusUI(nullptr);
}

} // namespace tavrin
