#pragma once

#include "platform/cloud/StateRecords.h"

#include <cstddef>
#include <string>
#include <string_view>

// The names that the store itself makes for items and folders.

namespace platform {

/// At most `limit` bytes of the text, without half a character at the end.
std::string_view cutAtCharacter(std::string_view text, std::size_t limit);

/// The longest name of an item, in bytes.
inline constexpr std::size_t longestItemName = 255;

/// "Report (conflict 2026-03-01 desk).pdf": beside the original, for what the other side has no
/// room for under its own name. `number` from 2 on makes it another one. Never longer than a disk
/// takes.
std::string conflictName(std::string_view name, ItemKind kind, Date date, std::string_view host,
                         int number = 1);
/// How many names are tried for what has to leave its own to another.
inline constexpr int namesAside = 100;
/// This machine, as conflict names tell it.
std::string deviceName();

/// Under this name an item waits for the place that another one has to leave first, on either side.
/// It is nobody's wish: an item that has it on one side is meant to be where the other side has it.
std::string temporaryName(ItemId item);
bool isTemporaryName(std::string_view name);

/// "2026-03-01" and "2026-03-01 14.05.09" (UTC): sort as text in the order of time.
std::string dayText(Date date);
std::string momentText(Date date);
/// The first moment of the day, or the moment, that such a text begins with; none when it begins
/// with something else.
std::optional<Date> dateOfText(std::string_view text);

} // namespace platform
