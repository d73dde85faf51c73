#pragma once

#include "platform/documents/preview/HtmlScanner.h"

namespace platform {

/// Writes what stands between the markup of a page: only signs that are shown, and words that can
/// be broken into lines.
class HtmlText {
public:
    /// Both must outlive it.
    HtmlText(HtmlScanner& in, QString& out) : in_(in), out_(out) {}

    /// The next sign; not at the end, nor at markup.
    void take();
    /// A word does not go on behind what comes next.
    void endWord() { word_ = 0; }

private:
    void entity();
    void breakLongWord(QChar last);

    HtmlScanner& in_;
    QString& out_;
    /// Letters since a line could be broken.
    int word_ = 0;
};

} // namespace platform
