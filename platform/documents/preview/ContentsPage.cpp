#include "platform/documents/preview/ContentsPage.h"

#include "platform/ui/Direction.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <QHBoxLayout>
#include <QLabel>
#include <QPainter>
#include <QVBoxLayout>

#include <cmath>

namespace platform {
namespace {

constexpr int padding = 12;
constexpr int lineGap = 8;

QLabel* makeText(const std::string& text, TextStyle style, const Color& color) {
    auto* const label = new QLabel(toQt(text));
    label->setFont(toQt(Font::preferred(style)));
    label->setWordWrap(true);
    label->setTextFormat(Qt::PlainText);
    // By the program's direction, also for a text of the other one.
    label->setAlignment(Qt::AlignAbsolute | Qt::AlignVCenter |
                        (readingSign() < 0 ? Qt::AlignRight : Qt::AlignLeft));
    QPalette colors = label->palette();
    colors.setColor(QPalette::WindowText, toQt(color));
    label->setPalette(colors);
    return label;
}

/// As high as the first line of the text beside it.
class Sign final : public QWidget {
public:
    Sign() {
        const int edge = static_cast<int>(Font::preferred(TextStyle::footnote).lineHeight());
        setFixedSize(edge, edge);
    }

protected:
    void paintEvent(QPaintEvent* /*event*/) override {
        QPainter painter(this);
        paintImage(painter, Image::system(SystemImage::warning).tinted(Theme::secondaryText),
                   rect());
    }
};

} // namespace

ContentsPage::ContentsPage()
    : head_(new QWidget(this)), lines_(new QVBoxLayout(head_)), list_(new ContentsList) {
    auto* const column = new QVBoxLayout(this);
    column->setContentsMargins(0, 0, 0, 1);
    column->setSpacing(1); // the line between the two
    column->addWidget(head_);
    column->addWidget(list_, 1);
    const int margin = static_cast<int>(std::lround(pageMargin()));
    lines_->setContentsMargins(margin, padding, margin, padding);
    lines_->setSpacing(lineGap);
    setFocusProxy(list_);
}

void ContentsPage::set(std::shared_ptr<const ContentsTree> tree, const std::string& summary,
                       const std::vector<Remark>& remarks) {
    std::vector<Remark> wanted{{summary, false}};
    wanted.insert(wanted.end(), remarks.begin(), remarks.end());
    if (wanted != shown_) {
        while (QLayoutItem* const item = lines_->takeAt(0)) {
            delete item->widget();
            delete item;
        }
        lines_->addWidget(makeText(summary, TextStyle::subheadline, Theme::text));
        for (const Remark& each : remarks)
            addRemark(each);
        shown_ = std::move(wanted);
    }
    list_->setTree(std::move(tree));
}

void ContentsPage::addRemark(const Remark& remark) {
    QLabel* const text = makeText(remark.text, TextStyle::footnote, Theme::secondaryText);
    if (!remark.warns) {
        lines_->addWidget(text);
        return;
    }
    auto* const line = new QWidget;
    auto* const row = new QHBoxLayout(line);
    row->setContentsMargins(0, 0, 0, 0);
    row->setSpacing(lineGap);
    row->addWidget(new Sign, 0, Qt::AlignTop);
    row->addWidget(text, 1);
    lines_->addWidget(line);
}

std::string ContentsPage::headText() const {
    std::string all;
    for (const Remark& each : shown_)
        all += each.text + '\n';
    return all;
}

void ContentsPage::paintEvent(QPaintEvent* /*event*/) {
    QPainter painter(this);
    painter.fillRect(rect(), toQt(Theme::page));
    painter.fillRect(head_->geometry(), toQt(Theme::bar));
    painter.fillRect(QRect(0, head_->geometry().bottom() + 1, width(), 1), toQt(Theme::hairline));
}

} // namespace platform
