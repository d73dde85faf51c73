#include "platform/documents/preview/SyntaxScanner.h"

#include <QString>

#include <string>

namespace platform {
namespace {

constexpr SyntaxState inNothing = 0;
constexpr SyntaxState inComment = 1;
constexpr SyntaxState inTag = 2;
/// And the value of an attribute, in " or in '.
constexpr SyntaxState inDoubleQuotes = 3;
constexpr SyntaxState inSingleQuotes = 4;
/// And those behind it: in the long quotes of the language, by their number.
constexpr SyntaxState inLongQuotes = 8;

bool isWordStart(QChar unit) {
    return unit.isLetter() || unit == u'_' || unit.isSurrogate();
}

bool isWordPart(QChar unit) {
    return isWordStart(unit) || unit.isDigit();
}

/// Takes the first word off a list; empty at its end.
std::string_view takeWord(std::string_view& list) {
    const std::size_t end = list.find(' ');
    const std::string_view word = list.substr(0, end);
    list.remove_prefix(end == std::string_view::npos ? list.size() : end + 1);
    return word;
}

QLatin1StringView latin(std::string_view text) {
    return {text.data(), static_cast<qsizetype>(text.size())};
}

class Scanner {
public:
    Scanner(const SyntaxLanguage& language, QStringView line, SyntaxState state)
        : language_(language), line_(line), state_(state) {}

    void run() {
        if (state_ != inNothing)
            goOn();
        else
            startLine();
        while (at_ < line_.size())
            language_.has(SyntaxLanguage::markup) ? scanMarkup() : scanCode();
    }

    std::vector<SyntaxSpan> takeSpans() { return std::move(spans_); }
    SyntaxState state() const { return state_; }

private:
    bool startsWith(std::string_view text) const {
        return !text.empty() && line_.sliced(at_).startsWith(latin(text));
    }

    void add(qsizetype from, SyntaxKind kind) {
        if (at_ > from)
            spans_.push_back({static_cast<int>(from), static_cast<int>(at_ - from), kind});
    }

    /// To behind the next `end`, or to the end of the line; answers whether it was there.
    bool skipTo(std::string_view end) {
        const qsizetype found = line_.indexOf(latin(end), at_);
        at_ = found < 0 ? line_.size() : found + static_cast<qsizetype>(end.size());
        return found >= 0;
    }

    /// What an earlier line opened.
    void goOn() {
        if (state_ == inComment)
            comment(0);
        else if (state_ >= inLongQuotes)
            longString(0, longQuote(state_ - inLongQuotes));
        else if (state_ != inTag)
            attributeValue(0);
    }

    std::string_view longQuote(int number) const {
        std::string_view list = language_.longQuotes;
        for (; number > 0; --number)
            takeWord(list);
        return takeWord(list);
    }

    void startLine() {
        const qsizetype text = line_.size() - line_.trimmed().size();
        if (line_.isEmpty() || text == line_.size())
            return;
        if (language_.has(SyntaxLanguage::changes)) {
            changedLine();
        } else if (language_.has(SyntaxLanguage::preprocessor) &&
                   line_.trimmed().startsWith(u'#')) {
            at_ = std::min(line_.indexOf(u'#') + 1, line_.size());
            while (at_ < line_.size() && (line_[at_].isLetter() || line_[at_].isSpace()))
                ++at_;
            add(0, SyntaxKind::directive);
        } else if (language_.has(SyntaxLanguage::headings) && line_.trimmed().startsWith(u'[')) {
            skipTo("]");
            add(0, SyntaxKind::directive);
        }
    }

    void changedLine() {
        const QChar first = line_[0];
        at_ = line_.size();
        if (first == u'+')
            add(0, SyntaxKind::string);
        else if (first == u'-')
            add(0, SyntaxKind::number);
        else if (first == u'@')
            add(0, SyntaxKind::name);
        else if (line_.startsWith(QLatin1StringView("diff ")))
            add(0, SyntaxKind::directive);
    }

    /// The marks around a comment: what opens it, and what closes it.
    std::string_view commentOpening() const {
        return language_.blockComment.substr(0, language_.blockComment.find(' '));
    }
    std::string_view commentEnd() const {
        const std::size_t space = language_.blockComment.find(' ');
        return space == std::string_view::npos ? std::string_view()
                                               : language_.blockComment.substr(space + 1);
    }

    void comment(qsizetype from) {
        state_ = skipTo(commentEnd()) ? inNothing : inComment;
        add(from, SyntaxKind::comment);
    }

    /// Behind what opens it.
    void longString(qsizetype from, std::string_view quote) {
        const SyntaxState open = state_;
        state_ = inNothing;
        for (;;) {
            const qsizetype before = at_;
            if (!skipTo(quote)) {
                state_ = open;
                break;
            }
            if (!isEscaped(before, at_ - static_cast<qsizetype>(quote.size())))
                break;
        }
        add(from, SyntaxKind::string);
    }

    /// Whether an odd number of backslashes stands before `at`, no further back than `from`.
    bool isEscaped(qsizetype from, qsizetype at) const {
        qsizetype first = at;
        while (first > from && line_[first - 1] == u'\\')
            --first;
        return (at - first) % 2 != 0;
    }

    bool lineComment() {
        if (language_.has(SyntaxLanguage::wordComments) && at_ > 0 && !line_[at_ - 1].isSpace())
            return false;
        std::string_view list = language_.lineComments;
        while (!list.empty()) {
            if (!startsWith(takeWord(list)))
                continue;
            const qsizetype from = std::exchange(at_, line_.size());
            add(from, SyntaxKind::comment);
            return true;
        }
        return false;
    }

    bool blockComment() {
        if (!startsWith(commentOpening()))
            return false;
        const qsizetype from = at_;
        at_ += static_cast<qsizetype>(commentOpening().size());
        comment(from);
        return true;
    }

