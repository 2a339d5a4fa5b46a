// Escaped lists and the text of node paths.

#include <vector>

#include <benchmark/benchmark.h>

#include "qn/dsc/StringBase.h"
#include "restree/NodePath.h"
#include "restree/TextList.h"

namespace {

using qn::dsc::String;

void SplitList(benchmark::State& state) {
    const String text(u"Bank0, Bank1,Bank\\,2,Bank3,Bank4,Bank5,Bank6,Bank7");
    const String separator(u",");
    for (auto round : state) {
        std::vector<String> pieces;
        zkhw::SplitList(text, separator, pieces, true);
        benchmark::DoNotOptimize(pieces.data());
    }
}
BENCHMARK(SplitList);

void JoinAll(benchmark::State& state) {
    const std::vector<String> pieces(8, String(u"Bank,0"));
    const String separator(u",");
    for (auto round : state) {
        benchmark::DoNotOptimize(zkhw::JoinAll(pieces, separator, true));
    }
}
BENCHMARK(JoinAll);

void MakeRelativeNodePath(benchmark::State& state) {
    const String target(u"/Board/ClockList/Clock3");
    const String base(u"/Board/Resources/Group17");
    for (auto round : state) {
        benchmark::DoNotOptimize(zkhw::MakeRelativeNodePath(target, base));
    }
}
BENCHMARK(MakeRelativeNodePath);

}  // namespace
