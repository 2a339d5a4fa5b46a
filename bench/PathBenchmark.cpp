// The text of file paths, and the listing of a folder.

#include <benchmark/benchmark.h>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/osdep/path.h"

namespace {

using qn::dsc::String;

void JoinPath(benchmark::State& state) {
    const String base(u"C:\\opt\\host\\Targets\\QN\\FPGA");
    const String part(u"BoardOne\\BoardOne_resource.xml");
    for (auto round : state) {
        benchmark::DoNotOptimize(qn::dsc::osdep::JoinPath(base, part));
    }
}
BENCHMARK(JoinPath);

void NormalizePath(benchmark::State& state) {
    const String path(u"C:\\opt\\host\\Targets\\QN\\FPGA\\Utilities\\..\\..\\..\\..\\menus\\virtex5");
    for (auto round : state) {
        benchmark::DoNotOptimize(qn::dsc::osdep::NormalizePath(path));
    }
}
BENCHMARK(NormalizePath);

void IsDirectory(benchmark::State& state) {
    const String path(u"C:\\usr\\lib");
    for (auto round : state) {
        benchmark::DoNotOptimize(qn::dsc::osdep::IsDirectory(path));
    }
}
BENCHMARK(IsDirectory);

}  // namespace
