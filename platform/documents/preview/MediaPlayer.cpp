// Plays the sound or the film that is its standard input, as it is told through the socket that is
// its standard output, and sends the pictures back; see MediaMessages.h. A program of its own: what
// a damaged film makes of a decoder ends with this process, and nobody who plays nothing waits for
// the decoders to be loaded.

#include "platform/documents/preview/MediaMessages.h"

#include <QAudioDevice>
#include <QAudioOutput>
#include <QGuiApplication>
#include <QImage>
#include <QMediaDevices>
#include <QMediaMetaData>
#include <QMediaPlayer>
#include <QSocketNotifier>
#include <QUrl>
#include <QVideoFrame>
#include <QVideoSink>

#include <algorithm>
#include <csignal>
#include <cstdlib>
#include <fcntl.h>
#include <optional>
#include <sys/prctl.h>
#include <sys/resource.h>
#include <sys/socket.h>
#include <unistd.h>

namespace {

using namespace platform;

constexpr int socketNumber = STDOUT_FILENO;
/// Decoders of the largest films take about 1 GiB of addresses.
constexpr rlim_t mostMemory = 4096UL << 20;

void limitThisProcess() {
    ::prctl(PR_SET_PDEATHSIG, SIGKILL);
    ::prctl(PR_SET_NO_NEW_PRIVS, 1, 0, 0, 0);
#if !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)
    const rlimit memory{mostMemory, mostMemory};
    ::setrlimit(RLIMIT_AS, &memory);
#endif
    const rlimit core{0, 0};
    ::setrlimit(RLIMIT_CORE, &core);
}

void write(const void* bytes, std::size_t size) {
    const char* at = static_cast<const char*>(bytes);
    while (size > 0) {
        const ssize_t done = ::send(socketNumber, at, size, MSG_NOSIGNAL);
        if (done <= 0)
            ::_exit(1); // nobody listens any more
        at += done;
        size -= static_cast<std::size_t>(done);
    }
}

void tell(MediaEvent event, std::int64_t value, const QByteArray& bytes = {}) {
    const MediaHead head{static_cast<std::uint32_t>(event),
                         static_cast<std::uint32_t>(bytes.size()), value};
    write(&head, sizeof head);
    write(bytes.constData(), static_cast<std::size_t>(bytes.size()));
}

void tellText(MediaEvent event, const QString& text) {
    if (!text.isEmpty())
        tell(event, 0, text.left(longestMediaText / 4).toUtf8());
}

class Player {
public:
    Player() {
        player_.setVideoSink(&sink_);
        if (!QMediaDevices::audioOutputs().isEmpty()) {
            // Without a device an output makes the decoder fail.
            output_.emplace();
            player_.setAudioOutput(&*output_);
        }
        connectPlayer();
        QObject::connect(&sink_, &QVideoSink::videoFrameChanged, &player_,
                         [this](const QVideoFrame& frame) { takeFrame(frame); });
        player_.setSource(QUrl::fromLocalFile(QStringLiteral("/proc/self/fd/0")));
    }

    void obey(const MediaHead& head) {
        switch (static_cast<MediaWish>(head.kind)) {
        case MediaWish::play:
            player_.play();
            break;
        case MediaWish::pause:
            player_.pause();
            break;
        case MediaWish::seek:
            player_.setPosition(head.value);
            break;
        case MediaWish::volume:
            if (output_)
                output_->setVolume(QAudio::convertVolume(static_cast<float>(head.value) / 1000,
                                                         QAudio::LogarithmicVolumeScale,
                                                         QAudio::LinearVolumeScale));
            break;
        case MediaWish::mute:
            if (output_)
                output_->setMuted(head.value != 0);
            break;
        case MediaWish::size:
            size_ = {static_cast<int>(
                         std::clamp<std::int64_t>(packedWidth(head.value), 16, mostPictureWidth)),
                     static_cast<int>(std::clamp<std::int64_t>(packedHeight(head.value), 16,
                                                               mostPictureHeight))};
            break;
        case MediaWish::taken:
            taken_ = true;
            if (std::exchange(late_, false))
                takeFrame(sink_.videoFrame());
            break;
        }
    }

private:
    void connectPlayer() {
        QObject::connect(&player_, &QMediaPlayer::errorOccurred, &player_,
                         [](QMediaPlayer::Error, const QString& said) {
                             tell(MediaEvent::failed, 0, said.left(200).toUtf8());
                         });
        QObject::connect(&player_, &QMediaPlayer::mediaStatusChanged, &player_,
                         [this](QMediaPlayer::MediaStatus status) { takeStatus(status); });
        QObject::connect(&player_, &QMediaPlayer::durationChanged, &player_,
                         [](qint64 time) { tell(MediaEvent::duration, time); });
        QObject::connect(&player_, &QMediaPlayer::positionChanged, &player_,
                         [](qint64 time) { tell(MediaEvent::position, time); });
        QObject::connect(&player_, &QMediaPlayer::playbackStateChanged, &player_,
                         [](QMediaPlayer::PlaybackState state) {
                             tell(MediaEvent::playing, state == QMediaPlayer::PlayingState);
                         });
        QObject::connect(&player_, &QMediaPlayer::metaDataChanged, &player_,
                         [this] { tellWords(); });
    }

