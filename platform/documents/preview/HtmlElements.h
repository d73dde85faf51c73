#pragma once

#include <QString>

#include <string_view>

namespace platform {

/// What an element is for a text; in the order in which one may hold the other.
enum class HtmlRole {
    /// With all that is in it.
    dropped,
    /// Without content.
    alone,
    /// Within a line.
    text,
    item,
    block,
    table,
    row,
    cell
};

struct HtmlElement {
    std::string_view name;
    HtmlRole role;
    /// The element that stands for it in a cleaned text.
    QString written;

    bool isList() const { return name == "ul" || name == "ol" || name == "dl"; }
};

/// By its name in small letters; none for one that means nothing to a text.
const HtmlElement* htmlElement(const QString& name);

} // namespace platform
