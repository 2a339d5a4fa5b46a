// A host that asks for a property, without memory from some place on, and then once more with memory. It catches
// nothing. Arguments: the number of the allocation that fails, counted from 1; "once" or "lasting", that is, with all
// behind it; the module of its run-time (PlainRuntime.c); its folder of targets, as the run-time tells it; the path of
// the property; and how to ask:
//
//     property    by FPGAResTree_GetProperty
//     object      by QueryResourceTreeInterface, and what that gives
//
// Prints "reached" if there was such an allocation, or else "complete"; then a line for each time: the result as eight
// digits, and the value, if there is one.

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>
#include <string_view>

#include "hostbridge/RuntimeModule.h"
#include "qn/dsc/StringBase.h"
#include "qn/dsc/osdep/AllocationFault.h"
#include "support/Modules.h"
#include "zkfpga/host_runtime.h"
#include "zkfpga/zkfpga.h"

namespace {

// What is asked before memory comes back isn't turned into anything until then.
class Question {
  public:
    Question(void* module, const char* path) : module(module), path(path), widePath(path) {
        handle = Find<decltype(&::HostNewHandleClear)>("HostNewHandleClear")(sizeof(int32_t));
    }
    Question(const Question&) = delete;
    Question& operator=(const Question&) = delete;
    ~Question() { Find<decltype(&::HostDisposeHandle)>("HostDisposeHandle")(handle); }

    void AskByName() { result = FPGAResTree_GetProperty("", path, "", handle, &found); }

    void AskObject() {
        void* object = nullptr;
        found = 0;
        result = QueryResourceTreeInterface(&IID_IzkEIOGResourceTree, nullptr, nullptr, &object);
        if (result < 0) {
            return;
        }
        auto* const tree = static_cast<IzkEIOGResourceTree*>(object);
        result = tree->GetProperty(widePath.CStr(), nullptr, &text);
        found = result == S_OK ? 1 : 0;
        tree->Release();
    }

    void Print() {
        std::string value;
        if (text != nullptr) {
            value = qn::dsc::NarrowString(qn::dsc::String(text)).CStr();
            SysFreeString(text);
            text = nullptr;
        } else {
            int32_t length = 0;
            std::memcpy(&length, *handle, sizeof length);
            value.assign(*handle + sizeof length, static_cast<size_t>(length));
        }
        std::printf("%08lx%s\n", static_cast<unsigned long>(static_cast<ULONG>(result)),
                    result >= 0 && found == 1 ? (" " + value).c_str() : "");
    }

  private:
    template <typename Function>
    Function Find(const char* name) const {
        void* const address = qn::dsc::osdep::FindInModule(module, name);
        Function function = nullptr;
        std::memcpy(&function, &address, sizeof function);
        return function;
    }

    void* module;
    const char* path;
    qn::dsc::String widePath;
    ZkStringHandle handle;
    unsigned char found = 0;
    BSTR text = nullptr;
    HRESULT result = S_OK;
};

}  // namespace

int main(int argc, char** argv) {
    if (argc != 7) {
        return 2;
    }
    void* const module = qn::dsc::osdep::LoadModuleFile(argv[3]);
    if (module == nullptr) {
        return 2;
    }
    std::strncpy(static_cast<char*>(qn::dsc::osdep::FindInModule(module, "specialFolder")), argv[4], 4095);
    zkhw::runtimeModule = module;
    Question question(module, argv[5]);
    const auto ask = std::string_view(argv[6]) == "object" ? &Question::AskObject : &Question::AskByName;
    const uint64_t nth = std::strtoull(argv[1], nullptr, 10);
    qn::dsc::osdep::FailAllocation(nth, std::string_view(argv[2]) == "lasting");
    (question.*ask)();
    qn::dsc::osdep::ClearAllocationFault();
    std::puts(qn::dsc::osdep::AllocationCount() < nth ? "complete" : "reached");
    question.Print();
    (question.*ask)();
    question.Print();
    return 0;
}
