// A fresh cache: how long a host waits for its targets, beside the time that a scan of them would take. The
// installation is laid out in a folder of its own below the system's temporary one.

#include <cstdint>
#include <filesystem>
#include <fstream>
#include <string>

#include <benchmark/benchmark.h>

#include "GeneratedBoard.h"
#include "cachebuilder/FPGAResTree.h"
#include "qn/dsc/osdep/CommandLine.h"
#include "restree/ResTreeNode.h"

namespace {

using qn::dsc::String;

// A folder of `targets` boards, and their cache. Gone with the object.
class Installation {
  public:
    explicit Installation(int64_t targets) {
        std::string name = (std::filesystem::temp_directory_path() / "zkfpga-bench-XXXXXX").string();
        folder = mkdtemp(name.data());
        const std::string board = bench::PlainBoard(200);
        for (int64_t i = 0; i < targets; ++i) {
            const std::string target = "Board" + std::to_string(i);
            std::string text = board;
            text.replace(text.find("\"Board\""), 7, '"' + target + '"');
            std::filesystem::create_directory(folder / target);
            std::ofstream(folder / target / (target + "_resource.xml")) << text;
        }
        zkhw::FPGAResTree owner;
        zkhw::ResTreeNode root(u"", u"ProviderResourceTreeRoot", false);
        owner.ScanTargets(Folder(), root);
        owner.WriteResourceCache(root, Cache());
    }
    ~Installation() { std::filesystem::remove_all(folder); }
    Installation(const Installation&) = delete;
    Installation& operator=(const Installation&) = delete;

    String Folder() const { return qn::dsc::osdep::PathFromArgument(folder.c_str()); }
    String Cache() const { return qn::dsc::osdep::PathFromArgument((folder / "resource_cache.xml").c_str()); }

  private:
    std::filesystem::path folder;
};

void ReadCache(benchmark::State& state) {
    const Installation installation(state.range(0));
    const String folder = installation.Folder();
    const String cache = installation.Cache();
    zkhw::FPGAResTree owner;
    for (auto round : state) {
        zkhw::ResTreeNode root(u"", u"ProviderResourceTreeRoot", false);
        if (owner.ReadResourceCache(folder, cache, root) != 0) {
            state.SkipWithError("the cache is not fresh");
            break;
        }
    }
    state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK(ReadCache)->Arg(10)->Arg(200)->Unit(benchmark::kMillisecond);

void Scan(benchmark::State& state) {
    const Installation installation(state.range(0));
    const String folder = installation.Folder();
    zkhw::FPGAResTree owner;
    for (auto round : state) {
        zkhw::ResTreeNode root(u"", u"ProviderResourceTreeRoot", false);
        owner.ScanTargets(folder, root);
        benchmark::DoNotOptimize(root.Begin() == root.End());
    }
    state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK(Scan)->Arg(10)->Arg(200)->Unit(benchmark::kMillisecond);

}  // namespace
