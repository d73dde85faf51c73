#include "platform/cloud/CloudDocumentService.h"
#include "platform/cloud/KeyValueCloudStore.h"
#include "platform/files/FileManager.h"
#include "tools/pelmora/Command.h"
#include "tools/pelmora/Session.h"

#include <algorithm>
#include <array>
#include <cstdio>
#include <functional>

namespace pelmora {
namespace {

using namespace platform;

// The user's tags as they lie in the synced values; all devices read them.
constexpr std::string_view dictionaryKey = "KolviTagDict";
constexpr std::string_view versionKey = "KolviTagDictVersion";
constexpr std::string_view tagsKey = "KolviTags";
constexpr std::string_view nameKey = "n";
constexpr std::string_view labelKey = "l";
constexpr std::int64_t knownVersion = 2;

/// By label number.
constexpr std::array<std::string_view, 8> colors{"none", "grey",   "green", "purple",
                                                 "blue", "yellow", "red",   "orange"};

const Value& at(const Value::Map& map, std::string_view key) {
    static const Value none;
    const auto found = map.find(key);
    return found == map.end() ? none : found->second;
}

std::string_view colorOf(const Value::Map& tag) {
    const std::int64_t label = at(tag, labelKey).integer().value_or(0);
    return colors[label > 0 && label < std::ssize(colors) ? static_cast<std::size_t>(label) : 0];
}

bool isNamed(const Value& tag, std::string_view name) {
    const Value::Map* const fields = tag.map();
    const std::string* const own = fields ? at(*fields, nameKey).text() : nullptr;
    return own && *own == name;
}

/// The dictionary to work on; none, after saying why, for one that a newer program wrote.
std::optional<Value::Map> dictionaryOf(const Value& stored) {
    const Value::Map* const map = stored.map();
    if (!map)
        return Value::Map{{std::string(versionKey), knownVersion}};
    const std::int64_t version = at(*map, versionKey).integer().value_or(0);
    if (version == knownVersion)
        return *map;
    complain("the account's tags are of version " + std::to_string(version) +
             ", which this program does not know; nothing was changed");
    return std::nullopt;
}

Value::List listOf(const Value::Map& dictionary) {
    const Value::List* const list = at(dictionary, tagsKey).list();
    return list ? *list : Value::List();
}

/// What else an entry says stays in it.
void setColor(Value::List& tags, const std::string& name, std::int64_t label) {
    const auto found =
        std::ranges::find_if(tags, [&](const Value& each) { return isNamed(each, name); });
    Value::Map fields = found == tags.end() ? Value::Map() : *found->map();
    fields.insert_or_assign(std::string(nameKey), name);
    fields.insert_or_assign(std::string(labelKey), label);
    if (found == tags.end())
        tags.emplace_back(std::move(fields));
    else
        *found = Value(std::move(fields));
}

int printTags() {
    Session session(Session::Purpose::look);
    if (const std::optional<int> code = session.complaint())
        return *code;
    const Value stored = session.cloud().keyValues().value(dictionaryKey);
    if (!stored.map())
        return done;
    const std::optional<Value::Map> dictionary = dictionaryOf(stored);
    if (!dictionary)
        return failed;
    for (const Value& tag : listOf(*dictionary))
        if (const Value::Map* const fields = tag.map())
            if (const std::string* const name = at(*fields, nameKey).text())
                std::printf("%-7s %s\n", std::string(colorOf(*fields)).c_str(), name->c_str());
    return done;
}

/// Brings the newest in, has `change` done to it, and sends it on. An account that is away gets it
/// when it is back.
int changeTags(const std::function<bool(Value::List& tags)>& change) {
    Session session(Session::Purpose::change);
    if (const std::optional<int> code = session.complaint())
        return *code;
    const Failure unread = refreshAndWait(session.cloud(), std::nullopt);
    if (unread && !unread->is(ErrorCode::serverNotAvailable))
        return complainOf(*unread);
    KeyValueCloudStore& values = session.cloud().keyValues();
    std::optional<Value::Map> dictionary = dictionaryOf(values.value(dictionaryKey));
    if (!dictionary)
        return failed;
    Value::List tags = listOf(*dictionary);
    if (!change(tags))
        return failed;
    dictionary->insert_or_assign(std::string(tagsKey), std::move(tags));
    values.setValue(dictionaryKey, *std::move(dictionary));
    if (unread) {
        complain("the account is away; it gets the tags when it is back");
        return done;
    }
    const Failure unsent = refreshAndWait(session.cloud(), std::nullopt);
    return unsent ? complainOf(*unsent) : done;
}

/// The names as the attribute has them, one comma between two. None, after saying why, for what it
/// cannot hold.
std::optional<std::string> joined(const std::vector<std::string>& names) {
    std::string text;
    for (const std::string& name : names) {
        if (name.empty() || name.find(',') != std::string::npos) {
            complain("a tag's name is not empty and has no comma in it");
            return std::nullopt;
        }
        text += (text.empty() ? "" : ",") + name;
    }
    return text;
}

} // namespace

int tagItem(const std::vector<std::string>& arguments) {
    if (arguments.empty())
        return usageFault("tag", "tag wants a path");
    const std::optional<std::string> names = joined({arguments.begin() + 1, arguments.end()});
    if (!names)
        return badUsage;
    Session session(Session::Purpose::change);
    if (const std::optional<int> code = session.complaint())
        return *code;
    const Url item = session.urlOf(arguments.front());
    if (session.cloud().documents().isPromised(item)) {
        complain("“" + arguments.front() + "” is not on this device; download it first");
        return failed;
    }
    constexpr const char* attribute = "user.xdg.tags";
    const bool isTagged = extendedAttribute(item.path(), attribute).has_value();
    Failure failure;
    if (!names->empty())
        failure = setExtendedAttribute(item, attribute, *names);
    else if (const auto there = FileManager::attributes(item.path(), FollowLinks::yes); !there)
        failure = there.error();
    else if (isTagged)
        failure = removeExtendedAttribute(item, attribute);
    return failure ? complainOf(*failure) : done;
}

int tags(const std::vector<std::string>& arguments) {
    if (arguments.empty())
        return printTags();
    if (arguments.size() != 2)
        return usageFault("tags", "tags takes a name and a colour");
    if (arguments.front() == "--remove")
        return changeTags([&](Value::List& all) {
            if (std::erase_if(all, [&](const Value& each) { return isNamed(each, arguments[1]); }))
                return true;
            complain("there is no tag “" + arguments[1] + "”");
            return false;
        });
    const auto color = std::ranges::find(colors, arguments[1]);
    if (color == colors.end())
        return usageFault("tags", "there is no colour “" + arguments[1] + "”");
    if (!joined({arguments.front()}))
        return badUsage;
    return changeTags([&](Value::List& all) {
        setColor(all, arguments.front(), color - colors.begin());
        return true;
    });
}

} // namespace pelmora
