#include "platform/launch/TypeRegistry.h"

#include "platform/base/Text.h"
#include "platform/base/Url.h"
#include "platform/launch/TypeCache.h"
#include "platform/launch/TypeNameRules.h"
#include "platform/launch/TypeTable.h"

#include <QLocale>
#include <QMimeDatabase>
#include <QString>
#include <algorithm>
#include <array>
#include <cerrno>
#include <fcntl.h>
#include <map>
#include <set>
#include <sys/stat.h>
#include <unistd.h>

namespace platform {
namespace {

constexpr std::string_view systematicPrefix = "org.freedesktop.mime.";
constexpr std::string_view unknownPrefix = "dyn.";
constexpr std::string_view noMimeType = "application/octet-stream";
constexpr std::string_view archiveIcon = "package-x-generic";
/// As much of a file as the database's rules for contents look at.
constexpr std::size_t headSize = 16UL * 1024;

using Names = std::set<std::string, std::less<>>;
using Table = std::map<std::string_view, std::string_view>;

QString qtText(std::string_view text) {
    return QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size()));
}

const QMimeDatabase& database() {
    static const QMimeDatabase instance; // thread-safe by itself
    return instance;
}

const Table& identifiersByMimeType() {
    static const Table table = [] {
        Table out;
        for (const NamedType& type : namedTypes())
            out.emplace(type.mimeType, type.identifier);
        return out;
    }();
    return table;
}

const Table& mimeTypesByIdentifier() {
    static const Table table = [] {
        Table out;
        for (const NamedType& type : namedTypes())
            out.emplace(type.identifier, type.mimeType);
        for (const PackageType& type : packageTypes())
            out.emplace(type.identifier, "inode/directory");
        return out;
    }();
    return table;
}

std::optional<std::string_view> find(const Table& table, std::string_view key) {
    const auto found = table.find(key);
    return found == table.end() ? std::nullopt : std::optional(found->second);
}

/// The MIME type of an identifier; none for families, packages' own and unknown ones.
std::optional<std::string> knownMimeType(std::string_view identifier) {
    if (const auto named = find(mimeTypesByIdentifier(), identifier))
        return std::string(*named);
    if (!identifier.starts_with(systematicPrefix))
        return std::nullopt;
    std::string name(identifier.substr(systematicPrefix.size()));
    const std::size_t dot = name.find('.');
    if (dot == std::string::npos)
        return std::nullopt;
    name[dot] = '/';
    return name;
}

/// For a canonical MIME type.
std::string identifierOf(std::string_view mimeType) {
    if (const auto named = find(identifiersByMimeType(), mimeType))
        return std::string(*named);
    std::string out(systematicPrefix);
    out += mimeType;
    std::replace(out.begin() + static_cast<std::ptrdiff_t>(systematicPrefix.size()), out.end(), '/',
                 '.');
    return out;
}

const PackageType* packageOfName(std::string_view name) {
    const std::string extension = lowercase(pathExtensionOf(name));
    for (const PackageType& type : packageTypes())
        if (type.extension == extension)
            return &type;
    return nullptr;
}

/// The families that a MIME type belongs to by its own name and its generic icon.
void addFamilies(const std::string& name, const std::string& icon, Names& out) {
    constexpr std::array<std::array<std::string_view, 3>, 5> families = {{
        {"image/", "image-x-generic", types::image},
        {"video/", "video-x-generic", types::movie},
        {"audio/", "audio-x-generic", types::audio},
        {"text/", "text-x-generic", types::text},
        {"font/", "font-x-generic", "public.font"},
    }};
    for (const auto& [group, generic, family] : families)
        if (name.starts_with(group) || icon == generic)
            out.emplace(family);
    if (icon == archiveIcon)
        out.emplace(types::archive);
    if (icon.starts_with("x-office-"))
        out.emplace(types::compositeContent);
    // The database draws data written like a script with a script's icon.
    if (icon == "text-x-script" && !name.ends_with("json"))
        out.emplace("public.script");
    if (isSourceCodeMimeType(name))
        out.emplace(types::sourceCode);
    if (!name.starts_with("inode/"))
        out.emplace(types::data);
}

