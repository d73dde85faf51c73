#pragma once

#include <functional>
#include <optional>
#include <string>
#include <string_view>

namespace platform {

/// The HTML of a Markdown text in UTF-8, with tables, task lists, struck-out words and bare
/// addresses as links. HTML within the text is in it as it stands: it is still to be cleaned. None
/// when it grows beyond all measure, or nobody wants it any more.
std::optional<std::string> htmlOfMarkdown(std::string_view text,
                                          const std::function<bool()>& isUnwanted);

} // namespace platform
