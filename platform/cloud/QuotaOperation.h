#pragma once

#include "platform/base/Result.h"
#include "platform/base/WorkQueue.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <string_view>

namespace platform {

/// The container of the cloud-documents service itself: whose private database answers for quota.
inline constexpr std::string_view cloudDocumentsContainerIdentifier = "com.pelmora.cloud-documents";

/// How urgently an operation runs; the values are the platform's.
enum class QualityOfService { background = 9, utility = 17, userInitiated = 25 };

/// Asks the account for its free bytes. Set up, then added to a database once.
struct QuotaOperation {
    QualityOfService qualityOfService = QualityOfService::utility;
    bool allowsCellularAccess = true;
    /// Called once, on a thread of the service's choosing.
    std::function<void(const Result<std::uint64_t>& freeBytes)> completion;
};

/// A container's database of the account.
class CloudDatabase {
public:
    virtual ~CloudDatabase() = default;
    virtual void addOperation(std::shared_ptr<QuotaOperation> operation) = 0;
};

} // namespace platform
