// Reserving and releasing: many nodes at once, a chain of dependants, and many owners of one node. Time per node or
// owner must hardly grow with the size.

#include <string>
#include <vector>

#include <benchmark/benchmark.h>

#include "restree/ResTreeNode.h"

namespace {

using qn::dsc::String;
using zkhw::ResTreeNode;

String Numbered(const char* name, int64_t number) {
    return String(qn::dsc::NarrowString((name + std::to_string(number)).c_str()));
}

void ReserveAll(benchmark::State& state) {
    ResTreeNode root(u"Root", u"Root", false);
    for (int64_t i = 0; i < state.range(0); ++i) {
        ResTreeNode* child = nullptr;
        root.AddChildEntry(Numbered("Line", i).View(), u"Line", false, child);
    }
    for (auto round : state) {
        benchmark::DoNotOptimize(root.ReserveAll(u"owner", zkhw::ReserveWrite, u""));
        benchmark::DoNotOptimize(root.ReleaseAll(u"owner", u""));
    }
    state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK(ReserveAll)->Arg(1000)->Arg(10000)->Arg(100000);

void ReserveChain(benchmark::State& state) {
    ResTreeNode root(u"Root", u"Root", false);
    ResTreeNode* first = nullptr;
    for (int64_t i = state.range(0); i-- > 0;) {
        root.AddChildEntry(Numbered("Line", i).View(), u"Line", false, first);
        first->SetProperty(u"Reserves", (u"../" + Numbered("Line", i + 1)).View());
    }
    for (auto round : state) {
        benchmark::DoNotOptimize(first->Reserve(u"owner", zkhw::ReserveWrite));
        benchmark::DoNotOptimize(first->Release(u"owner"));
    }
    state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK(ReserveChain)->Arg(1000)->Arg(10000)->Arg(100000);

// Released in the order of arrival: the text that shows the owners moves up each time.
void ManyOwners(benchmark::State& state) {
    std::vector<String> owners;
    for (int64_t i = 0; i < state.range(0); ++i) {
        owners.push_back(Numbered("Owner", i));
    }
    ResTreeNode node(u"n", u"N", false);
    for (auto round : state) {
        for (const String& owner : owners) {
            benchmark::DoNotOptimize(node.ReserveOne(owner, zkhw::ReserveRead));
        }
        for (const String& owner : owners) {
            benchmark::DoNotOptimize(node.ReleaseOne(owner));
        }
    }
    state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK(ManyOwners)->Arg(1000)->Arg(10000);

}  // namespace
