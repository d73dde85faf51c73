#include "bench/preview/MadeDocuments.h"
#include "bench/preview/PreviewBench.h"
#include "platform/documents/preview/ZoomWidget.h"
#include "platform/ui/Canvas.h"
#include "tests/documents/OneDocument.h"
#include "tests/documents/ScreenHouse.h"

#include <QApplication>
#include <QBackingStore>
#include <QEvent>
#include <QEventLoop>
#include <QImage>
#include <QImageReader>
#include <QPdfDocument>

#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <functional>
#include <utility>

namespace {

using namespace platform;

constexpr int rounds = 21;
constexpr int pages = 500;

/// Looks at what has been painted into the window, not at what was asked to be.
class Eye : public QObject {
public:
    Eye() { QCoreApplication::instance()->installEventFilter(this); }
    bool eventFilter(QObject* object, QEvent* event) override {
        if (event->type() == QEvent::Paint)
            if (auto* const found = dynamic_cast<ZoomWidget*>(object))
                widget = painted_ = found;
        return false;
    }
    /// The red mark of the document is on the screen, `below` pixels under the preview's top edge.
    bool seesMark(const std::function<int(const ZoomWidget&)>& below) {
        const ZoomWidget* const painted = std::exchange(painted_, nullptr);
        if (!painted)
            return false;
        const auto* const screen = dynamic_cast<QImage*>(painted->backingStore()->paintDevice());
        const QPoint point =
            painted->mapTo(painted->window(), QPoint(painted->width() / 2, below(*painted)));
        if (!screen || !screen->rect().contains(point))
            std::abort();
        const QColor color = screen->pixelColor(point);
        return color.red() > 150 && color.green() < 90 && color.blue() < 90;
    }
    ZoomWidget* widget = nullptr;

private:
    ZoomWidget* painted_ = nullptr;
};

struct Opening {
    double toScreen = 0;
    double toShown = 0;
    double zoom = 1;
};

Opening open(test::ScreenHouse& house, const Url& document,
             const std::function<int(const ZoomWidget&)>& below) {
    Eye eye;
    Opening opening;
    const auto start = SteadyClock::now();
    const auto screen = std::make_shared<test::OneDocument>(document);
    // When the document took the place of the empty screen.
    screen->whenShown = [&] { opening.toShown = millisecondsSince(start); };
    house.navigation->setViewControllers({screen}, false);
    while (!eye.seesMark(below))
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
    opening.toScreen = millisecondsSince(start);
    opening.zoom = eye.widget->zoom();
    house.navigation->setViewControllers({std::make_shared<ViewController>()}, false);
    settle(std::chrono::milliseconds(150));
    return opening;
}

double barePage(const std::string& path, double zoom) {
    const auto start = SteadyClock::now();
    QPdfDocument document;
    if (document.load(QString::fromStdString(path)) != QPdfDocument::Error::None)
        std::abort();
    const QSizeF page = document.pagePointSize(0);
    if (document.render(0, (page * zoom).toSize()).isNull())
        std::abort();
    return millisecondsSince(start);
}

/// A screen with nothing on it.
struct EmptyView : View {
    void draw(Canvas&) override { drawn = true; }
    bool drawn = false;
};
struct EmptyScreen : ViewController {
    void loadView() override { setView(empty); }
    const std::shared_ptr<EmptyView> empty = std::make_shared<EmptyView>();
};

double emptyScreen(test::ScreenHouse& house) {
    const auto start = SteadyClock::now();
    const auto screen = std::make_shared<EmptyScreen>();
    house.navigation->setViewControllers({screen}, false);
    while (!screen->empty->drawn)
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
    const double time = millisecondsSince(start);
    house.navigation->setViewControllers({std::make_shared<ViewController>()}, false);
    settle(std::chrono::milliseconds(50));
    return time;
}

double barePicture(const std::string& path) {
    const auto start = SteadyClock::now();
    if (QImageReader(QString::fromStdString(path)).read().isNull())
        std::abort();
    return millisecondsSince(start);
}

void measurePdf(test::ScreenHouse& house, Cover cover, const char* what) {
    const std::string path = house.givenFile("Report.pdf", madePdf(pages, cover));
    const auto below = [](const ZoomWidget& widget) {
        return 12 + static_cast<int>((markTop + markBottom) / 2 * widget.zoom());
    };
    settle(std::chrono::seconds(2)); // the store takes note of it
    const double zoom = open(house, Url::file(path), below).zoom;
    std::vector<double> ours;
    std::vector<double> shown;
    std::vector<double> bare;
    std::vector<double> empty;
    for (int i = 0; i < rounds; ++i) {
        bare.push_back(barePage(path, zoom));
        const Opening opening = open(house, Url::file(path), below);
        ours.push_back(opening.toScreen);
        shown.push_back(opening.toShown);
        empty.push_back(emptyScreen(house));
    }
    print(what, ours, "QPdfDocument, the page as large", bare, "≤ 1.2");
    std::printf("of that until it was read and drawn: %.2f ms; an empty screen on screen: %.2f ms; "
                "the quickest of %d: %.2f ms, of the reference %.2f ms\n",
                at(shown, 0.5), at(empty, 0.5), rounds, at(ours, 0), at(bare, 0));
}

void measurePicture(test::ScreenHouse& house) {
    const std::string path = house.givenFile("Coast.jpg", madePhoto(6000, 4000));
    const auto below = [](const ZoomWidget& widget) { return widget.height() / 2; };
    settle(std::chrono::seconds(2));
    open(house, Url::file(path), below);
    std::vector<double> ours;
    std::vector<double> shown;
    std::vector<double> bare;
    for (int i = 0; i < rounds; ++i) {
        bare.push_back(barePicture(path));
        const Opening opening = open(house, Url::file(path), below);
        ours.push_back(opening.toScreen);
        shown.push_back(opening.toShown);
    }
    print("a JPEG of 24 megapixels on screen", ours, "QImageReader", bare, "≤ 1.2");
    std::printf("of that until it was read and scaled: %.2f ms\n", at(shown, 0.5));
}

} // namespace

void measureOpening(test::ScreenHouse& house) {
    measurePdf(house, Cover::plain, "first page of a 500-page PDF on screen");
    measurePdf(house, Cover::photograph, "the same, a photograph of 4 megapixels on it");
    measurePicture(house);
}
