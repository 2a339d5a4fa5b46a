// A host. Does what its arguments say, one after the other, and prints a line for each answer. The first argument is
// the library's file; each of the others is a command with its own arguments behind bars:
//
//     runtime|FILE, name-runtime|FILE, own-runtime    loads a run-time module; names it to the library; is it itself
//     special|TEXT                                    what the run-time's folder of targets is
//     property, found, names, properties, dump        |BASE|SUB|OPTIONS
//     query|NAME, query-null|NAME                     an interface of the tree; the same without a result
//     convert|FUNCTION|HEX, same|FUNCTION|HEX         a conversion; into the source itself
//     node|NUMBER                                     the host's accessor
//     convert-foreign|FUNCTION                        a conversion into a string that no run-time has made
//     fail|FUNCTION|CODE                              the next call of that function of the run-time fails
//     calls, live                                     what the run-time was asked since the last time; its live handles
//     write|FILE|TEXT, remove|FILE
//
// Without a run-time it has no handles to give, and gives none.

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <exception>
#include <fstream>
#include <functional>
#include <map>
#include <string>
#include <vector>

#include "host/StandInRuntime.h"
#include "library/Exports.h"
#include "support/Modules.h"
#include "zkfpga/host_runtime.h"
#include "zkfpga/ids.h"

namespace {

using Arguments = std::vector<std::string>;

Exports library{};

// --- The run-time, and handles of it ---

struct Runtime {
    StandInRuntime* standIn = nullptr;
    decltype(&HostNewHandleClear) newHandle = nullptr;
    decltype(&HostDisposeHandle) dispose = nullptr;
};

Runtime runtime;

template <typename Target>
void Find(void* module, const char* name, Target*& target) {
    void* const address = qn::dsc::osdep::FindInModule(module, name);
    std::memcpy(&target, &address, sizeof target);
}

// Gives the module. One that has none of the functions is loaded all the same.
void* UseRuntime(const char* file) {
    void* const module = qn::dsc::osdep::LoadModuleFile(file);
    if (module == nullptr) {
        std::printf("no run-time %s\n", file);
        std::exit(3);
    }
    Find(module, "standInRuntime", runtime.standIn);
    Find(module, "HostNewHandleClear", runtime.newHandle);
    Find(module, "HostDisposeHandle", runtime.dispose);
    return module;
}

class HostString {
  public:
    explicit HostString(const std::string& bytes = {}) {
        if (runtime.newHandle == nullptr) {
            return;
        }
        const int32_t length = static_cast<int32_t>(bytes.size());
        handle = runtime.newHandle(sizeof length + bytes.size());
        std::memcpy(*handle, &length, sizeof length);
        std::memcpy(*handle + sizeof length, bytes.data(), bytes.size());
    }
    HostString(const HostString&) = delete;
    HostString& operator=(const HostString&) = delete;
    ~HostString() {
        if (handle != nullptr) {
            runtime.dispose(handle);
        }
    }
    ZkStringHandle Get() const { return handle; }