    bool longStringStart() {
        std::string_view list = language_.longQuotes;
        for (SyntaxState number = 0; !list.empty(); ++number) {
            const std::string_view quote = takeWord(list);
            if (!startsWith(quote))
                continue;
            const qsizetype from = at_;
            at_ += static_cast<qsizetype>(quote.size());
            state_ = static_cast<SyntaxState>(inLongQuotes + number);
            longString(from, quote);
            return true;
        }
        return false;
    }

    bool shortString() {
        const QChar quote = line_[at_];
        if (quote.unicode() >= 0x80 || quote == u' ' ||
            language_.quotes.find(static_cast<char>(quote.unicode())) == std::string_view::npos)
            return false;
        const qsizetype from = at_++;
        const bool doubles = language_.has(SyntaxLanguage::doublesQuotes);
        while (at_ < line_.size() && line_[at_] != quote)
            at_ += !doubles && line_[at_] == u'\\' ? 2 : 1;
        at_ = std::min(at_ + 1, line_.size());
        add(from, namesValue() ? SyntaxKind::name : SyntaxKind::string);
        return true;
    }

    /// Whether what was just read names a value, by the colon behind it; not by one within an
    /// address.
    bool namesValue() const {
        if (!comesNext(u':'))
            return false;
        const qsizetype next = line_.indexOf(u':', at_) + 1;
        return line_[at_ - 1] == u'"' || next >= line_.size() || line_[next].isSpace();
    }

    bool comesNext(QChar sign) const {
        if (!language_.has(SyntaxLanguage::namesValues))
            return false;
        qsizetype next = at_;
        while (next < line_.size() && line_[next].isSpace())
            ++next;
        return next < line_.size() && line_[next] == sign;
    }

    void scanCode() {
        if (line_[at_].isSpace()) {
            ++at_;
            return;
        }
        if (blockComment() || lineComment() || longStringStart() || shortString() || dollarName())
            return;
        if (line_[at_].isDigit())
            number();
        else if (isWordStart(line_[at_]))
            word();
        else
            ++at_;
    }

    bool dollarName() {
        if (!language_.has(SyntaxLanguage::dollarNames) || line_[at_] != u'$')
            return false;
        const qsizetype from = at_++;
        if (at_ < line_.size() && line_[at_] == u'{')
            skipTo("}");
        else
            while (at_ < line_.size() && isWordPart(line_[at_]))
                ++at_;
        add(from, SyntaxKind::name);
        return true;
    }

    void number() {
        const qsizetype from = at_;
        while (at_ < line_.size() && (isWordPart(line_[at_]) || line_[at_] == u'.'))
            ++at_;
        add(from, SyntaxKind::number);
    }

    void word() {
        const qsizetype from = at_;
        const bool dashes = language_.has(SyntaxLanguage::namesValues);
        while (at_ < line_.size() &&
               (isWordPart(line_[at_]) || (dashes && (line_[at_] == u'-' || line_[at_] == u'.'))))
            ++at_;
        constexpr qsizetype longestKeyword = 32;
        const QStringView found = line_.sliced(from, at_ - from);
        if (found.size() <= longestKeyword && language_.isKeyword(found.toUtf8().toStdString()))
            add(from, SyntaxKind::keyword);
        else if (namesValue() || comesNext(u'='))
            add(from, SyntaxKind::name);
    }

    void scanMarkup() {
        if (state_ == inTag)
            insideTag();
        else if (blockComment())
            return;
        else if (startsWith("<!") || startsWith("<?")) {
            const qsizetype from = at_;
            skipTo(">");
            add(from, SyntaxKind::directive);
        } else if (line_[at_] == u'<')
            tagStart();
        else if (line_[at_] == u'&')
            entity();
        else
            ++at_;
    }

    void tagStart() {
        const qsizetype from = at_++;
        while (at_ < line_.size() && !line_[at_].isSpace() && line_[at_] != u'>')
            ++at_;
        add(from, SyntaxKind::keyword);
        state_ = inTag;
    }

    void insideTag() {
        const qsizetype from = at_;
        const QChar unit = line_[at_];
        if (unit == u'>') {
            ++at_;
            add(from, SyntaxKind::keyword);
            state_ = inNothing;
        } else if (unit == u'"' || unit == u'\'') {
            ++at_;
            state_ = unit == u'"' ? inDoubleQuotes : inSingleQuotes;
            attributeValue(from);
        } else if (isWordStart(unit)) {
            while (at_ < line_.size() && (isWordPart(line_[at_]) || line_[at_] == u'-' ||
                                          line_[at_] == u':' || line_[at_] == u'.'))
                ++at_;
            add(from, SyntaxKind::name);
        } else
            ++at_;
    }

    void attributeValue(qsizetype from) {
        if (skipTo(state_ == inDoubleQuotes ? "\"" : "'"))
            state_ = inTag;
        add(from, SyntaxKind::string);
    }

    void entity() {
        constexpr qsizetype longestEntity = 12;
        const qsizetype from = at_++;
        const qsizetype end = line_.indexOf(u';', at_);
        if (end < 0 || end - from > longestEntity)
            return;
        at_ = end + 1;
        add(from, SyntaxKind::number);
    }

    const SyntaxLanguage& language_;
    const QStringView line_;
    SyntaxState state_;
    qsizetype at_ = 0;
    std::vector<SyntaxSpan> spans_;
};

} // namespace

std::vector<SyntaxSpan> scanSyntax(const SyntaxLanguage& language, QStringView line,
                                   SyntaxState& state) {
    Scanner scanner(language, line, state);
    scanner.run();
    state = scanner.state();
    return scanner.takeSpans();
}

} // namespace platform
