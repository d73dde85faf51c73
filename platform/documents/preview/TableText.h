#pragma once

#include "platform/documents/preview/TextFile.h"

#include <QString>

#include <cstddef>
#include <functional>
#include <string_view>
#include <vector>

namespace platform {

/// How the cells of a table are written one after the other. A cell in " may hold what separates
/// cells or ends rows, and a " when it is written twice. All sizes are bytes.
class TableText {
public:
    static constexpr std::size_t npos = std::string_view::npos;

    TableText(TextEncoding encoding, char separator) : encoding_(encoding), separator_(separator) {}

    /// What the head of a file says in its first line ("sep=;"), else which of , ; tab and | makes
    /// the most even table of it. `whole`: there is no more than the head.
    static TableText detect(std::string_view head, bool whole, TextEncoding encoding);

    char separator() const { return separator_; }
    /// Behind the row that begins at `from`; npos when its end is not in the bytes.
    std::size_t rowEnd(std::string_view bytes, std::size_t from) const;
    /// The same where quotes mean nothing.
    std::size_t lineEnd(std::string_view bytes, std::size_t from) const;
    /// The cells of one row, with their quotes, at most that many.
    std::vector<std::string_view> cells(std::string_view row, std::size_t most) const;
    /// What a decoded cell means: without its quotes, ends of lines as signs.
    static QString meaning(QString cell);

private:
    template<int unit>
    std::size_t walk(std::string_view bytes, std::size_t from,
                     const std::function<void(std::size_t begin, std::size_t end)>* cell) const;
    char at(std::string_view bytes, std::size_t place) const;
    bool isWide() const;

    TextEncoding encoding_;
    char separator_;
};

/// Whether one reads it as an amount, a date or a share: figures with what goes with them.
bool isNumberText(const QString& text);

} // namespace platform
