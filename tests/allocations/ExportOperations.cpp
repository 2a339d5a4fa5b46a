// The exported functions in a process whose tree is built already, and what the headers say of each where memory is
// short.

#include <cstring>
#include <optional>
#include <utility>

#include "allocations/Operation.h"
#include "library/ExportsTest.h"

namespace allocations {

namespace {

// A host that keeps its memory to itself, and its tree, from the first use to the end of the process.
class Host {
  public:
    static Host& Get() {
        static Host host;
        return host;
    }

    // The root, with a reference for the caller.
    static IzkhwResourceTreeNode* Root() {
        void* root = nullptr;
        QueryResourceTreeInterface(&IID_IzkhwResourceTreeNode, nullptr, nullptr, &root);
        return static_cast<IzkhwResourceTreeNode*>(root);
    }

    // What the reference 77 stands for; a call that gives it away makes this null.
    void*& ObjectOfRefNum() { return *static_cast<void**>(Exported("objectOfRefNum")); }
    int LiveHandles() { return *static_cast<int*>(Exported("liveHandles")); }

    void* const module = LoadModule(PLAIN_RUNTIME);

  private:
    Host() {
        folder.WriteFile("Targets/QN/FPGA/a_resource.xml",
                         "<Board name=\"a\"><b>plain</b><Sub name=\"s\"><d>deep</d></Sub></Board>");
        folder.WriteFile("Targets/QN/FPGA/c_resource.xml", "<Board name=\"c\"><DisplayName>C</DisplayName></Board>");
        const qn::dsc::NarrowString targets(folder.System(u"Targets"));
        targets.View().copy(static_cast<char*>(Exported("specialFolder")), 4095);
        zkhw::runtimeModule = module;
        LoadModule(ACCESSOR_MODULE);
        Root()->Release();
    }

    void* Exported(const char* name) { return qn::dsc::osdep::FindInModule(module, name); }

    const qn::dsc::osdep::TemporaryFolder folder;
};

std::string Xml(IzkhwResourceTreeNode* node) {
    BSTR text = nullptr;
    node->GetXml(&text);
    std::string xml = qn::dsc::NarrowString(qn::dsc::String(reinterpret_cast<const char16_t*>(text))).CStr();
    SysFreeString(text);
    node->Release();
    return xml;
}

// What a call works on, anew for each.
struct HandsOfTheHost {
    HostText source{"ab\xE2\x82\xAC"};
    HostText text{"before"};
    HostTexts list;
    unsigned char found = 9;
    int32_t accessor = 55;
    void* object = &found;
    // Holds "block", and is the function's where it takes it.
    char* block = nullptr;
    BSTR string = nullptr;
};

class ExportScene final : public Scene {
  public:
    using Function = HRESULT (*)(HandsOfTheHost& hands);

    explicit ExportScene(Function function) : function(function) {}
    ~ExportScene() override {
        Take();
        EXPECT_EQ(host.LiveHandles(), handlesBefore);
    }

    void GetReady() override {
        hands.emplace();
        hands->block = static_cast<char*>(CoTaskMemAlloc(16));
        std::memcpy(hands->block, "block", 6);
        hands->string = SysAllocString(u"string");
        if (host.ObjectOfRefNum() == nullptr) {
            host.ObjectOfRefNum() = Host::Root();
        }
    }
    HRESULT Call() override { return function(*hands); }
    std::string Take() override;
    std::string State() override { return Xml(Host::Root()); }
    std::string Rest() override { return State(); }