    void takeStatus(QMediaPlayer::MediaStatus status) {
        if (status == QMediaPlayer::EndOfMedia) {
            tell(MediaEvent::ended, 0);
        } else if (status == QMediaPlayer::LoadedMedia && !std::exchange(ready_, true)) {
            if (!player_.hasVideo() && !player_.hasAudio()) {
                tell(MediaEvent::failed, 0);
                return;
            }
            tell(MediaEvent::duration, player_.duration());
            tellWords();
            tell(MediaEvent::ready, (player_.hasVideo() ? mediaTrait::video : 0) |
                                        (player_.hasAudio() ? mediaTrait::audio : 0) |
                                        (output_ ? mediaTrait::soundDevice : 0) |
                                        (player_.isSeekable() ? mediaTrait::seekable : 0));
            player_.pause(); // shows the first picture
        }
    }

    void tellWords() {
        const QMediaMetaData words = player_.metaData();
        tellText(MediaEvent::title, words.stringValue(QMediaMetaData::Title));
        QString artist = words.stringValue(QMediaMetaData::ContributingArtist);
        if (artist.isEmpty())
            artist = words.stringValue(QMediaMetaData::Author);
        tellText(MediaEvent::artist, artist);
        for (const auto key : {QMediaMetaData::CoverArtImage, QMediaMetaData::ThumbnailImage})
            if (const QVariant cover = words.value(key); cover.canConvert<QImage>()) {
                tellPicture(MediaEvent::cover, cover.value<QImage>());
                return;
            }
    }

    void takeFrame(const QVideoFrame& frame) {
        if (!frame.isValid())
            return;
        // The preview draws slower than the film runs: those between are left out.
        if (!taken_) {
            late_ = true;
            return;
        }
        if (tellPicture(MediaEvent::picture, frame.toImage()))
            taken_ = false;
    }

    bool tellPicture(MediaEvent event, QImage image) {
        if (image.isNull())
            return false;
        if (image.width() > size_.width() || image.height() > size_.height())
            image = image.scaled(size_, Qt::KeepAspectRatio, Qt::SmoothTransformation);
        image = std::move(image).convertToFormat(QImage::Format_RGB32);
        const QByteArray bytes =
            QByteArray::fromRawData(reinterpret_cast<const char*>(image.constBits()),
                                    static_cast<qsizetype>(image.sizeInBytes()));
        tell(event, packedSize(image.width(), image.height()), bytes);
        return true;
    }

    QMediaPlayer player_;
    QVideoSink sink_;
    std::optional<QAudioOutput> output_;
    QSize size_{1280, 720};
    bool ready_ = false;
    bool taken_ = true;
    bool late_ = false;
};

/// Reads wishes until the preview goes.
class Wishes {
public:
    explicit Wishes(Player& player)
        : player_(player), notifier_(socketNumber, QSocketNotifier::Read) {
        QObject::connect(&notifier_, &QSocketNotifier::activated, &notifier_, [this] { read(); });
    }

private:
    void read() {
        const ssize_t got = ::recv(socketNumber, reinterpret_cast<char*>(&head_) + filled_,
                                   sizeof head_ - filled_, MSG_DONTWAIT);
        if (got == 0)
            ::_exit(0);
        if (got < 0)
            return;
        filled_ += static_cast<std::size_t>(got);
        if (filled_ < sizeof head_)
            return;
        filled_ = 0;
        player_.obey(head_);
    }

    Player& player_;
    QSocketNotifier notifier_;
    MediaHead head_;
    std::size_t filled_ = 0;
};

} // namespace

int main(int argc, char** argv) {
    limitThisProcess();
    // The decoders talk to themselves; what matters is told through the socket.
    const int nowhere = ::open("/dev/null", O_WRONLY | O_CLOEXEC);
    ::dup2(nowhere, STDERR_FILENO);
    // No window is opened here, and of the decoders that the toolkit brings, these need no others.
    ::setenv("QT_QPA_PLATFORM", "offscreen", 1);
    ::setenv("QT_MEDIA_BACKEND", "ffmpeg", 1);
    QGuiApplication application(argc, argv);
    if (!QMediaPlayer().isAvailable()) {
        tell(MediaEvent::unavailable, 0);
        return 1;
    }
    Player player;
    const Wishes wishes(player);
    const int status = QGuiApplication::exec();
    ::_exit(status);
}
