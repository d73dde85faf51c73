#include "platform/documents/preview/HtmlAttributes.h"

#include "platform/documents/preview/CleanHtml.h"

#include <QStringList>

#include <algorithm>

namespace platform {
namespace {

bool isOneOf(const QString& name, const QString& value) {
    static const QStringList sides{QStringLiteral("left"), QStringLiteral("right"),
                                   QStringLiteral("center"), QStringLiteral("justify")};
    static const QStringList ways{QStringLiteral("rtl"), QStringLiteral("ltr")};
    return (name == u"align" && sides.contains(value, Qt::CaseInsensitive)) ||
           (name == u"dir" && ways.contains(value, Qt::CaseInsensitive));
}

} // namespace

QString keptAttributes(const HtmlElement& element, const HtmlMarkup& markup) {
    QString out;
    for (const HtmlAttribute& each : markup.attributes) {
        const QString value = each.value.left(longestHtmlValue).trimmed();
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

} // namespace platform
