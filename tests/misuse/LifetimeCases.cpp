// Objects that go before what was made from them, objects that are given back twice, and a host that leaves without
// giving anything back.

#include "misuse/MisuseHost.h"

namespace misuse {

namespace {

constexpr ULONG registration = 5;

IzkhwResourceTreeNode* Copy(IzkhwResourceTreeNode5* node) {
    IzkhwResourceTreeNode* copy = nullptr;
    const HRESULT made = node->CloneDetached(nullptr, &copy);
    if (made != S_OK) {
        Say("no copy " + Hex(made));
    }
    return copy;
}

IzkhwResourceTreeNode* Find(IzkhwResourceTreeNode* node, LPCWSTR path) {
    IzkhwResourceTreeNode* found = nullptr;
    node->FindNode(path, nullptr, nullptr, &found);
    return found;
}

std::string Count(ULONG count) {
    return " " + std::to_string(count);
}

// All that may be done with a view whose node has gone.
void SayCounts(IUnknown* view) {
    std::string text = "counts";
    text += Count(view->AddRef());
    text += Count(view->Release());
    text += Count(view->Release());
    Say(text);
}

void SayNotice(IzkhwResourceTreeNode*, ULONG changes, ULONG id) {
    Say("notice " + Hex(changes) + " id " + std::to_string(id));
}

void AddCopies(Cases& cases) {
    cases["copy released before views of it"] = {[] {
        IzkhwResourceTreeNode* const copy = Copy(fixture.shelf);
        IzkhwResourceTreeNode* const slot = Find(copy, u"A");
        IzkhwResourceTreeNode* const pin = Find(copy, u"A/Q");
        IzkhwResourceTreeNode* const again = Find(copy, u"/");
        Say("copy" + Count(copy->Release()));
        SayCounts(slot);
        SayCounts(pin);
        SayCounts(again);
    }};
    cases["copy released before a view with a registration"] = {[] {
        static Observer observer;
        observer.reaction = SayNotice;
        IzkhwResourceTreeNode* const copy = Copy(fixture.shelf);
        IzkhwResourceTreeNode* const slot = Find(copy, u"A");
        slot->Advise(&observer, 0xFFFFFFFF, registration);
        const ULONG left = copy->Release();
        Say("copy" + Count(left) + ", observer" + Count(observer.references));
        SayCounts(slot);
    }};
    cases["copy released while a registration holds it"] = {[] {
        static Observer observer;
        observer.reaction = SayNotice;
        IzkhwResourceTreeNode* const copy = Copy(fixture.shelf);
        copy->Advise(&observer, ZkhwPropertyChanged, registration);
        Say("copy" + Count(copy->Release()));
        Say(Hex(copy->SetProperty(u"Height", u"8")));
        const HRESULT ended = copy->Unadvise(&observer, registration, 0);
        Say(Hex(ended) + " observer" + Count(observer.references));
    }};
    cases["copy of a copy outlives it"] = {[] {
        IzkhwResourceTreeNode* const copy = Copy(fixture.shelf);
        IzkhwResourceTreeNode* const second = Copy(static_cast<IzkhwResourceTreeNode5*>(copy));
        Say("copy" + Count(copy->Release()));
        Say(Describe(second));
        Say("copy" + Count(second->Release()));
    }};
    cases["copy outlives its original"] = {[] {
        IzkhwResourceTreeNode* const copy = Copy(fixture.shelf);
        IzkhwResourceTreeNode5* const rack = ViewOf(u"Rack");
        rack->RemoveEntry(u"S");
        rack->Release();
        Say(Describe(copy));
        Say("copy" + Count(copy->Release()));
    }};
    cases["copy counted while it ends"] = {[] {
        static Observer observer;
        IzkhwResourceTreeNode* const copy = Copy(fixture.shelf);
        IzkhwResourceTreeNode* const slot = Find(copy, u"A");
        slot->Advise(&observer, 0xFFFFFFFF, registration);
        // The end of the copy lets the observer go.
        observer.whenUnreferenced = [copy] {
            copy->AddRef();
            copy->Release();
            Say("counted");
        };
        Say("copy" + Count(copy->Release()));
        SayCounts(slot);
    }};
}

void AddRemovals(Cases& cases) {
    cases["view of a removed node"] = {[] {
        IzkhwResourceTreeNode* const slot = ViewOf(u"Rack/S/A");
        Say(Hex(fixture.shelf->RemoveEntry(u"A")));
        SayCounts(slot);
    }};
    cases["view below a removed node"] = {[] {
        IzkhwResourceTreeNode* const pin = ViewOf(u"Rack/S/A/Q");
        Say(Hex(fixture.shelf->RemoveEntry(u"A")));
        SayCounts(pin);
    }};
    cases["view of a replaced node"] = {[] {
        IzkhwResourceTreeNode* const slot = ViewOf(u"Rack/S/A");
        Say(Hex(fixture.shelf->LoadContent(u"<Drawer name=\"A\"/>")));
        SayCounts(slot);
    }};
    cases["RemoveEntry twice"] = {[] {
        Say(Hex(fixture.shelf->RemoveEntry(u"A")));
        Say(Hex(fixture.shelf->RemoveEntry(u"A")));
    }};
    cases["Unadvise twice"] = {[] {
        static Observer observer;
        fixture.shelf->Advise(&observer, 4, registration);
        for (const ULONG id : {registration, registration, ULONG{0xFFFFFFFF}}) {
            const HRESULT ended = fixture.shelf->Unadvise(&observer, id, 0);
            Say(Hex(ended) + Count(observer.references));
        }
    }};
    cases["Unreserve twice"] = {[] {
        fixture.shelf->Reserve(u"me", 1, nullptr);
        Say(Hex(fixture.shelf->Unreserve(u"me")));
        Say(Hex(fixture.shelf->Unreserve(u"me")));
    }};
}

void AddSurplus(Cases& cases) {
    // It has no references from the start.
    cases["Release of a selector"] = {[] {
        fixture.item.whenSelecting = [](IzkProjectItemSelector* selector) { selector->Release(); };
        ULONG count = 0;
        BSTR* names = nullptr;
        fixture.tree->GetDescendantNames(u"Kept", u"includeAliases=true", &count, &names);
    }};
    cases["SysFreeString twice"] = {[] {
        OLECHAR* const string = library.SysAllocString(u"ab");
        library.SysFreeString(string);
        library.SysFreeString(string);
    }};
    cases["SysStringLen of a freed string"] = {[] {
        OLECHAR* const string = library.SysAllocString(u"ab");
        library.SysFreeString(string);
        library.SysStringLen(string);
    }};
    // Inside of a block, so that what stands in front of the pointer may be read.
    cases["SysFreeString of task memory"] = {[] {
        auto* const block = static_cast<OLECHAR*>(library.CoTaskMemAlloc(64));
        for (int i = 0; i < 32; ++i) {
            block[i] = 0;
        }
        library.SysFreeString(block + 8);
    }};
}

// Outlives what the process destroys at its exit.
Observer& LastingObserver() {
    static Observer* const observer = new Observer;
    return *observer;
}

void AddExits(Cases& cases) {
    cases["views left at the exit"] = {[] {
        static IzkhwResourceTreeNode* left[] = {ViewOf(u"Rack/S/A"), ViewOf(u"Rack/S"), ViewOf(u"/")};
        Say(left[0] != left[1] && left[1] != left[2] ? "left" : "one");
    }};
    cases["registrations left at the exit"] = {[] {
        Observer& observer = LastingObserver();
        observer.reaction = SayNotice;
        fixture.shelf->Advise(&observer, ZkhwPropertyChanged, registration);
    }};
    // The tree still stands then.
    cases["registrations left at the exit, whose observer removes nodes"] = {[] {
        Observer& observer = LastingObserver();
        observer.reaction = [](IzkhwResourceTreeNode* node, ULONG changes, ULONG id) {
            SayNotice(node, changes, id);
            Say(Hex(node->RemoveEntry(u"A")));
        };
        fixture.shelf->Advise(&observer, ZkhwPropertyChanged, registration);
    }};
    cases["registrations left at the exit, whose observer ends them"] = {[] {
        Observer& observer = LastingObserver();
        observer.reaction = [&observer](IzkhwResourceTreeNode* node, ULONG changes, ULONG id) {
            SayNotice(node, changes, id);
            Say(Hex(node->Unadvise(&observer, 0xFFFFFFFF, 1)));
        };
        fixture.shelf->Advise(&observer, ZkhwPropertyChanged, registration);
        fixture.shelf->Advise(&observer, ZkhwPropertyChanged, registration + 1);
    }};
    cases["copy left at the exit"] = {[] {
        static IzkhwResourceTreeNode* const copy = Copy(fixture.shelf);
        Say(Describe(copy));
    }};
}

}  // namespace

void AddLifetimes(Cases& cases) {
    AddCopies(cases);
    AddRemovals(cases);
    AddSurplus(cases);
    AddExits(cases);
}

}  // namespace misuse
