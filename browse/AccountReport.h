#pragma once

#include "platform/cloud/CloudService.h"
#include "platform/cloud/TransferActivity.h"

#include <optional>
#include <string>
#include <vector>

namespace tavrin {

/// What goes on with the account, in words for the user.
struct AccountReport {
    /// A line each: what is sent and received, with how far it is.
    std::vector<std::string> transfers;
    /// What waits, with its cause.
    std::vector<std::string> waiting;
    /// Documents that were changed on both sides: paths relative to the store.
    std::vector<std::string> conflicts;
    /// Names that one side cannot hold, with the reason.
    std::vector<std::string> refused;
    std::optional<platform::DeletionQuestion> question;
    bool operator==(const AccountReport&) const = default;
};

/// Asks the store; takes as long as that takes. From any thread.
AccountReport makeAccountReport();
/// One line: "Sending “a.pdf”", "Sending 3 documents, receiving …"; "" when nothing is on its way.
std::string transferSummary(const std::vector<platform::TransferInfo>& transfers);
/// One line: "3 documents wait", with the cause where all have the same; "" for none.
std::string waitingSummary(const std::vector<platform::PendingWork>& work);
/// At most so many lines, and how many more there are.
std::string linesOf(const std::vector<std::string>& lines, std::size_t atMost);

} // namespace tavrin
