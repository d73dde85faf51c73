#pragma once

#include "platform/base/Url.h"

#include <functional>
#include <string>

namespace platform {

/// Makes a document ready for another program: waits for whoever writes it and, when it is only
/// promised, makes it local. What takes longer is shown in an alert with its progress and a way
/// out. Main thread.
class DocumentFetch {
public:
    struct Request {
        Url document;
        /// Tells this wish from others for the same document; the same one is not fulfilled twice
        /// at a time.
        std::string purpose;
        /// What the alert of a failure says above the cause.
        std::string failureTitle;
        /// Gets the document as it then lies there, on the main queue. Not called after a
        /// cancellation, nor after a failure, which is shown to the user.
        std::function<void(const Url& document)> ready;
    };
    /// Returns at once. What is under way when the application ends is given up.
    static void start(Request request);
};

} // namespace platform
