// The host's accessor of a node. Each test has a process of its own: the accessor's module stays loaded.

#include <array>
#include <cstdlib>

#include "host/LoadedRuntime.h"
#include "zkfpga/exports.h"
#include "zkfpga/types.h"

namespace {

constexpr int32_t untouched = 55;

// What the host knows by a reference: as much of a node as the accessor needs, which is its address.
class HostNode final : public IUnknown {
  public:
    HRESULT QueryInterface(const IID&, void**) override { std::abort(); }
    ULONG AddRef() override { return static_cast<ULONG>(++references); }
    ULONG Release() override {
        ++releases;
        return static_cast<ULONG>(--references);
    }
    int references = 0;
    int releases = 0;
};

struct Outcome {
    int32_t result;
    int32_t accessor;
    int releases;
    int references;
    std::string call;
    bool operator==(const Outcome&) const = default;
};

// The host of this process gives `node` for the reference 77, with `given` as the result.
StandInRuntime& HostThatGives(HRESULT given, HostNode& node) {
    StandInRuntime& host = LoadStandInRuntime();
    host.queryInterface = [given, &node](uint32_t refNum, const std::array<uint8_t, 16>&, void** object) {
        if (given >= 0 && refNum == 77) {
            node.AddRef();
            *object = static_cast<IUnknown*>(&node);
        }
        return given;
    };
    return host;
}

Outcome GetNode(HRESULT given, HostNode& node) {
    const StandInRuntime& host = HostThatGives(given, node);
    int32_t accessor = untouched;
    const int32_t result = ZkhwResTree_GetNode(77, &accessor);
    return {result, accessor, node.releases, node.references, host.calls.empty() ? "" : host.calls[0]};
}

void* LastNodeOf(void* module) {
    return *static_cast<void**>(qn::dsc::osdep::FindInModule(module, "lastNode"));
}

const char* const call = "QueryInterfaceForZKRefNum 77";

TEST(NodeAccessor, AccessorIsWhatTheHostsModuleGives) {
    EXPECT_IN_CHILD([] {
        void* const module = LoadModule(ACCESSOR_MODULE);
        HostNode node;
        return GetNode(S_OK, node) == Outcome{0, -77, 1, 0, call} && LastNodeOf(module) == &node;
    });
}

TEST(NodeAccessor, InterfaceIsAskedForByTheIdOfTheFourthVersion) {
    EXPECT_IN_CHILD([] {
        std::array<uint8_t, 16> askedId{};
        LoadStandInRuntime().queryInterface = [&](uint32_t, const std::array<uint8_t, 16>& id, void**) {
            askedId = id;
            return E_NOINTERFACE;
        };
        return ZkhwResTree_GetNode(77, nullptr) == 1 &&
               askedId == std::array<uint8_t, 16>{0xEC, 0x5A, 0xF9, 0xFE, 0x75, 0x4F, 0x23, 0x41,
                                                  0xBA, 0xA9, 0xB8, 0xA0, 0xBD, 0x3F, 0x8A, 0xB1};
    });
}

TEST(NodeAccessor, FailureOfTheHostGivesOne) {
    EXPECT_IN_CHILD([] {
        void* const module = LoadModule(ACCESSOR_MODULE);
        HostNode node;
        return GetNode(E_NOINTERFACE, node) == Outcome{1, untouched, 0, 0, call} && LastNodeOf(module) == nullptr;
    });
}

TEST(NodeAccessor, PositiveResultOfTheHostIsNoFailure) {
    EXPECT_IN_CHILD([] {
        LoadModule(ACCESSOR_MODULE);
        HostNode node;
        return GetNode(S_FALSE, node) == Outcome{0, -77, 1, 0, call};
    });
}

TEST(NodeAccessor, MissingModuleGivesOneAndTheReferenceBack) {
    EXPECT_IN_CHILD([] {
        HostNode node;
        return GetNode(S_OK, node) == Outcome{1, untouched, 1, 0, call};
    });
}

TEST(NodeAccessor, MissingExportGivesOneAndTheReferenceBack) {
    EXPECT_IN_CHILD([] {
        void* const module = LoadModule(POOR_ACCESSOR_MODULE);
        HostNode node;
        return GetNode(S_OK, node) == Outcome{1, untouched, 1, 0, call} && LastNodeOf(module) == nullptr;
    });
}

// It bears no name inside: it is known by the name of its file, wherever that was loaded from.
TEST(NodeAccessor, ModuleIsFoundByTheNameOfItsFile) {
    EXPECT_IN_CHILD([] {
        void* const module = LoadModule(ACCESSOR_PLUG_IN);
        HostNode node;
        return GetNode(S_OK, node) == Outcome{0, -77, 1, 0, call} && LastNodeOf(module) == &node;
    });
}

TEST(NodeAccessor, ModuleThatIsUnloadedIsNotThere) {
    EXPECT_IN_CHILD([] {
        void* const module = LoadModule(ACCESSOR_PLUG_IN);
        HostNode node;
        const bool wasThere = GetNode(S_OK, node).result == 0;
        qn::dsc::osdep::UnloadModule(module);
        return wasThere && GetNode(S_OK, node) == Outcome{1, untouched, 2, 0, call};
    });
}

TEST(NodeAccessor, AccessorNeedNotBeWanted) {
    EXPECT_IN_CHILD([] {
        LoadModule(ACCESSOR_MODULE);
        HostNode node;
        HostThatGives(S_OK, node);
        return ZkhwResTree_GetNode(77, nullptr) == 0 && node.references == 0 && node.releases == 1;
    });
}

}  // namespace
