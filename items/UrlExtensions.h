#pragma once

#include "platform/base/Url.h"

#include <optional>

namespace tavrin {

/// The document that an external document reference stands for, a promise resolved to its logical
/// URL. None when the URL is no such reference, or it leads nowhere.
std::optional<platform::Url> tavrin_URLByResolvingBookmark(const platform::Url& url);

/// The logical URL of the promise whose placeholder lies at `url`, with `url` recorded on it as its
/// physical location. None when no placeholder lies there.
std::optional<platform::Url> tavrin_URLByResolvingPromise(const platform::Url& url);

/// Whether media at the URL should play in the platform's default player: always.
bool wantsDefaultMediaPlayer(const platform::Url& url);

/// The URL is the documents root of a container.
bool dossa_isDocumentsContainer(const platform::Url& url);
/// The URL lies inside the directory of all cloud documents.
bool dossa_isInShelfroot(const platform::Url& url);

} // namespace tavrin
