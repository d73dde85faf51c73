#include "platform/cloud/NameFolding.h"

#include <QByteArray>
#include <QString>
#include <QStringConverter>

#include <algorithm>

namespace platform {

std::string foldedName(std::string_view name) {
    const bool ascii = std::all_of(name.begin(), name.end(),
                                   [](char c) { return static_cast<unsigned char>(c) < 0x80; });
    if (ascii) {
        std::string folded(name);
        std::transform(folded.begin(), folded.end(), folded.begin(), [](char c) {
            return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
        });
        return folded;
    }
    const QString text = QString::fromUtf8(name.data(), static_cast<qsizetype>(name.size()));
    return text.normalized(QString::NormalizationForm_C)
        .toCaseFolded()
        .normalized(QString::NormalizationForm_C)
        .toStdString();
}

bool isUtf8(std::string_view text) {
    QStringDecoder decoder(QStringDecoder::Utf8, QStringDecoder::Flag::Stateless);
    const QString decoded =
        decoder(QByteArrayView(text.data(), static_cast<qsizetype>(text.size())));
    return !decoder.hasError() && decoded.size() <= static_cast<qsizetype>(text.size());
}

} // namespace platform
