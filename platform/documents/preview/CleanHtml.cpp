#include "platform/documents/preview/CleanHtml.h"

#include "platform/documents/preview/HtmlAttributes.h"
#include "platform/documents/preview/HtmlElements.h"
#include "platform/documents/preview/HtmlScanner.h"
#include "platform/documents/preview/HtmlText.h"

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

/// A text that is written as it stands gets a ground of its own.
const QString boxStart = QStringLiteral("table class=\"code\" border=\"0\" cellspacing=\"0\" "
                                        "cellpadding=\"10\" width=\"100%\"><tr><td><");
const QString boxEnd = QStringLiteral("></td></tr></table");

class Cleaner {
public:
    Cleaner(QStringView html, const InlinePictures& pictures)
        : length_(html.size()), in_(html), pictures_(pictures) {}

    std::optional<QString> run() {
        out_.reserve(length_);
        while (!in_.isAtEnd() && elements_ <= mostElements && cells_ <= mostCells)
            in_.isAtMarkup() ? markup() : text_.take();
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

    void markup() {
        const HtmlMarkup markup = in_.takeMarkup();
        if (markup.kind == HtmlMarkup::Kind::sign)
            out_ += QStringLiteral("&lt;");
        const HtmlElement* const element = htmlElement(markup.name);
        if (element && markup.kind == HtmlMarkup::Kind::begin)
            open(*element, markup);
        else if (element && markup.kind == HtmlMarkup::Kind::end)
            close(*element);
    }

    void open(const HtmlElement& element, const HtmlMarkup& markup) {
        ++elements_;
        if (element.role != HtmlRole::text)
            text_.endWord();
        switch (element.role) {
        case HtmlRole::dropped:
            in_.skipContent(markup.name);
            return;
        case HtmlRole::alone:
            alone(element, markup);
            return;
        case HtmlRole::table:
            endParagraph();
            openTable(element);
            return;
        case HtmlRole::row:
            openRow();
            return;
        case HtmlRole::cell:
            openCell(element, markup);
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
        const QString more = keptAttributes(element, markup);
        if (element.name == "pre" && tables_.empty()) {
            cells_ += cellsForATable;
            push(element, boxStart + element.written, element.written + boxEnd);
        } else if (element.name == "a" && !more.contains(QStringLiteral(" href=")))
            push(element, QStringLiteral("span") + more, QStringLiteral("span"));
        else
            push(element, element.written + more, element.written);
    }

    /// `tag`: its name with attributes; `end`: what is written for its end. Too deep, and only what
    /// is in it is written.
    void push(const HtmlElement& element, const QString& tag, const QString& end) {
        if (open_.size() >= deepest)
            return;
        out_ += u'<' + tag + u'>';
        open_.push_back({&element, end});
    }

    void alone(const HtmlElement& element, const HtmlMarkup& markup) {
        if (element.name == "img")
            picture(markup);
        else
            out_ += u'<' + element.written + u'>';
    }

    void picture(const HtmlMarkup& markup) {
        const QString address = markup.valueOf(u"src");
        const auto found = pictures_ ? pictures_(address) : std::nullopt;
        if (!found) {
            const QString words = markup.valueOf(u"alt").left(longestHtmlValue);
            if (!words.isEmpty())
                out_ += QStringLiteral("<i>[%1]</i>").arg(words.toHtmlEscaped());
            return;
        }
        QSize size = found->size;
        const int wanted = markup.valueOf(u"width").toInt();
        if (wanted > 0 && wanted < size.width())
            size = size.scaled(wanted, size.height(), Qt::KeepAspectRatio);
        out_ += QStringLiteral("<img src=\"%1\" width=\"%2\" height=\"%3\">")
                    .arg(found->name)
                    .arg(std::max(1, size.width()))
                    .arg(std::max(1, size.height()));
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
        text_.endWord();
    }

    void close(const HtmlElement& element) {
        for (std::size_t i = open_.size(); i-- > 0;) {
            if (open_[i].element == &element) {
                closeTo(i);
                return;
            }
            // A stray end of a text's element does not end the table around it.
            if (open_[i].element->role == HtmlRole::cell && element.role < HtmlRole::table)
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

    void openCell(const HtmlElement& element, const HtmlMarkup& markup) {
        if (!inTable())
            return;
        if (!innermost(HtmlRole::row, HtmlRole::table))
            openRow();
        Table& table = tables_.back();
        const int span = std::clamp(markup.valueOf(u"colspan").toInt(), 1, mostColumns);
        if (table.columnsOfRow + span > mostColumns) {
            out_ += u' '; // its text goes on in the last cell
            return;
        }
        if (const auto row = innermost(HtmlRole::row, HtmlRole::table))
            closeTo(*row + 1);
        table.columnsOfRow += span;
        table.columns = std::max(table.columns, table.columnsOfRow);
        QString tag = element.written + keptAttributes(element, markup);
        if (span > 1)
            tag += QStringLiteral(" colspan=\"%1\"").arg(span);
        push(element, tag, element.written);
        if (costOf(table) > mostCells)
            cells_ = mostCells + 1;
    }

    const qsizetype length_;
    HtmlScanner in_;
    const InlinePictures& pictures_;
    QString out_;
    HtmlText text_{in_, out_};
    std::vector<Open> open_;
    std::vector<Table> tables_;
    int elements_ = 0;
    int cells_ = 0;
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
