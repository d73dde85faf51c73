#include "platform/documents/preview/CleanHtml.h"

#include "platform/documents/preview/HtmlElements.h"

#include <QStringList>
#include <QUrl>

#include <algorithm>
#include <vector>

namespace platform {
namespace {

/// Deeper ones count as part of what is around them: 64 blocks within another leave no room.
constexpr std::size_t deepest = 48;
/// A table within a table is laid out several times for each level.
constexpr int deepestTable = 3;
constexpr int mostColumns = 64;
/// Of all tables together, whether there is something in them or not: each takes as much as a
/// paragraph; two seconds. A table itself costs as much as so many, and one within another four
/// times as much for each level.
constexpr int mostCells = 60'000;
constexpr int cellsForATable = 10;
/// Two seconds as well.
constexpr int mostElements = 150'000;
/// Time for a word grows with the square of its length: longer ones may be broken anywhere.
constexpr int longestWord = 100;
constexpr qsizetype longestAddress = 4096;

/// A text that is written as it stands gets a ground of its own.
const QString boxStart = QStringLiteral("table class=\"code\" border=\"0\" cellspacing=\"0\" "
                                        "cellpadding=\"10\" width=\"100%\"><tr><td><");
const QString boxEnd = QStringLiteral("></td></tr></table");

struct Attribute {
    QString name;
    QString value;
};

class Cleaner {
public:
    Cleaner(QStringView html, const InlinePictures& pictures) : html_(html), pictures_(pictures) {}

    std::optional<QString> run() {
        out_.reserve(html_.size());
        while (at_ < html_.size() && elements_ <= mostElements && cells_ <= mostCells)
            html_[at_] == u'<' ? markup() : text();
        if (elements_ > mostElements || cells_ > mostCells)
            return std::nullopt;
        closeTo(0);
        return std::move(out_);
    }

private:
    struct Open {
        const HtmlElement* element;
        /// What was written for it; "" for nothing.
        QString written;
    };
    struct Table {
        int rows = 0;
        int columns = 0;
        int columnsOfRow = 0;
    };

    QChar charAt(qsizetype place) const { return place < html_.size() ? html_[place] : QChar(); }

    void text() {
        const QChar unit = html_[at_++];
        if (unit == u'&') {
            entity();
            return;
        }
        const bool breaks = unit.isSpace() || unit == u'-';
        word_ = breaks ? 0 : word_ + 1;
        const char16_t code = unit.unicode();
        const bool shown = code >= 0x20 || unit == u'\n' || unit == u'\t' || unit == u'\r';
        out_ += isStructural(code) || !shown ? QChar(QChar::ReplacementCharacter) : unit;
        breakLongWord(unit);
    }

    void breakLongWord(QChar last) {
        if (word_ < longestWord || last.isHighSurrogate())
            return;
        out_ += QChar(0x200B);
        word_ = 0;
    }

    /// What the toolkit's documents take for a frame or an object of their own.
    static bool isStructural(char32_t code) {
        return code == 0 || code == 0xFDD0 || code == 0xFDD1 || code == 0xFFFC || code == 0x2028 ||
               code == 0x2029;
    }

    void entity() {
        const QStringView rest = html_.sliced(at_, std::min<qsizetype>(32, html_.size() - at_));
        const qsizetype end = rest.indexOf(u';');
        const QStringView name = end > 0 ? rest.first(end) : QStringView();
        const bool number = name.startsWith(u'#');
        const bool hexadecimal = number && name.size() > 2 && name[1].toLower() == u'x';
        bool known = std::all_of(name.begin() + (number ? 1 : 0), name.end(),
                                 [](QChar unit) { return unit.isLetterOrNumber(); }) &&
                     !name.isEmpty();
        if (known && number) {
            const uint code =
                name.sliced(hexadecimal ? 2 : 1).toUInt(&known, hexadecimal ? 16 : 10);
            if (known && (isStructural(code) || code < 0x20 || code > 0x10FFFF)) {
                out_ += QChar(QChar::ReplacementCharacter);
                at_ += end + 1;
                return;
            }
        }
        if (known) {
            out_ += u'&' + name.toString() + u';';
            at_ += end + 1;
        } else {
            out_ += QStringLiteral("&amp;");
        }
        ++word_;
        breakLongWord(u';');
    }

