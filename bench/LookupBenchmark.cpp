// Finding entries by key and nodes by path, in nodes of both forms and of sizes that use different layouts.

#include <string>
#include <vector>

#include <benchmark/benchmark.h>

#include "GeneratedBoard.h"
#include "restree/ResTreeNode.h"

namespace {

using qn::dsc::String;
using zkhw::ResTreeNode;

std::u16string Key(int64_t number) {
    return u"Line" + bench::Number(number);
}

void FindEntry(benchmark::State& state, bool ordered) {
    const int64_t size = state.range(0);
    ResTreeNode node(u"n", u"N", ordered);
    std::vector<std::u16string> keys;
    for (int64_t i = 0; i < size; ++i) {
        keys.push_back(Key(i * 7919 % size));
        node.AddTextEntry(Key(i), u"value", zkhw::TextEntry);
    }
    // The first search of a long ordered node builds its index.
    benchmark::DoNotOptimize(node.Find(keys[0]));
    size_t next = 0;
    for (auto round : state) {
        benchmark::DoNotOptimize(node.Find(keys[next]));
        next = next + 1 == keys.size() ? 0 : next + 1;
    }
}
BENCHMARK_CAPTURE(FindEntry, Unordered, false)->Arg(8)->Arg(100)->Arg(1000)->Arg(100000);
BENCHMARK_CAPTURE(FindEntry, Ordered, true)->Arg(8)->Arg(100)->Arg(1000)->Arg(100000);

void LookupPath(benchmark::State& state) {
    const auto root = bench::Loaded(bench::PlainBoard(1000));
    for (auto round : state) {
        benchmark::DoNotOptimize(root->Lookup(u"/Board/Line500/../Line501", nullptr));
    }
}
BENCHMARK(LookupPath);

void GetPath(benchmark::State& state) {
    const auto root = bench::Loaded(bench::PlainBoard(100));
    ResTreeNode* node = root->Lookup(u"/Board/Line50", nullptr);
    for (auto round : state) {
        benchmark::DoNotOptimize(node->GetPath());
    }
}
BENCHMARK(GetPath);

}  // namespace
