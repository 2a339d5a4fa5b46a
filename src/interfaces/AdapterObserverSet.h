#pragma once

// The registrations of hosts' observers in one tree. Those of a node stand side by side. The set owns its members as
// long as they are in it, but its own end only frees the set: whoever ends a tree ends the registrations first.

#include <set>

#include "interfaces/ResTreeNodeObserverAdapter.h"

namespace zkhw {

class AdapterObserverSet {
  public:
    // By these three, each as an unsigned number, two registrations are the same. Views of one node count as one.
    struct Key {
        const ResTreeNode* node;
        const IzkhwResourceTreeNodeObserver* observer;
        ULONG id;
    };

  private:
    struct ByKey {
        using is_transparent = void;
        static Key KeyOf(const ResTreeNodeObserverAdapter* member) {
            return {member->GetNode(), member->GetObserver(), member->GetId()};
        }
        static const Key& KeyOf(const Key& key) { return key; }
        static bool IsLess(const Key& left, const Key& right);

        template <typename Left, typename Right>
        bool operator()(const Left& left, const Right& right) const {
            return IsLess(KeyOf(left), KeyOf(right));
        }
    };

    using Members = std::set<ResTreeNodeObserverAdapter*, ByKey>;

  public:
    // The member with this key, or null.
    ResTreeNodeObserverAdapter* Find(const Key& key) const;

    // Takes over a member; its key must be new. bad_alloc: it is still the caller's.
    void Insert(ResTreeNodeObserverAdapter* member) { members.insert(member); }

    // Gives a member back to the caller; null if there is none.
    ResTreeNodeObserverAdapter* TakeOut(const Key& key);

    // The member with the least key, and the first one whose key isn't less than `key`; null if there is none.
    ResTreeNodeObserverAdapter* First() const { return members.empty() ? nullptr : *members.begin(); }
    ResTreeNodeObserverAdapter* FirstFrom(const Key& key) const;
    // The first one behind `key`.
    ResTreeNodeObserverAdapter* FirstBehind(const Key& key) const;

    // Registrations that have ended. Deletes them at its own end, which may release the last reference to a view or to
    // an observer of the host, and so end the very set that they come from: nothing of it may be used behind that.
    class Ended {
      public:
        Ended() = default;
        Ended(const Ended&) = delete;
        Ended& operator=(const Ended&) = delete;
        ~Ended();

      private:
        friend AdapterObserverSet;
        // What the set has held them in comes along, so that ending a registration needs no memory.
        std::multiset<ResTreeNodeObserverAdapter*, ByKey> members;
    };

    // Ends a registration: the node has nothing more to tell it, and `ended` takes the member over. May load.
    void End(ResTreeNodeObserverAdapter* member, Ended& ended);

    // Ends all registrations, each as if the host had unregistered it through the view that it used.
    void UnadviseAll();

  private:
    Members members;
};

}  // namespace zkhw