/// What the identifier conforms to directly.
Names parentsOf(const std::string& identifier) {
    Names out;
    for (const TypeParent& one : typeParents())
        if (one.identifier == identifier)
            out.emplace(one.parent);
    const bool placedByHand = !out.empty();
    if (identifier.starts_with(unknownPrefix))
        out.emplace(types::data);
    const std::optional<std::string> name = knownMimeType(identifier);
    if (!name || *name == "inode/directory")
        return out;
    const QMimeType type = database().mimeTypeForName(qtText(*name));
    const std::string icon = type.isValid() ? type.genericIconName().toStdString() : "";
    addFamilies(*name, icon, out);
    if (!type.isValid() || *name == noMimeType || placedByHand)
        return out;
    for (const QString& parent : type.parentMimeTypes()) {
        const QMimeType above = database().mimeTypeForName(parent);
        const bool packed =
            above.genericIconName().toStdString() == archiveIcon && icon != archiveIcon;
        if (!packed)
            out.insert(identifierOf(above.name().toStdString()));
    }
    out.erase(identifier);
    return out;
}

/// Everything that the identifier conforms to, itself included.
Names conformance(std::string_view identifier) {
    static TypeCache<Names> cache;
    return cache.get(identifier, [](const std::string& start) {
        Names all{start};
        std::vector<std::string> open{start};
        while (!open.empty()) {
            const Names parents = parentsOf(std::exchange(open.back(), {}));
            open.pop_back();
            for (const std::string& parent : parents)
                if (all.insert(parent).second)
                    open.push_back(parent);
        }
        return all;
    });
}

std::string unknownIdentifier(std::string_view extension) {
    return extension.empty() ? std::string(types::data)
                             : std::string(unknownPrefix) + lowercase(extension);
}

std::optional<std::string> askByName(std::string_view name) {
    const QList<QMimeType> found = database().mimeTypesForFileName(qtText(name));
    if (found.isEmpty())
        return std::nullopt;
    return identifierOf(found.front().name().toStdString());
}

/// The database's answer for a name; none when it knows no rule for it.
std::optional<std::string> identifierByName(std::string_view name) {
    static TypeCache<std::optional<std::string>> cache;
    if (const auto end = TypeNameRules::shared().decidingEnd(name))
        return cache.get(*end, [name](const std::string&) { return askByName(name); });
    return askByName(name);
}

/// The first bytes of a file; fewer when it is shorter, none when it cannot be read.
QByteArray headOf(const std::string& path) {
    const int file = ::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK);
    if (file < 0)
        return {};
    QByteArray head(headSize, Qt::Uninitialized);
    qsizetype length = 0;
    while (length < head.size()) {
        const ssize_t got =
            ::read(file, head.data() + length, headSize - static_cast<std::size_t>(length));
        if (got <= 0 && !(got < 0 && errno == EINTR))
            break;
        length += std::max<ssize_t>(got, 0);
    }
    ::close(file);
    head.truncate(length);
    return head;
}

} // namespace

std::optional<std::string>
TypeRegistry::preferredIdentifierForExtension(std::string_view extension) {
    if (extension.empty())
        return std::nullopt;
    static TypeCache<std::string> cache;
    return cache.get(lowercase(extension), [](const std::string& lower) {
        const std::string name = "name." + lower;
        if (const PackageType* package = packageOfName(name))
            return std::string(package->identifier);
        return identifierByName(name).value_or(unknownIdentifier(lower));
    });
}

std::string TypeRegistry::identifierForFileName(std::string_view name) {
    if (const PackageType* package = packageOfName(name))
        return std::string(package->identifier);
    if (const auto found = identifierByName(name))
        return *found;
    // The database's rules keep the case of some letters apart.
    const std::string_view extension = pathExtensionOf(name);
    return preferredIdentifierForExtension(extension).value_or(std::string(types::data));
}

