#pragma once

#include <QAbstractButton>
#include <QAbstractSlider>

#include <functional>

namespace platform {

/// A button that shows what it does.
class GlyphButton final : public QAbstractButton {
public:
    enum class Glyph { play, pause, sound, muted };
    GlyphButton(QWidget* parent, std::function<void()> press);
    void setGlyph(Glyph glyph, const QString& name);
    Glyph glyph() const { return glyph_; }

    /// The shape in a square of that edge around the origin.
    static void paint(QPainter& painter, Glyph glyph, double edge);

protected:
    void paintEvent(QPaintEvent* event) override;
    bool event(QEvent* event) override;

private:
    Glyph glyph_ = Glyph::play;
};

/// A line with a knob on it, in the direction of time: from left to right in every language.
class LineSlider final : public QAbstractSlider {
public:
    /// `moved` is called when the user has chosen a value.
    LineSlider(QWidget* parent, std::function<void(int value)> moved);
    /// `drawn` is called while a finger draws the knob.
    void setDrawnHandler(std::function<void(int value)> drawn) { drawn_ = std::move(drawn); }

protected:
    void paintEvent(QPaintEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;
    void sliderChange(SliderChange change) override;

private:
    void goTo(double x);

    std::function<void(int)> moved_;
    std::function<void(int)> drawn_;
};

} // namespace platform
