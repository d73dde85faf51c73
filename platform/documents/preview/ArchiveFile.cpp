#include "platform/documents/preview/ArchiveFile.h"

#include "platform/base/Text.h"
#include "platform/documents/preview/ArchiveRecords.h"
#include "platform/documents/preview/ChildWork.h"

namespace platform {
namespace {

using namespace std::chrono_literals;
using State = ArchiveListing::State;
using Kind = ArchiveRecord::Kind;

/// To list a compressed archive all of it has to be unpacked: a large one takes a minute.
constexpr Duration longestListing = 90s;
/// When what there is is shown while more is read; then after twice that time, and so on: every
/// time all of it is put in order.
constexpr Duration firstProgress = 700ms;

State endOf(Kind kind) {
    switch (kind) {
    case Kind::complete:
        return State::complete;
    case Kind::cut:
        return State::cut;
    case Kind::locked:
        return State::locked;
    default:
        return State::damaged;
    }
}

ContentsTree::Item itemOf(const ArchiveRecord& record) {
    ContentsTree::Item item;
    item.folder = record.kind == Kind::folder;
    item.link = record.kind == Kind::link;
    item.encrypted = record.encrypted;
    item.size = record.size;
    // Dates that no clock shows come from broken headers.
    constexpr std::int64_t latest = 253'402'300'799; // the year 9999
    constexpr std::int64_t latestNanoseconds = INT64_MAX / 1'000'000'000;
    if (record.modified && *record.modified > 0 &&
        *record.modified < std::min(latest, latestNanoseconds))
        item.modified = Date::fromParts(*record.modified, 0);
    return item;
}

} // namespace

ArchiveFile::ArchiveFile(std::string lister, std::string name, Clock& clock)
    : lister_(std::move(lister)), name_(std::move(name)), clock_(clock) {
}

bool ArchiveFile::take(const ArchiveRecord& record) {
    if (record.isLast()) {
        listing_.state = full_ ? State::cut : endOf(record.kind);
        listing_.detail = record.text;
        return false;
    }
    const std::string& path = record.kind == Kind::content ? name_ : record.text;
    full_ = full_ || !listing_.tree->add(path, itemOf(record));
    return true;
}

void ArchiveFile::tell(PreviewToken& token, const std::function<void(ArchiveListing)>& progress) {
    ArchiveListing copy = listing_;
    copy.tree = std::make_shared<ContentsTree>(*listing_.tree);
    copy.tree->sort(token.flag());
    progress(std::move(copy));
}

Result<ArchiveListing> ArchiveFile::list(int file, PreviewToken& token,
                                         const std::function<void(ArchiveListing)>& progress) {
    ArchiveRecordReader reader;
    const Duration start = clock_.monotonic();
    nextTold_ = firstProgress;
    ProgramStart program{{lister_}, "/"};
    program.input = file;
    const ChildEnd end =
        runChild(std::move(program), token, clock_, longestListing, [&](std::string_view bytes) {
            reader.add(bytes);
            while (const auto record = reader.next())
                if (!take(*record))
                    return true;
            if (clock_.monotonic() - start >= nextTold_) {
                nextTold_ *= 2;
                tell(token, progress);
            }
            return !reader.failed();
        });
    if (end == ChildEnd::cancelled)
        return makeError(ErrorCode::userCancelled);
    if (end == ChildEnd::absent)
        return makeErrorWithText(ErrorCode::unsupportedOperation,
                                 localized("A part of this program is missing: archives cannot be "
                                           "listed. Install it again."));
    if (listing_.state == State::reading)
        listing_.state = end == ChildEnd::outOfTime ? State::cut : State::damaged;
    listing_.tree->sort(token.flag());
    return std::move(listing_);
}

} // namespace platform
