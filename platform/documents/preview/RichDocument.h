#pragma once

#include "platform/base/Result.h"
#include "platform/base/Url.h"

#include <QHash>
#include <QImage>
#include <QPointF>
#include <QSizeF>
#include <QString>

#include <memory>
#include <optional>
#include <string>

class QEventLoop;
class QTextDocument;

namespace platform {

class PreviewToken;

enum class RichFormat { markdown, html };

/// A text with structure and pictures, laid out as one column in the middle of a page as wide as
/// the view. Made, used and destroyed on one queue: what the toolkit lays out belongs to its
/// thread. Points; the page has its margins.
class RichDocument {
public:
    RichDocument();
    ~RichDocument();

    struct Shape {
        double viewWidth = 0;
        /// Of the letters.
        double scale = 1;
        bool operator==(const Shape&) const = default;
    };

    /// Reads the text, and pictures from the text itself and from the folder that it is in, nowhere
    /// else. `false` when it is too long or too intricate to be shown as more than its source.
    Result<bool> read(const Url& file, const std::string& path, RichFormat format,
                      PreviewToken& token);
    bool isRead() const { return read_; }
    /// Lays out what was read; answers where that which was at `top` is now.
    double layOut(const Shape& shape, double top);
    QSizeF pageSize() const;
    /// All of its text, once it is laid out.
    QString plainText() const;
    /// The part of the page from `top` on, that high; so many pixels wide.
    QImage draw(double top, double height, int width) const;
    /// "" for none.
    QString linkAt(QPointF place) const;
    std::optional<double> topOfAnchor(const QString& name) const;

private:
    QPointF corner() const;
    double columnWidth() const;

    /// The toolkit's layout starts timers, which a thread has only with one of these.
    std::unique_ptr<QEventLoop> loop_;
    bool read_ = false;
    QString html_;
    QHash<QString, QImage> pictures_;
    Shape shape_;
    std::unique_ptr<QTextDocument> document_;
};

} // namespace platform
