// Writing a tree as text.

#include <benchmark/benchmark.h>

#include "GeneratedBoard.h"
#include "restree/TreeWriter.h"

namespace {

void WriteNode(benchmark::State& state) {
    const auto root = bench::Loaded(bench::PlainBoard(static_cast<int>(state.range(0))));
    int64_t units = 0;
    for (auto round : state) {
        qn::dsc::String text;
        zkhw::WriteNode(*root, text, u"");
        units = text.Length();
        benchmark::DoNotOptimize(text.CStr());
    }
    state.SetBytesProcessed(state.iterations() * units);
}
BENCHMARK(WriteNode)->Arg(100)->Arg(10000);

}  // namespace
