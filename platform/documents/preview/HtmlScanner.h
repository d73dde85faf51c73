#pragma once

#include <QString>
#include <QStringView>

#include <algorithm>
#include <vector>

namespace platform {

struct HtmlAttribute {
    /// In small letters.
    QString name;
    QString value;
};

/// What stands between < and >.
struct HtmlMarkup {
    enum class Kind {
        /// A comment or an instruction.
        nothing,
        /// No markup, but the sign itself.
        sign,
        begin,
        end
    };
    Kind kind = Kind::nothing;
    /// Of the element, in small letters.
    QString name;
    std::vector<HtmlAttribute> attributes = {};

    /// "" for none of that name.
    QString valueOf(QStringView attribute) const;
};

/// Reads HTML from its beginning to its end, whatever it is; the text must outlive it.
class HtmlScanner {
public:
    explicit HtmlScanner(QStringView html) : html_(html) {}

    bool isAtEnd() const { return at_ >= html_.size(); }
    bool isAtMarkup() const { return html_[at_] == u'<'; }
    /// Not at the end.
    QChar takeUnit() { return html_[at_++]; }
    /// So many of the units that come next; fewer at the end.
    QStringView ahead(qsizetype most) const {
        return html_.sliced(at_, std::min(most, html_.size() - at_));
    }
    void skip(qsizetype units) { at_ += units; }
    /// At markup; reads it to its end.
    HtmlMarkup takeMarkup();
    /// To and behind the end of the element; without one, everything that follows.
    void skipContent(const QString& name);

private:
    QChar charAt(qsizetype place) const { return place < html_.size() ? html_[place] : QChar(); }
    void skipBehind(QStringView end, qsizetype from);
    QString takeName();
    std::vector<HtmlAttribute> takeAttributes();
    QString takeValue();

    const QStringView html_;
    qsizetype at_ = 0;
};

} // namespace platform
