#include "platform/cloud/webdav/MultiStatus.h"

#include "platform/base/Text.h"

#include <charconv>
#include <expat.h>
#include <vector>

namespace platform {
namespace {

/// Between a namespace and a name; in neither of those that are looked for.
constexpr char spaceSeparator = '\n';
constexpr int deepestNesting = 64;
constexpr std::size_t longestValue = 64 * 1024;
/// Far more than any account has: an answer without an end fills no memory.
constexpr std::size_t mostItems = 4'000'000;

enum class Element {
    other,
    multistatus,
    response,
    href,
    status,
    propstat,
    prop,
    resourceType,
    collection,
    size,
    modified,
    etag,
    quota,
    tags,
    id,
    permissions
};

Element davElement(std::string_view name) {
    constexpr std::pair<std::string_view, Element> names[] = {
        {"response", Element::response},
        {"href", Element::href},
        {"propstat", Element::propstat},
        {"prop", Element::prop},
        {"status", Element::status},
        {"getetag", Element::etag},
        {"getlastmodified", Element::modified},
        {"resourcetype", Element::resourceType},
        {"collection", Element::collection},
        {"getcontentlength", Element::size},
        {"quota-available-bytes", Element::quota},
        {"multistatus", Element::multistatus},
    };
    for (const auto& [known, element] : names)
        if (known == name)
            return element;
    return Element::other;
}

Element elementOf(std::string_view name) {
    const std::size_t cut = name.find(spaceSeparator);
    if (cut == std::string_view::npos)
        return Element::other;
    const std::string_view space = name.substr(0, cut);
    name.remove_prefix(cut + 1);
    if (space == "DAV:")
        return davElement(name);
    if (space == storeNamespace)
        return name == "tags" ? Element::tags : Element::other;
    if (space == richNamespace)
        return name == "id"            ? Element::id
               : name == "permissions" ? Element::permissions
                                       : Element::other;
    return Element::other;
}

/// The element may only stand in that one; anywhere else it is none of ours.
Element parentOf(Element element) {
    switch (element) {
    case Element::response:
        return Element::multistatus;
    case Element::href:
    case Element::propstat:
        return Element::response;
    case Element::prop:
        return Element::propstat;
    case Element::collection:
        return Element::resourceType;
    default:
        return Element::prop;
    }
}

bool holdsText(Element element) {
    switch (element) {
    case Element::other:
    case Element::multistatus:
    case Element::response:
    case Element::propstat:
    case Element::prop:
    case Element::resourceType:
    case Element::collection:
        return false;
    default:
        return true;
    }
}

std::string_view trimmedText(std::string_view text) {
    constexpr std::string_view blanks = " \t\r\n";
    const std::size_t begin = text.find_first_not_of(blanks);
    if (begin == std::string_view::npos)
        return {};
    return text.substr(begin, text.find_last_not_of(blanks) - begin + 1);
}

template<class Number>
std::optional<Number> numberIn(std::string_view text) {
    Number number{};
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    if (error != std::errc() || end != text.data() + text.size())
        return std::nullopt;
    return number;
}

/// "HTTP/1.1 200 OK"
int statusIn(std::string_view line) {
    const std::size_t blank = line.find(' ');
    return blank == std::string_view::npos ? 0
                                           : numberIn<int>(line.substr(blank + 1, 3)).value_or(0);
}

Error unreadableAnswer(std::string reason) {
    Error error = makeErrorWithText(
        ErrorCode::serverRefused,
        localized("The server's list of a folder is not whole or not well-formed. Nothing is "
                  "concluded from it; it is asked again later."));
    error.localizedFailureReason = std::move(reason);
    return error;
}

} // namespace

struct MultiStatusParser::State {
    Take take;
    XML_Parser parser = XML_ParserCreateNS(nullptr, spaceSeparator);
    std::vector<Element> open;
    std::string text;
    DavItem item;
    /// Of the propstat that is open: counts when its status is a good one.
    DavItem found;
    int foundStatus = 0;
    std::size_t items = 0;
    bool sawMultistatus = false;
    Failure failure;

    explicit State(Take given) : take(std::move(given)) {
        XML_SetUserData(parser, this);
        XML_SetElementHandler(parser, &State::onStart, &State::onEnd);
        XML_SetCharacterDataHandler(parser, &State::onText);
        XML_SetStartDoctypeDeclHandler(
            parser, [](void* self, const XML_Char*, const XML_Char*, const XML_Char*, int) {
                static_cast<State*>(self)->stop(unreadableAnswer("a document type"));
            });
    }
    ~State() { XML_ParserFree(parser); }
    State(const State&) = delete;
    State& operator=(const State&) = delete;

    void stop(Error error) {
        if (!failure)
            failure = std::move(error);
        XML_StopParser(parser, XML_FALSE);
    }

