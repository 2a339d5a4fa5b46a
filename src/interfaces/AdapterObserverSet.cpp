#include "interfaces/AdapterObserverSet.h"

#include <cstdint>
#include <new>
#include <tuple>

#include "restree/AdapterFactory.h"
#include "restree/ChangeFlags.h"
#include "restree/ResTreeNode.h"

namespace zkhw {

bool AdapterObserverSet::ByKey::IsLess(const Key& left, const Key& right) {
    const auto numbers = [](const Key& key) {
        return std::make_tuple(reinterpret_cast<uintptr_t>(key.node), reinterpret_cast<uintptr_t>(key.observer),
                               key.id);
    };
    return numbers(left) < numbers(right);
}

ResTreeNodeObserverAdapter* AdapterObserverSet::Find(const Key& key) const {
    const auto found = members.find(key);
    return found == members.end() ? nullptr : *found;
}

ResTreeNodeObserverAdapter* AdapterObserverSet::TakeOut(const Key& key) {
    const auto found = members.find(key);
    if (found == members.end()) {
        return nullptr;
    }
    ResTreeNodeObserverAdapter* const member = *found;
    members.erase(found);
    return member;
}

ResTreeNodeObserverAdapter* AdapterObserverSet::FirstFrom(const Key& key) const {
    const auto found = members.lower_bound(key);
    return found == members.end() ? nullptr : *found;
}

ResTreeNodeObserverAdapter* AdapterObserverSet::FirstBehind(const Key& key) const {
    const auto found = members.upper_bound(key);
    return found == members.end() ? nullptr : *found;
}

AdapterObserverSet::Ended::~Ended() {
    for (const ResTreeNodeObserverAdapter* member : members) {
        delete member;
    }
}

void AdapterObserverSet::End(ResTreeNodeObserverAdapter* member, Ended& ended) {
    const Key key = ByKey::KeyOf(member);
    member->GetNode()->RemoveObserver(member, static_cast<int32_t>(key.id), false);
    // That may have read files, and whoever heard of it may have ended this registration too.
    const auto found = members.find(key);
    if (found != members.end() && *found == member) {
        ended.members.insert(members.extract(found));
    }
}

void AdapterObserverSet::UnadviseAll() {
    while (ResTreeNodeObserverAdapter* const member = First()) {
        const auto adapter = InterfacePointer<ResTreeNodeAdapter>::Share(member->GetAdapter());
        adapter->Unadvise(member->GetObserver(), member->GetId(), 0);
    }
}

AdapterObserverSet* MakeAdapterObserverSet() {
    return new (std::nothrow) AdapterObserverSet;
}

void EndAdapterObservers(AdapterObserverSet& observers, ResTreeNode* root) {
    while (ResTreeNodeObserverAdapter* const member = observers.First()) {
        const auto adapter = InterfacePointer<ResTreeNodeAdapter>::Share(member->GetAdapter());
        IzkhwResourceTreeNodeObserver* const observer = member->GetObserver();
        const ULONG id = member->GetId();
        member->OnNodeChanged(root, NodeDeleted, 0);
        // By its key: the observer may have ended this registration, and with it its own life, or may have renewed it.
        adapter->Unadvise(observer, id, 0);
    }
}

void DestroyAdapterObserverSet(AdapterObserverSet* observers) noexcept {
    delete observers;
}

}  // namespace zkhw
