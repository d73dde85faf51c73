#include "platform/ui/layout/VisualFormatParser.h"

#include "platform/base/Format.h"

#include <cctype>
#include <charconv>
#include <cmath>

namespace platform {

namespace {

bool startsName(char c) {
    return std::isalpha(static_cast<unsigned char>(c)) || c == '_';
}

bool continuesName(char c) {
    return startsName(c) || std::isdigit(static_cast<unsigned char>(c));
}

/// Reads from left to right and stops at the first thing that it does not understand.
class Reader {
public:
    explicit Reader(std::string_view text) : text_(text) {}
    Result<ParsedFormat> read();

private:
    bool readAll();
    bool readView();
    bool readGap();
    bool readPredicates(std::vector<ParsedFormat::Predicate>& list, bool mayNameView);
    bool readPredicate(std::vector<ParsedFormat::Predicate>& list, bool mayNameView);
    bool readNumber(double& number);
    std::string readName();

    char next() const { return at_ < text_.size() ? text_[at_] : '\0'; }
    bool take(std::string_view token) {
        if (!text_.substr(at_).starts_with(token))
            return false;
        at_ += token.size();
        return true;
    }
    bool fail(std::string_view expected) {
        if (expected_.empty())
            expected_ = expected;
        return false;
    }

    std::string_view text_;
    std::size_t at_ = 0;
    std::string expected_;
    ParsedFormat format_;
};

Result<ParsedFormat> Reader::read() {
    if (!readAll())
        return visualFormatError(text_, at_, platform::format("expected %@", expected_));
    return std::move(format_);
}

bool Reader::readAll() {
    if (take("V:"))
        format_.axis = Axis::vertical;
    else
        take("H:");
    if (take("|")) {
        format_.startsAtSuperview = true;
        if (!readGap())
            return false;
    }
    if (!readView())
        return false;
    while (at_ < text_.size()) {
        if (!readGap())
            return false;
        if (take("|")) {
            format_.endsAtSuperview = true;
            return at_ == text_.size() || fail("the end after “|”");
        }
        if (!readView())
            return false;
    }
    return true;
}

bool Reader::readView() {
    if (!take("["))
        return fail("a view, “[name]”");
    ParsedFormat::View view;
    view.place = at_;
    view.name = readName();
    if (view.name.empty())
        return fail("the name of a view");
    if (take("(") && !readPredicates(view.sizes, true))
        return false;
    if (!take("]"))
        return fail("“]”");
    format_.views.push_back(std::move(view));
    return true;
}

bool Reader::readGap() {
    ParsedFormat::Gap& gap = format_.gaps.emplace_back();
    if (!take("-")) {
        gap.emplace_back();
        return true;
    }
    if (next() == '[' || next() == '|') {
        gap.push_back({LayoutRelation::equal, standardSpace, {}, layoutRequired, at_});
        return true;
    }
    if (take("(")) {
        if (!readPredicates(gap, false))
            return false;
    } else {
        gap.push_back({LayoutRelation::equal, 0, {}, layoutRequired, at_});
        if (!std::isdigit(static_cast<unsigned char>(next())) && next() != '.')
            return fail("a space, “10” or “(>=10)”, a view or “|”");
        if (!readNumber(gap.back().number))
            return fail("a number");
    }
    return take("-") || fail("“-” after the space");
}

/// After an opening bracket, up to and with the closing one.
bool Reader::readPredicates(std::vector<ParsedFormat::Predicate>& list, bool mayNameView) {
    do {
        if (!readPredicate(list, mayNameView))
            return false;
    } while (take(","));
    return take(")") || fail("“,” or “)”");
}

bool Reader::readPredicate(std::vector<ParsedFormat::Predicate>& list, bool mayNameView) {
    ParsedFormat::Predicate& predicate = list.emplace_back();
    if (take("<="))
        predicate.relation = LayoutRelation::lessOrEqual;
    else if (take(">="))
        predicate.relation = LayoutRelation::greaterOrEqual;
    else
        take("==");
    predicate.place = at_;
    if (startsName(next())) {
        if (!mayNameView)
            return fail("a number");
        predicate.view = readName();
    } else if (!readNumber(predicate.number)) {
        return fail(mayNameView ? "a number or a view" : "a number");
    }
    if (!take("@"))
        return true;
    double priority = 0;
    const std::size_t start = at_;
    if (readNumber(priority) && priority >= 1 && priority <= layoutRequired) {
        predicate.priority = static_cast<LayoutPriority>(priority);
        return true;
    }
    at_ = start;
    return fail("a priority from 1 to 1000");
}

bool Reader::readNumber(double& number) {
    const char* const begin = text_.data() + at_;
    const auto [end, fault] =
        std::from_chars(begin, text_.data() + text_.size(), number, std::chars_format::fixed);
    if (fault != std::errc() || !std::isfinite(number))
        return false;
    at_ += static_cast<std::size_t>(end - begin);
    return true;
}

std::string Reader::readName() {
    const std::size_t start = at_;
    if (startsName(next()))
        while (continuesName(next()))
            ++at_;
    return std::string(text_.substr(start, at_ - start));
}

} // namespace

Error visualFormatError(std::string_view format, std::size_t place, std::string_view what) {
    return makeErrorWithText(
        ErrorCode::invalidArgument,
        platform::format("Visual format “%@”, character %d: %@", format, place + 1, what));
}

Result<ParsedFormat> parseVisualFormat(std::string_view format) {
    return Reader(format).read();
}

} // namespace platform
