#pragma once

#include <chrono>
#include <vector>

namespace test {
class ScreenHouse;
}

// What the parts of the bench share. Times are milliseconds.

using SteadyClock = std::chrono::steady_clock;

double millisecondsSince(SteadyClock::time_point start);

/// The figure below which such a share of them lies.
double at(std::vector<double> figures, double share);

/// A row of the table in bench/README.md.
void print(const char* what, const std::vector<double>& ours, const char* reference,
           const std::vector<double>& bare, const char* goal);

/// Runs the event loop for so long.
void settle(std::chrono::milliseconds time);

/// From the wish to see a document to its first page on screen, beside a bare decode of it.
void measureOpening(test::ScreenHouse& house);

/// Repaints and processor time of the main thread while a download reports its progress.
void measureReports(test::ScreenHouse& house);

/// From the press of the cancel button to the end of the download.
void measureCancelling(test::ScreenHouse& house);
