#pragma once

#include <QDBusConnection>
#include <QString>

#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <vector>

namespace test {

/// States of the accessibility interface that the story asks for, with its numbers.
enum class Has : std::uint32_t {
    focus = 12,
    modality = 16,
    selection = 23,
    sensitivity = 24,
    showing = 25,
};

/// A thing in another program's accessibility tree, as screen readers see it. What it stands for
/// may go at any moment: then answers are empty and commands fail.
class Accessible {
public:
    Accessible(QDBusConnection bus, QString program, QString path);

    /// As the interface calls it: "push button", "list item".
    std::string role() const;
    std::string name() const;
    std::string description() const;
    bool has(Has state) const;
    std::vector<Accessible> children() const;
    std::vector<std::string> actions() const;
    bool act(const std::string& action) const;
    /// What stands in a text, or in a field for typing.
    std::string text() const;
    bool setText(const std::string& text) const;
    bool takeFocus() const;
    /// The connection of the program that it belongs to.
    const QString& program() const { return program_; }

    /// The first of what is shown below, from the top down, that passes. Rows are shown wherever
    /// their list has been scrolled to.
    std::optional<Accessible> find(const std::function<bool(const Accessible&)>& passes) const;
    /// The tree from here on, a line a thing.
    std::string picture(int depth = 0) const;

private:
    QVariant property(const char* name) const;
    QVariantList call(const char* interface, const char* method,
                      const QVariantList& arguments = {}) const;
    std::uint64_t states() const;

    QDBusConnection bus_;
    QString program_;
    QString path_;
};

} // namespace test
