#include "platform/launch/DocumentClipboard.h"

#include "platform/ui/qt/Bridge.h"

#include <QByteArray>
#include <QClipboard>
#include <QGuiApplication>
#include <QList>
#include <QMimeData>
#include <QUrl>

namespace platform {

void copyDocument(const Url& document) {
    const QByteArray address = QByteArray::fromStdString(document.absoluteString());
    auto* const data = new QMimeData; // the clipboard owns it
    data->setUrls({QUrl::fromEncoded(address)});
    data->setText(toQt(document.path()));
    // File managers tell a copy from a move by this one.
    data->setData(QStringLiteral("x-special/gnome-copied-files"), "copy\n" + address);
    QGuiApplication::clipboard()->setMimeData(data);
}

void copyText(const std::string& text) {
    QGuiApplication::clipboard()->setText(toQt(text));
}

} // namespace platform
