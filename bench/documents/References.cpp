#include "bench/documents/References.h"

#include "platform/documents/list/ListWidget.h"

#include <QImage>
#include <QPainter>

#include <array>
#include <dirent.h>
#include <fcntl.h>
#include <sys/inotify.h>
#include <sys/stat.h>
#include <unistd.h>
#include <vector>

using namespace platform;

double millisecondsSince(SteadyClock::time_point start) {
    return std::chrono::duration<double, std::milli>(SteadyClock::now() - start).count();
}

double bareReading(const std::string& folder) {
    const auto start = SteadyClock::now();
    const int handle = ::open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    std::vector<char> buffer(256 * 1024);
    std::vector<std::string> names;
    for (;;) {
        const ssize_t length = ::getdents64(handle, buffer.data(), buffer.size());
        if (length <= 0)
            break;
        for (ssize_t i = 0; i < length;) {
            const auto* entry = reinterpret_cast<const dirent64*>(buffer.data() + i);
            i += entry->d_reclen;
            names.emplace_back(entry->d_name);
        }
    }
    std::uint64_t bytes = 0;
    for (const std::string& name : names) {
        struct statx status {};
        if (::statx(handle, name.c_str(), AT_SYMLINK_NOFOLLOW, STATX_BASIC_STATS, &status) == 0)
            bytes += status.stx_size;
    }
    ::close(handle);
    return bytes == ~0ULL ? 0 : millisecondsSince(start);
}

double bareFrame(ListWidget& widget) {
    static QImage image;
    const QSize pixels = widget.size() * widget.devicePixelRatio();
    if (image.size() != pixels)
        image = QImage(pixels, QImage::Format_ARGB32_Premultiplied);
    ListState& rows = widget.state();
    const auto start = SteadyClock::now();
    image.fill(Qt::white);
    QPainter painter(&image);
    for (std::size_t i = rows.firstInView(); i < rows.endInView(); ++i) {
        const RowContent& row = rows.contents.at(rows.model, i);
        painter.setFont(rows.style.name);
        painter.drawText(QPointF(80, rows.yOf(i) + 24), row.fittingName);
        painter.setFont(rows.style.details);
        painter.drawText(QPointF(80, rows.yOf(i) + 44), row.fittingDetails);
    }
    return millisecondsSince(start);
}

double bareChange(const std::string& folder, const std::string& file) {
    const int notices = ::inotify_init1(IN_CLOEXEC);
    ::inotify_add_watch(notices, folder.c_str(), IN_CREATE);
    const auto start = SteadyClock::now();
    ::close(::open(file.c_str(), O_CREAT | O_WRONLY | O_CLOEXEC, 0644));
    std::array<char, 4096> buffer;
    const ssize_t length = ::read(notices, buffer.data(), buffer.size());
    const double time = millisecondsSince(start);
    ::close(notices);
    ::unlink(file.c_str());
    return length > 0 ? time : 0;
}
