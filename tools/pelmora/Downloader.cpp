#include "tools/pelmora/Downloader.h"

#include "platform/files/FileManager.h"
#include "tools/pelmora/Command.h"
#include "tools/pelmora/ItemList.h"

#include <cstdio>
#include <unistd.h>

namespace pelmora {
using namespace platform;

Downloader::Downloader(Session& session) : session_(session), terminal_(isatty(STDOUT_FILENO)) {
}

Failure Downloader::fetch(const Url& url) {
    bool directory = false;
    FileManager::exists(url.path(), &directory);
    return directory ? fetchFolder(url) : fetchDocument(url);
}

Failure Downloader::fetchFolder(const Url& folder) {
    const Result<std::vector<ListedItem>> items = itemsAt(session_.cloud().documents(), folder);
    if (!items)
        return items.error();
    Failure first;
    for (const ListedItem& item : *items) {
        if (session_.interruptedByUser())
            return makeError(ErrorCode::userCancelled);
        bool directory = false;
        FileManager::exists(item.url.path(), &directory);
        if (!directory && !item.promised)
            continue;
        const Failure failure = fetch(item.url);
        if (failure && !first)
            first = failure;
        else if (failure)
            complain(failure->localizedDescription.value_or(item.name));
    }
    return first;
}

Failure Downloader::fetchDocument(const Url& document) {
    const std::string name(document.lastPathComponent());
    lastShown_ = -1;
    const auto token =
        session_.progress().addSubscriber(document, [&](const std::shared_ptr<Progress>& progress) {
            const Progress::ObserverId id =
                progress->addObserver([this, name](const Progress& now) { show(name, now); });
            return [progress, id] { progress->removeObserver(id); };
        });
    const bool needed = session_.cloud().documents().isPromised(document);
    const Failure failure = session_.cloud().contents().makeLocal(document, session_.cancel());
    if (terminal_ && lastShown_ >= 0)
        std::printf("\r\033[K");
    if (!failure)
        std::printf("%s: %s\n", name.c_str(), needed ? "downloaded" : "is on this device already");
    return failure;
}

void Downloader::show(const std::string& name, const Progress& progress) {
    const int percent = static_cast<int>(progress.fractionCompleted() * 100);
    if (!terminal_ || percent == lastShown_)
        return;
    lastShown_ = percent;
    std::printf("\r\033[K%s: %d %% (%s of %s)", name.c_str(), percent,
                sizeText(progress.completedUnitCount()).c_str(),
                sizeText(progress.totalUnitCount()).c_str());
    std::fflush(stdout);
}

} // namespace pelmora
