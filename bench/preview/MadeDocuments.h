#pragma once

#include <string>

/// A4 pages of text with a chart, the content of a PDF; the first one has a red bar from
/// `markTop` to `markBottom` points below its top edge, over all of its width, and below the text
/// a photograph where that is wanted.
enum class Cover { plain, photograph };
std::string madePdf(int pages, Cover cover);
inline constexpr double markTop = 40;
inline constexpr double markBottom = 90;

/// A picture as detailed as a photograph, the content of a JPEG; its middle is red.
std::string madePhoto(int width, int height);
