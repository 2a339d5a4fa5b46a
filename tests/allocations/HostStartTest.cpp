// A host's first query, which builds the tree, with each allocation failing in turn, alone and with all behind it: over
// a fresh cache, over a stale one, and without one. It ends with a result or with bad_alloc; the next query has memory
// and is answered. What couldn't be read isn't there; nothing is there that no file says. The cache is whole for what
// was read, or as it was.

#include <gtest/gtest.h>

#include <memory>
#include <new>
#include <optional>

#include "cachebuilder/FPGAResTree.h"
#include "host/LoadedRuntime.h"
#include "hostbridge/RuntimeModule.h"
#include "interfaces/InterfacePointer.h"
#include "interfaces/support/HostMemory.h"
#include "interfaces/support/ProjectItems.h"
#include "library/HostInstallation.h"
#include "support/AllocationFaultScope.h"
#include "support/FaultyFileSystem.h"
#include "zkfpga/tree_owner.h"
#include "zkfpga/tree_root.h"

namespace allocations {
namespace {

using support::AllocationFaultScope;
using Tree = zkhw::InterfacePointer<IzkEIOGResourceTree2>;
using Node = zkhw::InterfacePointer<IzkhwResourceTreeNode>;

enum class Cache { Fresh, Stale, Absent };

class Observer final : public zkhw::StackObject<IzkhwResourceTreeNodeObserver> {
  public:
    HRESULT STDMETHODCALLTYPE NodeChanged(IzkhwResourceTreeNode*, ULONG, ULONG) override { return S_OK; }
};

// A host and what stands on its disk.
class Host {
  public:
    explicit Host(Cache cache) : cache(cache), module(LoadModule(PLAIN_RUNTIME)) {
        files.SetExecutablePath(installation.Root().System(u"TheHost"));
        const qn::dsc::NarrowString targets(installation.Root().System(u"Targets"));
        targets.View().copy(static_cast<char*>(qn::dsc::osdep::FindInModule(module, "specialFolder")), 4095);
        zkhw::runtimeModule = module;
    }
    Host(const Host&) = delete;
    Host& operator=(const Host&) = delete;
    ~Host() { zkhw::runtimeModule = nullptr; }

    // The cache as it is before a start.
    void ResetCache() {
        const std::string path = HostInstallation::Below("resource_cache.xml");
        if (cache == Cache::Absent) {
            if (installation.HasCache()) {
                installation.Root().Remove(path);
            }
        } else {
            installation.Write("resource_cache.xml", Before());
        }
        installation.SetFileTimes();
        if (cache == Cache::Stale) {
            installation.Root().SetFileTime(path, 500, 0);
        }
    }

    // What stood in the cache then.
    std::string Before() const {
        switch (cache) {
            case Cache::Fresh:
                return installation.SoundCache();
            case Cache::Stale:
                return "old";
            default:
                return "none";
        }
    }
    std::string CacheNow() const { return installation.HasCache() ? installation.Cache() : "none"; }

    // Whether `text` is a cache of some of the files, each of which has its own block in it.
    bool IsCacheOfSome(const std::string& text) const {
        std::vector<std::string> blocks = {
            TargetInCache("Board", installation.SystemPath("Board/Board_resource.xml"), "7"),
            TargetInCache("Card", installation.SystemPath("Card/Card_resource.xml"), "8"),
            "\n   <FPGAHostSet>\n      <HostA>1</HostA>\n   </FPGAHostSet>",
            "\n   <Parts>\n      <Protocols></Protocols>\n      <FPGA_XMLSource>" +
                installation.SystemPath("parts_resource.xml") + "</FPGA_XMLSource>\n   </Parts>"};
        for (uint32_t choice = 0; choice < 16; ++choice) {
            std::string chosen;
            for (uint32_t i = 0; i < 4; ++i) {
                chosen += (choice >> i & 1) != 0 ? blocks[i] : "";
            }
            if (text == CacheOf(chosen)) {
                return true;
            }
        }
        return false;
    }

    HostInstallation installation;
    qn::dsc::osdep::FaultyFileSystem files;

  private:
    const qn::dsc::osdep::FileSystemScope scope{files};
    const Cache cache;
    void* const module;
};

struct Property {
    const char16_t* path;
    const char* value;
};

// One of each that the files have, and some of those that they share.
constexpr Property properties[] = {{u"Board/Speed", "40"},   {u"Board/C/Rate", "40"},    {u"Board/Label", "Clock"},
                                   {u"Board/L/Rate", "40"},  {u"Board/B\\/1/Pins", "8"}, {u"Board/DeviceIDs", "7"},
                                   {u"Card/Speed", "50"},    {u"Card/C/Rate", "40"},     {u"Parts/P/Size", "3"},
                                   {u"Card/DeviceIDs", "8"}, {u"FPGAHostSet/HostA", "1"}};

// How many of them are there. No other value is.
size_t CountAnswers(IzkEIOGResourceTree2& tree) {
    size_t count = 0;
    for (const Property& property : properties) {
        const std::string given =
            zkhw::GivenText([&](BSTR* value) { return tree.GetProperty(property.path, nullptr, value); });
        const bool isThere = given != "S_FALSE untouched";
        EXPECT_TRUE(!isThere || given == std::string("S_OK ") + property.value) << given << " for " << property.value;
        count += isThere ? 1 : 0;
    }
    return count;
}

HRESULT Query(zkhw::FPGAResTree& owner, Tree& tree) {
    return owner.QueryTreeInterface(IID_IzkEIOGResourceTree2, nullptr, nullptr, tree.ReceiveAny());
}

class Start {
  public:
    Start(Host& host, bool fromThenOn) : host(host), fromThenOn(fromThenOn) {}

