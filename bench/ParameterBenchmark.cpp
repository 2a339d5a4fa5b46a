// The expansion of "#{name}" in texts.

#include <benchmark/benchmark.h>

#include <string_view>
#include <utility>

#include "restree/Parameters.h"

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

}  // namespace
