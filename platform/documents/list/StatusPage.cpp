#include "platform/documents/list/StatusPage.h"

#include "platform/ui/Canvas.h"
#include "platform/ui/Theme.h"

#include <initializer_list>
#include <utility>

namespace platform {
namespace {

constexpr double messageGap = 8;
constexpr double buttonGap = 16;
constexpr Color quietLine = Color::hex(0xB6BECA);
constexpr Color quietFill = Color::hex(0xF1F3F7);

Path roundedPolygon(std::initializer_list<Point> points) {
    Path path;
    bool first = true;
    for (const Point point : points) {
        if (std::exchange(first, false))
            path.moveTo(point);
        else
            path.lineTo(point);
    }
    path.close();
    return path;
}

void drawFolder(Canvas& canvas) {
    const Path back = roundedPolygon({{14, 26}, {38, 26}, {45, 34}, {82, 34}, {82, 74}, {14, 74}});
    canvas.fill(back, quietFill);
    canvas.stroke(back, quietLine, 2);
    Path line;
    line.moveTo({14, 44});
    line.lineTo({82, 44});
    canvas.stroke(line, quietLine, 2);
}

void drawGlass(Canvas& canvas) {
    canvas.fillEllipse({22, 18, 44, 44}, quietFill);
    canvas.strokeEllipse({22, 18, 44, 44}, quietLine, 3);
    Path handle;
    handle.moveTo({60, 56});
    handle.lineTo({78, 76});
    canvas.stroke(handle, quietLine, 5);
}

void drawWarning(Canvas& canvas) {
    const Path triangle = roundedPolygon({{48, 18}, {82, 76}, {14, 76}});
    canvas.fill(triangle, quietFill);
    canvas.stroke(triangle, quietLine, 2.5);
    Path line;
    line.moveTo({48, 40});
    line.lineTo({48, 58});
    canvas.stroke(line, quietLine, 4);
    canvas.fillEllipse({45.5, 64, 5, 5}, quietLine);
}

} // namespace

class StatusPage::Picture : public View {
public:
    void setDrawing(Drawing drawing) {
        drawing_ = drawing;
        setNeedsDisplay();
    }

protected:
    void draw(Canvas& canvas) override {
        switch (drawing_) {
        case Drawing::emptyFolder:
            drawFolder(canvas);
            break;
        case Drawing::nothingFound:
            drawGlass(canvas);
            break;
        case Drawing::problem:
            drawWarning(canvas);
            break;
        }
    }

private:
    Drawing drawing_ = Drawing::emptyFolder;
};

StatusPage::StatusPage()
    : picture_(std::make_shared<Picture>()),
      title_(addText(TextStyle::headline, Theme::text, 0)),
      message_(addText(TextStyle::subheadline, Theme::secondaryText, messageGap)),
      button_(std::make_shared<Button>(ButtonType::system)) {
    setPicture(picture_);
    addControl(button_, buttonGap);
    button_->addAction(ControlEvent::touchUpInside, [this] {
        if (const auto action = action_)
            action();
    });
}

void StatusPage::setContent(const Content& content, std::function<void()> action) {
    picture_->setDrawing(content.drawing);
    title_->setText(content.title);
    message_->setText(content.message);
    message_->setHidden(content.message.empty());
    button_->setTitle(content.button);
    button_->setHidden(content.button.empty());
    action_ = std::move(action);
    setNeedsLayout();
}

} // namespace platform
