#include "platform/documents/preview/HtmlScanner.h"

namespace platform {

QString HtmlMarkup::valueOf(QStringView attribute) const {
    for (const HtmlAttribute& each : attributes)
        if (each.name == attribute)
            return each.value;
    return {};
}

HtmlMarkup HtmlScanner::takeMarkup() {
    using Kind = HtmlMarkup::Kind;
    if (html_.sliced(at_).startsWith(QLatin1StringView("<!--"))) {
        skipBehind(u"-->", at_ + 4);
        return {Kind::nothing, {}};
    }
    if (charAt(at_ + 1) == u'!' || charAt(at_ + 1) == u'?') {
        skipBehind(u">", at_);
        return {Kind::nothing, {}};
    }
    if (charAt(at_ + 1) == u'/' && charAt(at_ + 2).isLetter()) {
        at_ += 2;
        QString name = takeName();
        skipBehind(u">", at_);
        return {Kind::end, std::move(name)};
    }
    ++at_;
    if (!charAt(at_).isLetter())
        return {Kind::sign, {}};
    QString name = takeName();
    return {Kind::begin, std::move(name), takeAttributes()};
}

void HtmlScanner::skipContent(const QString& name) {
    const qsizetype end = html_.indexOf(QStringLiteral("</") + name, at_, Qt::CaseInsensitive);
    at_ = end < 0 ? html_.size() : end;
    if (end >= 0)
        skipBehind(u">", at_);
}

void HtmlScanner::skipBehind(QStringView end, qsizetype from) {
    const qsizetype found = html_.indexOf(end, from);
    at_ = found < 0 ? html_.size() : found + end.size();
}

QString HtmlScanner::takeName() {
    const qsizetype from = at_;
    while (at_ < html_.size() && (html_[at_].isLetterOrNumber() || html_[at_] == u'-'))
        ++at_;
    return html_.sliced(from, at_ - from).toString().toLower();
}

/// Up to and behind the tag's end.
std::vector<HtmlAttribute> HtmlScanner::takeAttributes() {
    std::vector<HtmlAttribute> out;
    while (at_ < html_.size() && html_[at_] != u'>') {
        if (html_[at_].isSpace() || html_[at_] == u'/') {
            ++at_;
            continue;
        }
        const qsizetype from = at_;
        while (at_ < html_.size() && html_[at_] != u'=' && html_[at_] != u'>' &&
               html_[at_] != u'/' && !html_[at_].isSpace())
            ++at_;
        HtmlAttribute attribute{html_.sliced(from, at_ - from).toString().toLower(), {}};
        while (charAt(at_).isSpace())
            ++at_;
        if (charAt(at_) == u'=') {
            ++at_;
            attribute.value = takeValue();
        }
        out.push_back(std::move(attribute));
    }
    at_ = std::min(at_ + 1, html_.size());
    return out;
}

QString HtmlScanner::takeValue() {
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

} // namespace platform
