// Doubles with fifty significant digits, as the archives write them.
//
// The bytes are the same as those of the peer, which is checked before anything is measured.

#include "benchmarks/inputs/inputs.h"
#include "containers/value/buffer.h"
#include "storage/xml/xmlnumber.h"

#include <benchmark/benchmark.h>

#include <cstdio>
#include <cstring>

namespace
{
using Doubles = const std::vector<double>& (*)();

void isSame(benchmark::State& state, Doubles doubles)
{
    for (const double value : doubles())
    {
        char expected[512];
        const int length = snprintf(expected, sizeof(expected), "%.50g", value);
        Buffer ours;
        Xml::appendFloat(ours, value);
        if (ours.getFillSize() != static_cast<uint32>(length) ||
            memcmp(ours.ptr(), expected, static_cast<size_t>(length)) != 0)
            state.SkipWithError("other bytes");
    }
}

template <Doubles doubles>
void appendFloat(benchmark::State& state)
{
    isSame(state, doubles);
    Buffer target(1024);
    for (auto _ : state)
        for (const double value : doubles())
        {
            target.flush();
            Xml::appendFloat(target, value);
            benchmark::DoNotOptimize(target.ptr());
        }
}

template <Doubles doubles>
void printByPrintf(benchmark::State& state)
{
    char text[512];
    for (auto _ : state)
        for (const double value : doubles())
        {
            snprintf(text, sizeof(text), "%.50g", value);
            benchmark::DoNotOptimize(text[0]);
        }
}
} // namespace

BENCHMARK(appendFloat<Inputs::shortDoubles>)->Name("%.50g, few digits/ours");
BENCHMARK(printByPrintf<Inputs::shortDoubles>)->Name("%.50g, few digits/printf");
BENCHMARK(appendFloat<Inputs::plainDoubles>)->Name("%.50g, 0 to 1000/ours");
BENCHMARK(printByPrintf<Inputs::plainDoubles>)->Name("%.50g, 0 to 1000/printf");
BENCHMARK(appendFloat<Inputs::wideDoubles>)->Name("%.50g, every magnitude/ours");
BENCHMARK(printByPrintf<Inputs::wideDoubles>)->Name("%.50g, every magnitude/printf");
