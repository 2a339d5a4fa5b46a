// The cache file on any bytes, with a resource file beside it: what is read is armed for loading or not there at all,
// every stub grows at the first miss, and the tree can be written as a cache again.

#include <string>

#include "FuzzInput.h"
#include "MemoryFileSystem.h"
#include "TreeLaws.h"
#include "cachebuilder/FPGAResTree.h"
#include "qn/dsc/osdep/AllocationFault.h"
#include "restree/ResTreeNode.h"

namespace {

using qn::dsc::String;
using zkhw::FPGAResTree;
using zkhw::ResTreeNode;

// Copies of copies can make a few bytes fill any memory; this is where an input stops and memory is said to be out.
constexpr uint64_t mostAllocations = 30000;
constexpr auto folder = u"C:\\Targets\\QN\\FPGA";
constexpr auto cachePath = u"C:\\Targets\\QN\\FPGA\\resource_cache.xml";

void CheckStub(ResTreeNode& child) {
    if (child.IsA(u"Target")) {
        const auto name = child.GetProperty(u"TargetClassShortClassName");
        fuzz::Require(!name || *name == child.GetName(), "a target's short name is its name");
        fuzz::Require(child.GetTypeTable() != nullptr, "a target has its own types");
    }
    child.Find(u"no such entry");
    fuzz::Require(child.FindRaw(u":DeferredLoadPath") == nullptr, "a miss loads what is deferred");
}

void ReadAndWrite(fuzz::MemoryFileSystem& disk) {
    FPGAResTree owner;
    ResTreeNode root(u"", u"ProviderResourceTreeRoot", false);
    const int32_t result = owner.ReadResourceCache(String(folder), String(cachePath), root);
    fuzz::Require(result == 0 || result == 1, "the cache is taken or a scan is asked for");
    fuzz::CheckTree(root);
    fuzz::Require(result == 0 || root.Begin() == root.End(), "what is not taken leaves nothing");
    for (auto entry = root.Begin(); entry != root.End(); ++entry) {
        if (entry->Child() != nullptr) {
            CheckStub(*entry->Child());
        }
    }
    fuzz::CheckTree(root);
    fuzz::Require(owner.ScanTargets(String(folder), root) == 0, "a scan gives 0");
    fuzz::CheckTree(root);
    const int32_t written = owner.WriteResourceCache(root, String(cachePath));
    fuzz::Require(written == 0 || written == static_cast<int32_t>(0x80004005), "a write gives one of two results");
    fuzz::Require(written != 0 || !disk.files[cachePath].bytes.empty(), "a cache that was written is there");
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    fuzz::Input input(data, size);
    fuzz::MemoryFileSystem disk(u"C:\\host");
    const uint8_t newer = input.TakeByte();
    std::string cache;
    for (std::string line; !input.IsEmpty() && (line = input.TakeLine()) != "----";) {
        cache += line + '\n';
    }
    disk.files[cachePath] = {cache, 5};
    disk.files[u"C:\\Targets\\QN\\FPGA\\B\\b_resource.xml"] = {input.TakeRest(), newer % 16 == 15 ? 6U : 4U};
    try {
        qn::dsc::osdep::FailAllocation(mostAllocations, true);
        ReadAndWrite(disk);
    } catch (const std::bad_alloc&) {
        // As the tool, which ends here.
    }
    qn::dsc::osdep::ClearAllocationFault();
    return 0;
}
