#pragma once

#include <string>

// Documents made to hurt whoever reads them.
namespace test {

/// The head of a PNG that says so, and nothing behind it.
std::string pngThatClaims(unsigned width, unsigned height);
/// A GIF of two frames, red and green.
std::string movingPicture();
/// A JPEG of a landscape, lying as `orientation` (1 to 8, as cameras write it) says; upright it is
/// 160 x 120.
std::string photoLying(int orientation);
/// An SVG of 100 x 100 around `content`.
std::string drawing(const std::string& content, const std::string& before = {});
/// gzip of so many spaces within an SVG.
std::string packedSpaces(std::size_t count);
/// Blank pages, one after the other in the file.
std::string pdfOfBlankPages(int pages);
/// Wants a password that nobody has.
std::string lockedPdf();

} // namespace test
