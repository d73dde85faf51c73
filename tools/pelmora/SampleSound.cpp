#include "tools/pelmora/SampleSound.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdint>
#include <vector>

namespace pelmora {
namespace {

constexpr int rate = 22'050;
constexpr double secondsPerNote = 0.32;

template<class Number>
void append(std::string& out, Number number) {
    for (std::size_t i = 0; i < sizeof(Number); ++i)
        out.push_back(static_cast<char>(static_cast<std::uint64_t>(number) >> (8 * i) & 0xFFU));
}

/// A string that is plucked at `start` (in samples): its overtones die away sooner than itself.
void pluck(std::vector<double>& sound, std::size_t start, double frequency, double strength) {
    for (std::size_t i = start; i < sound.size(); ++i) {
        const double time = static_cast<double>(i - start) / rate;
        double value = 0;
        for (int overtone = 1; overtone <= 6; ++overtone)
            value += std::sin(6.28318530718 * frequency * overtone * time) *
                     std::exp(-time * (1.6 + overtone)) / overtone;
        sound[i] += value * strength * std::min(1.0, time * 400);
    }
}

} // namespace

std::string tuneWav() {
    // Half-tones above A3.
    constexpr std::array notes{3, 7, 10, 15, 14, 10, 12, 7, 8, 3, 8, 10, 5, 2, 3, 3};
    const auto samples = static_cast<std::size_t>((notes.size() + 4) * secondsPerNote * rate);
    std::vector<double> sound(samples, 0.0);
    for (std::size_t i = 0; i < notes.size(); ++i) {
        const auto start = static_cast<std::size_t>(static_cast<double>(i) * secondsPerNote * rate);
        pluck(sound, start, 220 * std::pow(2.0, notes[i] / 12.0), 0.28);
        if (i % 4 == 0)
            pluck(sound, start, 110 * std::pow(2.0, (notes[i] - 12) / 12.0 + 1), 0.2);
    }
    std::string wav = "RIFF";
    const auto bytes = static_cast<std::uint32_t>(samples * 2);
    append(wav, bytes + 36);
    wav += "WAVEfmt ";
    append(wav, std::uint32_t{16});
    append(wav, std::uint16_t{1});
    append(wav, std::uint16_t{1});
    append(wav, std::uint32_t{rate});
    append(wav, std::uint32_t{rate * 2});
    append(wav, std::uint16_t{2});
    append(wav, std::uint16_t{16});
    wav += "data";
    append(wav, bytes);
    for (const double value : sound)
        append(wav, static_cast<std::int16_t>(std::clamp(value, -1.0, 1.0) * 32'000));
    return wav;
}

} // namespace pelmora