std::string TypeRegistry::identifierForFile(std::string_view path) {
    const std::string terminated(path);
    const std::string_view name = path.substr(path.rfind('/') + 1);
    struct stat info {};
    if (::stat(terminated.c_str(), &info) != 0)
        return identifierForFileName(name);
    if (S_ISDIR(info.st_mode)) {
        const PackageType* package = packageOfName(name);
        return std::string(package ? package->identifier : types::folder);
    }
    const QList<QMimeType> byName = database().mimeTypesForFileName(qtText(name));
    if (byName.size() == 1 || !S_ISREG(info.st_mode))
        return identifierForFileName(name);
    const QMimeType found = database().mimeTypeForFileNameAndData(qtText(name), headOf(terminated));
    const std::string mime = found.name().toStdString();
    if (mime == noMimeType || mime == "application/x-zerosize")
        return unknownIdentifier(pathExtensionOf(name));
    return identifierOf(mime);
}

std::string TypeRegistry::identifierForMimeType(std::string_view mimeType) {
    std::string name = lowercase(mimeType.substr(0, mimeType.find(';')));
    while (name.ends_with(' '))
        name.pop_back();
    const std::size_t slash = name.find('/');
    if (slash == 0 || slash == std::string::npos || slash + 1 == name.size())
        return std::string(types::data);
    const QMimeType known = database().mimeTypeForName(qtText(name)); // follows aliases
    return identifierOf(known.isValid() ? known.name().toStdString() : name);
}

std::string TypeRegistry::mimeTypeForIdentifier(std::string_view identifier) {
    return knownMimeType(lowercase(identifier)).value_or(std::string(noMimeType));
}

bool TypeRegistry::conformsTo(std::string_view identifier, std::string_view family) {
    if (identifier == family)
        return true;
    static TypeCache<bool> cache;
    std::string pair = lowercase(identifier);
    const std::size_t length = pair.size();
    pair.append(1, '\n').append(lowercase(family));
    return cache.get(pair, [length](const std::string& key) {
        return conformance(key.substr(0, length)).contains(key.substr(length + 1));
    });
}

std::optional<std::string> TypeRegistry::localizedDescription(std::string_view identifier) {
    static TypeCache<std::optional<std::string>> cache;
    const std::string lower = lowercase(identifier);
    // The user's language is part of the key: it is chosen after the first types may be asked for.
    const std::string key = QLocale().name().toStdString() + '\n' + lower;
    return cache.get(key, [&lower](const std::string&) -> std::optional<std::string> {
        for (const TypeWords& one : typeWords())
            if (one.identifier == lower)
                return localized(one.words);
        const std::optional<std::string> name = knownMimeType(lower);
        QString words = name ? database().mimeTypeForName(qtText(*name)).comment() : QString();
        if (words.isEmpty())
            return std::nullopt;
        words.replace(0, 1, words.left(1).toUpper());
        return words.toStdString();
    });
}

bool TypeRegistry::isPackageName(std::string_view name) {
    return packageOfName(name) != nullptr;
}

std::vector<std::string> TypeRegistry::iconNames(std::string_view identifier) {
    const std::string lower = lowercase(identifier);
    if (conformsTo(lower, types::package))
        return {"package-x-generic", "folder"};
    if (conformsTo(lower, types::directory))
        return {"folder", "inode-directory"};
    std::vector<std::string> names;
    const auto add = [&names](std::string name) {
        if (std::find(names.begin(), names.end(), name) == names.end())
            names.push_back(std::move(name));
    };
    if (const std::optional<std::string> mime = knownMimeType(lower)) {
        const QMimeType type = database().mimeTypeForName(qtText(*mime));
        if (type.isValid()) {
            add(type.iconName().toStdString());
            add(type.genericIconName().toStdString());
        }
    }
    constexpr std::array<std::array<std::string_view, 2>, 6> generic = {{
        {types::image, "image-x-generic"},
        {types::movie, "video-x-generic"},
        {types::audio, "audio-x-generic"},
        {types::archive, "package-x-generic"},
        {types::sourceCode, "text-x-script"},
        {types::text, "text-x-generic"},
    }};
    for (const auto& [family, icon] : generic)
        if (conformsTo(lower, family))
            add(std::string(icon));
    add("unknown");
    return names;
}

} // namespace platform
