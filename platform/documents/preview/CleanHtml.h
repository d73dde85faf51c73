#pragma once

#include <QSize>
#include <QString>

#include <functional>
#include <optional>

namespace platform {

/// A picture that may be shown in a text, by the name that the text is to use for it.
struct InlinePicture {
    QString name;
    /// In points, as large as it is.
    QSize size;
};

/// Answers the picture at an address of the text; none when it is not to be shown.
using InlinePictures = std::function<std::optional<InlinePicture>(const QString& address)>;

/// The text and the structure of an HTML page, without all that could do something: scripts,
/// styles, forms, frames, pictures that `pictures` does not give, links to anything but the web,
/// mail and the page itself. Well formed and of bounded depth and width, whatever it was. None for
/// one that would take too much to lay out. Takes time in proportion to the length.
std::optional<QString> cleanHtml(QStringView html, const InlinePictures& pictures);

/// Whether a link may be followed: to the web, or to write a mail.
bool isOpenableAddress(const QString& address);

} // namespace platform
