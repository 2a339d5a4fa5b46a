// Null for every pointer of the exported functions.

#include "misuse/NullCases.h"

namespace misuse {

namespace {

// The cases of an exported function: all its arguments by their names.
template <typename Call, typename... Arguments>
void AddExport(Cases& cases, const std::string& function, const char* const (&names)[sizeof...(Arguments)], Call call,
               Arguments... good) {
    AddNullAt<0>(cases, function, names, true, call, std::tuple<Arguments...>(good...));
}

// Stands for an out argument: the case makes the real one, unless this has become null.
int wanted;
using Wanted = const int*;
using Text = const char*;

const char* const untouched = "untouched";

std::string FoundText(Wanted found, unsigned char value) {
    return found == nullptr ? "" : " found=" + std::to_string(value);
}

void GetProperty(Text basePath, Text subPath, Text options, Wanted value, Wanted found) {
    const HostString text(untouched);
    unsigned char isFound = 9;
    const HRESULT result = library.FPGAResTree_GetProperty(
        basePath, subPath, options, value == nullptr ? nullptr : text.Get(), found == nullptr ? nullptr : &isFound);
    Say(Hex(result) + " \"" + text.Bytes() + "\"" + FoundText(found, isFound));
}

template <auto Library::*Function>
void GetList(Text basePath, Text subPath, Text options, Wanted names, Wanted found) {
    ZkStringArrayHandle array = nullptr;
    unsigned char isFound = 9;
    const HRESULT result = (library.*Function)(basePath, subPath, options, names == nullptr ? nullptr : &array,
                                               found == nullptr ? nullptr : &isFound);
    Say(Hex(result) + " " + TakeArray(array) + FoundText(found, isFound));
}

void Dump(Text basePath, Text subPath, Text options, Wanted text) {
    const HostString xml(untouched);
    const HRESULT result = library.FPGAResTree_Dump(basePath, subPath, options, text == nullptr ? nullptr : xml.Get());
    std::string shown = xml.Bytes();
    for (char& each : shown) {
        each = each == '\n' ? '|' : each;
    }
    Say(Hex(result) + " " + shown);
}

template <auto Library::*Function>
void Convert(Wanted source, Wanted destination) {
    const HostString from("ab");
    const HostString to(untouched);
    const int32_t result =
        (library.*Function)(source == nullptr ? nullptr : from.Get(), destination == nullptr ? nullptr : to.Get());
    Say(Hex(HRESULT{result}) + " \"" + to.Bytes() + "\"");
}

// What a query says while a module is named or isn't.
void SayProperty() {
    GetProperty("Rack/S/Height", "", "", &wanted, &wanted);
}

void AddQueries(Cases& cases) {
    const Wanted out = &wanted;
    AddExport(cases, "FPGAResTree_GetProperty", {"basePath", "subPath", "options", "value", "found"}, GetProperty,
              Text{"Rack"}, Text{"S/Height"}, Text{"recurse=true"}, out, out);
    AddExport(cases, "FPGAResTree_GetDescendantNames", {"basePath", "subPath", "options", "names", "found"},
              GetList<&Library::FPGAResTree_GetDescendantNames>, Text{"Rack"}, Text{"S"}, Text{"protocol=Slot"}, out,
              out);
    AddExport(cases, "FPGAResTree_GetMultipleProperties", {"basePath", "subPath", "options", "names", "found"},
              GetList<&Library::FPGAResTree_GetMultipleProperties>, Text{"Rack"}, Text{"S/B"}, Text{"protocol=Slot"},
              out, out);
    AddExport(cases, "FPGAResTree_Dump", {"basePath", "subPath", "options", "text"}, Dump, Text{"Rack/S/B"}, Text{""},
              Text{"recurse=true"}, out);
}

void AddConversions(Cases& cases) {
    const Wanted out = &wanted;
    AddExport(cases, "FPGA_mbstowcs", {"source", "destination"}, Convert<&Library::FPGA_mbstowcs>, out, out);
    AddExport(cases, "FPGA_wcstombs", {"source", "destination"}, Convert<&Library::FPGA_wcstombs>, out, out);
    AddExport(cases, "FPGA_MbsToUtf8", {"source", "destination"}, Convert<&Library::FPGA_MbsToUtf8>, out, out);
    AddExport(cases, "FPGA_Utf8ToMbs", {"source", "destination"}, Convert<&Library::FPGA_Utf8ToMbs>, out, out);
}

void QueryInterface(const IID* id, IzkHostContext* context, IzkProjectItem* item, Wanted result) {
    void* object = &wanted;
    const HRESULT given = library.QueryResourceTreeInterface(id, context, item, result == nullptr ? nullptr : &object);
    Say(Hex(given) + (object == nullptr ? " null" : object == &wanted ? " untouched" : " object"));
    if (object != nullptr && object != &wanted) {
        static_cast<IUnknown*>(object)->Release();
    }
}

void AddInterfaces(Cases& cases) {
    AddExport(cases, "QueryResourceTreeInterface", {"id", "context", "item", "result"}, QueryInterface,
              &IID_IzkhwResourceTreeNode, static_cast<IzkHostContext*>(&fixture.context),
              static_cast<IzkProjectItem*>(&fixture.item), Wanted{&wanted});
    cases["QueryResourceTreeInterface result of a tree"] = {
        [] { QueryInterface(&IID_IzkEIOGResourceTree2, &fixture.context, &fixture.item, nullptr); }};
    cases["QueryResourceTreeInterface result of an owner"] = {
        [] { QueryInterface(&IID_IzkhwResourceTreeOwner, &fixture.context, nullptr, nullptr); }};
    cases["QueryResourceTreeInterface context and item of an owner"] = {
        [] { QueryInterface(&IID_IzkhwResourceTreeOwner, nullptr, nullptr, &wanted); }};
    cases["QueryResourceTreeInterface context and item of a tree"] = {
        [] { QueryInterface(&IID_IzkEIOGResourceTree2, nullptr, nullptr, &wanted); }};
    AddExport(
        cases, "ZkhwResTree_GetNode", {"refNum", "accessor"},
        [](uint32_t refNum, Wanted accessor) {
            int32_t node = 55;
            const int32_t result = library.ZkhwResTree_GetNode(refNum, accessor == nullptr ? nullptr : &node);
            Say(Hex(HRESULT{result}) + " " + std::to_string(node));
        },
        uint32_t{5}, Wanted{&wanted});
    AddExport(
        cases, "SetZKRTModule", {"module"},
        [](void* module) {
            library.SetZKRTModule(module);
            SayProperty();
        },
        static_cast<void*>(&wanted));
    AddExport(
        cases, "SetZKRTModuleHook", {"module"},
        [](void* module) {
            library.SetZKRTModuleHook(module);
            SayProperty();
        },
        static_cast<void*>(&wanted));
}

void AddMemory(Cases& cases) {
    AddExport(
        cases, "CoTaskMemRealloc", {"block", "size"},
        [](void* block, size_t size) {
            void* const made = library.CoTaskMemRealloc(block, size);
            Say(made == nullptr ? "null" : "block");
            library.CoTaskMemFree(made);
        },
        static_cast<void*>(&wanted), size_t{16});
    AddExport(
        cases, "CoTaskMemFree", {"block"},
        [](void* block) {
            library.CoTaskMemFree(block);
            Say("freed");
        },
        static_cast<void*>(&wanted));
    AddExport(
        cases, "SysAllocString", {"text"},
        [](const OLECHAR* text) { Say(library.SysAllocString(text) == nullptr ? "null" : "string"); },
        static_cast<const OLECHAR*>(u"ab"));
    AddExport(
        cases, "SysAllocStringLen", {"text", "length"},
        [](const OLECHAR* text, unsigned length) {
            OLECHAR* const string = library.SysAllocStringLen(text, length);
            Say(string == nullptr ? "null" : "length " + std::to_string(library.SysStringLen(string)));
            library.SysFreeString(string);
        },
        static_cast<const OLECHAR*>(u"ab"), 2U);
    AddExport(
        cases, "SysStringLen", {"string"},
        [](BSTR string) { Say("length " + std::to_string(library.SysStringLen(string))); }, BSTR{nullptr});
    AddExport(
        cases, "SysFreeString", {"string"},
        [](BSTR string) {
            library.SysFreeString(string);
            Say("freed");
        },
        BSTR{nullptr});
}

}  // namespace

void AddExportNulls(Cases& cases) {
    AddQueries(cases);
    AddConversions(cases);
    AddInterfaces(cases);
    AddMemory(cases);
}

}  // namespace misuse
