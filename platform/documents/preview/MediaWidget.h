#pragma once

#include "platform/documents/preview/MediaControls.h"

#include <QImage>
#include <QWidget>

#include <cstdint>
#include <functional>
#include <string>

class QLabel;

namespace platform {

/// A film or a piece of music, with what one needs to play it. Knows nothing of who plays it:
/// shows what it is told, and says what the user wants. Times in milliseconds.
class MediaWidget final : public QWidget {
public:
    struct Wishes {
        std::function<void(bool play)> play;
        std::function<void(std::int64_t time)> seek;
        /// Of 1000.
        std::function<void(int volume)> volume;
        std::function<void(bool mute)> mute;
        /// In pixels.
        std::function<void(QSize size)> size;
    };
    explicit MediaWidget(Wishes wishes);

    /// What there is to see and hear, by the bits of MediaTrait.
    void setTraits(std::int64_t traits);
    void setName(const QString& name, const QImage& icon);
    void setTitle(const QString& title);
    void setArtist(const QString& artist);
    void setCover(QImage cover);
    void setPicture(QImage picture);
    void setDuration(std::int64_t time);
    void setPosition(std::int64_t time);
    void setPlaying(bool playing);

    bool isPlaying() const { return playing_; }
    bool hasPicture() const { return !picture_.isNull(); }
    std::int64_t position() const { return position_; }
    QString timeText() const;
    QString remark() const;
    LineSlider& timeLine() { return *timeLine_; }
    GlyphButton& playButton() { return *play_; }

protected:
    void paintEvent(QPaintEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;
    void hideEvent(QHideEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;

private:
    void layOut();
    QRectF stage() const;
    void paintFilm(QPainter& painter);
    void paintMusic(QPainter& painter);
    void showTimes(std::int64_t at);
    void seek(std::int64_t time);
    void changeVolume(int by);
    void setMuted(bool muted);

    Wishes wishes_;
    GlyphButton* play_;
    GlyphButton* mute_;
    LineSlider* timeLine_;
    LineSlider* volume_;
    QLabel* passed_;
    QLabel* whole_;
    QLabel* remark_;
    QString name_;
    QString title_;
    QString artist_;
    QImage icon_;
    QImage cover_;
    QImage picture_;
    double barTop_ = 0;
    std::int64_t duration_ = 0;
    std::int64_t position_ = 0;
    bool film_ = false;
    bool playing_ = false;
    bool muted_ = false;
};

} // namespace platform
