// Filling a node: in order, in front, in sorted and in scattered order of keys. Time per entry must hardly grow with
// the size.

#include <cstdio>
#include <string>
#include <vector>

#include <benchmark/benchmark.h>

#include "restree/ResTreeNode.h"

namespace {

using qn::dsc::String;
using zkhw::ResTreeNode;

std::vector<std::u16string> Keys(int64_t size, int64_t stride) {
    std::vector<std::u16string> keys;
    for (int64_t i = 0; i < size; ++i) {
        char digits[24];
        const int length =
            std::snprintf(digits, sizeof digits, "Line%08lld", static_cast<long long>(i * stride % size));
        keys.emplace_back(digits, digits + length);
    }
    return keys;
}

void Fill(benchmark::State& state, bool ordered, int64_t stride) {
    const std::vector<std::u16string> keys = Keys(state.range(0), stride);
    for (auto round : state) {
        ResTreeNode node(u"n", u"N", ordered);
        for (const std::u16string& key : keys) {
            benchmark::DoNotOptimize(node.AddTextEntry(key, u"value", zkhw::TextEntry).entry);
        }
    }
    state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK_CAPTURE(Fill, Ordered, true, 1)->Arg(1000)->Arg(10000)->Arg(100000);
BENCHMARK_CAPTURE(Fill, UnorderedSortedKeys, false, 1)->Arg(1000)->Arg(10000)->Arg(100000);
BENCHMARK_CAPTURE(Fill, UnorderedScatteredKeys, false, 7919)->Arg(1000)->Arg(10000)->Arg(100000);

void FillInFront(benchmark::State& state) {
    const std::vector<std::u16string> keys = Keys(state.range(0), 1);
    for (auto round : state) {
        ResTreeNode node(u"n", u"N", true);
        for (size_t i = 0; i < keys.size(); ++i) {
            const String before(keys[i == 0 ? 0 : i - 1]);
            benchmark::DoNotOptimize(node.AddTextEntry(keys[i], u"value", zkhw::TextEntry, &before).entry);
        }
    }
    state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK(FillInFront)->Arg(1000)->Arg(10000)->Arg(100000);

}  // namespace
