// Names that stand for something else than what the operation is about, texts that aren't of the form that it takes,
// and a host whose own objects break their word.

#include "misuse/NullCases.h"

namespace misuse {

namespace {

// On the shelf with the link.
template <typename Call>
void OnOtherShelf(Call call) {
    IzkhwResourceTreeNode5* const shelf = ViewOf(u"Rack/T");
    SayResult(call(*shelf));
    shelf->Release();
}

void AddNodes(Cases& cases) {
    cases["SetProperty of a child"] = {[] { SayResult(fixture.shelf->SetProperty(u"A", u"x")); }};
    cases["SetProperty of a link"] = {
        [] { OnOtherShelf([](IzkhwResourceTreeNode5& shelf) { return shelf.SetProperty(u"L", u"x"); }); }};
    cases["GetProperty of a child"] = {[] { SayResult(fixture.shelf->GetProperty(u"A", &outputs.text)); }};
    cases["GetProperty of a link"] = {
        [] { OnOtherShelf([](IzkhwResourceTreeNode5& shelf) { return shelf.GetProperty(u"L", &outputs.text); }); }};
    cases["IsLocalizedProperty of a child"] = {[] { SayResult(fixture.shelf->IsLocalizedProperty(u"A")); }};
    cases["IsLocalizedProperty of a plain property"] = {
        [] { SayResult(fixture.shelf->IsLocalizedProperty(u"Height")); }};
    cases["FindNode of a property"] = {
        [] { SayResult(fixture.shelf->FindNode(u"Height", nullptr, nullptr, &outputs.node)); }};
    cases["FindNode through a property"] = {
        [] { SayResult(fixture.shelf->FindNode(u"Height/A", &outputs.number, &outputs.flag, &outputs.node)); }};
    cases["RemoveEntry of a link"] = {
        [] { OnOtherShelf([](IzkhwResourceTreeNode5& shelf) { return shelf.RemoveEntry(u"L"); }); }};
    cases["SetName to the name of a sibling"] = {[] {
        IzkhwResourceTreeNode5* const slot = ViewOf(u"Rack/S/B");
        SayResult(slot->SetName(u"A"));
        slot->Release();
    }};
    cases["LoadContent of what isn't well formed"] = {
        [] { SayResult(fixture.shelf->LoadContent(u"<Made>1</Made></Oops>")); }};
    cases["IsCompatibleWith itself"] = {
        [] { SayResult(fixture.shelf->IsCompatibleWith(fixture.shelf, &outputs.flag)); }};
}

void ReserveWith(LPCWSTR reserves) {
    fixture.shelf->SetProperty(u"Reserves", reserves);
    SayResult(fixture.shelf->Reserve(u"me", ZkhwReserveWrite, &outputs.number));
    SayResult(fixture.shelf->Unreserve(u"me"));
    fixture.shelf->RemoveEntry(u"Reserves");
}

void AddReservations(Cases& cases) {
    cases["Reserve with a property in Reserves"] = {[] { ReserveWith(u"Height"); }};
    cases["Reserve with a path that leads nowhere in Reserves"] = {[] { ReserveWith(u"X/Y,../X"); }};
    // It is on the present path of the walk already.
    cases["Reserve with the node itself in Reserves"] = {[] { ReserveWith(u"../S"); }};
    cases["ResolveReservations of an owner that is no GUID"] = {[] {
        fixture.shelf->Reserve(u"me", ZkhwReserveRead, nullptr);
        SayResult(fixture.shelf->ResolveReservations(&fixture.locator, &outputs.count, &outputs.items,
                                                     &outputs.otherCount, &outputs.texts, 0));
    }};
}

void SayFound(const char* path) {
    unsigned char found = 9;
    const HRESULT result = library.FPGAResTree_GetProperty(path, "", "", nullptr, &found);
    Say(Hex(result) + " found=" + std::to_string(found));
}

void SayList(decltype(Library::FPGAResTree_GetDescendantNames) function, const char* path) {
    ZkStringArrayHandle array = nullptr;
    unsigned char found = 9;
    const HRESULT result = function(path, "", "", &array, &found);
    Say(Hex(result) + " " + TakeArray(array) + " found=" + std::to_string(found));
}

void Dump(const char* path) {
    const HostString text;
    Say(Hex(library.FPGAResTree_Dump(path, "", "", text.Get())));
}

void AddExports(Cases& cases) {
    cases["FPGAResTree_GetProperty of a node"] = {[] { SayFound("Rack/S"); }, true};
    cases["FPGAResTree_GetProperty of nothing"] = {[] { SayFound("Rack/X/Y"); }, true};
    cases["FPGAResTree_GetDescendantNames of a property"] = {
        [] { SayList(library.FPGAResTree_GetDescendantNames, "Rack/S/Height"); }, true};
    cases["FPGAResTree_GetMultipleProperties of a property"] = {
        [] { SayList(library.FPGAResTree_GetMultipleProperties, "Rack/S/Height"); }, true};
    cases["FPGAResTree_Dump of a property"] = {[] { Dump("Rack/S/Height"); }, true};
    cases["FPGAResTree_Dump of nothing"] = {[] { Dump("Rack/X"); }, true};
    cases["FPGAResTree_Dump of the empty path"] = {[] { Dump(""); }, true};
}

void QueryOwner(IzkHostContext* context, IzkProjectItem* item) {
    void* object = &fixture;
    const HRESULT result = library.QueryResourceTreeInterface(&IID_IzkhwResourceTreeOwner, context, item, &object);
    Say(Hex(result) + (object == nullptr ? " null" : " object"));
    if (object != nullptr) {
        auto* const owner = static_cast<IzkhwResourceTreeOwner*>(object);
        SayResult(owner->GetRootNode(&outputs.node));
        owner->Release();
    }
}

void AddHosts(Cases& cases) {
    cases["owner of an item without a project"] = {[] { QueryOwner(&fixture.context, &fixture.item); }};
    cases["owner of an item whose project fails"] = {[] {
        fixture.item.projectGiven = E_OUTOFMEMORY;
        QueryOwner(&fixture.context, &fixture.item);
    }};
    cases["owner of a context without the node interface"] = {[] { QueryOwner(&fixture.context, nullptr); }};
    cases["owner of a context that gives no object"] = {[] {
        fixture.context.givesItself = false;
        QueryOwner(&fixture.context, nullptr);
    }};
}

}  // namespace

void AddWrongKinds(Cases& cases) {
    AddNodes(cases);
    AddReservations(cases);
    AddExports(cases);
    AddHosts(cases);
}

}  // namespace misuse
