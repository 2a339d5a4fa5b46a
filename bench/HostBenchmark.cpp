// What a host does once the tree is there, each beside the least that the same answer would cost.

#include <array>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include <benchmark/benchmark.h>

#include "GeneratedBoard.h"
#include "interfaces/AdapterObserverSet.h"
#include "interfaces/InterfacePointer.h"
#include "interfaces/NodeViews.h"
#include "restree/AdapterFactory.h"
#include "restree/ResTreeNode.h"
#include "zkfpga/zkfpga.h"

namespace {

using zkhw::InterfacePointer;
using zkhw::ResTreeNode;
using zkhw::String;
using NodePointer = InterfacePointer<IzkhwResourceTreeNode>;

// The names that a target has in the cache, and two that the reader of the cache adds.
constexpr std::array<const char16_t*, 13> keys = {u"DeviceCategory",
                                                  u"EIOItemIconName",
                                                  u"EIOItemTypeName",
                                                  u"FPGAItemSubType",
                                                  u"SupportedFPGAHostList",
                                                  u"TargetClass",
                                                  u"TargetXMLPath",
                                                  u"LocalizedInformationToDisplayWhenAddingNewTarget",
                                                  u"FindTargetVIPath",
                                                  u"DeviceIDs",
                                                  u"CustomFPGAMethodList",
                                                  u"TargetDir",
                                                  u"TargetClassShortClassName"};

// The least that a host could be offered in place of a node.
struct PropertyMap {
    virtual ~PropertyMap() = default;
    virtual HRESULT GetProperty(LPCWSTR name, BSTR* value) {
        const auto found = values.find(name);
        if (found == values.end()) {
            return S_FALSE;
        }
        *value = SysAllocString(found->second.c_str());
        return S_OK;
    }
    std::map<std::u16string, std::u16string> values;
};

struct Tree {
    Tree() : root(u"", u"Root", false), observers(zkhw::MakeAdapterObserverSet()) {
        zkhw::GiveView(&root, observers, rootView.Receive());
    }
    ~Tree() {
        rootView.Reset();
        zkhw::DestroyAdapterObserverSet(observers);
    }

