// The expansion of "#{name}" in texts.

#include <benchmark/benchmark.h>

#include <string>
#include <string_view>
#include <utility>

#include "restree/Parameters.h"
#include "restree/ResTreeNode.h"

namespace {

void FindVariable(benchmark::State& state) {
    const std::u16string_view text(u"help/lines/digital.html");
    for (auto round : state) {
        benchmark::DoNotOptimize(zkhw::FindVariable(text));
    }
}
BENCHMARK(FindVariable);

void ExpandInstance(benchmark::State& state) {
    const std::u16string_view text(u"#{name} of port 17, line #{i}");
    const zkhw::InstanceParameters parameters(u"Bit3", u"i", 3);
    for (auto round : state) {
        qn::dsc::TextBuilder expanded;
        zkhw::ExpandVariables(text, parameters, expanded);
        benchmark::DoNotOptimize(expanded.View().data());
    }
}
BENCHMARK(ExpandInstance);

void ExpandFromAMap(benchmark::State& state) {
    const std::u16string_view text(u"Line on pin #{Pin} of #{Board}");
    zkhw::ParameterMap values;
    values.emplace(u"Board", u"Board0003");
    values.emplace(u"Pin", u"A17");
    const zkhw::MapParameters parameters(std::move(values));
    for (auto round : state) {
        qn::dsc::TextBuilder expanded;
        zkhw::ExpandVariables(text, parameters, expanded);
        benchmark::DoNotOptimize(expanded.View().data());
    }
}
BENCHMARK(ExpandFromAMap);

// A node of so many nodes, of which one has a text to expand: what each of many includes asks for. Time must hardly
// grow with the size.
void ExpandOneOfMany(benchmark::State& state) {
    zkhw::ResTreeNode root(u"Root", u"Root", true);
    zkhw::ResTreeNode* child = nullptr;
    for (int64_t i = 0; i < state.range(0); ++i) {
        const std::string name = "Line" + std::to_string(i);
        root.AddChildEntry(std::u16string(name.begin(), name.end()), u"Line", false, child);
        child->SetProperty(u"Label", i % 100 == 0 ? u"#{name}" : u"label");
    }
    root.ApplyInstance(u"name", u"", 0);
    for (auto round : state) {
        child->SetProperty(u"Label", u"#{name} of port 17");
        root.ApplyInstance(u"name", u"", 0);
    }
}
BENCHMARK(ExpandOneOfMany)->Arg(100)->Arg(10000)->Arg(100000);

}  // namespace
