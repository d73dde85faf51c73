#pragma once

#include "platform/base/Clock.h"
#include "platform/documents/preview/OfficeCache.h"
#include "platform/documents/preview/PreviewWorker.h"

#include <optional>
#include <string>
#include <string_view>

namespace platform {

/// Whether an office program shows documents of the type, installed or not.
bool isOfficeType(std::string_view typeIdentifier);
/// The installed office program's path; none where there is none.
std::optional<std::string> officeProgram();

/// Has an office program make pages of a document. On a worker's queue.
class OfficeConverter {
public:
    OfficeConverter(std::string program, OfficeCache cache, Clock& clock);

    /// Answers the path of a PDF in the cache, made now unless it is there. Takes a while; gives up
    /// when cancelled (userCancelled).
    Result<std::string> convert(const Url& document, const std::string& workFolder,
                                PreviewToken& token);
    const OfficeCache& cache() const { return cache_; }

private:
    Failure makePages(const Url& document, const std::string& copy, const std::string& workFolder,
                      PreviewToken& token);

    std::string program_;
    OfficeCache cache_;
    Clock& clock_;
};

} // namespace platform
