#include "platform/documents/preview/VectorPicture.h"

#include "platform/base/Text.h"
#include "platform/documents/preview/ChildWork.h"
#include "platform/documents/preview/DrawnPicture.h"

#include <QCoreApplication>
#include <QFile>

#include <algorithm>
#include <cstring>
#include <string_view>
#include <unistd.h>

namespace platform {
namespace {

constexpr const char* drawerName = "/tavrin-draw-picture";
/// Longer than the drawer may work: on a busy machine it gets a part of the time.
constexpr Duration longestDrawing = std::chrono::seconds(20);

bool isDrawn(const DrawnHead& head) {
    return head.state == DrawnHead::State::drawn && head.width > 0 && head.height > 0 &&
           head.fullWidth > 0 && head.fullHeight > 0 && head.width <= longestDrawnEdge &&
           head.height <= longestDrawnEdge &&
           static_cast<double>(head.width) * head.height <= 2 * mostDrawnPixels;
}

/// Puts the picture together from the pieces in which it comes.
class Arriving {
public:
    /// False for what is no picture.
    bool add(std::string_view bytes) {
        const std::size_t ofHead = std::min(bytes.size(), sizeof head_ - headBytes_);
        std::memcpy(reinterpret_cast<char*>(&head_) + headBytes_, bytes.data(), ofHead);
        headBytes_ += ofHead;
        bytes.remove_prefix(ofHead);
        if (headBytes_ < sizeof head_)
            return true;
        if (image_.isNull() && isDrawn(head_))
            image_ = QImage(head_.width, head_.height, QImage::Format_ARGB32_Premultiplied);
        if (bytes.size() > size() - filled_)
            return false;
        if (!bytes.empty())
            std::memcpy(image_.bits() + filled_, bytes.data(), bytes.size());
        filled_ += bytes.size();
        return true;
    }
    bool isComplete() const { return !image_.isNull() && filled_ == size(); }
    bool isDamaged() const {
        return headBytes_ == sizeof head_ && head_.state == DrawnHead::State::damaged;
    }
    Picture take() { return {std::move(image_), {head_.fullWidth, head_.fullHeight}}; }

private:
    std::size_t size() const { return static_cast<std::size_t>(image_.sizeInBytes()); }

    DrawnHead head_;
    std::size_t headBytes_ = 0;
    QImage image_;
    std::size_t filled_ = 0;
};

} // namespace

Result<Picture> drawVectorPicture(const Url& file, QFile& content, double mostPixels,
                                  PreviewToken& token) {
    const std::string drawer =
        (QCoreApplication::applicationDirPath() + QLatin1String(drawerName)).toStdString();
    ProgramStart program{{drawer, std::to_string(std::min(mostPixels, mostDrawnPixels))}, "/"};
    // It has letters to draw and no window to show.
    program.environment = {{"QT_QPA_PLATFORM", "offscreen"}};
    program.input = content.handle();
    ::lseek(program.input, 0, SEEK_SET); // its head has been looked at
    Arriving picture;
    const ChildEnd end =
        runChild(std::move(program), token, token.clock(), longestDrawing,
                 [&picture](std::string_view bytes) { return picture.add(bytes); });
    if (end == ChildEnd::cancelled)
        return makeError(ErrorCode::userCancelled);
    if (end == ChildEnd::absent)
        return makeErrorWithText(ErrorCode::unsupportedOperation,
                                 localized("A part of this program is missing: drawings cannot be "
                                           "shown. Install it again."));
    if (picture.isComplete())
        return picture.take();
    // It wanted more time or memory than a picture is worth, or broke down on it.
    return picture.isDamaged() ? damagedDocument(file) : tooLargeDocument(file);
}

} // namespace platform
