#pragma once

#include "platform/documents/preview/ContentsList.h"

#include <QWidget>

#include <memory>
#include <string>
#include <vector>

class QVBoxLayout;

namespace platform {

/// A list of contents below a few words on the whole.
class ContentsPage final : public QWidget {
public:
    /// What one should know besides.
    struct Remark {
        std::string text;
        /// Something is not as it should be, or stands in the way.
        bool warns = true;
        bool operator==(const Remark&) const = default;
    };

    ContentsPage();

    /// `summary` in one line.
    void set(std::shared_ptr<const ContentsTree> tree, const std::string& summary,
             const std::vector<Remark>& remarks);
    ContentsList& list() { return *list_; }
    std::string headText() const;

protected:
    void paintEvent(QPaintEvent* event) override;

private:
    void addRemark(const Remark& remark);

    QWidget* head_;
    QVBoxLayout* lines_;
    ContentsList* list_;
    std::vector<Remark> shown_;
};

} // namespace platform
