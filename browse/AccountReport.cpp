#include "browse/AccountReport.h"

#include "platform/Platform.h"
#include "platform/base/Text.h"

#include <algorithm>

namespace tavrin {
namespace {

using platform::localized;
using platform::localizedFormat;
using platform::localizedPlural;

/// Lines of a kind that a person reads; the rest is counted.
constexpr std::size_t refusedAtMost = 100;

std::string nameIn(const std::string& path) {
    const std::size_t slash = path.rfind('/');
    return slash == std::string::npos ? path : path.substr(slash + 1);
}

std::string lineOf(const platform::TransferInfo& transfer) {
    const std::string name = nameIn(transfer.path);
    const std::string what = transfer.up ? localizedFormat("Sending “%1$@”", name)
                                         : localizedFormat("Receiving “%1$@”", name);
    if (transfer.total == 0)
        return what;
    const auto share = std::min<std::uint64_t>(100, transfer.done * 100 / transfer.total);
    return what + " – " + platform::localizedNumber(static_cast<long long>(share)) + "\u00a0%";
}

std::string lineOf(const platform::PendingWork& work) {
    return localizedFormat("“%1$@”: %2$@", nameIn(work.path), work.cause);
}

std::string part(const std::vector<platform::TransferInfo>& transfers, bool up) {
    const auto ofKind = [up](const platform::TransferInfo& each) { return each.up == up; };
    const auto count = std::ranges::count_if(transfers, ofKind);
    if (count == 0)
        return {};
    if (count > 1)
        return localizedPlural(up ? ".DICT.SENDING.%d" : ".DICT.RECEIVING.%d", count);
    const std::string name = nameIn(std::ranges::find_if(transfers, ofKind)->path);
    return up ? localizedFormat("Sending “%1$@”", name)
              : localizedFormat("Receiving “%1$@”", name);
}

} // namespace

AccountReport makeAccountReport() {
    platform::CloudService& cloud = platform::Platform::current().cloud();
    AccountReport report;
    for (const platform::TransferInfo& transfer : cloud.transfers())
        report.transfers.push_back(lineOf(transfer));
    for (const platform::PendingWork& work : cloud.pending())
        report.waiting.push_back(lineOf(work));
    for (const platform::RefusedRow& row : cloud.refusedNames(refusedAtMost))
        report.refused.push_back(localizedFormat("“%1$@”: %2$@", row.name, row.reason));
    report.conflicts = cloud.conflicts();
    report.question = cloud.question();
    return report;
}

std::string transferSummary(const std::vector<platform::TransferInfo>& transfers) {
    const std::string up = part(transfers, true);
    const std::string down = part(transfers, false);
    return up.empty() || down.empty() ? up + down : localizedFormat("%1$@, %2$@", up, down);
}

std::string waitingSummary(const std::vector<platform::PendingWork>& work) {
    if (work.empty())
        return {};
    const std::string count =
        localizedPlural(".DICT.WAITING.%d", static_cast<long long>(work.size()));
    const bool same = std::ranges::all_of(
        work, [&](const platform::PendingWork& each) { return each.cause == work.front().cause; });
    return same ? count + ": " + work.front().cause : count;
}

std::string linesOf(const std::vector<std::string>& lines, std::size_t atMost) {
    std::string text;
    for (std::size_t i = 0; i < lines.size() && i < atMost; ++i)
        text += (text.empty() ? "" : "\n") + lines[i];
    if (lines.size() > atMost)
        text += '\n' + localizedPlural(".DICT.MORE.%d",
                                       static_cast<long long>(lines.size() - atMost));
    return text;
}

} // namespace tavrin
