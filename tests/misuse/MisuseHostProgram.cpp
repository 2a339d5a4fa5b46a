// A host that breaks the rules once, and says what came of it. Arguments: the library's file; the run-time's; the
// host's folder of targets, as a run-time tells it; the name of a case. "list" in place of all gives the names.
//
// Prints what the case has to say, whether anything of /Rack is another than before, and "answers" if the tree still
// does. Ends itself with a status of its own if a case takes more than a minute.

#include <chrono>
#include <cstdlib>
#include <cstring>
#include <exception>
#include <thread>

#include "misuse/MisuseHost.h"
#include "support/Modules.h"

extern "C" {
#include "library/SlotsHostModule.h"
}

namespace misuse {

namespace {

constexpr int noSuchThing = 3;
constexpr int tookTooLong = 4;

template <typename Function>
void Find(void* (*find)(void*, const char*), void* module, const char* name, Function*& function) {
    void* const address = find(module, name);
    if (address == nullptr) {
        Say(std::string("no ") + name);
        std::exit(noSuchThing);
    }
    std::memcpy(&function, &address, sizeof function);
}

void* Load(const char* file) {
    void* const module = qn::dsc::osdep::LoadModuleFile(file);
    if (module == nullptr) {
        Say(std::string("no module ") + file);
        std::exit(noSuchThing);
    }
    return module;
}

void LoadLibraryFunctions(const char* file) {
    void* const module = Load(file);
#define FIND(name) Find(FindExport, module, #name, library.name)
    FIND(gFPGAResTree);
    FIND(QueryResourceTreeInterface);
    FIND(FPGAResTree_GetProperty);
    FIND(FPGAResTree_GetDescendantNames);
    FIND(FPGAResTree_GetMultipleProperties);
    FIND(FPGAResTree_Dump);
    FIND(ZkhwResTree_GetNode);
    FIND(FPGA_mbstowcs);
    FIND(FPGA_wcstombs);
    FIND(FPGA_MbsToUtf8);
    FIND(FPGA_Utf8ToMbs);
    FIND(SetZKRTModule);
    FIND(SetZKRTTLSIndex);
    FIND(SetZKRTModuleHook);
    FIND(SetZKRTTLSIndexHook);
    FIND(CoTaskMemAlloc);
    FIND(CoTaskMemRealloc);
    FIND(CoTaskMemFree);
    FIND(SysAllocString);
    FIND(SysAllocStringLen);
    FIND(SysStringLen);
    FIND(SysFreeString);
#undef FIND
}

void UseRuntime(const char* file, const char* targets) {
    void* const module = Load(file);
    const auto find = qn::dsc::osdep::FindInModule;
    Find(find, module, "standInRuntime", fixture.runtime.standIn);
    Find(find, module, "HostNewHandleClear", fixture.runtime.newHandle);
    Find(find, module, "HostDisposeHandle", fixture.runtime.dispose);
    fixture.runtime.standIn->specialDirectories[28] = targets;
}

template <typename Interface>
void Query(REFIID id, Interface*& result) {
    void* object = nullptr;
    const HRESULT given = library.QueryResourceTreeInterface(&id, &fixture.context, &fixture.item, &object);
    if (given != S_OK) {
        Say("no tree " + Hex(given));
        std::exit(noSuchThing);
    }
    result = static_cast<Interface*>(object);
}

std::string DescribeRack() {
    IzkhwResourceTreeNode* rack = nullptr;
    if (fixture.root->FindNode(u"Rack", nullptr, nullptr, &rack) != S_OK) {
        return "no rack";
    }
    std::string text;
    ULONG count = 0;
    IzkhwResourceTreeNode** shelves = nullptr;
    rack->GetChildren(&count, &shelves);
    for (ULONG i = 0; i < count; ++i) {
        text += Describe(shelves[i]);
        shelves[i]->Release();
    }
    library.CoTaskMemFree(shelves);
    rack->Release();
    return text;
}

// By a node and by the tree, each asked for anew.
std::string SignOfLife() {
    IzkhwResourceTreeNode5* root = nullptr;
    IzkEIOGResourceTree2* tree = nullptr;
    IzkhwResourceTreeNode* kept = nullptr;
    Query(IID_IzkhwResourceTreeNode5, root);
    Query(IID_IzkEIOGResourceTree2, tree);
    BSTR byNode = nullptr;
    BSTR byTree = nullptr;
    if (root->FindNode(u"Kept", nullptr, nullptr, &kept) == S_OK) {
        kept->GetProperty(u"Sign", &byNode);
        kept->Release();
    }
    tree->GetProperty(u"Kept/Sign", nullptr, &byTree);
    root->Release();
    tree->Release();
    const std::string answers = Take(byNode) + ", " + Take(byTree);
    return answers == "still here, still here" ? "answers" : answers;
}

void Run(const Case& chosen) {
    Query(IID_IzkhwResourceTreeNode5, fixture.root);
    Query(IID_IzkEIOGResourceTree2, fixture.tree);
    fixture.shelf = ViewOf(u"Rack/S");
    const std::string before = DescribeRack();
    // A shelf that the case removes has to be void when its view goes.
    try {
        chosen.run();
    } catch (const std::exception&) {
        Say("threw");
    }
    const std::string after = DescribeRack();
    if (after != before) {
        Say("now " + after);
    }
    Say(SignOfLife());
    fixture.shelf->Release();
    fixture.tree->Release();
    fixture.root->Release();
    if (fixture.runtime.standIn != nullptr && fixture.runtime.standIn->LiveHandleCount() != 0) {
        Say("handles are left");
    }
}

Cases AllCases() {
    Cases cases;
    for (const auto add : {AddNodeNulls, AddTreeNulls, AddExportNulls, AddNumbers, AddExportNumbers, AddIds, AddNotices,
                           AddBrackets, AddLifetimes, AddWrongKinds}) {
        add(cases);
    }
    return cases;
}

void WatchTheTime() {
    std::thread([] {
        std::this_thread::sleep_for(std::chrono::minutes(1));
        std::_Exit(tookTooLong);
    }).detach();
}

}  // namespace

}  // namespace misuse

using namespace misuse;  // NOLINT(google-build-using-namespace): main belongs to no namespace.

int main(int argc, char** argv) {
    const Cases cases = AllCases();
    if (argc == 2) {
        for (const auto& [name, unused] : cases) {
            Say(name);
        }
        return 0;
    }
    const auto chosen = argc == 5 ? cases.find(argv[4]) : cases.end();
    if (chosen == cases.end()) {
        Say("no such case");
        return noSuchThing;
    }
    WatchTheTime();
    LoadLibraryFunctions(argv[1]);
    if (chosen->second.needsRuntime) {
        UseRuntime(argv[2], argv[3]);
    }
    Run(chosen->second);
    return 0;
}
