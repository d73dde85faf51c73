#include "platform/documents/preview/SourceIndex.h"

#include <utility>

namespace platform {
namespace {

/// What lies between a known place and the wanted one is read for its colours up to here (a fifth
/// of a second). Behind a longer way the text is taken to begin anew: no program is as long.
constexpr std::uint64_t longestScan = 8ULL * 1024 * 1024;
/// Line ends are counted up to here (half a second from the disk's cache); beyond there are no
/// numbers.
constexpr std::uint64_t longestCount = 1024ULL * 1024 * 1024;

} // namespace

SourceIndex::SourceIndex(const TextFile& file, const SyntaxLanguage& language)
    : file_(file), language_(language) {
    places_.emplace(file.start(), Place());
}

std::vector<SyntaxSpan> SourceIndex::pass(const TextLine& line, Place& place) const {
    std::vector<SyntaxSpan> spans = scanSyntax(language_, line.text, place.state);
    place.withinLine = line.goesOn;
    if (place.number && !line.goesOn)
        ++place.number;
    return spans;
}

SourceIndex::Place SourceIndex::afterJump(std::uint64_t from, std::uint64_t to,
                                          const Place& start) const {
    Place place;
    place.number = start.number && to - from <= longestCount
                       ? start.number + file_.lineEndsBetween(from, to)
                       : 0;
    return place;
}

SourceIndex::Place SourceIndex::placeAt(std::uint64_t offset) {
    auto known = std::prev(places_.upper_bound(std::max(offset, file_.start())));
    std::uint64_t at = known->first;
    Place place = known->second;
    if (offset - at > longestScan)
        return places_.emplace(offset, afterJump(at, offset, place)).first->second;
    while (at < offset) {
        const std::vector<TextLine> lines = file_.linesFrom(at);
        if (lines.empty())
            break;
        for (const TextLine& line : lines) {
            if (line.offset >= offset)
                return place;
            pass(line, place);
            at = line.end;
        }
        places_.emplace(at, place);
    }
    return place;
}

void SourceIndex::describe(std::vector<TextLine>& lines) {
    if (lines.empty())
        return;
    Place place = placeAt(lines.front().offset);
    for (TextLine& line : lines) {
        line.number = place.withinLine ? 0 : place.number;
        line.spans = pass(line, place);
    }
    places_.emplace(lines.back().end, place);
}

} // namespace platform