    void markup() {
        if (html_.sliced(at_).startsWith(QLatin1StringView("<!--"))) {
            skipBehind(u"-->", at_ + 4);
        } else if (charAt(at_ + 1) == u'!' || charAt(at_ + 1) == u'?') {
            skipBehind(u">", at_);
        } else if (charAt(at_ + 1) == u'/' && charAt(at_ + 2).isLetter()) {
            at_ += 2;
            const QString name = tagName();
            skipBehind(u">", at_);
            close(name);
        } else if (charAt(at_ + 1).isLetter()) {
            ++at_;
            const QString name = tagName();
            const std::vector<Attribute> attributes = readAttributes();
            if (const HtmlElement* const element = htmlElement(name))
                open(*element, name, attributes);
        } else {
            out_ += QStringLiteral("&lt;");
            ++at_;
        }
    }

    void skipBehind(QStringView end, qsizetype from) {
        const qsizetype found = html_.indexOf(end, from);
        at_ = found < 0 ? html_.size() : found + end.size();
    }

    QString tagName() {
        const qsizetype from = at_;
        while (at_ < html_.size() && (html_[at_].isLetterOrNumber() || html_[at_] == u'-'))
            ++at_;
        return html_.sliced(from, at_ - from).toString().toLower();
    }

    /// Up to and behind the tag's end.
    std::vector<Attribute> readAttributes() {
        std::vector<Attribute> out;
        while (at_ < html_.size() && html_[at_] != u'>') {
            if (html_[at_].isSpace() || html_[at_] == u'/') {
                ++at_;
                continue;
            }
            const qsizetype from = at_;
            while (at_ < html_.size() && html_[at_] != u'=' && html_[at_] != u'>' &&
                   html_[at_] != u'/' && !html_[at_].isSpace())
                ++at_;
            Attribute attribute{html_.sliced(from, at_ - from).toString().toLower(), {}};
            while (charAt(at_).isSpace())
                ++at_;
            if (charAt(at_) == u'=') {
                ++at_;
                attribute.value = attributeValue();
            }
            out.push_back(std::move(attribute));
        }
        at_ = std::min(at_ + 1, html_.size());
        return out;
    }

    QString attributeValue() {
        while (charAt(at_).isSpace())
            ++at_;
        const QChar quote = charAt(at_);
        const bool quoted = quote == u'"' || quote == u'\'';
        const qsizetype from = quoted ? ++at_ : at_;
        if (quoted) {
            const qsizetype end = html_.indexOf(quote, from);
            at_ = end < 0 ? html_.size() : end;
        } else {
            while (at_ < html_.size() && html_[at_] != u'>' && !html_[at_].isSpace())
                ++at_;
        }
        QString value = html_.sliced(from, at_ - from).toString();
        if (quoted)
            at_ = std::min(at_ + 1, html_.size());
        return value.replace(QStringLiteral("&amp;"), QStringLiteral("&"));
    }

    static QString valueOf(const std::vector<Attribute>& attributes, QStringView name) {
        for (const Attribute& each : attributes)
            if (each.name == name)
                return each.value;
        return {};
    }

    void open(const HtmlElement& element, const QString& name,
              const std::vector<Attribute>& attributes) {
        ++elements_;
        if (element.role != HtmlRole::text)
            word_ = 0;
        switch (element.role) {
        case HtmlRole::dropped:
            dropContent(name);
            return;
        case HtmlRole::alone:
            alone(element, attributes);
            return;
        case HtmlRole::table:
            endParagraph();
            openTable(element);
            return;
        case HtmlRole::row:
            openRow();
            return;
        case HtmlRole::cell:
            openCell(element, attributes);
            return;
        case HtmlRole::item:
            endItem();
            break;
        case HtmlRole::block:
            endParagraph();
            break;
        case HtmlRole::text:
            break;
        }
        const QString more = textAttributes(element, attributes);
        if (element.name == "pre" && tables_.empty()) {
            cells_ += cellsForATable;
            push(element, boxStart + element.written, element.written + boxEnd);
        } else if (element.name == "a" && !more.contains(QStringLiteral(" href=")))
            push(element, QStringLiteral("span") + more, QStringLiteral("span"));
        else
            push(element, element.written + more, element.written);
    }

