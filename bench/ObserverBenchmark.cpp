// What a host hears of: changes with and without an observer, many in one bracket, and nodes that go.

#include <string>

#include <benchmark/benchmark.h>

#include "restree/ChangeFlags.h"
#include "restree/ResTreeNode.h"
#include "restree/ResTreeNodeChangeObserver.h"

namespace {

using qn::dsc::String;
using zkhw::ResTreeNode;

class CountingObserver : public zkhw::ResTreeNodeChangeObserver {
  public:
    void OnNodeChanged(ResTreeNode*, uint32_t, int32_t) override { ++calls; }

    int64_t calls = 0;
};

String Numbered(const char* name, int64_t number) {
    return String(qn::dsc::NarrowString((name + std::to_string(number)).c_str()));
}

void AddLines(ResTreeNode& root, int64_t count) {
    for (int64_t i = 0; i < count; ++i) {
        ResTreeNode* child = nullptr;
        root.AddChildEntry(Numbered("Line", i).View(), u"Line", false, child);
        child->SetProperty(u"Kind", u"digital");
    }
}

// Of so many nodes, all observed or none: their properties are set one by one.
void SetProperties(benchmark::State& state, bool isObserved) {
    CountingObserver observer;
    ResTreeNode root(u"Root", u"Root", false);
    AddLines(root, state.range(0));
    for (auto entry = root.Begin(); isObserved && !entry.IsEnd(); ++entry) {
        entry->Child()->AddObserver(&observer, zkhw::PropertyChanged, 0);
    }
    for (auto round : state) {
        for (auto entry = root.Begin(); !entry.IsEnd(); ++entry) {
            entry->Child()->SetProperty(u"Kind", u"analog");
        }
    }
    benchmark::DoNotOptimize(observer.calls);
    root.RemoveObserver(&observer, -1, true);
    state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK_CAPTURE(SetProperties, Unheard, false)->Arg(1000)->Arg(100000);
BENCHMARK_CAPTURE(SetProperties, Heard, true)->Arg(1000)->Arg(100000);

// One node with so many observers is changed.
void NotifyMany(benchmark::State& state) {
    CountingObserver observer;
    ResTreeNode root(u"Root", u"Root", false);
    root.SetProperty(u"Kind", u"digital");
    for (int64_t i = 0; i < state.range(0); ++i) {
        root.AddObserver(&observer, zkhw::PropertyChanged, static_cast<int32_t>(i + 3));
    }
    for (auto round : state) {
        root.SetProperty(u"Kind", u"analog");
    }
    benchmark::DoNotOptimize(observer.calls);
    root.RemoveObserver(&observer, -1, false);
    state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK(NotifyMany)->Arg(1)->Arg(1000)->Arg(100000);

// So many nodes leave the tree; with an observer in the process each of them has to be told. The making counts as well.
void RemoveNodes(benchmark::State& state, bool isObserved) {
    CountingObserver observer;
    ResTreeNode root(u"Root", u"Root", false);
    if (isObserved) {
        root.AddObserver(&observer, zkhw::ChildRemoved, 0);
    }
    for (auto round : state) {
        AddLines(root, state.range(0));
        root.RemoveChildNodes();
    }
    benchmark::DoNotOptimize(observer.calls);
    root.RemoveObserver(&observer, -1, false);
    state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK_CAPTURE(RemoveNodes, Unheard, false)->Arg(1000)->Arg(10000)->Arg(100000);
BENCHMARK_CAPTURE(RemoveNodes, Heard, true)->Arg(1000)->Arg(10000)->Arg(100000);

}  // namespace
