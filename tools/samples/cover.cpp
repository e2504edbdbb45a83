#include "tools/samples/cover.h"

#include <algorithm>
#include <cstdint>
#include <fstream>

namespace
{

void appendBigEndian(std::string& bytes, std::uint32_t value)
{
    for (int shift = 24; shift >= 0; shift -= 8)
        bytes.push_back(static_cast<char>(value >> shift));
}

std::uint32_t crcOf(const std::string& bytes)
{
    std::uint32_t crc = 0xFFFFFFFFu;
    for (const char byte : bytes)
    {
        crc ^= static_cast<unsigned char>(byte);
        for (int bit = 0; bit < 8; ++bit)
            crc = (crc >> 1) ^ ((crc & 1u) ? 0xEDB88320u : 0u);
    }
    return ~crc;
}

std::uint32_t adlerOf(const std::string& bytes)
{
    std::uint32_t low = 1, high = 0;
    for (const char byte : bytes)
    {
        low = (low + static_cast<unsigned char>(byte)) % 65521u;
        high = (high + low) % 65521u;
    }
    return (high << 16) | low;
}

std::string chunk(const std::string& type, const std::string& data)
{
    std::string bytes;
    appendBigEndian(bytes, static_cast<std::uint32_t>(data.size()));
    bytes += type + data;
    appendBigEndian(bytes, crcOf(type + data));
    return bytes;
}

/// A zlib stream of stored blocks: nothing is compressed, so no library is needed.
std::string storedStream(const std::string& data)
{
    constexpr std::size_t kBlock = 65535;
    std::string bytes = "\x78\x01";
    for (std::size_t at = 0; at < data.size(); at += kBlock)
    {
        const std::size_t size = std::min(kBlock, data.size() - at);
        bytes.push_back(at + size == data.size() ? '\1' : '\0');
        for (const std::size_t number : {size, ~size})
        {
            bytes.push_back(static_cast<char>(number & 0xFFu));
            bytes.push_back(static_cast<char>((number >> 8) & 0xFFu));
        }
        bytes.append(data, at, size);
    }
    appendBigEndian(bytes, adlerOf(data));
    return bytes;
}

/// One filter byte (0, none) and the red, green and blue of each point, row by row.
std::string gradient(unsigned pixels)
{
    std::string rows;
    for (unsigned y = 0; y < pixels; ++y)
    {
        rows.push_back('\0');
        for (unsigned x = 0; x < pixels; ++x)
        {
            rows.push_back(static_cast<char>(255u * x / pixels));
            rows.push_back(static_cast<char>(255u * y / pixels));
            rows.push_back(static_cast<char>(160));
        }
    }
    return rows;
}

} // namespace

bool writeCover(const std::string& path, unsigned pixels)
{
    std::string header;
    appendBigEndian(header, pixels);
    appendBigEndian(header, pixels);
    header += std::string("\x08\x02\x00\x00\x00", 5); // 8 bits a channel, RGB
    const std::string bytes = "\x89PNG\r\n\x1A\n" + chunk("IHDR", header) +
                              chunk("IDAT", storedStream(gradient(pixels))) + chunk("IEND", "");

    std::ofstream file(path, std::ios::binary);
    file.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
    return file.flush().good();
}