    static void onStart(void* user, const XML_Char* name, const XML_Char**) {
        auto* const self = static_cast<State*>(user);
        const Element parent = self->open.empty() ? Element::other : self->open.back();
        Element element = elementOf(name);
        if (element == Element::status)
            element = parent == Element::propstat || parent == Element::response ? element
                                                                                 : Element::other;
        else if (element == Element::multistatus)
            element = self->open.empty() ? element : Element::other;
        else if (element != Element::other && parent != parentOf(element))
            element = Element::other;
        if (self->open.empty() && element != Element::multistatus)
            return self->stop(unreadableAnswer("not a multistatus"));
        if (self->open.size() >= deepestNesting)
            return self->stop(unreadableAnswer("too deep"));
        self->open.push_back(element);
        self->text.clear();
        self->begin(element);
    }

    void begin(Element element) {
        if (element == Element::multistatus) {
            sawMultistatus = true;
        } else if (element == Element::response) {
            item = {};
        } else if (element == Element::propstat) {
            found = {};
            foundStatus = 0;
        } else if (element == Element::collection) {
            found.isCollection = true;
        }
    }

    static void onText(void* user, const XML_Char* text, int length) {
        auto* const self = static_cast<State*>(user);
        if (self->open.empty() || !holdsText(self->open.back()))
            return;
        if (self->text.size() + static_cast<std::size_t>(length) > longestValue)
            return self->stop(unreadableAnswer("a value too long"));
        self->text.append(text, static_cast<std::size_t>(length));
    }

    static void onEnd(void* user, const XML_Char*) {
        auto* const self = static_cast<State*>(user);
        const Element element = self->open.back();
        self->open.pop_back();
        self->end(element, trimmedText(self->text));
        self->text.clear();
    }

    void end(Element element, std::string_view value) {
        switch (element) {
        case Element::href:
            item.href = value;
            break;
        case Element::status:
            (open.back() == Element::propstat ? foundStatus : item.status) = statusIn(value);
            break;
        case Element::size:
            found.size = numberIn<std::uint64_t>(value);
            break;
        case Element::modified:
            found.modified = value;
            break;
        case Element::etag:
            found.etag = value;
            break;
        case Element::quota:
            found.quotaAvailable = numberIn<std::int64_t>(value);
            break;
        case Element::tags:
            found.tags = value;
            break;
        case Element::id:
            found.id = value;
            break;
        case Element::permissions:
            found.permissions = value;
            break;
        case Element::propstat:
            mergeFound();
            break;
        case Element::response:
            endItem();
            break;
        default:
            break;
        }
    }

    void mergeFound() {
        if (foundStatus < 200 || foundStatus > 299)
            return;
        const auto adopt = [](std::string& to, std::string& from) {
            if (!from.empty())
                to = std::move(from);
        };
        item.hasProperties = true;
        item.isCollection = item.isCollection || found.isCollection;
        item.size = found.size ? found.size : item.size;
        item.quotaAvailable = found.quotaAvailable ? found.quotaAvailable : item.quotaAvailable;
        adopt(item.modified, found.modified);
        adopt(item.etag, found.etag);
        adopt(item.tags, found.tags);
        adopt(item.id, found.id);
        adopt(item.permissions, found.permissions);
    }

    void endItem() {
        if (item.href.empty())
            return stop(unreadableAnswer("an answer about nothing"));
        if (++items > mostItems)
            return stop(unreadableAnswer("no end of answers"));
        if (Failure refused = take(std::move(item)))
            stop(std::move(*refused));
        item = {};
    }

    Failure result(XML_Status status) {
        if (failure)
            return failure;
        if (status == XML_STATUS_OK)
            return std::nullopt;
        failure =
            unreadableAnswer(std::string(XML_ErrorString(XML_GetErrorCode(parser))) + ", line " +
                       std::to_string(XML_GetCurrentLineNumber(parser)));
        return failure;
    }
};

MultiStatusParser::MultiStatusParser(Take take) : state_(std::make_unique<State>(std::move(take))) {
}
MultiStatusParser::~MultiStatusParser() = default;

Failure MultiStatusParser::feed(std::span<const std::byte> piece) {
    if (state_->failure)
        return state_->failure;
    return state_->result(XML_Parse(state_->parser, reinterpret_cast<const char*>(piece.data()),
                                    static_cast<int>(piece.size()), 0));
}

Failure MultiStatusParser::finish() {
    if (state_->failure)
        return state_->failure;
    if (Failure failure = state_->result(XML_Parse(state_->parser, "", 0, 1)))
        return failure;
    return state_->sawMultistatus ? Failure() : Failure(unreadableAnswer("empty"));
}

} // namespace platform
