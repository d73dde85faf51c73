#include "platform/base/Text.h"
#include "platform/documents/DisplayName.h"
#include "platform/documents/preview/MediaProcess.h"
#include "platform/documents/preview/MediaWidget.h"
#include "platform/documents/preview/PreviewKinds.h"
#include "platform/documents/preview/PreviewWorker.h"
#include "platform/launch/DocumentIcons.h"
#include "platform/launch/TypeRegistry.h"
#include "platform/ui/qt/Bridge.h"

#include <QCoreApplication>

#include <algorithm>
#include <cerrno>
#include <fcntl.h>
#include <utility>

namespace platform {
namespace {

/// Stands beside the program.
constexpr const char* playerName = "/tavrin-play-media";
constexpr double iconEdge = 128;
/// The decoders take a second to be loaded; one that still says nothing then never will.
constexpr Duration longestStart = std::chrono::seconds(30);

/// What the decoders can play. Notes for instruments and lists of other files are not among them.
constexpr std::string_view playedTypes[] = {
    "application/ogg",
    "application/vnd.rn-realmedia",
    "application/x-matroska",
    "audio/AMR",
    "audio/AMR-WB",
    "audio/aac",
    "audio/ac3",
    "audio/basic",
    "audio/flac",
    "audio/mp2",
    "audio/mp4",
    "audio/mpeg",
    "audio/ogg",
    "audio/vnd.dts",
    "audio/webm",
    "audio/x-aiff",
    "audio/x-ape",
    "audio/x-flac+ogg",
    "audio/x-m4b",
    "audio/x-matroska",
    "audio/x-ms-wma",
    "audio/x-musepack",
    "audio/x-opus+ogg",
    "audio/x-speex+ogg",
    "audio/x-tta",
    "audio/x-vorbis+ogg",
    "audio/x-wav",
    "audio/x-wavpack",
    "video/3gpp",
    "video/3gpp2",
    "video/dv",
    "video/mp2t",
    "video/mp4",
    "video/mpeg",
    "video/ogg",
    "video/quicktime",
    "video/vnd.avi",
    "video/webm",
    "video/x-flv",
    "video/x-matroska",
    "video/x-ms-wmv",
    "video/x-msvideo",
    "video/x-theora+ogg",
};
static_assert(std::is_sorted(std::begin(playedTypes), std::end(playedTypes)));

bool playsType(std::string_view identifier) {
    return std::binary_search(std::begin(playedTypes), std::end(playedTypes),
                              TypeRegistry::mimeTypeForIdentifier(identifier));
}

/// The player of the file that is shown; of the worker's queue, which waits for its end.
struct MediaSlot {
    std::shared_ptr<MediaChild> child;
};

class MediaRenderer final : public PreviewRenderer {
public:
    MediaRenderer(MainQueue& main, PreviewReports reports)
        : main_(main),
          reports_(std::move(reports)),
          player_(
              (QCoreApplication::applicationDirPath() + QLatin1String(playerName)).toStdString()),
          worker_(main) {
        auto widget = std::make_unique<MediaWidget>(MediaWidget::Wishes{
            [this](bool play) { wish(play ? MediaWish::play : MediaWish::pause); },
            [this](std::int64_t time) { wish(MediaWish::seek, time); },
            [this](int volume) { wish(MediaWish::volume, volume_ = volume); },
            [this](bool mute) { wish(MediaWish::mute, mute_ = mute); },
            [this](QSize size) {
                wish(MediaWish::size, size_ = packedSize(size.width(), size.height()));
            }});
        widget_ = widget.get();
        view_ = std::make_shared<WidgetView>(std::move(widget));
        worker_.setLastJob([slot = slot_] { slot->child.reset(); });
    }

    std::shared_ptr<View> view() override { return view_; }

    void load(const Url& file) override {
        file_ = file;
        const QString name = shownName(file.lastPathComponent());
        view_->setAccessibleName(name.toStdString());
        const std::string type = TypeRegistry::identifierForFileName(file.lastPathComponent());
        widget_->setName(name, toQt(DocumentIcons::forType(type, iconEdge), {iconEdge, iconEdge},
                                    widget_->devicePixelRatioF()));
        start(0);
    }