  private:
    ZkStringHandle handle = nullptr;
};

std::string BytesOf(ZkStringHandle handle) {
    int32_t length = 0;
    if (handle == nullptr) {
        return "none";
    }
    std::memcpy(&length, *handle, sizeof length);
    return {*handle + sizeof length, static_cast<size_t>(length)};
}

// Takes the strings of an array and the array itself back.
std::vector<std::string> TakeStrings(ZkStringArrayHandle array) {
    std::vector<std::string> texts;
    int32_t count = 0;
    if (array != nullptr) {
        std::memcpy(&count, *array, sizeof count);
    }
    for (int32_t i = 0; i < count; ++i) {
        ZkStringHandle element = nullptr;
        std::memcpy(&element, *array + sizeof(void*) * static_cast<size_t>(i + 1), sizeof element);
        texts.push_back(BytesOf(element));
        runtime.dispose(element);
    }
    if (array != nullptr) {
        runtime.dispose(array);
    }
    return texts;
}

// --- Commands ---

void PrintResult(const char* command, HRESULT result) {
    std::printf("%s %08x", command, static_cast<unsigned>(result));
}

void Property(const Arguments& a) {
    const HostString value("before");
    unsigned char found = 9;
    PrintResult("property", library.getProperty(a[1].c_str(), a[2].c_str(), a[3].c_str(), value.Get(), &found));
    std::printf(" %d \"%s\"\n", found, BytesOf(value.Get()).c_str());
}

// Whether there is such a property, whatever it says.
void Found(const Arguments& a) {
    unsigned char found = 9;
    PrintResult("found", library.getProperty(a[1].c_str(), a[2].c_str(), a[3].c_str(), nullptr, &found));
    std::printf(" %d\n", found);
}

void PrintList(const char* command, const Arguments& a, decltype(&FPGAResTree_GetDescendantNames) function) {
    ZkStringArrayHandle array = nullptr;
    unsigned char found = 9;
    PrintResult(command, function(a[1].c_str(), a[2].c_str(), a[3].c_str(), &array, &found));
    std::printf(" %d", found);
    for (const std::string& text : TakeStrings(array)) {
        std::printf(" [%s]", text.c_str());
    }
    std::printf("\n");
}

void Names(const Arguments& a) {
    PrintList("names", a, library.getDescendantNames);
}

void Properties(const Arguments& a) {
    PrintList("properties", a, library.getMultipleProperties);
}

void Dump(const Arguments& a) {
    const HostString text("before");
    PrintResult("dump", library.dump(a[1].c_str(), a[2].c_str(), a[3].c_str(), text.Get()));
    std::printf(" %s\n", BytesOf(text.Get()).c_str());
}

const std::map<std::string, const IID*> ids = {{"Node", &IID_IzkhwResourceTreeNode},
                                               {"Node2", &IID_IzkhwResourceTreeNode2},
                                               {"Node3", &IID_IzkhwResourceTreeNode3},
                                               {"Node4", &IID_IzkhwResourceTreeNode4},
                                               {"Node5", &IID_IzkhwResourceTreeNode5},
                                               {"Owner", &IID_IzkhwResourceTreeOwner},
                                               {"Tree", &IID_IzkEIOGResourceTree},
                                               {"Tree2", &IID_IzkEIOGResourceTree2},
                                               {"Unknown", &IID_IUnknown},
                                               {"Selector", &IID_IzkProjectItemSelector}};

void Query(const Arguments& a) {
    void* object = &runtime;
    PrintResult("query", library.queryInterface(ids.at(a[1]), nullptr, nullptr, &object));
    std::printf(" %s %s\n", a[1].c_str(), object == nullptr ? "null" : "object");
    if (object != nullptr) {
        static_cast<IUnknown*>(object)->Release();
    }
}

void QueryNull(const Arguments& a) {
    PrintResult("query", library.queryInterface(ids.at(a[1]), nullptr, nullptr, nullptr));
    std::printf("\n");
}

std::string FromHex(const std::string& hex) {
    std::string bytes;
    for (size_t i = 0; i + 1 < hex.size(); i += 2) {
        bytes.push_back(static_cast<char>(std::stoi(hex.substr(i, 2), nullptr, 16)));
    }
    return bytes;
}

void PrintHex(const std::string& bytes) {
    for (const char byte : bytes) {
        std::printf("%02X", static_cast<unsigned char>(byte));
    }
    std::printf("\n");
}

decltype(&FPGA_mbstowcs) ConversionOf(const std::string& name) {
    const std::map<std::string, decltype(&FPGA_mbstowcs)> conversions = {{"mbstowcs", library.mbsToWcs},
                                                                         {"wcstombs", library.wcsToMbs},
                                                                         {"MbsToUtf8", library.mbsToUtf8},
                                                                         {"Utf8ToMbs", library.utf8ToMbs}};
    return conversions.at(name);
}

void Convert(const Arguments& a) {
    const HostString source(FromHex(a[2]));
    const HostString destination("before");
    std::printf("convert %d ", ConversionOf(a[1])(source.Get(), destination.Get()));
    PrintHex(BytesOf(destination.Get()));
}

void ConvertInPlace(const Arguments& a) {
    const HostString text(FromHex(a[2]));
    std::printf("same %d ", ConversionOf(a[1])(text.Get(), text.Get()));
    PrintHex(BytesOf(text.Get()));
}

// A conversion into a string that isn't the run-time's, as a host without one would try.
void ConvertForeign(const Arguments& a) {
    char block[8] = {};
    char* pointer = block;
    ConversionOf(a[1])(nullptr, &pointer);
}

void Node(const Arguments& a) {
    int32_t accessor = 55;
    const int32_t result = library.getNode(static_cast<uint32_t>(std::stoul(a[1])), &accessor);
    std::printf("node %d %d\n", result, accessor);
}

void Calls(const Arguments&) {
    for (const std::string& call : runtime.standIn->calls) {
        std::printf("call %s\n", call.c_str());
    }
    runtime.standIn->calls.clear();
}

void Write(const Arguments& a) {
    std::ofstream file(a[1], std::ios::binary | std::ios::trunc);
    file << a[2];
}

const std::map<std::string, std::function<void(const Arguments&)>> commands = {
    {"runtime", [](const Arguments& a) { UseRuntime(a[1].c_str()); }},
    {"name-runtime", [](const Arguments& a) { library.setModule(UseRuntime(a[1].c_str())); }},
    {"own-runtime", [](const Arguments&) { UseRuntime(nullptr); }},
    {"special", [](const Arguments& a) { runtime.standIn->specialDirectories[28] = a[1]; }},
    {"property", Property},
    {"found", Found},
    {"names", Names},
    {"properties", Properties},
    {"dump", Dump},
    {"query", Query},
    {"query-null", QueryNull},
    {"convert", Convert},
    {"same", ConvertInPlace},
    {"convert-foreign", ConvertForeign},
    {"node", Node},
    {"fail", [](const Arguments& a) { runtime.standIn->Fail(a[1], std::stoi(a[2])); }},
    {"calls", Calls},
    {"live", [](const Arguments&) { std::printf("live %zu\n", runtime.standIn->LiveHandleCount()); }},
    {"write", Write},
    {"remove", [](const Arguments& a) { std::printf("%s", std::remove(a[1].c_str()) == 0 ? "" : "not removed\n"); }},
};

Arguments Split(const std::string& text) {
    Arguments pieces{""};
    for (const char c : text) {
        if (c == '|') {
            pieces.emplace_back();
        } else {
            pieces.back().push_back(c);
        }
    }
    return pieces;
}

}  // namespace

int main(int argc, char** argv) {
    std::setvbuf(stdout, nullptr, _IOLBF, BUFSIZ);
    library = GetExports(argv[1]);
    const ZkhwFPGAResTree* const singleton = library.singleton();
    std::printf("%s\n", singleton != nullptr && library.singleton() == singleton ? "ready" : "no singleton");
    for (int i = 2; i < argc; ++i) {
        try {
            const Arguments arguments = Split(argv[i]);
            commands.at(arguments[0])(arguments);
        } catch (const std::exception& failure) {
            std::printf("threw %s\n", failure.what());
        }
    }
    return 0;
}
