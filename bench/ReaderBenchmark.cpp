// Reading descriptions from text, and taking the tree down again, which the same loop measures apart.

#include <string>

#include <benchmark/benchmark.h>

#include "GeneratedBoard.h"
#include "restree/ResTreeNode.h"

namespace {

void Read(benchmark::State& state, std::string (*board)(int)) {
    const std::string text = board(static_cast<int>(state.range(0)));
    const qn::dsc::String wide = bench::Wide(text);
    for (auto round : state) {
        auto root = std::make_unique<zkhw::ResTreeNode>(u"", u"Root", false);
        if (root->LoadResourceText(wide, true, nullptr) != 0) {
            state.SkipWithError("the text is not well formed");
            break;
        }
        state.PauseTiming();
        root.reset();
        state.ResumeTiming();
    }
    state.SetItemsProcessed(state.iterations() * state.range(0));
    state.SetBytesProcessed(state.iterations() * static_cast<int64_t>(text.size()));
}
BENCHMARK_CAPTURE(Read, PlainResources, bench::PlainBoard)->Arg(100)->Arg(10000);
BENCHMARK_CAPTURE(Read, InstancesOfAPrototype, bench::PrototypeBoard)->Arg(100)->Arg(10000);
BENCHMARK_CAPTURE(Read, CopiesByNames, bench::NamesBoard)->Arg(100)->Arg(10000);

void Destroy(benchmark::State& state) {
    const std::string text = bench::PlainBoard(static_cast<int>(state.range(0)));
    for (auto round : state) {
        state.PauseTiming();
        auto root = bench::Loaded(text);
        state.ResumeTiming();
        root.reset();
    }
    state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK(Destroy)->Arg(100)->Arg(10000);

void Clone(benchmark::State& state) {
    const auto root = bench::Loaded(bench::PlainBoard(static_cast<int>(state.range(0))));
    for (auto round : state) {
        auto copy = root->Clone();
        state.PauseTiming();
        copy.reset();
        state.ResumeTiming();
    }
    state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK(Clone)->Arg(100)->Arg(10000);

}  // namespace
