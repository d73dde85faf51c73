#include "platform/ui/qt/DesktopSettings.h"

#include <QDBusConnection>
#include <QDBusMessage>
#include <QDBusPendingCallWatcher>
#include <QDBusVariant>
#include <QFileInfo>
#include <QGuiApplication>

#include <iterator>
#include <memory>

namespace platform {
namespace {

/// A longer wait means a portal that hangs; nobody waits for it anyway.
constexpr int portalTimeoutMs = 5000;

struct Question {
    const char* group;
    const char* key;
    DesktopSettings (*read)(const QVariant& value);
};

const Question questions[] = {
    {"org.freedesktop.appearance", "reduced-motion",
     [](const QVariant& value) {
         return DesktopSettings{value.toUInt() == 1, {}};
     }},
    {"org.gnome.desktop.interface", "enable-animations",
     [](const QVariant& value) {
         return DesktopSettings{!value.toBool(), {}};
     }},
    {"org.kde.kdeglobals.KDE", "AnimationDurationFactor",
     [](const QVariant& value) {
         return DesktopSettings{value.toDouble() == 0, {}};
     }},
    {"org.gnome.desktop.interface", "text-scaling-factor",
     [](const QVariant& value) {
         return DesktopSettings{{}, value.toDouble()};
     }},
};

/// The answers of one round, which come one by one.
struct Round {
    std::function<void(const DesktopSettings&)> answer;
    DesktopSettings all;
    std::size_t waiting = std::size(questions);

    void take(const DesktopSettings& one) {
        // Desktops ask for less motion in different words; one of them is enough.
        if (one.reducesMotion)
            all.reducesMotion = *one.reducesMotion || all.reducesMotion.value_or(false);
        if (one.textScale)
            all.textScale = one.textScale;
    }
    void oneCame() {
        if (--waiting == 0)
            answer(all);
    }
};

/// Without an address libdbus would try to start a bus of its own.
bool hasSessionBus() {
    return qEnvironmentVariableIsSet("DBUS_SESSION_BUS_ADDRESS") ||
           QFileInfo::exists(qEnvironmentVariable("XDG_RUNTIME_DIR") + QLatin1String("/bus"));
}

/// Portals wrap the value in one variant or in two, by version.
QVariant unwrapped(QVariant value) {
    while (value.canConvert<QDBusVariant>())
        value = value.value<QDBusVariant>().variant();
    return value;
}

} // namespace

void askDesktopSettings(QObject& context, std::function<void(const DesktopSettings&)> answer) {
    if (!hasSessionBus() || QGuiApplication::platformName() == QLatin1String("offscreen"))
        return;
    const QDBusConnection bus = QDBusConnection::sessionBus();
    if (!bus.isConnected())
        return;
    const auto round = std::make_shared<Round>();
    round->answer = std::move(answer);
    for (const Question& question : questions) {
        QDBusMessage call = QDBusMessage::createMethodCall(
            QStringLiteral("org.freedesktop.portal.Desktop"),
            QStringLiteral("/org/freedesktop/portal/desktop"),
            QStringLiteral("org.freedesktop.portal.Settings"), QStringLiteral("Read"));
        call << QString::fromLatin1(question.group) << QString::fromLatin1(question.key);
        auto* const watcher =
            new QDBusPendingCallWatcher(bus.asyncCall(call, portalTimeoutMs), &context);
        QObject::connect(watcher, &QDBusPendingCallWatcher::finished, &context,
                         [round, read = question.read](QDBusPendingCallWatcher* done) {
                             const QDBusMessage reply = done->reply();
                             done->deleteLater();
                             if (reply.type() == QDBusMessage::ReplyMessage &&
                                 !reply.arguments().isEmpty())
                                 round->take(read(unwrapped(reply.arguments().constFirst())));
                             round->oneCame();
                         });
    }
}

} // namespace platform
