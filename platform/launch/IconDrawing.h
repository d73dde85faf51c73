#pragma once

#include "platform/ui/Image.h"

#include <QImage>
#include <QString>

#include <string_view>

namespace platform {

/// A page with a folded corner and a coloured band that bears the extension (a plain page for "").
QImage drawPage(const QString& extension, int pixels);
QImage drawFolder(int pixels);
/// A rounded square in the identifier's colour with the letter on it.
QImage drawLetterTile(std::string_view identifier, const QString& letter, int pixels);

} // namespace platform
