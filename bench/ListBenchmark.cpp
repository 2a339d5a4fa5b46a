// Escaped lists, the text of node paths, and the lists that a resource file writes.

#include <vector>

#include <benchmark/benchmark.h>

#include "qn/dsc/FindUnit.h"
#include "qn/dsc/StringBase.h"
#include "restree/LocalizeText.h"
#include "restree/NameRange.h"
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

void RebaseListPaths(benchmark::State& state) {
    const String list(u"/Board/Bank17,../Clock");
    const String base(u"/Board0003/Resources/IIC_Main_SerialClock_17");
    for (auto round : state) {
        benchmark::DoNotOptimize(zkhw::RebaseListPaths(list, base));
    }
}
BENCHMARK(RebaseListPaths);

void ParseNames(benchmark::State& state) {
    const String names(u"Bank[i=0..7],Clock");
    std::vector<zkhw::InstanceRecord> records;
    std::vector<String> loopVariables;
    for (auto round : state) {
        records.clear();
        loopVariables.clear();
        zkhw::ParseNames(names, records, loopVariables);
        benchmark::DoNotOptimize(records.data());
    }
}
BENCHMARK(ParseNames);

void LocalizeText(benchmark::State& state) {
    const String list(u"eng=Line 17 of the board,jpn=\u7dda 17");
    for (auto round : state) {
        benchmark::DoNotOptimize(zkhw::LocalizeText(list.View()));
    }
}
BENCHMARK(LocalizeText);

void FindUnit(benchmark::State& state) {
    const std::u16string text(static_cast<size_t>(state.range(0)), u'a');
    for (auto round : state) {
        benchmark::DoNotOptimize(qn::dsc::FindUnit(text, u'#'));
    }
}
BENCHMARK(FindUnit)->Arg(4)->Arg(20)->Arg(200);

}  // namespace
