// The order of texts: what ASCII costs, where the texts part early, late and not at all, and what other letters cost.

#include <string>

#include <benchmark/benchmark.h>

#include "qn/dsc/osdep/Compare.h"

namespace {

using qn::dsc::osdep::Compare;

void CompareTexts(benchmark::State& state, std::u16string_view a, std::u16string_view b) {
    for (auto round : state) {
        benchmark::DoNotOptimize(a);
        benchmark::DoNotOptimize(Compare(a, b));
    }
}

BENCHMARK_CAPTURE(CompareTexts, EqualKeys, u"SupportedFPGAHostList", u"SupportedFPGAHostList");
BENCHMARK_CAPTURE(CompareTexts, KeysThatDifferInCase, u"SupportedFPGAHostList", u"supportedfpgahostlist");
BENCHMARK_CAPTURE(CompareTexts, KeysThatPartAtOnce, u"DeviceCategory", u"TargetClass");
BENCHMARK_CAPTURE(CompareTexts, KeysThatPartLate, u"IOResource_Line_1004", u"IOResource_Line_1005");
BENCHMARK_CAPTURE(CompareTexts, ShortKeys, u"Pin", u"Kind");
BENCHMARK_CAPTURE(CompareTexts, KeysWithHyphens, u"document-root", u"document-list");
BENCHMARK_CAPTURE(CompareTexts, JapaneseTexts, u"\u30ed\u30fc\u30ab\u30eb", u"\u30ed\u30fc\u30ab\u30e9");

}  // namespace