    ResTreeNode root;
    zkhw::AdapterObserverSet* observers;
    NodePointer rootView;
};

ResTreeNode& AddNode(ResTreeNode& parent, const char16_t* name, bool ordered = false) {
    ResTreeNode* child = nullptr;
    parent.AddChildEntry(name, u"Node", ordered, child);
    return *child;
}

void FillIn(ResTreeNode& node) {
    for (const char16_t* key : keys) {
        node.AddTextEntry(key, u"COM.QN.FPGA.Board", zkhw::TextEntry);
    }
}

template <typename Ask>
void AskInTurn(benchmark::State& state, Ask ask) {
    size_t next = 0;
    for (auto round : state) {
        BSTR value = nullptr;
        benchmark::DoNotOptimize(ask(keys[next], &value));
        SysFreeString(value);
        next = next + 1 == keys.size() ? 0 : next + 1;
    }
}

void PropertyOfAMap(benchmark::State& state) {
    const std::unique_ptr<PropertyMap> map = std::make_unique<PropertyMap>();
    for (const char16_t* key : keys) {
        map->values.emplace(key, u"COM.QN.FPGA.Board");
    }
    PropertyMap* volatile hidden = map.get();
    AskInTurn(state, [&](LPCWSTR name, BSTR* value) { return hidden->GetProperty(name, value); });
}
BENCHMARK(PropertyOfAMap);

void PropertyOfANode(benchmark::State& state, bool ordered) {
    Tree tree;
    ResTreeNode& node = AddNode(tree.root, u"Board", ordered);
    FillIn(node);
    NodePointer view;
    zkhw::GiveView(&node, tree.observers, view.Receive());
    AskInTurn(state, [&](LPCWSTR name, BSTR* value) { return view->GetProperty(name, value); });
}
BENCHMARK_CAPTURE(PropertyOfANode, Unordered, false);
BENCHMARK_CAPTURE(PropertyOfANode, Ordered, true);

constexpr std::array<const char16_t*, 4> wayDown = {u"Board", u"ConnectorList", u"J12", u"PinList"};

void PropertyByPathOfAMap(benchmark::State& state) {
    std::map<std::u16string, std::u16string> level;
    for (const char16_t* key : keys) {
        level.emplace(key, u"COM.QN.FPGA.Board");
    }
    for (const char16_t* name : wayDown) {
        level.emplace(name, u"");
    }
    PropertyMap last;
    last.values = level;
    PropertyMap* volatile hidden = &last;
    for (auto round : state) {
        for (const char16_t* name : wayDown) {
            benchmark::DoNotOptimize(level.find(name));
        }
        BSTR value = nullptr;
        benchmark::DoNotOptimize(hidden->GetProperty(u"TargetClass", &value));
        SysFreeString(value);
    }
}
BENCHMARK(PropertyByPathOfAMap);

void PropertyByPathOfATree(benchmark::State& state) {
    Tree tree;
    ResTreeNode* node = &tree.root;
    FillIn(*node);
    for (const char16_t* name : wayDown) {
        node = &AddNode(*node, name);
        FillIn(*node);
    }
    IUnknown* queries = nullptr;
    zkhw::CreateTreeObject(nullptr, nullptr, tree.rootView.Get(), &queries);
    InterfacePointer<IzkEIOGResourceTree> owned(static_cast<IzkEIOGResourceTree*>(queries));
    for (auto round : state) {
        BSTR value = nullptr;
        benchmark::DoNotOptimize(owned->GetProperty(u"/Board/ConnectorList/J12/PinList/TargetClass", nullptr, &value));
        SysFreeString(value);
    }
}
BENCHMARK(PropertyByPathOfATree);

// Time for each name of a wide tree of `count` nodes, in groups of 100.
void DescendantNames(benchmark::State& state) {
    const int64_t count = state.range(0);
    Tree tree;
    for (int64_t group = 0; group < count / 100; ++group) {
        ResTreeNode& node = AddNode(tree.root, (u"Group" + bench::Number(group)).c_str());
        for (int64_t i = 1; i < 100; ++i) {
            AddNode(node, (u"Line" + bench::Number(i)).c_str());
        }
    }
    for (auto round : state) {
        ULONG found = 0;
        BSTR* names = nullptr;
        tree.rootView->GetDescendantNames(nullptr, nullptr, 1, &found, &names, nullptr);
        for (ULONG i = 0; i < found; ++i) {
            SysFreeString(names[i]);
        }
        CoTaskMemFree(names);
    }
    state.SetItemsProcessed(state.iterations() * count);
}
BENCHMARK(DescendantNames)->RangeMultiplier(10)->Range(1000, 100000)->Unit(benchmark::kMillisecond);

// Counts its references and nothing else.
struct IdleObserver final : IzkhwResourceTreeNodeObserver {
    HRESULT QueryInterface(REFIID, void** result) override {
        *result = nullptr;
        return E_NOINTERFACE;
    }
    ULONG AddRef() override { return ++count; }
    ULONG Release() override { return --count; }
    HRESULT NodeChanged(IzkhwResourceTreeNode*, ULONG, ULONG) override { return S_OK; }
    ULONG count = 1;
};

// Registers and ends `count` observers, on one node or on a node each.
void Observers(benchmark::State& state, bool onOneNode) {
    const int64_t count = state.range(0);
    Tree tree;
    std::vector<NodePointer> views;
    for (int64_t i = 0; i < (onOneNode ? 1 : count); ++i) {
        NodePointer view;
        zkhw::GiveView(&AddNode(tree.root, (u"Line" + bench::Number(i)).c_str()), tree.observers, view.Receive());
        views.push_back(std::move(view));
    }
    IdleObserver observer;
    for (auto round : state) {
        for (int64_t i = 0; i < count; ++i) {
            views[onOneNode ? 0 : static_cast<size_t>(i)]->Advise(&observer, ZkhwPropertyChanged | ZkhwAncestorChanged,
                                                                  static_cast<ULONG>(i));
        }
        tree.rootView->Unadvise(&observer, 0xFFFFFFFF, 1);
    }
    state.SetItemsProcessed(state.iterations() * count);
}
BENCHMARK_CAPTURE(Observers, OnOneNode, true)->Arg(1000)->Arg(10000)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(Observers, OnANodeEach, false)->Arg(1000)->Arg(10000)->Unit(benchmark::kMillisecond);

}  // namespace
