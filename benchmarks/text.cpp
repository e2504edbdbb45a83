// Strings: conversions, appending, comparison by value and hashing.

#include "benchmarks/inputs/inputs.h"
#include "foundation/object/stringhash.h"
#include "foundation/text/itextservices.h"
#include "foundation/text/natcompare.h"
#include "foundation/text/string.h"

#include <absl/hash/hash.h>
#include <benchmark/benchmark.h>

#include <QtCore/QString>
#include <cstdlib>
#include <cstring>
#include <string>
#include <unicode/ustring.h>

namespace
{
using Text = const std::string& (*)();

void setRate(benchmark::State& state, size_t bytes)
{
    state.SetBytesProcessed(state.iterations() * static_cast<int64_t>(bytes));
}

template <Text text>
void decodeOurs(benchmark::State& state)
{
    for (auto _ : state)
    {
        String wide;
        wide.fromUTF8(text().c_str());
        benchmark::DoNotOptimize(wide.ptr());
    }
    setRate(state, text().size());
}

template <Text text>
void decodeQt(benchmark::State& state)
{
    for (auto _ : state)
    {
        const QString wide = QString::fromUtf8(text().data(), static_cast<qsizetype>(text().size()));
        benchmark::DoNotOptimize(wide.constData());
    }
    setRate(state, text().size());
}

template <Text text>
void decodeIcu(benchmark::State& state)
{
    const auto size = static_cast<int32_t>(text().size());
    for (auto _ : state)
    {
        UErrorCode status = U_ZERO_ERROR;
        int32_t length = 0;
        std::u16string wide(text().size(), 0);
        u_strFromUTF8(wide.data(), size, &length, text().data(), size, &status);
        wide.resize(static_cast<size_t>(length));
        benchmark::DoNotOptimize(wide.data());
    }
    setRate(state, text().size());
}

template <Text text>
void encodeOurs(benchmark::State& state)
{
    String wide;
    wide.fromUTF8(text().c_str());
    for (auto _ : state)
    {
        unsigned length = 0;
        char* narrow =
            ITextServices::instance().toMultiByte(wide.text16(), wide.length(), kEncodingUtf8, '?', length);
        benchmark::DoNotOptimize(narrow);
        free(narrow);
    }
    setRate(state, text().size());
}

template <Text text>
void encodeQt(benchmark::State& state)
{
    const QString wide = QString::fromUtf8(text().data(), static_cast<qsizetype>(text().size()));
    for (auto _ : state)
    {
        const QByteArray narrow = wide.toUtf8();
        benchmark::DoNotOptimize(narrow.constData());
    }
    setRate(state, text().size());
}

template <int count>
void appendOurs(benchmark::State& state)
{
    static constexpr char16 piece[] = u"abcdefgh";
    for (auto _ : state)
    {
        String text;
        for (int64_t length = 0; length < state.range(0); length += count)
            if constexpr (count == 1)
                text.append(u'x');
            else
                text.append(piece, count);
        benchmark::DoNotOptimize(text.ptr());
    }
}

template <int count>
void appendStd(benchmark::State& state)
{
    static constexpr char16_t piece[] = u"abcdefgh";
    for (auto _ : state)
    {
        std::u16string text;
        for (int64_t length = 0; length < state.range(0); length += count)
            if constexpr (count == 1)
                text.push_back(u'x');
            else
                text.append(piece, count);
        benchmark::DoNotOptimize(text.data());
    }
}

/// Each name with the next one.
template <class Compare>
void compareNames(benchmark::State& state, Compare compare)
{
    const std::vector<std::string>& names = Inputs::fileNames();
    int sum = 0;
    for (auto _ : state)
        for (size_t i = 1; i < names.size(); i++)
            sum += compare(names[i - 1].c_str(), names[i].c_str());
    benchmark::DoNotOptimize(sum);
}

void compareOurs(benchmark::State& state)
{
    compareNames(state, [](const char* a, const char* b) { return strnatcmp8(a, b, true) < 0; });
}

void compareGlibc(benchmark::State& state)
{
    compareNames(state, [](const char* a, const char* b) { return strverscmp(a, b) < 0; });
}

/// A bucket for each name, as a table of 1009 buckets asks for it.
template <class Hash>
void hashNames(benchmark::State& state, Hash hash)
{
    size_t sum = 0;
    for (auto _ : state)
        for (const std::string& name : Inputs::fileNames())
            sum += hash(name);
    benchmark::DoNotOptimize(sum);
}

void hashOurs(benchmark::State& state)
{
    hashNames(state, [](const std::string& name) { return hashString8(name.c_str(), 1009); });
}

/// As a CmString asks, which knows its length as the peer does.
void hashCountedOurs(benchmark::State& state)
{
    hashNames(state, [](const std::string& name) { return hashString8(name.c_str(), name.size(), 1009); });
}

void hashAbsl(benchmark::State& state)
{
    hashNames(state, [](const std::string& name) { return absl::Hash<std::string>()(name) % 1009; });
}
} // namespace

BENCHMARK(decodeOurs<Inputs::asciiText>)->Name("UTF-8 to 16 bits, ASCII/ours");
BENCHMARK(decodeQt<Inputs::asciiText>)->Name("UTF-8 to 16 bits, ASCII/Qt");
BENCHMARK(decodeOurs<Inputs::mixedText>)->Name("UTF-8 to 16 bits, mixed/ours");
BENCHMARK(decodeIcu<Inputs::mixedText>)->Name("UTF-8 to 16 bits, mixed/ICU");
BENCHMARK(decodeOurs<Inputs::japaneseText>)->Name("UTF-8 to 16 bits, Japanese/ours");
BENCHMARK(decodeIcu<Inputs::japaneseText>)->Name("UTF-8 to 16 bits, Japanese/ICU");
BENCHMARK(encodeOurs<Inputs::asciiText>)->Name("16 bits to UTF-8, ASCII/ours");
BENCHMARK(encodeQt<Inputs::asciiText>)->Name("16 bits to UTF-8, ASCII/Qt");
BENCHMARK(encodeOurs<Inputs::mixedText>)->Name("16 bits to UTF-8, mixed/ours");
BENCHMARK(encodeQt<Inputs::mixedText>)->Name("16 bits to UTF-8, mixed/Qt");
BENCHMARK(encodeOurs<Inputs::japaneseText>)->Name("16 bits to UTF-8, Japanese/ours");
BENCHMARK(encodeQt<Inputs::japaneseText>)->Name("16 bits to UTF-8, Japanese/Qt");
BENCHMARK(appendOurs<1>)->Name("append by 1/ours")->Arg(100)->Arg(10000)->Arg(1000000);
BENCHMARK(appendStd<1>)->Name("append by 1/std::u16string")->Arg(100)->Arg(10000)->Arg(1000000);
BENCHMARK(appendOurs<8>)->Name("append by 8/ours")->Arg(104)->Arg(10000)->Arg(1000000);
BENCHMARK(appendStd<8>)->Name("append by 8/std::u16string")->Arg(104)->Arg(10000)->Arg(1000000);
BENCHMARK(compareOurs)->Name("natural comparison/ours");
BENCHMARK(compareGlibc)->Name("natural comparison/strverscmp");
BENCHMARK(hashOurs)->Name("hash of a text/ours");
BENCHMARK(hashAbsl)->Name("hash of a text/absl");
BENCHMARK(hashCountedOurs)->Name("hash of a counted text/ours");
BENCHMARK(hashAbsl)->Name("hash of a counted text/absl");
