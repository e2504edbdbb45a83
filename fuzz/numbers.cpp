#include "foundation/text/fstring.h"
#include "fuzz/fuzztext.h"

#include <cmath>
#include <cstdio>

// Numbers in texts: those that the standard library finds, at the first place where it finds one.

namespace
{
constexpr size_t kTrySlowly = 400;

template <class T>
bool scanSlowly(const std::string& text, const char* format, T& value)
{
    for (size_t i = 0; i < text.size(); i++)
        if (std::sscanf(text.c_str() + i, format, &value) == 1)
            return true;
    return false;
}

template <class T>
bool isSame(T a, T b)
{
    return a == b || (std::isnan(static_cast<double>(a)) && std::isnan(static_cast<double>(b)));
}

template <class T, class Expected>
void check(const std::string& text, const char* format, bool isFound, T value)
{
    Expected expected{};
    const bool isThere = scanSlowly(text, format, expected);
    require(isThere == isFound && (!isFound || isSame(value, static_cast<T>(expected))));
}

void scanAll(const ConstString& text, const std::string& narrow)
{
    int64 whole = 0;
    uint64 natural = 0;
    uint8 byte = 0;
    double real = 0;
    const bool isWhole = text.scanInt64(whole);
    const bool isNatural = text.scanUInt64(natural);
    const bool isHex = text.scanHex(byte);
    const bool isReal = text.scanFloat(real);
    if (narrow.size() > kTrySlowly)
        return;
    check<int64, long long>(narrow, "%lld", isWhole, whole);
    check<uint64, unsigned long long>(narrow, "%llu", isNatural, natural);
    check<uint8, unsigned>(narrow, "%x", isHex, byte);
    std::string points = narrow;
    if (const size_t comma = points.find(','); comma != std::string::npos)
        points[comma] = '.';
    check<double, double>(points, "%lf", isReal, real);
}
} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    const std::string text = std::string(reinterpret_cast<const char*>(data), size).c_str();
    scanAll(text.c_str(), text);
    FString wide(text.c_str());
    if (wide.isAsciiString() && wide.toWideString())
        scanAll(wide, text);
    return 0;
}
