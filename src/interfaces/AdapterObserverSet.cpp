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

void AdapterObserverSet::End(ResTreeNodeObserverAdapter* member) {
    member->GetNode()->RemoveObserver(member, static_cast<int32_t>(member->GetId()), false);
    // Out of the set first: what the host does when it is released must not find it there.
    TakeOut({member->GetNode(), member->GetObserver(), member->GetId()});
    delete member;
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
        const AdapterObserverSet::Key key{member->GetNode(), member->GetObserver(), member->GetId()};
        const auto adapter = InterfacePointer<ResTreeNodeAdapter>::Share(member->GetAdapter());
        member->OnNodeChanged(root, NodeDeleted, 0);
        // The observer may have unregistered itself.
        if (observers.Find(key) == member) {
            adapter->Unadvise(member->GetObserver(), member->GetId(), 0);
        }
    }
}

void DestroyAdapterObserverSet(AdapterObserverSet* observers) noexcept {
    delete observers;
}

}  // namespace zkhw