  private:
    Host& host = Host::Get();
    const int handlesBefore = host.LiveHandles();
    Function function;
    std::optional<HandsOfTheHost> hands;
};

std::string ExportScene::Take() {
    std::string taken;
    if (!hands) {
        return taken;
    }
    if (hands->found != 9) {
        taken += " " + std::to_string(hands->found);
    }
    if (hands->text.Bytes() != "before") {
        taken += " ";
        for (const char byte : hands->text.Bytes()) {
            taken += byte == 0 ? "{00}" : std::string(1, byte);
        }
    }
    if (hands->list.array != nullptr) {
        std::string separator = " [";
        for (const std::string& each : hands->list.Texts()) {
            taken += separator + each;
            separator = ", ";
        }
        taken += separator == ", " ? "]" : " []";
    }
    if (hands->accessor != 55) {
        taken += " " + std::to_string(hands->accessor);
    }
    if (hands->object != &hands->found) {
        taken += hands->object == nullptr ? " null" : " object";
    }
    if (hands->block != nullptr) {
        taken += hands->block == std::string("block") ? "" : std::string(" not ") + hands->block;
    }
    CoTaskMemFree(hands->block);
    SysFreeString(hands->string);
    hands.reset();
    return taken;
}

struct ExportOperation {
    const char* name;
    ExportScene::Function function;
    const char* answer;
    std::vector<std::string> withoutMemory;
};

#define ELEMENT(name, value) "<String><Name>" name "</Name><Val>" value "</Val></String>"

const std::vector<ExportOperation> table = {
    {"gFPGAResTree",
     [](HandsOfTheHost& h) {
         h.object = gFPGAResTree();
         return S_OK;
     },
     "S_OK object",
     {}},
    {"QueryResourceTreeInterface",
     [](HandsOfTheHost& h) {
         const HRESULT result = QueryResourceTreeInterface(&IID_IzkEIOGResourceTree2, nullptr, nullptr, &h.object);
         static_cast<IUnknown*>(h.object)->Release();
         return result;
     },
     "S_OK object",
     {}},
    {"FPGAResTree_GetProperty",
     [](HandsOfTheHost& h) { return FPGAResTree_GetProperty("a", "s/d", "x", h.text.Get(), &h.found); },
     "S_OK 1 deep",
     {"E_OUTOFMEMORY", thrown, "bad_alloc 1"}},
    {"FPGAResTree_GetDescendantNames",
     [](HandsOfTheHost& h) {
         return FPGAResTree_GetDescendantNames("", "", "recurse=true,protocol=Board", &h.list.array, &h.found);
     },
     "S_OK 1 [/a, /c]",
     // The array has its size at first, and what was stored before memory ran out stays.
     {"E_OUTOFMEMORY", thrown, "bad_alloc 1 [, ]", "bad_alloc 1 [/a, ]"}},
    {"FPGAResTree_GetDescendantNames, in clusters",
     [](HandsOfTheHost& h) {
         return FPGAResTree_GetDescendantNames("a", "", "includeDisplayNames=true", &h.list.array, &h.found);
     },
     "S_OK 1 [<Cluster><Name></Name><NumElts>3</NumElts>" ELEMENT("resource", "s") ELEMENT("alias", "")
         ELEMENT("display name", "/a/s") "</Cluster>]",
     {"E_OUTOFMEMORY", thrown, "bad_alloc 1 []"}},
    {"FPGAResTree_GetMultipleProperties",
     [](HandsOfTheHost& h) { return FPGAResTree_GetMultipleProperties("a", "s", "", &h.list.array, &h.found); },
     "S_OK 1 [<Cluster><Name></Name><NumElts>2</NumElts>" ELEMENT("name", "s/d") ELEMENT("value", "deep") "</Cluster>]",
     {"E_OUTOFMEMORY", thrown, "bad_alloc 1 []"}},
    {"FPGAResTree_Dump",
     [](HandsOfTheHost& h) { return FPGAResTree_Dump("a", "s", "", h.text.Get()); },
     "S_OK \n<Sub name=\"s\">\n   <d>deep</d>\n</Sub>",
     {"E_OUTOFMEMORY", thrown}},
    {"ZkhwResTree_GetNode",
     [](HandsOfTheHost& h) { return HRESULT{ZkhwResTree_GetNode(77, &h.accessor)}; },
     "S_OK -77",
     {thrown}},
    {"FPGA_mbstowcs",
     [](HandsOfTheHost& h) { return HRESULT{FPGA_mbstowcs(h.source.Get(), h.text.Get())}; },
     "S_OK a{00}b{00}\xAC\x20",
     {thrown}},
    {"FPGA_wcstombs",
     // As units these are U+6261 and U+82E2, and half of one.
     [](HandsOfTheHost& h) { return HRESULT{FPGA_wcstombs(h.source.Get(), h.text.Get())}; },
     "S_OK \xE6\x89\xA1\xE8\x8B\xA2",
     {thrown}},
    {"FPGA_MbsToUtf8",
     [](HandsOfTheHost& h) { return HRESULT{FPGA_MbsToUtf8(h.source.Get(), h.text.Get())}; },
     "S_OK ab\xE2\x82\xAC",
     {thrown}},
    {"FPGA_Utf8ToMbs",
     [](HandsOfTheHost& h) { return HRESULT{FPGA_Utf8ToMbs(h.source.Get(), h.text.Get())}; },
     "S_OK ab\xE2\x82\xAC",
     {thrown}},
    {"SetZKRTModule",
     [](HandsOfTheHost&) {
         SetZKRTModule(Host::Get().module);
         return S_OK;
     },
     "S_OK",
     {}},
    {"SetZKRTTLSIndex",
     [](HandsOfTheHost&) {
         SetZKRTTLSIndex(0xFFFFFFFF);
         return S_OK;
     },
     "S_OK",
     {}},
    {"SetZKRTModuleHook",
     [](HandsOfTheHost&) {
         SetZKRTModuleHook(nullptr);
         return S_OK;
     },
     "S_OK",
     {}},
    {"SetZKRTTLSIndexHook",
     [](HandsOfTheHost&) {
         SetZKRTTLSIndexHook(0);
         return S_OK;
     },
     "S_OK",
     {}},
};

template <typename Block>
HRESULT Note(HandsOfTheHost& h, Block* made) {
    h.object = made;
    return S_OK;
}

const std::vector<ExportOperation> tableOfMemory = {
    {"CoTaskMemAlloc",
     [](HandsOfTheHost& h) {
         void* const made = CoTaskMemAlloc(4096);
         Note(h, made);
         CoTaskMemFree(made);
         return S_OK;
     },
     "S_OK object",
     {"S_OK null"}},
    // A block that can't grow is as it was.
    {"CoTaskMemRealloc",
     [](HandsOfTheHost& h) {
         void* const made = CoTaskMemRealloc(h.block, 4096);
         h.block = made == nullptr ? h.block : static_cast<char*>(made);
         return Note(h, made);
     },
     "S_OK object",
     {"S_OK null"}},
    {"CoTaskMemFree",
     [](HandsOfTheHost& h) {
         CoTaskMemFree(std::exchange(h.block, nullptr));
         return S_OK;
     },
     "S_OK",
     {}},
    {"SysAllocString",
     [](HandsOfTheHost& h) {
         auto* const made = SysAllocString(u"text");
         Note(h, made);
         SysFreeString(made);
         return S_OK;
     },
     "S_OK object",
     {"S_OK null"}},
    {"SysAllocStringLen",
     [](HandsOfTheHost& h) {
         auto* const made = SysAllocStringLen(u"text", 3);
         Note(h, made);
         SysFreeString(made);
         return S_OK;
     },
     "S_OK object",
     {"S_OK null"}},
    {"SysStringLen",
     [](HandsOfTheHost& h) {
         h.accessor = static_cast<int32_t>(SysStringLen(h.string));
         return S_OK;
     },
     "S_OK 6",
     {}},
    {"SysFreeString",
     [](HandsOfTheHost& h) {
         SysFreeString(std::exchange(h.string, nullptr));
         return S_OK;
     },
     "S_OK",
     {}},
};

}  // namespace

std::vector<Operation> ExportOperations() {
    std::vector<Operation> operations;
    for (const auto& part : {table, tableOfMemory}) {
        for (const ExportOperation& each : part) {
            operations.push_back(
                {.name = each.name,
                 .make = [function = each.function](Contents) { return std::make_unique<ExportScene>(function); },
                 .answer = each.answer,
                 .withoutMemory = each.withoutMemory,
                 .answerFromFile = {}});
        }
    }
    return operations;
}

}  // namespace allocations
