#pragma once

#include "platform/documents/model/RowModel.h"
#include "platform/documents/thumbnails/ThumbnailLoader.h"

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <unordered_map>

namespace platform {

/// The pictures of the documents in view. A row has one only for the document that it shows, as
/// that was when the row was read. Belongs to the main thread.
class RowThumbnails {
public:
    explicit RowThumbnails(std::function<void()> changed);

    /// Asks for those of the rows from `first` up to `end` and lets go of all others.
    void follow(const RowModel& model, std::size_t first, std::size_t end, double scale);
    /// Empty when there is none, or not yet.
    const Image& of(RowId row) const;

private:
    struct Row {
        /// What `request` was made from.
        std::shared_ptr<const EntryDetails> details;
        std::string name;
        double scale = 0;
        /// None for a row without picture.
        std::optional<ThumbnailRequest> request;
        bool answered = false;
        Image image;
    };
    static void renew(Row& row, const RowModel& model, std::size_t index, double scale);
    void take(const ThumbnailRequest& request, const Image& image);

    const std::function<void()> changed_;
    std::unordered_map<RowId, Row> rows_;
    ThumbnailLoader loader_;
};

} // namespace platform
