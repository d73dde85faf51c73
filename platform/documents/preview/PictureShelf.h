#pragma once

#include "platform/documents/preview/CleanHtml.h"
#include "platform/documents/preview/PreviewWorker.h"

#include <QHash>
#include <QImage>

#include <string>

namespace platform {

/// Reads the pictures of a text, each once: those that it holds itself, and those beside it. Of one
/// queue; the token must outlive it.
class PictureShelf {
public:
    /// `folder` with its slash: what stands beside the text.
    PictureShelf(std::string folder, const PreviewToken& token)
        : folder_(std::move(folder)), token_(token) {}

    /// None for one that is not there, or that is more than a text may have.
    std::optional<InlinePicture> find(const QString& address);
    /// By the names that were answered.
    QHash<QString, QImage> take() { return std::move(images_); }

private:
    std::optional<InlinePicture> read(const QString& address);
    QImage beside(const QString& address) const;

    const std::string folder_;
    const PreviewToken& token_;
    QHash<QString, std::optional<InlinePicture>> known_;
    QHash<QString, QImage> images_;
    double pixels_ = 0;
};

} // namespace platform
