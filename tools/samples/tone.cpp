#include "tools/samples/tone.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <fstream>
#include <numbers>

namespace
{

constexpr std::uint32_t kSampleRate = 44100;
constexpr double kFadeSeconds = 0.02;

void appendNumber(std::string& bytes, std::uint32_t value, int width)
{
    for (int i = 0; i < width; ++i)
        bytes.push_back(static_cast<char>(value >> (8 * i)));
}

std::string waveHeader(std::uint32_t dataSize)
{
    constexpr std::uint32_t kFrameSize = 2;
    std::string header = "RIFF";
    appendNumber(header, 36 + dataSize, 4);
    header += "WAVEfmt ";
    appendNumber(header, 16, 4);
    appendNumber(header, 1, 2); // linear PCM
    appendNumber(header, 1, 2); // one channel
    appendNumber(header, kSampleRate, 4);
    appendNumber(header, kSampleRate * kFrameSize, 4);
    appendNumber(header, kFrameSize, 2);
    appendNumber(header, 16, 2);
    header += "data";
    appendNumber(header, dataSize, 4);
    return header;
}

} // namespace

bool writeTone(const std::string& path, double seconds, double hertz)
{
    const auto frames = static_cast<std::uint32_t>(seconds * kSampleRate);
    std::string bytes = waveHeader(frames * 2);
    for (std::uint32_t frame = 0; frame < frames; ++frame)
    {
        const double time = static_cast<double>(frame) / kSampleRate;
        const double fade = std::min({1.0, time / kFadeSeconds, (seconds - time) / kFadeSeconds});
        const double value = 0.5 * fade * std::sin(2.0 * std::numbers::pi * hertz * time);
        appendNumber(bytes, static_cast<std::uint32_t>(static_cast<std::int32_t>(value * 32767.0)), 2);
    }

    std::ofstream file(path, std::ios::binary);
    file.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
    return file.flush().good();
}