    // False if the query needs no `nth` allocation.
    bool FailAt(uint64_t nth) {
        SCOPED_TRACE("allocation " + std::to_string(nth) + (fromThenOn ? " and all behind it" : ""));
        host.ResetCache();
        auto owner = std::make_unique<zkhw::FPGAResTree>();
        Tree tree;
        bool wasReached = false;
        std::optional<HRESULT> result;
        {
            const AllocationFaultScope fault(nth, fromThenOn);
            try {
                result = Query(*owner, tree);
            } catch (const std::bad_alloc&) {
            }
            wasReached = qn::dsc::osdep::AllocationCount() >= nth;
        }
        EXPECT_EQ(host.files.OpenFiles() + host.files.OpenSearches() + host.files.OpenWalks(), 0);
        if (wasReached) {
            CheckResult(result, tree);
            CheckCache();
        } else {
            EXPECT_EQ(result, std::optional<HRESULT>(S_OK));
            EXPECT_EQ(host.CacheNow(), host.installation.SoundCache());
        }
        CheckNextQuery(*owner, !wasReached || result == std::optional<HRESULT>(E_OUTOFMEMORY));
        End(owner);
        return wasReached;
    }

    uint64_t failures = 0;

  private:
    void CheckResult(std::optional<HRESULT> result, const Tree& tree) {
        EXPECT_TRUE(!result || *result == S_OK || *result == E_OUTOFMEMORY || *result == E_FAIL) << *result;
        EXPECT_EQ(static_cast<bool>(tree), result == std::optional<HRESULT>(S_OK));
        failures += result == std::optional<HRESULT>(S_OK) ? 0U : 1U;
    }

    void CheckCache() const {
        const std::string now = host.CacheNow();
        EXPECT_TRUE(now == host.Before() || host.IsCacheOfSome(now)) << now;
    }

    // Without a root or an object around it nothing is lost.
    static void CheckNextQuery(zkhw::FPGAResTree& owner, bool isWhole) {
        Tree tree;
        ASSERT_EQ(Query(owner, tree), S_OK);
        const size_t count = CountAnswers(*tree.Get());
        EXPECT_TRUE(count == std::size(properties) || !isWhole) << count;
    }

    // The end of a tree that is observed can't fail.
    static void End(std::unique_ptr<zkhw::FPGAResTree>& owner) {
        Observer observer;
        {
            Node root;
            ASSERT_EQ(owner->QueryTreeInterface(IID_IzkhwResourceTreeNode, nullptr, nullptr, root.ReceiveAny()), S_OK);
            ASSERT_EQ(root->Advise(&observer, 0xFFFFFFFF, 1), S_OK);
        }
        {
            const AllocationFaultScope fault(1, true);
            owner.reset();
        }
        EXPECT_EQ(observer.references, 0U);
    }

    Host& host;
    const bool fromThenOn;
};

class HostStartOutOfMemory : public testing::TestWithParam<Cache> {};

TEST_P(HostStartOutOfMemory, EndsInOrderAndIsAnsweredNextTime) {
    Host host(GetParam());
    // What lives to the end of the process is made here.
    Start(host, false).FailAt(UINT64_MAX);
    uint64_t count = 0;
    for (const bool fromThenOn : {false, true}) {
        Start start(host, fromThenOn);
        uint64_t nth = 1;
        while (start.FailAt(nth) && !HasFailure()) {
            ++nth;
        }
        count += nth - 1;
        EXPECT_GT(start.failures, (nth - 1) / 2);
    }
    EXPECT_GT(count, 500U);
    RecordProperty("failures", std::to_string(count));
}

std::string NameOf(const testing::TestParamInfo<Cache>& info) {
    switch (info.param) {
        case Cache::Fresh:
            return "AFreshCache";
        case Cache::Stale:
            return "AStaleCache";
        default:
            return "NoCache";
    }
}

INSTANTIATE_TEST_SUITE_P(Over, HostStartOutOfMemory, testing::Values(Cache::Fresh, Cache::Stale, Cache::Absent),
                         NameOf);

}  // namespace
}  // namespace allocations