    void reload() override { start(widget_->position()); }

private:
    /// Ready to be played from `place` on; plays nothing yet.
    void start(std::int64_t place) {
        worker_.cancel();
        process_.reset();
        patience_.cancel();
        told_ = false;
        place_ = place;
        widget_->setPlaying(false);
        worker_.run(
            [this, file = file_, slot = slot_, player = player_](PreviewToken& token) -> Job {
                slot->child.reset();
                FileDescriptor open;
                const Failure failure = readDocument(file, token, [&](const std::string& path) {
                    open = FileDescriptor(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK));
                    return open ? Failure() : posixError(errno, file, false);
                });
                if (!failure && open)
                    slot->child = startPlayer(player, open.get());
                return [this, failure, child = slot->child] { take(child, failure); };
            });
    }

    void take(const std::shared_ptr<MediaChild>& child, const Failure& failure) {
        if (failure) {
            reports_.failed(*failure);
            return;
        }
        if (!child) {
            unavailable();
            return;
        }
        process_ = std::make_unique<MediaProcess>(
            child,
            MediaProcess::Events{[this](MediaEvent event, std::int64_t value,
                                        const std::string& text) { hear(event, value, text); },
                                 [this](MediaEvent event, QImage image) {
                                     if (event == MediaEvent::cover)
                                         widget_->setCover(std::move(image));
                                     else
                                         widget_->setPicture(std::move(image));
                                 },
                                 [this] { fail({}); }});
        wish(MediaWish::size, size_);
        patience_ = main_.timer(longestStart, [this] {
            process_.reset();
            fail({});
        });
    }

    void hear(MediaEvent event, std::int64_t value, const std::string& text) {
        switch (event) {
        case MediaEvent::ready:
            getReady(value);
            break;
        case MediaEvent::duration:
            widget_->setDuration(value);
            break;
        case MediaEvent::position:
            widget_->setPosition(value);
            break;
        case MediaEvent::playing:
            widget_->setPlaying(value != 0);
            break;
        case MediaEvent::ended:
            widget_->setPlaying(false);
            break;
        case MediaEvent::title:
            widget_->setTitle(shownName(text));
            break;
        case MediaEvent::artist:
            widget_->setArtist(shownName(text));
            break;
        case MediaEvent::failed:
            fail(text);
            break;
        case MediaEvent::unavailable:
            unavailable();
            break;
        default:
            break;
        }
    }

    void getReady(std::int64_t traits) {
        patience_.cancel();
        widget_->setTraits(traits);
        wish(MediaWish::volume, volume_);
        wish(MediaWish::mute, mute_);
        if (place_ > 0)
            wish(MediaWish::seek, place_);
        reports_.shown();
    }

    void fail(const std::string& said) {
        patience_.cancel();
        if (std::exchange(told_, true))
            return;
        Error error = makeErrorWithText(
            ErrorCode::readCorrupt,
            localizedFormat("“%1$@” cannot be played. It may be damaged, or of a kind for which "
                            "there is no decoder here.",
                            displayName(file_.lastPathComponent())));
        if (!said.empty())
            error.localizedFailureReason = said;
        reports_.failed(error);
    }

    void unavailable() {
        if (std::exchange(told_, true))
            return;
        reports_.failed(makeErrorWithText(
            ErrorCode::unsupportedOperation,
            localized("Sound and films cannot be played: a part of this program is missing. "
                      "Install it again.")));
    }

    void wish(MediaWish wish, std::int64_t value = 0) {
        if (process_)
            process_->wish(wish, value);
    }

    MainQueue& main_;
    PreviewReports reports_;
    const std::string player_;
    Url file_;
    const std::shared_ptr<MediaSlot> slot_ = std::make_shared<MediaSlot>();
    MediaWidget* widget_ = nullptr;
    std::shared_ptr<View> view_;
    std::int64_t volume_ = 1000;
    std::int64_t mute_ = 0;
    std::int64_t size_ = packedSize(1280, 720);
    /// Where to go on once it is ready.
    std::int64_t place_ = 0;
    /// That it cannot be played.
    bool told_ = false;
    Timer patience_;
    PreviewWorker worker_;
    std::unique_ptr<MediaProcess> process_;
};

} // namespace

const PreviewKind mediaPreview{
    &playsType, [](MainQueue& main, PreviewReports reports) -> std::unique_ptr<PreviewRenderer> {
        return std::make_unique<MediaRenderer>(main, std::move(reports));
    }};

} // namespace platform
