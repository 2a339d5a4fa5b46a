// 0, 1, the greatest signed number and the greatest for every number that goes into an operation: an index, a count, a
// mode, a set of changes, a number of the caller's. The names are "Scope::Operation argument=value". Counts of arrays
// that the caller hands in are 0 and 1 only, and the arrays have one element: a greater one would be a lie.

#include "misuse/NullCases.h"

namespace misuse {

namespace {

constexpr ULONG values[] = {0, 1, 0x7FFFFFFF, 0xFFFFFFFF};

LPCWSTR nodeNames[] = {u"A"};
LPCWSTR propertyNames[] = {u"Height"};
LPCWSTR nullNames[] = {nullptr};

template <typename Run>
void AddEach(Cases& cases, const std::string& operation, const std::string& argument, Run run) {
    for (const ULONG value : values) {
        cases[operation + " " + argument + "=" + Hex(value)] = {[run, value] { run(value); }};
    }
}

template <typename Run>
void AddZeroAndOne(Cases& cases, const std::string& operation, const std::string& argument, Run run) {
    for (const ULONG value : {0U, 1U}) {
        cases[operation + " " + argument + "=" + Hex(ULONG{value})] = {[run, value] { run(ULONG{value}); }};
    }
}

void AddProperties(Cases& cases) {
    AddEach(cases, "IzkhwResourceTreeNode::GetPropertyAt", "index",
            [](ULONG index) { SayResult(fixture.shelf->GetPropertyAt(index, &outputs.text)); });
    AddEach(cases, "IzkhwResourceTreeNode::SetPropertyAt", "index",
            [](ULONG index) { SayResult(fixture.shelf->SetPropertyAt(index, u"8")); });
}

void AddModes(Cases& cases) {
    AddEach(cases, "IzkhwResourceTreeNode::Reserve", "mode",
            [](ULONG mode) { SayResult(fixture.shelf->Reserve(u"me", mode, &outputs.number)); });
    AddEach(cases, "IzkhwResourceTreeNode::ReserveDescendants", "mode",
            [](ULONG mode) { SayResult(fixture.shelf->ReserveDescendants(u"me", mode, u"Slot")); });
    AddEach(cases, "IzkhwResourceTreeNode5::ReserveForItem", "mode",
            [](ULONG mode) { SayResult(fixture.shelf->ReserveForItem(&fixture.item, mode, &outputs.number)); });
    AddEach(cases, "IzkhwResourceTreeNode5::ReserveDescendantsForItem", "mode",
            [](ULONG mode) { SayResult(fixture.shelf->ReserveDescendantsForItem(&fixture.item, mode, u"Slot")); });
}

void SayNotice(IzkhwResourceTreeNode*, ULONG changes, ULONG id) {
    Say("notice " + Hex(changes) + " id " + Hex(id));
}

// Registers an observer, changes a property, and ends the registration in the way of `unadvise`.
void Watch(ULONG mask, ULONG id) {
    static Observer observer;
    observer.reaction = SayNotice;
    SayResult(fixture.shelf->Advise(&observer, mask, id));
    fixture.shelf->SetPropertyAt(0, u"7");
    SayResult(fixture.shelf->Unadvise(&observer, id, 0));
    fixture.shelf->SetPropertyAt(0, u"7");
    Say("observer " + std::to_string(observer.references));
}

void Unwatch(ULONG id) {
    static Observer observer;
    observer.reaction = SayNotice;
    fixture.shelf->Advise(&observer, ZkhwPropertyChanged, 5);
    SayResult(fixture.shelf->Unadvise(&observer, id, 0));
    fixture.shelf->SetPropertyAt(0, u"7");
    fixture.shelf->Unadvise(&observer, 5, 0);
    Say("observer " + std::to_string(observer.references));
}

void EndWith(ULONG flags) {
    static Observer observer;
    observer.reaction = SayNotice;
    fixture.shelf->Advise(&observer, 0xFFFFFFFF, 5);
    ULONG pending = 9;
    SayResult(fixture.shelf->BeginChange(&pending));
    SayResult(fixture.shelf->EndChange(flags, 0));
    SayResult(fixture.shelf->HasPendingChanges());
    fixture.shelf->Unadvise(&observer, 5, 0);
}

void AddChanges(Cases& cases) {
    AddEach(cases, "IzkhwResourceTreeNode::Advise", "mask", [](ULONG mask) { Watch(mask, 5); });
    AddEach(cases, "IzkhwResourceTreeNode::Advise", "id", [](ULONG id) { Watch(ZkhwPropertyChanged, id); });
    AddEach(cases, "IzkhwResourceTreeNode::Unadvise", "id", Unwatch);
    AddEach(cases, "IzkhwResourceTreeNode::EndChange", "flags", EndWith);
}

void AddFilters(Cases& cases) {
    const std::string node3 = "IzkhwResourceTreeNode3::GetFilteredXml";
    const std::string node4 = "IzkhwResourceTreeNode4::GetFilteredXmlEx";
    const std::string tree = "IzkEIOGResourceTree2::GetFilteredXml";
    BSTR* const xml = &outputs.text;
    AddZeroAndOne(cases, node3, "nodeNameCount", [xml](ULONG count) {
        SayResult(fixture.shelf->GetFilteredXml(count, nodeNames, 0, propertyNames, xml));
    });
    AddZeroAndOne(cases, node3, "propertyNameCount", [xml](ULONG count) {
        SayResult(fixture.shelf->GetFilteredXml(0, nodeNames, count, propertyNames, xml));
    });
    AddZeroAndOne(cases, node4, "nodeNameCount", [xml](ULONG count) {
        SayResult(fixture.shelf->GetFilteredXmlEx(1, count, nodeNames, 0, propertyNames, xml));
    });
    AddZeroAndOne(cases, node4, "propertyNameCount", [xml](ULONG count) {
        SayResult(fixture.shelf->GetFilteredXmlEx(1, 0, nodeNames, count, propertyNames, xml));
    });
    AddZeroAndOne(cases, tree, "nodeNameCount", [xml](ULONG count) {
        SayResult(fixture.tree->GetFilteredXml(u"Rack/S", count, nodeNames, 0, propertyNames, xml));
    });
    AddZeroAndOne(cases, tree, "propertyNameCount", [xml](ULONG count) {
        SayResult(fixture.tree->GetFilteredXml(u"Rack/S", 0, nodeNames, count, propertyNames, xml));
    });
    // A null name is the empty one, which nothing has.
    cases[node4 + " null among the names"] = {
        [xml] { SayResult(fixture.shelf->GetFilteredXmlEx(1, 1, nullNames, 1, nullNames, xml)); }};
}

void SayBlock(void* block) {
    Say(block == nullptr ? "null" : "block");
    library.CoTaskMemFree(block);
}

void SayString(unsigned length) {
    OLECHAR* const string = library.SysAllocStringLen(nullptr, length);
    Say(string == nullptr ? "null" : "length " + std::to_string(library.SysStringLen(string)));
    library.SysFreeString(string);
}

void Reallocate(size_t size) {
    auto* const block = static_cast<char*>(library.CoTaskMemAlloc(16));
    block[0] = 'a';
    auto* const made = static_cast<char*>(library.CoTaskMemRealloc(block, size));
    if (made != nullptr) {
        Say(std::string("block ") + made[0]);
        library.CoTaskMemFree(made);
    } else if (size != 0) {
        Say(std::string("null, and the block still ") + block[0]);
        library.CoTaskMemFree(block);
    } else {
        Say("null");
    }
}

void AddMemory(Cases& cases) {
    struct Size {
        const char* name;
        size_t value;
    };
    for (const Size& size : {Size{"00000000", 0}, Size{"00000001", 1}, Size{"max", SIZE_MAX}}) {
        cases[std::string("CoTaskMemAlloc size=") + size.name] = {
            [value = size.value] { SayBlock(library.CoTaskMemAlloc(value)); }};
        cases[std::string("CoTaskMemRealloc size=") + size.name] = {[value = size.value] { Reallocate(value); }};
    }
    for (const ULONG length : {0U, 1U, 0x80000000U, 0xFFFFFFFFU}) {
        cases["SysAllocStringLen length=" + Hex(ULONG{length})] = {[length] { SayString(unsigned{length}); }};
    }
}

}  // namespace

void AddNumbers(Cases& cases) {
    AddProperties(cases);
    AddModes(cases);
    AddChanges(cases);
    AddFilters(cases);
}

void AddExportNumbers(Cases& cases) {
    for (const ULONG value : values) {
        cases["ZkhwResTree_GetNode refNum=" + Hex(value)] = {[value] {
                                                                 int32_t node = 55;
                                                                 SayResult(library.ZkhwResTree_GetNode(value, &node));
                                                                 Say(std::to_string(node));
                                                             },
                                                             true};
        cases["SetZKRTTLSIndexHook index=" + Hex(value)] = {[value] {
                                                                library.SetZKRTTLSIndexHook(value);
                                                                Say("done");
                                                            },
                                                            true};
    }
    // No slot. Any other number has to be that of one.
    cases["SetZKRTTLSIndex index=ffffffff"] = {[] {
                                                   library.SetZKRTTLSIndex(0xFFFFFFFF);
                                                   Say("done");
                                               },
                                               true};
    AddMemory(cases);
}

}  // namespace misuse
