#pragma once

#include <string>
#include <vector>

namespace pelmora {

struct PageText {
    std::string heading;
    std::vector<std::string> paragraphs;
    /// Bars of a figure below the text; none without values.
    std::vector<double> figure;
    std::string caption;
};

/// A PDF on A4 with a title page line, running text, figures and page numbers.
std::string pdfBytes(const std::string& title, const std::vector<PageText>& pages);

} // namespace pelmora
