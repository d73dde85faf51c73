#include "items/FileTags.h"

#include "app/VXLogging.h"
#include "items/ColorBlending.h"
#include "platform/Platform.h"
#include "platform/cloud/KeyValueCloudStore.h"
#include "platform/ui/Canvas.h"

#include <cmath>
#include <mutex>

namespace tavrin {
namespace {

using platform::Color;
using platform::Value;

constexpr std::uint64_t knownVersion = 2;
constexpr double outlineWidth = 1.0;
constexpr Color halfWhite = Color::white.withAlpha(0.5);

std::mutex tablesMutex;
FileTags::ColorMap colorsByTag;    // guarded by tablesMutex
std::vector<std::string> tagNames; // guarded by tablesMutex

void setUpOnce() {
    static std::once_flag once;
    std::call_once(once, [] {
        // Registered for as long as the process lives, so never taken down.
        static auto& observation = *new platform::Observation();
        observation = platform::Platform::current().notifications().observe(
            platform::keyValueStoreDidChangeExternallyNotification,
            [](const auto&) { FileTags::_tagColorsDidChange(); });
        FileTags::_tagColorsDidChange();
    });
}

const Value* entryOf(const Value::Map& map, std::string_view key) {
    const auto found = map.find(key);
    return found == map.end() ? nullptr : &found->second;
}

std::uint64_t unsignedEntry(const Value::Map& map, std::string_view key) {
    const Value* value = entryOf(map, key);
    return value ? static_cast<std::uint64_t>(value->integer().value_or(0)) : 0;
}

/// The user's tag dictionary; none (logged) when it is missing, empty or of another version.
const Value::Map* checkedDictionary(const Value& stored) {
    const Value::Map* dictionary = stored.map();
    if (dictionary) {
        const std::uint64_t version = unsignedEntry(*dictionary, "KolviTagDictVersion");
        if (version != knownVersion) {
            VXLOG(vxDebug, "Kolvi tag dictionary has incorrect version (%lu, should be 2)",
                  version);
            dictionary = nullptr;
        }
    }
    if (!dictionary || dictionary->empty())
        VXLOG(vxWarning, "Kolvi tag dictionary is empty");
    return dictionary;
}

/// A name that the dictionary does not know is drawn like label 0.
Color colorOf(const std::string& tag) {
    setUpOnce();
    const std::lock_guard lock(tablesMutex); // in place: a copy of a long list for each dot is dear
    const auto found = colorsByTag.find(tag);
    return found == colorsByTag.end() ? FileTags::_tagBlipColors()[0] : found->second;
}

} // namespace

const std::array<Color, 8>& FileTags::_tagBlipColors() {
    static constexpr std::array<Color, 8> colors = {
        Color::gray(0.8),     Color::hex(0x8E8E93), Color::hex(0x34A853), Color::hex(0x9B51C8),
        Color::hex(0x2F7DE1), Color::hex(0xF2C230), Color::hex(0xE5484D), Color::hex(0xF2862B)};
    return colors;
}

FileTags::ColorMap FileTags::tagColorsByTag() {
    setUpOnce();
    const std::lock_guard lock(tablesMutex);
    return colorsByTag;
}

std::vector<std::string> FileTags::allTags() {
    setUpOnce();
    const std::lock_guard lock(tablesMutex);
    return tagNames;
}

void FileTags::_tagColorsDidChange() {
    const Value stored = platform::Platform::current().keyValueStore().value("KolviTagDict");
    ColorMap colors;
    std::vector<std::string> names;
    const Value::Map* dictionary = checkedDictionary(stored);
    const Value* entries = dictionary ? entryOf(*dictionary, "KolviTags") : nullptr;
    if (entries && entries->list()) {
        for (const Value& entry : *entries->list()) {
            const Value::Map* fields = entry.map();
            const Value* name = fields ? entryOf(*fields, "n") : nullptr;
            if (!name || !name->text())
                continue; // nothing could ever be found under it
            const std::uint64_t label = unsignedEntry(*fields, "l");
            names.push_back(*name->text());
            colors[*name->text()] = _tagBlipColors()[label < _tagBlipColors().size() ? label : 0];
        }
    }
    const std::lock_guard lock(tablesMutex);
    colorsByTag.swap(colors);
    tagNames.swap(names);
}

platform::Image FileTags::blipWithTags(const std::vector<std::string>& tags, double height,
                                       double scale) {
    if (tags.empty())
        return {};
    const double diameter = std::ceil(height);
    const double step = height / 2;
    platform::ImageCanvas canvas({diameter + step * static_cast<double>(tags.size() - 1), diameter},
                                 false, scale);
    for (std::size_t i = 0; i < tags.size(); ++i) {
        const platform::Rect square{static_cast<double>(i) * step, 0, diameter, diameter};
        const platform::Rect circle = square.inset(0.5, 0.5);
        const Color color = colorOf(tags[i]);
        canvas.fillEllipse(circle, color);
        canvas.strokeEllipse(circle, _colorBlendedWithColor(color, halfWhite), outlineWidth);
    }
    return canvas.image();
}

platform::Image FileTags::blipWithTag(const std::optional<std::string>& tag,
                                      platform::Size imageSize, double blipHeight,
                                      platform::Point offset) {
    if (!tag)
        return {};
    platform::ImageCanvas canvas(imageSize, false, 1.0);
    canvas.fillEllipse({offset.x, offset.y, blipHeight, blipHeight}, colorOf(*tag));
    return canvas.image();
}

} // namespace tavrin
