#include "platform/launch/DocumentIcons.h"

#include "platform/launch/IconDrawing.h"
#include "platform/launch/TypeRegistry.h"
#include "platform/ui/qt/Bridge.h"

#include <QCoreApplication>
#include <QDir>
#include <QGuiApplication>
#include <QIcon>
#include <QMimeDatabase>
#include <QPixmap>
#include <QStandardPaths>
#include <QTextBoundaryFinder>

#include <algorithm>
#include <cmath>
#include <functional>
#include <map>
#include <optional>

namespace platform {
namespace {

constexpr auto fallbackTheme = "breeze";
/// Themes draw their small sizes as outlines in one colour, which say little among documents: up to
/// here a size is asked for as it is, above it the next larger drawing is scaled down.
constexpr int largestPlainSize = 32;
constexpr int fullDrawingSize = 64;
constexpr std::size_t mostIcons = 512;
/// Characters that a page has room for; a type that prefers more is told by a shorter extension.
constexpr qsizetype longestLabel = 5;

/// Where no desktop told the toolkit of its icons, the places that every desktop uses.
void findThemes() {
    static bool done = false;
    if (std::exchange(done, true))
        return;
    QStringList paths = QIcon::themeSearchPaths();
    for (const QString& folder :
         QStandardPaths::standardLocations(QStandardPaths::GenericDataLocation))
        if (const QString icons = folder + QStringLiteral("/icons");
            QDir(icons).exists() && !paths.contains(icons))
            paths.append(icons);
    QIcon::setThemeSearchPaths(paths);
    QIcon::setFallbackThemeName(QLatin1String(fallbackTheme));
    if (QIcon::themeName().isEmpty())
        QIcon::setThemeName(QLatin1String(fallbackTheme));
}

QImage themeIcon(const QString& name, int pixels) {
    findThemes();
    if (name.isEmpty() || !QIcon::hasThemeIcon(name))
        return {};
    const int asked = pixels <= largestPlainSize ? pixels : std::max(pixels, fullDrawingSize);
    QImage image = QIcon::fromTheme(name).pixmap(QSize(asked, asked), 1.0).toImage();
    if (image.isNull() || image.width() == pixels)
        return image;
    return image.scaled(pixels, pixels, Qt::KeepAspectRatio, Qt::SmoothTransformation);
}

/// The extension that people know the type by; "" for none.
QString extensionOf(std::string_view typeIdentifier) {
    constexpr std::string_view unknown = "dyn.";
    if (typeIdentifier.starts_with(unknown))
        return toQt(typeIdentifier.substr(unknown.size()));
    const std::string mime = TypeRegistry::mimeTypeForIdentifier(typeIdentifier);
    if (mime == "application/octet-stream")
        return {};
    const QMimeType known = QMimeDatabase().mimeTypeForName(toQt(mime));
    const QString preferred = known.preferredSuffix();
    if (preferred.size() <= longestLabel)
        return preferred;
    const QStringList all = known.suffixes();
    return *std::ranges::min_element(all, {}, [](const QString& each) { return each.size(); });
}

QImage drawType(std::string_view typeIdentifier, int pixels) {
    // What a theme draws for a type that nobody knows says less than its extension.
    if (!typeIdentifier.starts_with("dyn."))
        for (const std::string& name : TypeRegistry::iconNames(typeIdentifier))
            if (QImage image = themeIcon(toQt(name), pixels); !image.isNull())
                return image;
    return drawPage(extensionOf(typeIdentifier), pixels);
}

/// A whole character as people see it, with its accents.
QString firstLetter(std::string_view name) {
    const QString text = toQt(name).trimmed();
    QTextBoundaryFinder finder(QTextBoundaryFinder::Grapheme, text);
    const qsizetype end = finder.toNextBoundary();
    return end <= 0 ? QString() : text.left(end).toUpper();
}

/// Icons by what they show, at a size in pixels. Small: a few types are in use at a time.
Image cached(const std::string& key, double points, const std::function<QImage(int)>& draw) {
    static std::map<std::string, Image> icons;
    const double scale = qGuiApp ? qGuiApp->devicePixelRatio() : 1;
    const int pixels = std::max(1, static_cast<int>(std::lround(points * scale)));
    const std::string whole =
        key + '\n' + std::to_string(pixels) + '\n' + QIcon::themeName().toStdString();
    if (icons.size() > mostIcons)
        icons.clear(); // a folder full of extensions that nobody knows
    Image& icon = icons[whole];
    if (icon.empty())
        icon = imageOf(draw(pixels), scale);
    return icon;
}

} // namespace

Image DocumentIcons::forType(std::string_view typeIdentifier, double points) {
    return cached("type " + std::string(typeIdentifier), points,
                  [&](int pixels) { return drawType(typeIdentifier, pixels); });
}

Image DocumentIcons::folder(double points) {
    return cached("folder", points, [](int pixels) {
        const QImage image = themeIcon(QStringLiteral("folder"), pixels);
        return image.isNull() ? drawFolder(pixels) : image;
    });
}

Image DocumentIcons::container(std::string_view identifier, std::string_view localizedName,
                               double points) {
    const QString letter = firstLetter(localizedName);
    return cached("container " + std::string(identifier) + '\n' + letter.toStdString(), points,
                  [&](int pixels) { return drawLetterTile(identifier, letter, pixels); });
}

} // namespace platform
