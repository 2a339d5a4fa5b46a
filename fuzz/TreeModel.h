#pragma once

// A resource tree with its observers and reservations, made the slow and plain way: every rule step by step, by
// recursion and by looking at everything. It is what a real tree has to agree with. Nothing in it is deferred.
//
// Calls of observers from outside are numbered records in `calls`; what an observer does from inside one is up to
// `reaction`. A model is small, so that recursion and exponential walks are of no account.

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "restree/NodeEntry.h"

namespace zkhw {
class ResTreeNode;
}

namespace fuzz::model {

struct Node;

struct Entry {
    std::u16string key;
    zkhw::EntryKind kind;
    std::u16string text;          // Of a text or a link.
    std::unique_ptr<Node> child;  // Of a child.
};

// What an observer from outside has asked for; owned by the tree.
struct Registration {
    Node* node;
    size_t observer;
    uint32_t id;
};

// Who listens to a node: somebody from outside, or another node.
struct Record {
    enum State { Active, Removed, Added };

    Registration* registration;
    Node* watcher;
    int32_t context;
    uint32_t mask;
    State state;

    bool Is(const Registration* wanted, const Node* wantedNode) const {
        return registration == wanted && watcher == wantedNode;
    }
};

struct Holder {
    std::u16string owner;
    uint32_t mode;
};

struct Node {
    std::u16string name;
    std::u16string type;
    bool ordered;
    Node* parent;
    std::vector<std::unique_ptr<Entry>> entries;
    std::vector<Holder> holders;
    std::vector<std::unique_ptr<Record>> records;
    uint32_t pending = 0;
    uint32_t suspendCount = 0;
    uint32_t brackets = 0;  // Those of suspendCount that the test has opened.
    uint64_t run = 0;       // The dispatch that has the node open; 0: none.
    bool isNotifying = false;
    bool isOnPath = false;              // Of a walk over dependants.
    bool isBeingWatched = false;        // A registration is on its way through its dependants.
    zkhw::ResTreeNode* real = nullptr;  // The node that has to agree with this one.
};

// One call of an observer, as the observer sees it.
struct Call {
    size_t observer;
    uint32_t changes;
    uint32_t id;
    const zkhw::ResTreeNode* node;

    bool operator==(const Call&) const = default;
};

class Tree {
  public:
    explicit Tree(bool ordered);

    Node root;
    std::vector<Call> calls;
    std::vector<std::unique_ptr<Registration>> registrations;

    // What the observer does when it has been called. Gets copies: the registration may go meanwhile.
    std::function<void(Registration registration)> reaction;

    // Every node, parents first.
    std::vector<Node*> Nodes();

    // --- Entries and paths ---

    static Entry* Find(Node& node, std::u16string_view key);
    static Node* Lookup(Node& node, std::u16string_view path);
    static Node* Resolve(Node& node, const Entry& entry);
    static std::u16string PathOf(const Node& node);
    static std::u16string DisplayPathOf(Node& node);
    static bool Supports(Node& node, std::u16string_view type);

    void Set(Node& node, std::u16string_view key, std::u16string_view value);
    void Assign(Node& node, Entry& entry, std::u16string_view value);
    // Null if an unordered node has the key already. `text` is the type of a child.
    Entry* Add(Node& node, std::u16string_view key, zkhw::EntryKind kind, std::u16string_view text, bool childOrdered,
               const std::u16string* before);
    void Remove(Node& node, Entry* entry);
    void RemoveByName(Node& node, std::u16string_view key);
    // Whether Rename would lose the node's entry.
    static bool WouldLose(const Node& node, std::u16string_view newName);
    // False if the parent has no entry of the node's name: a sibling of that name has lost it by its own renaming.
    bool Rename(Node& node, std::u16string_view newName);
    // `source` as a copy without a parent, without its reservations and observers.
    void CopyInto(Node& target, Node& source);

    // --- Notices ---

    void Raise(Node& node, uint32_t changes);
    uint32_t BeginChanges(Node& node);
    void EndChanges(Node& node, uint32_t saved, bool replace);
    void Advise(Node& node, size_t observer, uint32_t mask, uint32_t id);
    void Unadvise(Node& node, size_t observer, uint32_t id, bool subtree);

    // --- Reservations ---

    uint32_t Reserve(Node& node, const std::u16string& owner, uint32_t mode);
    bool Release(Node& node, const std::u16string& owner);
    bool ReserveAll(Node& node, const std::u16string& owner, uint32_t mode, std::u16string_view filter);
    bool ReleaseAll(Node& node, const std::u16string& owner, std::u16string_view filter);
    static uint32_t Flags(Node& node, const std::u16string* owners, bool except);

  private:
    using Nodelist = std::vector<Node*>;

    static Node* LookupCounting(Node& node, std::u16string_view path, size_t& links);
    static Nodelist Dependants(Node& node);
    void RemoveChildNodes(Node& node);
    void Destroy(Node& node);

    void RaiseChained(Node& node, uint32_t changes, uint64_t run);
    void Dispatch(Node& node, uint64_t run);
    void Deliver(Node& node, uint32_t delivered, uint64_t run);
    bool AddObserver(Node& node, Registration* registration, Node* watcher, uint32_t mask, int32_t context);
    bool RemoveObserver(Node& node, const Registration* registration, const Node* watcher, int32_t context);
    void End(Registration& registration);

    uint32_t ReserveOne(Node& node, const std::u16string& owner, uint32_t mode);
    bool ReserveDependants(Node& node, const std::u16string& owner, uint32_t mode);
    bool ReserveEach(const Nodelist& list, const std::u16string& owner, uint32_t mode);
    bool ReleaseOne(Node& node, const std::u16string& owner);
    bool ReleaseDependants(Node& node, const std::u16string& owner);
    bool ReleaseEach(const Nodelist& list, const std::u16string& owner);
    static void CollectMatching(Node& node, std::u16string_view filter, Nodelist& list);
    void ShowHolders(Node& node);

    uint64_t runs = 0;
};

}  // namespace fuzz::model