    /// To its end; without one, everything that follows.
    void dropContent(const QString& name) {
        const qsizetype end = html_.indexOf(QStringLiteral("</") + name, at_, Qt::CaseInsensitive);
        at_ = end < 0 ? html_.size() : end;
        if (end >= 0)
            skipBehind(u">", at_);
    }

    /// `tag`: its name with attributes; `end`: what is written for its end. Too deep, and only what
    /// is in it is written.
    void push(const HtmlElement& element, const QString& tag, const QString& end) {
        if (open_.size() >= deepest)
            return;
        out_ += u'<' + tag + u'>';
        open_.push_back({&element, end});
    }

    void alone(const HtmlElement& element, const std::vector<Attribute>& attributes) {
        if (element.name == "img")
            picture(attributes);
        else
            out_ += u'<' + element.written + u'>';
    }

    void picture(const std::vector<Attribute>& attributes) {
        const QString address = valueOf(attributes, u"src");
        const auto found = pictures_ ? pictures_(address) : std::nullopt;
        if (!found) {
            const QString words = valueOf(attributes, u"alt").left(longestAddress);
            if (!words.isEmpty())
                out_ += QStringLiteral("<i>[%1]</i>").arg(words.toHtmlEscaped());
            return;
        }
        QSize size = found->size;
        const int wanted = valueOf(attributes, u"width").toInt();
        if (wanted > 0 && wanted < size.width())
            size = size.scaled(wanted, size.height(), Qt::KeepAspectRatio);
        out_ += QStringLiteral("<img src=\"%1\" width=\"%2\" height=\"%3\">")
                    .arg(found->name)
                    .arg(std::max(1, size.width()))
                    .arg(std::max(1, size.height()));
    }

    QString textAttributes(const HtmlElement& element, const std::vector<Attribute>& attributes) {
        QString out;
        for (const Attribute& each : attributes) {
            const QString value = each.value.left(longestAddress).trimmed();
            const bool anchor = each.name == u"id" || (each.name == u"name" && element.name == "a");
            if (each.name == u"href" && element.name == "a" &&
                (isOpenableAddress(value) || value.startsWith(u'#')))
                out += QStringLiteral(" href=\"%1\"").arg(value.toHtmlEscaped());
            else if (anchor && !value.isEmpty())
                out += QStringLiteral(" id=\"%1\"").arg(value.toHtmlEscaped());
            else if (each.name == u"start" && element.name == "ol")
                out += QStringLiteral(" start=\"%1\"").arg(std::clamp(value.toInt(), 0, 1'000'000));
            else if (each.name == u"class" && element.name == "li" &&
                     (value == u"checked" || value == u"unchecked"))
                out += QStringLiteral(" class=\"%1\"").arg(value);
            else if (isOneOf(each.name, value))
                out += QStringLiteral(" %1=\"%2\"").arg(each.name, value.toLower());
        }
        return out;
    }

    static bool isOneOf(const QString& name, const QString& value) {
        static const QStringList sides{QStringLiteral("left"), QStringLiteral("right"),
                                       QStringLiteral("center"), QStringLiteral("justify")};
        static const QStringList ways{QStringLiteral("rtl"), QStringLiteral("ltr")};
        return (name == u"align" && sides.contains(value, Qt::CaseInsensitive)) ||
               (name == u"dir" && ways.contains(value, Qt::CaseInsensitive));
    }

    /// The number of elements that are open around the innermost one of these roles (or names);
    /// none when there is none within `limit`.
    std::optional<std::size_t> innermost(HtmlRole role, HtmlRole limit) const {
        for (std::size_t i = open_.size(); i-- > 0;) {
            if (open_[i].element->role == role)
                return i;
            if (open_[i].element->role == limit)
                return std::nullopt;
        }
        return std::nullopt;
    }

    void closeTo(std::size_t count) {
        while (open_.size() > count) {
            const Open& last = open_.back();
            if (last.element->role == HtmlRole::table)
                endTable();
            out_ += QStringLiteral("</%1>").arg(last.written);
            open_.pop_back();
        }
        word_ = 0;
    }

