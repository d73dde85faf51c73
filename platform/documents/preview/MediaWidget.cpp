#include "platform/documents/preview/MediaWidget.h"

#include "platform/base/Text.h"
#include "platform/documents/preview/MediaMessages.h"
#include "platform/ui/Direction.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <QKeyEvent>
#include <QLabel>
#include <QLocale>
#include <QPainter>
#include <QPainterPath>
#include <QTime>

#include <algorithm>
#include <limits>

namespace platform {
namespace {

using Glyph = GlyphButton::Glyph;

/// One line of controls needs so much; below it they stand in two.
constexpr int wideBar = 560;
constexpr int gap = 8;
constexpr int target = static_cast<int>(Theme::minimumTarget);
constexpr int volumeWidth = 120;
constexpr int fullVolume = 1000;
constexpr int volumeStep = 50;
constexpr std::int64_t jump = 5000;
constexpr double coverEdge = 260;
constexpr double overlayRadius = 34;
/// Longer than a day: a clock's hours.
constexpr std::int64_t dayLong = 24LL * 3600 * 1000;

QLabel* makeLabel(QWidget* parent, Qt::Alignment alignment) {
    auto* const label = new QLabel(parent);
    label->setFont(toQt(Font::preferred(TextStyle::footnote)));
    label->setAlignment(alignment);
    label->setTextFormat(Qt::PlainText);
    QPalette colors = label->palette();
    colors.setColor(QPalette::WindowText, toQt(Theme::secondaryText));
    label->setPalette(colors);
    return label;
}

QString timeText(std::int64_t time) {
    const QLocale locale;
    const std::int64_t within = std::max<std::int64_t>(0, time) % dayLong;
    const QTime clock = QTime::fromMSecsSinceStartOfDay(static_cast<int>(within));
    if (time < 3600 * 1000)
        return locale.toString(clock, QStringLiteral("m:ss"));
    const QString hours = locale.toString(static_cast<qlonglong>(time / (3600 * 1000)));
    return hours + locale.toString(clock, QStringLiteral(":mm:ss"));
}

int sliderValue(std::int64_t time) {
    return static_cast<int>(std::clamp<std::int64_t>(time, 0, std::numeric_limits<int>::max()));
}

} // namespace

MediaWidget::MediaWidget(Wishes wishes)
    : wishes_(std::move(wishes)),
      play_(new GlyphButton(this, [this] { wishes_.play(!playing_); })),
      mute_(new GlyphButton(this, [this] { setMuted(!muted_); })),
      timeLine_(new LineSlider(this, [this](int time) { seek(time); })),
      volume_(new LineSlider(this, [this](int volume) { wishes_.volume(volume); })),
      passed_(makeLabel(this, Qt::AlignLeft | Qt::AlignVCenter)),
      whole_(makeLabel(this, Qt::AlignRight | Qt::AlignVCenter)),
      remark_(makeLabel(this, Qt::AlignHCenter | Qt::AlignVCenter)) {
    setFocusPolicy(Qt::StrongFocus);
    remark_->setWordWrap(true);
    remark_->hide();
    timeLine_->setSingleStep(static_cast<int>(jump));
    timeLine_->setPageStep(static_cast<int>(4 * jump));
    timeLine_->setAccessibleName(toQt(localized("Position")));
    timeLine_->setDrawnHandler([this](int time) { showTimes(time); });
    volume_->setRange(0, fullVolume);
    volume_->setSingleStep(volumeStep);
    volume_->setValue(fullVolume);
    volume_->setAccessibleName(toQt(localized("Volume")));
    setPlaying(false);
    mute_->setGlyph(Glyph::sound, toQt(localized("Mute")));
    showTimes(0);
}

void MediaWidget::setTraits(std::int64_t traits) {
    film_ = (traits & mediaTrait::video) != 0;
    const bool sounds = (traits & mediaTrait::audio) != 0;
    const bool heard = sounds && (traits & mediaTrait::soundDevice) != 0;
    timeLine_->setEnabled((traits & mediaTrait::seekable) != 0);
    mute_->setEnabled(heard);
    volume_->setEnabled(heard);
    remark_->setText(sounds && !heard
                         ? toQt(localized("There is no device here to hear the sound from."))
                         : QString());
    layOut();
}

void MediaWidget::setName(const QString& name, const QImage& icon) {
    name_ = name;
    icon_ = icon;
    update();
}

void MediaWidget::setTitle(const QString& title) {
    title_ = title;
    update();
}

void MediaWidget::setArtist(const QString& artist) {
    artist_ = artist;
    update();
}

void MediaWidget::setCover(QImage cover) {
    cover_ = std::move(cover);
    update();
}

void MediaWidget::setPicture(QImage picture) {
    picture_ = std::move(picture);
    update(stage().toAlignedRect());
}

void MediaWidget::setDuration(std::int64_t time) {
    duration_ = time;
    timeLine_->setRange(0, sliderValue(time));
    showTimes(position_);
}

void MediaWidget::setPosition(std::int64_t time) {
    position_ = time;
    if (timeLine_->isSliderDown())
        return;
    timeLine_->setValue(sliderValue(time));
    showTimes(time);
}

void MediaWidget::setPlaying(bool playing) {
    playing_ = playing;
    play_->setGlyph(playing ? Glyph::pause : Glyph::play,
                    toQt(playing ? localized("Pause") : localized("Play")));
    update();
}

void MediaWidget::setMuted(bool muted) {
    muted_ = muted;
    mute_->setGlyph(muted ? Glyph::muted : Glyph::sound,
                    toQt(muted ? localized("Unmute") : localized("Mute")));
    wishes_.mute(muted);
}

void MediaWidget::seek(std::int64_t time) {
    const std::int64_t wanted =
        std::clamp<std::int64_t>(time, 0, std::max<std::int64_t>(0, duration_));
    setPosition(wanted);
    wishes_.seek(wanted);
}

void MediaWidget::changeVolume(int by) {
    volume_->setValue(volume_->value() + by);
    wishes_.volume(volume_->value());
}

QString MediaWidget::timeText() const {
    return passed_->text() + QStringLiteral(" / ") + whole_->text();
}

QString MediaWidget::remark() const {
    return remark_->text();
}

void MediaWidget::showTimes(std::int64_t at) {
    passed_->setText(platform::timeText(at));
    whole_->setText(platform::timeText(duration_));
}

void MediaWidget::layOut() {
    const bool wide = width() >= wideBar;
    const int margin = static_cast<int>(pageMargin());
    const int left = margin - 10; // what a button's target has around its glyph
    const int right = width() - left;
    const int timeWidth =
        QFontMetrics(passed_->font()).horizontalAdvance(platform::timeText(duration_)) + gap;
    const int line = std::max(target, passed_->sizeHint().height());
    const int remark =
        remark_->text().isEmpty() ? 0 : remark_->heightForWidth(width() - 2 * margin) + gap;
    barTop_ = height() - remark - 2 * gap - (wide ? line : 2 * line);
    remark_->setGeometry(margin, static_cast<int>(barTop_) + gap, width() - 2 * margin,
                         std::max(0, remark - gap));
    remark_->setVisible(remark > 0);
    int y = static_cast<int>(barTop_) + gap + remark;
    volume_->setVisible(wide);
    const auto centred = [&](QWidget& each, int x, int wideness) {
        each.setGeometry(x, y + (line - target) / 2, wideness, target);
    };
    if (wide) {
        centred(*play_, left, target);
        centred(*passed_, left + target + gap, timeWidth);
        const int lineLeft = left + target + gap + timeWidth;
        const int end = right - volumeWidth - target - gap - timeWidth;
        centred(*timeLine_, lineLeft, std::max(target, end - lineLeft));
        centred(*whole_, end, timeWidth);
        centred(*mute_, right - volumeWidth - target, target);
        centred(*volume_, right - volumeWidth, volumeWidth);
    } else {
        centred(*timeLine_, left, right - left);
        y += line;
        centred(*passed_, margin, timeWidth + gap);
        centred(*play_, (width() - target) / 2, target);
        centred(*mute_, right - timeWidth - gap - target, target);
        centred(*whole_, width() - margin - timeWidth - gap, timeWidth + gap);
    }
    update();
}

QRectF MediaWidget::stage() const {
    return {0, 0, static_cast<double>(width()), barTop_};
}

void MediaWidget::paintEvent(QPaintEvent* /*event*/) {
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setRenderHint(QPainter::SmoothPixmapTransform);
    if (film_)
        paintFilm(painter);
    else
        paintMusic(painter);
    const QRectF bar(0, barTop_, width(), height() - barTop_);
    painter.fillRect(bar, toQt(Theme::bar));
    painter.fillRect(QRectF(0, barTop_, width(), 1), toQt(Theme::hairline));
}

void MediaWidget::paintFilm(QPainter& painter) {
    const QRectF whole = stage();
    painter.fillRect(whole, toQt(Theme::text));
    if (!picture_.isNull()) {
        const QSizeF size = QSizeF(picture_.size()).scaled(whole.size(), Qt::KeepAspectRatio);
        QRectF place(QPointF(), size);
        place.moveCenter(whole.center());
        painter.drawImage(place, picture_);
    }
    if (playing_)
        return;
    painter.setPen(QPen(toQt(Color::white.withAlpha(0.9)), 2));
    painter.setBrush(toQt(Theme::text.withAlpha(0.6)));
    painter.drawEllipse(whole.center(), overlayRadius, overlayRadius);
    painter.translate(whole.center());
    painter.setBrush(Qt::white);
    GlyphButton::paint(painter, Glyph::play, overlayRadius);
    painter.resetTransform();
}

void MediaWidget::paintMusic(QPainter& painter) {
    const QRectF whole = stage();
    painter.fillRect(whole, toQt(Theme::page));
    const Font titleFont = Font::preferred(TextStyle::headline);
    const Font artistFont = Font::preferred(TextStyle::subheadline);
    const double texts = titleFont.lineHeight() + artistFont.lineHeight() + 2 * gap;
    const double margin = pageMargin();
    const double edge = std::max(
        0.0, std::min({coverEdge, whole.width() - 2 * margin, whole.height() - texts - 4 * gap}));
    QRectF tile((whole.width() - edge) / 2, (whole.height() - edge - texts) / 2, edge, edge);
    QPainterPath shape;
    shape.addRoundedRect(tile, Theme::overlayCorner, Theme::overlayCorner);
    painter.save();
    painter.setClipPath(shape);
    painter.fillRect(tile, toQt(Theme::selection));
    const QImage& shown = cover_.isNull() ? icon_ : cover_;
    if (!shown.isNull()) {
        const QSizeF size =
            QSizeF(shown.size())
                .scaled(cover_.isNull() ? tile.size() * 0.45 : tile.size(), Qt::KeepAspectRatio);
        QRectF place(QPointF(), size);
        place.moveCenter(tile.center());
        painter.drawImage(place, shown);
    }
    painter.restore();
    painter.setPen(toQt(Theme::hairline));
    painter.setBrush(Qt::NoBrush);
    painter.drawPath(shape);
    const auto line = [&](const QString& text, const Font& font, const Color& color, double y) {
        painter.setFont(toQt(font));
        painter.setPen(toQt(color));
        const QRectF box(margin, y, whole.width() - 2 * margin, font.lineHeight());
        painter.drawText(
            box, Qt::AlignCenter,
            painter.fontMetrics().elidedText(text, Qt::ElideMiddle, static_cast<int>(box.width())));
    };
    line(title_.isEmpty() ? name_ : title_, titleFont, Theme::text, tile.bottom() + 2 * gap);
    line(artist_, artistFont, Theme::secondaryText,
         tile.bottom() + 2 * gap + titleFont.lineHeight());
}

void MediaWidget::resizeEvent(QResizeEvent* event) {
    QWidget::resizeEvent(event);
    layOut();
    wishes_.size((stage().size() * devicePixelRatioF()).toSize());
}

/// Under another screen nothing is seen of it, so nothing is heard either.
void MediaWidget::hideEvent(QHideEvent* event) {
    QWidget::hideEvent(event);
    if (playing_)
        wishes_.play(false);
}

void MediaWidget::mousePressEvent(QMouseEvent* event) {
    event->accept();
}

void MediaWidget::mouseReleaseEvent(QMouseEvent* event) {
    if (event->button() == Qt::LeftButton && film_ && stage().contains(event->position()))
        wishes_.play(!playing_);
}

void MediaWidget::keyPressEvent(QKeyEvent* event) {
    // Alt+Left, for one, is the screen's.
    if (event->modifiers() & (Qt::AltModifier | Qt::MetaModifier)) {
        QWidget::keyPressEvent(event);
        return;
    }
    switch (event->key()) {
    case Qt::Key_Space:
    case Qt::Key_MediaTogglePlayPause:
        wishes_.play(!playing_);
        break;
    case Qt::Key_Left:
        seek(position_ - jump);
        break;
    case Qt::Key_Right:
        seek(position_ + jump);
        break;
    case Qt::Key_Home:
        seek(0);
        break;
    case Qt::Key_Up:
        changeVolume(volumeStep);
        break;
    case Qt::Key_Down:
        changeVolume(-volumeStep);
        break;
    case Qt::Key_M:
        setMuted(!muted_);
        break;
    default:
        QWidget::keyPressEvent(event);
    }
}

} // namespace platform
