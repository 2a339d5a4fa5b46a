// Every id that there is, and two that there aren't, asked of every object: "id of object".

#include "misuse/MisuseHost.h"

namespace misuse {

namespace {

struct NamedId {
    const char* name;
    IID id;
};

constexpr NamedId ids[] = {
    {"IzkhwResourceTreeNode", IID_IzkhwResourceTreeNode},
    {"IzkhwResourceTreeNode2", IID_IzkhwResourceTreeNode2},
    {"IzkhwResourceTreeNode3", IID_IzkhwResourceTreeNode3},
    {"IzkhwResourceTreeNode4", IID_IzkhwResourceTreeNode4},
    {"IzkhwResourceTreeNode5", IID_IzkhwResourceTreeNode5},
    {"IzkhwResourceTreeOwner", IID_IzkhwResourceTreeOwner},
    {"IzkEIOGResourceTree", IID_IzkEIOGResourceTree},
    {"IzkEIOGResourceTree2", IID_IzkEIOGResourceTree2},
    {"IzkProjectItemSelector", IID_IzkProjectItemSelector},
    {"IzkItemMarker", IID_IzkItemMarker},
    {"IzkItemResourceLink", IID_IzkItemResourceLink},
    {"IUnknown", {0x00000000, 0x0000, 0x0000, {0xC0, 0x00, 0x00, 0x00, 0x00, 0x00, 0x00, 0x46}}},
    {"nothing", {}},
    // The last byte is another.
    {"almost", {0x238663B5, 0xBA4F, 0x4A53, {0x82, 0xEE, 0x98, 0x6B, 0x3E, 0x80, 0xC8, 0xF3}}},
};

void Ask(IUnknown* object, REFIID id) {
    void* result = &fixture;
    const HRESULT given = object->QueryInterface(id, &result);
    Say(Hex(given) + (result == nullptr ? " null" : result == object ? " itself" : " another"));
    if (result != nullptr) {
        object->Release();
    }
}

void AskOwner(REFIID id) {
    void* owner = nullptr;
    library.QueryResourceTreeInterface(&IID_IzkhwResourceTreeOwner, &fixture.context, nullptr, &owner);
    Ask(static_cast<IUnknown*>(owner), id);
    static_cast<IUnknown*>(owner)->Release();
}

// It has no references, and so may be asked, but what it gives must not be given back: that would be the last one.
void AskSelector(REFIID id) {
    fixture.item.whenSelecting = [&id](IzkProjectItemSelector* selector) {
        void* result = &fixture;
        const HRESULT given = selector->QueryInterface(id, &result);
        Say(Hex(given) + (result == nullptr ? " null" : result == selector ? " itself" : " another"));
    };
    ULONG count = 0;
    BSTR* names = nullptr;
    fixture.tree->GetDescendantNames(u"Kept", u"includeAliases=true", &count, &names);
}

void AskLibrary(REFIID id) {
    void* result = &fixture;
    const HRESULT given = library.QueryResourceTreeInterface(&id, &fixture.context, nullptr, &result);
    Say(Hex(given) + (result == nullptr ? " null" : result == fixture.root || result == fixture.tree ? " it" : " new"));
    if (result != nullptr) {
        static_cast<IUnknown*>(result)->Release();
    }
}

}  // namespace

void AddIds(Cases& cases) {
    for (const NamedId& each : ids) {
        const std::string name = each.name;
        const IID& id = each.id;
        cases[name + " of a view"] = {[&id] { Ask(fixture.shelf, id); }};
        cases[name + " of a tree"] = {[&id] { Ask(fixture.tree, id); }};
        cases[name + " of an owner"] = {[&id] { AskOwner(id); }};
        cases[name + " of a selector"] = {[&id] { AskSelector(id); }};
        cases[name + " of the library"] = {[&id] { AskLibrary(id); }};
    }
}

}  // namespace misuse