    void close(const QString& name) {
        const HtmlElement* const element = htmlElement(name);
        if (!element)
            return;
        for (std::size_t i = open_.size(); i-- > 0;) {
            if (open_[i].element == element) {
                closeTo(i);
                return;
            }
            // A stray end of a text's element does not end the table around it.
            if (open_[i].element->role == HtmlRole::cell && element->role < HtmlRole::table)
                return;
        }
    }

    /// A paragraph ends where another block begins.
    void endParagraph() {
        for (std::size_t i = open_.size(); i-- > 0;) {
            if (open_[i].element->name == "p") {
                closeTo(i);
                return;
            }
            if (open_[i].element->role != HtmlRole::text)
                return;
        }
    }

    /// An item of a list ends where the next begins.
    void endItem() {
        for (std::size_t i = open_.size(); i-- > 0;) {
            if (open_[i].element->role == HtmlRole::item) {
                closeTo(i);
                return;
            }
            if (open_[i].element->isList() || open_[i].element->role == HtmlRole::cell)
                return;
        }
    }

    void openTable(const HtmlElement& element) {
        if (open_.size() + 3 >= deepest || static_cast<int>(tables_.size()) >= deepestTable)
            return;
        push(
            element,
            QStringLiteral("table class=\"grid\" border=\"1\" cellspacing=\"0\" cellpadding=\"6\""),
            element.written);
        tables_.emplace_back();
    }

    /// Of the innermost table, in cells.
    int costOf(const Table& table) const {
        const int times = 1 << (2 * (static_cast<int>(tables_.size()) - 1));
        return times * (cellsForATable + table.rows * table.columns);
    }

    void endTable() {
        cells_ += costOf(tables_.back());
        tables_.pop_back();
    }

    bool inTable() const { return innermost(HtmlRole::table, HtmlRole::dropped).has_value(); }

    void openRow() {
        if (!inTable())
            return;
        if (const auto row = innermost(HtmlRole::row, HtmlRole::table))
            closeTo(*row);
        else
            closeTo(*innermost(HtmlRole::table, HtmlRole::dropped) + 1);
        ++tables_.back().rows;
        tables_.back().columnsOfRow = 0;
        push(*htmlElement(QStringLiteral("tr")), QStringLiteral("tr"), QStringLiteral("tr"));
    }

    void openCell(const HtmlElement& element, const std::vector<Attribute>& attributes) {
        if (!inTable())
            return;
        if (!innermost(HtmlRole::row, HtmlRole::table))
            openRow();
        Table& table = tables_.back();
        const int span = std::clamp(valueOf(attributes, u"colspan").toInt(), 1, mostColumns);
        if (table.columnsOfRow + span > mostColumns) {
            out_ += u' '; // its text goes on in the last cell
            return;
        }
        if (const auto row = innermost(HtmlRole::row, HtmlRole::table))
            closeTo(*row + 1);
        table.columnsOfRow += span;
        table.columns = std::max(table.columns, table.columnsOfRow);
        QString tag = element.written + textAttributes(element, attributes);
        if (span > 1)
            tag += QStringLiteral(" colspan=\"%1\"").arg(span);
        push(element, tag, element.written);
        if (costOf(table) > mostCells)
            cells_ = mostCells + 1;
    }

    const QStringView html_;
    const InlinePictures& pictures_;
    qsizetype at_ = 0;
    QString out_;
    std::vector<Open> open_;
    std::vector<Table> tables_;
    int elements_ = 0;
    int cells_ = 0;
    /// Letters since a line could be broken.
    int word_ = 0;
};

} // namespace

std::optional<QString> cleanHtml(QStringView html, const InlinePictures& pictures) {
    return Cleaner(html, pictures).run();
}

bool isOpenableAddress(const QString& address) {
    const QUrl url(address, QUrl::StrictMode);
    const QString scheme = url.scheme().toLower();
    return url.isValid() && ((scheme == u"mailto" && !url.path().isEmpty()) ||
                             ((scheme == u"http" || scheme == u"https") && !url.host().isEmpty()));
}

} // namespace platform
