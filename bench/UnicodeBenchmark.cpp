// UTF-8 to units and back, in texts as short as a key and as long as a cache file.

#include <cstdint>
#include <memory>
#include <string>

#include <benchmark/benchmark.h>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/WideToUtf8.h"

namespace {

using qn::dsc::String;

std::string Text(int64_t bytes, bool ascii) {
    std::string text;
    while (static_cast<int64_t>(text.size()) < bytes) {
        text += ascii ? "IOResource" : "\xE7\xB7\x9A";
    }
    return text;
}

void FromUtf8(benchmark::State& state, bool ascii) {
    const std::string text = Text(state.range(0), ascii);
    for (auto round : state) {
        benchmark::DoNotOptimize(String::FromUtf8(text.data(), static_cast<uint32_t>(text.size())));
    }
    state.SetBytesProcessed(state.iterations() * static_cast<int64_t>(text.size()));
}
BENCHMARK_CAPTURE(FromUtf8, Ascii, true)->Arg(10)->Arg(100)->Arg(1 << 20);
BENCHMARK_CAPTURE(FromUtf8, Japanese, false)->Arg(10)->Arg(100)->Arg(1 << 20);

void ToUtf8(benchmark::State& state, bool ascii) {
    const std::string text = Text(state.range(0), ascii);
    const String wide = String::FromUtf8(text.data(), static_cast<uint32_t>(text.size()));
    for (auto round : state) {
        const std::unique_ptr<char[]> bytes(qn::dsc::WideToUtf8(wide.CStr(), wide.End()));
        benchmark::DoNotOptimize(bytes.get());
    }
    state.SetBytesProcessed(state.iterations() * static_cast<int64_t>(text.size()));
}
BENCHMARK_CAPTURE(ToUtf8, Ascii, true)->Arg(10)->Arg(100)->Arg(1 << 20);
BENCHMARK_CAPTURE(ToUtf8, Japanese, false)->Arg(10)->Arg(100)->Arg(1 << 20);

}  // namespace
