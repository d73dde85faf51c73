#pragma once

class QString;

namespace platform {

/// A widget whose content is a text that screen readers can read, whatever draws it.
class ReadableText {
public:
    virtual ~ReadableText() = default;
    /// What it knows of the text at the moment; empty for none.
    virtual QString readableText() const = 0;
};

/// Lets screen readers find such widgets. Called before one is made.
void installTextAccessibility();

} // namespace platform
