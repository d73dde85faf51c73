#include "platform/ui/qt/RestorationFile.h"

#include "platform/base/Error.h"
#include "platform/base/Log.h"
#include "platform/ui/qt/Bridge.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QSaveFile>

namespace platform {
namespace {

// JSON has no word for these kinds; an object with one of the keys stands for them.
constexpr QLatin1String bytesKey("bytes");
constexpr QLatin1String dateKey("date");
constexpr QLatin1String urlKey("url");
constexpr QLatin1String mapKey("map");

/// No state is a hundredth of that; a longer file is not ours.
constexpr qint64 sizeLimit = 1024 * 1024;

QJsonObject toJson(const Value::Map& map);

QJsonValue toJson(const Value& value) {
    if (const auto flag = value.boolean())
        return *flag;
    if (value.isNumber()) {
        const double number = *value.number();
        const auto whole = value.integer();
        return whole && static_cast<double>(*whole) == number ? QJsonValue(qint64(*whole))
                                                              : QJsonValue(number);
    }
    if (const auto* const text = value.text())
        return toQt(*text);
    if (const auto* const bytes = value.bytes()) {
        const auto raw = QByteArray::fromRawData(reinterpret_cast<const char*>(bytes->data()),
                                                 static_cast<qsizetype>(bytes->size()));
        return QJsonObject{{bytesKey, QString::fromLatin1(raw.toBase64())}};
    }
    if (const auto date = value.date())
        return QJsonObject{{dateKey, qint64(date->nanoseconds)}};
    if (const auto* const url = value.url())
        return QJsonObject{{urlKey, toQt(url->absoluteString())}};
    if (const auto* const list = value.list()) {
        QJsonArray array;
        for (const Value& each : *list)
            array.append(toJson(each));
        return array;
    }
    if (const auto* const map = value.map())
        return QJsonObject{{mapKey, toJson(*map)}};
    return QJsonValue::Null;
}

QJsonObject toJson(const Value::Map& map) {
    QJsonObject object;
    for (const auto& [key, value] : map)
        object.insert(toQt(key), toJson(value));
    return object;
}

Value::Map mapOf(const QJsonObject& object);

Value valueOf(const QJsonObject& tagged) {
    if (tagged.contains(bytesKey)) {
        const QByteArray raw = QByteArray::fromBase64(tagged[bytesKey].toString().toLatin1());
        const auto* const first = reinterpret_cast<const std::byte*>(raw.constData());
        return Bytes(first, first + raw.size());
    }
    if (tagged.contains(dateKey))
        return Date{tagged[dateKey].toInteger()};
    if (tagged.contains(urlKey)) {
        const auto url = Url::parse(fromQt(tagged[urlKey].toString()));
        return url ? Value(*url) : Value();
    }
    return mapOf(tagged[mapKey].toObject());
}

Value valueOf(const QJsonValue& json) {
    switch (json.type()) {
    case QJsonValue::Bool:
        return json.toBool();
    case QJsonValue::Double: {
        const double number = json.toDouble();
        const qint64 whole = json.toInteger();
        return static_cast<double>(whole) == number ? Value(std::int64_t(whole)) : Value(number);
    }
    case QJsonValue::String:
        return fromQt(json.toString());
    case QJsonValue::Array: {
        Value::List list;
        for (const auto& each : json.toArray())
            list.push_back(valueOf(QJsonValue(each)));
        return list;
    }
    case QJsonValue::Object:
        return valueOf(json.toObject());
    default:
        return {};
    }
}

Value::Map mapOf(const QJsonObject& object) {
    Value::Map map;
    for (auto each = object.begin(); each != object.end(); ++each)
        map.emplace(fromQt(each.key()), valueOf(QJsonValue(each.value())));
    return map;
}

} // namespace

Failure writeRestorationFile(const std::string& path, const Value::Map& values) {
    const QString name = QFile::decodeName(path.c_str());
    QDir().mkpath(QFileInfo(name).path());
    QSaveFile file(name);
    if (file.open(QIODevice::WriteOnly)) {
        file.setPermissions(QFile::ReadOwner | QFile::WriteOwner);
        file.write(QJsonDocument(toJson(values)).toJson(QJsonDocument::Compact));
        if (file.commit())
            return std::nullopt;
    }
    return makeErrorWithText(ErrorCode::unknownIo, fromQt(file.errorString()));
}

Value::Map readRestorationFile(const std::string& path) {
    QFile file(QFile::decodeName(path.c_str()));
    if (!file.open(QIODevice::ReadOnly))
        return {};
    QJsonParseError error{};
    const QJsonDocument document = QJsonDocument::fromJson(file.read(sizeLimit), &error);
    if (!document.isObject())
        platformLog(LogLevel::warning, "The saved state of the screens is damaged: %@",
                    error.error == QJsonParseError::NoError ? "it is no object"
                                                            : fromQt(error.errorString()));
    return mapOf(document.object());
}

} // namespace platform
