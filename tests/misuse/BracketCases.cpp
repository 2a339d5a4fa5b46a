// EndChange without its BeginChange, and the other way round. The count of brackets has 32 bits and is taken down
// without a look: below 0 notices wait until it is 0 again.

#include "misuse/MisuseHost.h"

namespace misuse {

namespace {

constexpr ULONG registration = 5;

// Hears of the shelf's properties, and says so.
class Watch {
  public:
    Watch() {
        observer.reaction = [](IzkhwResourceTreeNode*, ULONG changes, ULONG) { Say("notice " + Hex(changes)); };
        fixture.shelf->Advise(&observer, ZkhwPropertyChanged, registration);
    }
    Watch(const Watch&) = delete;
    Watch& operator=(const Watch&) = delete;
    ~Watch() { fixture.shelf->Unadvise(&observer, registration, 0); }

    Observer observer;
};

// Without a change of the text there is a change all the same.
void Touch() {
    fixture.shelf->SetProperty(u"Height", u"7");
}

void Begin() {
    ULONG pending = 9;
    const HRESULT result = fixture.shelf->BeginChange(&pending);
    Say(Hex(result) + " pending " + Hex(pending));
}

void End() {
    Say(Hex(fixture.shelf->EndChange(0, 0)));
}

void Nest(int depth) {
    ULONG pending = 0;
    for (int i = 0; i < depth; ++i) {
        fixture.shelf->BeginChange(&pending);
    }
    Touch();
    for (int i = 0; i < depth; ++i) {
        fixture.shelf->EndChange(0, 0);
    }
}

// Nobody hears of it.
void RemoveShelf(void (*unbalance)()) {
    Observer observer;
    observer.reaction = [](IzkhwResourceTreeNode*, ULONG changes, ULONG) { Say("notice " + Hex(changes)); };
    fixture.shelf->Advise(&observer, 0xFFFFFFFF, registration);
    unbalance();
    Touch();
    IzkhwResourceTreeNode5* const rack = ViewOf(u"Rack");
    Say(Hex(rack->RemoveEntry(u"S")));
    rack->Release();
    Say("observer " + std::to_string(observer.references));
}

}  // namespace

void AddBrackets(Cases& cases) {
    cases["EndChange unmatched, then BeginChange"] = {[] {
        const Watch watch;
        End();
        Touch();
        Say(Hex(fixture.shelf->HasPendingChanges()));
        Begin();
        Touch();
        Say(Hex(fixture.shelf->HasPendingChanges()));
    }};
    cases["EndChange unmatched twice, then BeginChange twice"] = {[] {
        const Watch watch;
        End();
        End();
        Begin();
        Touch();
        Begin();
        Touch();
    }};
    cases["EndChange twice for one BeginChange"] = {[] {
        const Watch watch;
        Begin();
        Touch();
        End();
        End();
        Touch();
        Begin();
    }};
    cases["EndChange unmatched in a notice"] = {[] {
        Watch watch;
        watch.observer.reaction = [](IzkhwResourceTreeNode*, ULONG changes, ULONG) {
            Say("notice " + Hex(changes));
            End();
        };
        Touch();
        watch.observer.reaction = [](IzkhwResourceTreeNode*, ULONG changes, ULONG) { Say("notice " + Hex(changes)); };
        Touch();
    }};
    cases["EndChange unmatched, then the node is removed"] = {[] { RemoveShelf(End); }};
    cases["BeginChange unmatched, then the node is removed"] = {[] { RemoveShelf(Begin); }};
    cases["BeginChange 100000 times"] = {[] {
        const Watch watch;
        Nest(100'000);
        Touch();
    }};
}

}  // namespace misuse
