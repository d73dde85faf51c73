#pragma once

#include <string>

namespace test {

/// A JPEG whose pixels lie on their side, with the mark that tells so. Upright it is `width` wide:
/// sky above, meadow below.
std::string turnedPhoto(int width, int height);
std::string pngPicture(int width, int height);
/// A PDF of A4 pages that bear their numbers.
std::string pdfOfPages(int pages);
/// Numbered lines, some of them long.
std::string longText(int lines);
/// A tone in a WAV file, with a title.
std::string soundOf(int seconds);
/// A film of plain green pictures, ten a second.
std::string filmOf(int width, int height, int pictures);

/// C++ of a few functions.
std::string sampleProgram();
/// A table of bookings, with names above its columns.
std::string sampleTable();
/// Markdown with all that it may have.
std::string sampleGuide();

} // namespace test
