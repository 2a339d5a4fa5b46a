// The host's strings, arrays, paths and words through a run-time that stands in for the host's, beside plain texts. The
// input is a sequence of operations, of which any call of the host may fail, and any allocation of ours. After each one
// every handle holds what it should: a failure changes nothing, but for strings of an array that were given back
// already. At the end the host has all its handles and paths back.

#include <array>
#include <new>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "FuzzInput.h"
#include "host/StandInRuntime.h"
#include "hostbridge/ClusterText.h"

#include "hostbridge/HostFunctions.h"
#include "hostbridge/HostPath.h"
#include "hostbridge/HostString.h"
#include "hostbridge/HostStringArray.h"
#include "hostbridge/RuntimeModule.h"
#include "qn/dsc/osdep/AllocationFault.h"
#include "qn/dsc/osdep/Module.h"
#include "qn/dsc/zk/HostErrorText.h"
#include "qn/dsc/zk/ThrowIfZKError.h"

extern "C" StandInRuntime standInRuntime;

namespace {

using fuzz::Require;
using qn::dsc::NarrowString;
using qn::dsc::String;
using qn::dsc::zk::ZKErrorException;
using zkhw::HostHandle;

constexpr const char* functions[] = {"HostResizeArray",        "HostDisposeHandle", "HostNewHandleClear",
                                     "HostSetHandleSizeClear", "HostPathToString",  "HostGetSpecialDir",
                                     "HostSystemTextToPath",   "HostTextToPath"};

// A string as it should be; null: no handle.
using Bytes = std::optional<std::string>;

std::string BytesOf(HostHandle handle) {
    return std::string(zkhw::HostStringToNarrow(handle).View());
}

// What is kept of a wide text: its bytes up to the first NUL.
std::string NarrowOf(const std::u16string& text) {
    return std::string(NarrowString(String(std::u16string_view(text.c_str()))).View());
}

struct Array {
    HostHandle handle = nullptr;
    std::vector<Bytes> strings;  // Counts only if there is a handle.
};

struct Session {
    size_t refusals = 0;  // How often the host did not take a handle back.
    std::array<HostHandle, 4> handles = {};
    std::array<Bytes, 4> strings;
    std::array<Array, 2> arrays;
};

void Same(HostHandle handle, const Bytes& bytes) {
    Require((handle == nullptr) == !bytes.has_value(), "there is a handle, or there is none");
    Require(BytesOf(handle) == bytes.value_or(""), "a string has its bytes");
}

void Same(const Session& session) {
    for (size_t i = 0; i < session.handles.size(); ++i) {
        Same(session.handles[i], session.strings[i]);
    }
    for (const Array& array : session.arrays) {
        const auto count = static_cast<int32_t>(array.strings.size());
        Require(zkhw::GetHostStringArrayCount(array.handle) == (array.handle == nullptr ? -1 : count), "the count");
        for (int32_t i = 0; array.handle != nullptr && i < count; ++i) {
            Same(zkhw::GetHostStringArrayElement(array.handle, static_cast<uint32_t>(i)),
                 array.strings[static_cast<size_t>(i)]);
        }
    }
}

// Which of our allocations fails in the next action, and whether all behind it do; 0: none.
uint64_t failingAllocation = 0;
bool failsOn = false;

// True if `action` came to its end. What it throws must be an error of the host or our want of memory.
template <typename Action>
bool Succeeds(Action action) {
    struct Clearing {
        ~Clearing() { qn::dsc::osdep::ClearAllocationFault(); }
    };
    const Clearing clearing;
    if (failingAllocation != 0) {
        qn::dsc::osdep::FailAllocation(std::exchange(failingAllocation, 0), failsOn);
    }
    try {
        action();
        return true;
    } catch (const ZKErrorException& error) {
        const std::string text = error.what();
        Require(error.GetErrorCode() != 0, "success is no error");
        Require(text.rfind("Error Code: " + std::to_string(error.GetErrorCode()), 0) == 0, "an error names its code");
    } catch (const std::bad_alloc&) {
    }
    return false;
}

// --- Operations ---

void ChangeString(Session& session, fuzz::Input& input, uint8_t operation) {
    const size_t at = operation / 8 % 4;
    HostHandle& handle = session.handles[at];
    Bytes& bytes = session.strings[at];
    switch (operation % 4) {
        case 0: {
            const std::string text = input.TakeLine();
            if (Succeeds([&] { zkhw::StoreInHostString(text.data(), static_cast<uint32_t>(text.size()), handle); })) {
                bytes = text;
            }
            break;
        }
        case 1: {
            const std::u16string text = input.TakeText();
            if (Succeeds([&] { zkhw::StoreInHostString(String(text), handle); })) {
                bytes = NarrowOf(text);
            }
            break;
        }
        case 2:
            if (Succeeds([&] { zkhw::ClearHostString(handle); })) {
                bytes = "";
            }
            break;
        default:
            if (Succeeds([&] { zkhw::DisposeHostString(handle); })) {
                bytes.reset();
            }
    }
}

// On a failure the strings behind the new end that were given back are gone, and the count is as it was.
void Resize(Array& array, int32_t newSize) {
    const bool isNew = array.handle == nullptr;
    const size_t before = isNew ? 0 : array.strings.size();
    const bool succeeded = Succeeds([&] { zkhw::ResizeHostStringArray(newSize, array.handle); });
    Require(!succeeded || newSize >= 0, "a negative size is refused");
    if (succeeded) {
        array.strings.resize(static_cast<size_t>(newSize), Bytes(""));
        return;
    }
    if (array.handle == nullptr) {
        return;
    }
    Require(zkhw::GetHostStringArrayCount(array.handle) == static_cast<int32_t>(before), "the count stays");
    array.strings.resize(before);
    for (size_t i = newSize < 0 ? before : static_cast<size_t>(newSize); i < before; ++i) {
        if (zkhw::GetHostStringArrayElement(array.handle, static_cast<uint32_t>(i)) == nullptr) {
            array.strings[i].reset();
        }
    }
}

void ChangeArray(Session& session, fuzz::Input& input, uint8_t operation) {
    Array& array = session.arrays[operation / 8 % 2];
    const uint32_t index = input.TakeByte() % 12;
    const bool isThere = array.handle != nullptr && index < array.strings.size();
    switch (operation % 4) {
        case 0:
        case 1:
            Resize(array, static_cast<int32_t>(index) - 1);
            break;
        case 2: {
            const std::u16string text = input.TakeText();
            const bool done = Succeeds([&] { zkhw::StoreInHostStringArray(String(text), array.handle, index); });
            Require(!done || isThere, "only an element that is there is stored in");
            if (done) {
                array.strings[index] = NarrowOf(text);
            }
            break;
        }
        default: {
            const bool done = Succeeds([&] { zkhw::DisposeHostStringArrayElement(array.handle, index); });
            Require(!done || isThere, "only an element that is there is given back");
            if (done) {
                array.strings[index].reset();
            }
        }
    }
}

void UsePath(fuzz::Input& input, uint8_t operation) {
    const std::u16string text = input.TakeText();
    const uint32_t number = input.TakeByte() % 32;
    Succeeds([&] {
        zkhw::HostPath path{String(text)};
        String back(u"untouched");
        const bool isGiven = path.GetText(back);
        Require(isGiven || back.View() == u"untouched", "a path without a text leaves the text alone");
        const auto form = (operation & 8) != 0 ? zkhw::HostPathForm::Host : zkhw::HostPathForm::FileSystem;
        zkhw::StoreInHostPath(String(text), form, path.Get());
    });
    standInRuntime.specialDirectories[static_cast<int32_t>(number) + 4] = NarrowOf(text);
    Succeeds([&] {
        const String directory = zkhw::GetHostSpecialDir(number);
        Require(number <= 24 || directory.IsEmpty(), "there is no folder of a number behind the last");
    });
}

void AskForWords(fuzz::Input& input) {
    const auto code = static_cast<int32_t>(input.TakeNumber());
    const std::string words = input.TakeLine();
    standInRuntime.errorTexts[code] = words;
    Succeeds([&] { Require(qn::dsc::zk::GetHostErrorText(code).View() == words, "an error has the host's words"); });
    const std::string plain = NarrowOf(input.TakeText());
    const String value(plain.data(), static_cast<uint32_t>(plain.size()));
    Succeeds([&] {
        String cluster;
        zkhw::MakeNameValueCluster(value, value, cluster);
        const std::u16string expected = u"<Cluster><Name></Name><NumElts>2</NumElts>" +
                                        std::u16string(zkhw::MakeStringElement(value, String(u"name")).View()) +
                                        std::u16string(zkhw::MakeStringElement(value, String(u"value")).View()) +
                                        u"</Cluster>";
        Require(cluster.View() == expected, "a cluster is its elements");
    });
}

void Step(Session& session, fuzz::Input& input) {
    const uint8_t operation = input.TakeByte();
    const uint8_t faults = input.TakeByte();
    standInRuntime.faults.clear();
    if (faults < 64) {
        standInRuntime.Fail(functions[faults % 8], faults % 3 == 0 ? -1 : faults + 1, 1 + faults / 8 % 4);
    } else if (faults < 96) {
        failingAllocation = 1 + faults % 4;
        failsOn = faults % 8 < 4;
    }
    switch (operation / 64) {
        case 0:
            ChangeString(session, input, operation);
            break;
        case 1:
        case 2:
            ChangeArray(session, input, operation);
            break;
        default:
            (operation & 4) != 0 ? UsePath(input, operation) : AskForWords(input);
    }
    failingAllocation = 0;
    for (const auto& [call, code] : standInRuntime.faults) {
        const bool hasHappened = standInRuntime.Count(call.first) >= call.second;
        session.refusals += call.first == "HostDisposeHandle" && hasHappened ? 1 : 0;
    }
    standInRuntime.faults.clear();
}

void GiveBack(Session& session) {
    for (HostHandle& handle : session.handles) {
        zkhw::DisposeHostString(handle);
    }
    for (Array& array : session.arrays) {
        if (array.handle != nullptr) {
            zkhw::ResizeHostStringArray(0, array.handle);
            zkhw::DisposeHostString(array.handle);
        }
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    // The run-time is linked into this program.
    zkhw::runtimeModule = qn::dsc::osdep::GetMainModule();
    standInRuntime.Reset();
    fuzz::Input input(data, size);
    Session session;
    for (int steps = 0; !input.IsEmpty() && steps < 60; ++steps) {
        Step(session, input);
        Same(session);
        standInRuntime.calls.clear();
    }
    GiveBack(session);
    Require(standInRuntime.LiveHandleCount() <= session.refusals, "the host has every handle back that it took");
    while (!standInRuntime.blockSizes.empty()) {
        zkhw::HostDisposeHandle(standInRuntime.blockSizes.begin()->first);
    }
    Require(standInRuntime.LivePathCount() == 0, "the host has every path back");
    return 0;
}
