#include "platform/base/DateFormat.h"

#include "platform/base/Text.h"

#include <QDateTime>
#include <QLocale>
#include <QRegularExpression>

namespace platform {
namespace {

QDateTime localTime(Date date) {
    return QDateTime::fromMSecsSinceEpoch(date.nanoseconds / 1'000'000);
}

/// The locale's long pattern without the weekday; `month` is how its month is written.
QString patternWithoutWeekday(const QLocale& locale, const QString& month) {
    QString pattern = locale.dateFormat(QLocale::LongFormat);
    static const QRegularExpression weekday(QStringLiteral("dddd\\s*[,،]?\\s*"));
    pattern.remove(weekday);
    return pattern.replace(QStringLiteral("MMMM"), month).trimmed();
}

QString dayText(const QDateTime& moment, DateStyle style) {
    const QLocale locale;
    switch (style) {
    case DateStyle::none:
        return {};
    case DateStyle::shortStyle:
        return locale.toString(moment.date(), QLocale::ShortFormat);
    case DateStyle::medium:
        return locale.toString(moment.date(), patternWithoutWeekday(locale, QStringLiteral("MMM")));
    case DateStyle::longStyle:
        return locale.toString(moment.date(),
                               patternWithoutWeekday(locale, QStringLiteral("MMMM")));
    case DateStyle::full:
        return locale.toString(moment.date(), QLocale::LongFormat);
    }
    return {};
}

} // namespace

std::string localizedDayText(Date date, DateStyle style) {
    return dayText(localTime(date), style).toStdString();
}

std::string localizedDateText(Date date, DateStyle style) {
    const QDateTime moment = localTime(date);
    const QString time = QLocale().toString(moment.time(), QLocale::ShortFormat);
    if (style == DateStyle::none)
        return time.toStdString();
    return localizedFormat("%1$@, %2$@", dayText(moment, style).toStdString(), time.toStdString());
}

} // namespace platform
