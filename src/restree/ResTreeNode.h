#pragma once

// A node of a resource tree. It has one collection of named entries that holds everything: texts, child nodes and
// links to other nodes. A node lives on the heap; a child lives as long as its entry in the parent, a root and a
// detached clone belong to whoever made them. A tree is used by one thread at a time.
//
// Names are compared with Compare (blind to letter case) throughout. Nothing here recurses over the depth of a tree.
// All operations that make something may throw bad_alloc.

#include <cstdint>
#include <memory>
#include <optional>
#include <set>
#include <string_view>
#include <vector>

#include "qn/dsc/StringBase.h"
#include "restree/ChangeFlags.h"
#include "restree/EntryIterator.h"
#include "restree/EntryList.h"
#include "restree/NameAndType.h"
#include "restree/NodeEntry.h"
#include "restree/ResTreeNodeChangeObserver.h"
#include "restree/Reservation.h"
#include "restree/TypeTable.h"

namespace zkhw {

using qn::dsc::NarrowString;

class ElementReader;
class LoadChain;
class Parameters;
class ParseStack;
class ReservationList;
struct ObserverRecord;

class ResTreeNode : public ResTreeNodeChangeObserver {
  public:
    // What an operation that adds an entry gives.
    struct Added {
        NodeEntry* entry;  // The new entry, or the one that has the key already.
        bool isNew;
    };

    // A root, with the table of the built-in type relations.
    ResTreeNode(std::u16string_view name, std::u16string_view type, bool ordered);

    // A child of `parent`, which doesn't hold it yet.
    ResTreeNode(NameAndType&& texts, bool ordered, ResTreeNode* parent);

    // A detached node with a copy of `sourceTable`, or with no table if that is null.
    ResTreeNode(std::u16string_view name, std::u16string_view type, bool ordered, const TypeTable* sourceTable);

    // Removes the entries one by one from the first, with the notices that go with it, then ends all watching. What no
    // notice can be given of for lack of memory goes without.
    ~ResTreeNode() override;

    // Deletes a root; null does nothing. While a ReleaseScope stands, which an operation of the tree further up the
    // stack may have set up, the memory stays until that ends.
    static void Destroy(ResTreeNode* root) noexcept;

    // Nodes come from the same allocator as their texts.
    static void* operator new(size_t size);
    static void* operator new(size_t size, const std::nothrow_t&) noexcept;
    static void operator delete(void* memory) noexcept;
    static void operator delete(void* memory, const std::nothrow_t&) noexcept;

    // --- Reading ---

    // Good until the node gets another name or type.
    std::u16string_view GetName() const { return texts.Name(); }
    std::u16string_view GetType() const { return texts.Type(); }
    ResTreeNode* GetParent() const { return parent; }

    // Whether the node, or one above it, has left its tree since the outermost ReleaseScope began, which alone still
    // keeps it. At most linear in its depth; constant as long as nothing was removed.
    bool HasLeft() const;

    bool IsOrdered() const { return entries.IsOrdered(); }

    // The entries as they stand.
    EntryIterator Begin() { return {entries, entries.Begin()}; }
    EntryIterator End() { return {entries, EntryList::End()}; }
    ConstEntryIterator Begin() const { return {entries, entries.Begin()}; }
    ConstEntryIterator End() const { return {entries, EntryList::End()}; }

    // The same after a deferred load, if one is pending. Such a walk ends at End().
    EntryIterator BeginLoaded();

    // The entries as they stand, for a walk during which they may change (EntryWalk.h).
    const EntryList& Entries() const { return entries; }

    // The entry `key` as things stand; the first one in an ordered node. The end position, or null, on a miss.
    // Logarithmic. Find... gives the entry itself, which stays where it is until it is removed.
    EntryIterator FindEntryRaw(std::u16string_view key);
    NodeEntry* FindRaw(HashedKey key) const { return entries.Find(key); }

    // The same; a miss on a node whose contents are deferred loads them first and looks once more.
    EntryIterator FindEntry(std::u16string_view key);
    NodeEntry* Find(HashedKey key);

    // The position of an entry of this node; the end if it has been removed, where a ReleaseScope still keeps it.
    EntryIterator PositionOf(const NodeEntry* entry) {
        return {entries, StillHolds(entry) ? entries.Locate(entry) : EntryList::End()};
    }

    // The value of the text entry `key`; none if there is no such entry or it is of another kind. May load (FindEntry).
    // The result lives in the node until the entry is changed or removed.
    std::optional<std::u16string_view> GetProperty(HashedKey key);

    // As GetProperty, with the empty text in place of none.
    std::u16string_view GetPropertyOrEmpty(HashedKey key);

    // The node that the entry stands for: a child, or where a link leads. Null at the end, for a text and for a link
    // that leads nowhere. Following a link may load.
    ResTreeNode* ResolveEntry(EntryIterator iterator);
    ResTreeNode* ResolveEntry(NodeEntry* entry);

    // --- Changing ---

    // Assigns the text entry `key`, or makes one at the end. False, and nothing changes, if the entry is no text.
    bool SetProperty(std::u16string_view key, std::u16string_view value);

    // Assigns the value of a text entry; its kind stays. False, and nothing changes, if the entry is no text.
    bool SetEntryText(EntryIterator iterator, std::u16string_view value);
    bool SetEntryText(NodeEntry* entry, std::u16string_view value);

    // The text of a text entry of this node, for changes in place (NodeEntry::EditText), which raise nothing.
    String& EditEntryText(NodeEntry& entry) {
        NoteVariables(&entry);
        return entry.EditText();
    }

    // Add an entry in front of `before`, or at the end if that is null or not to be found. An unordered node that has
    // the key already makes nothing and gives what is there; an ordered node always makes a new entry. Looking for
    // `before` may load: the other texts must outlive that.
    Added AddTextEntry(std::u16string_view key, std::u16string_view value, EntryKind kind,
                       const String* before = nullptr);
    Added AddLinkEntry(std::u16string_view key, std::u16string_view path, const String* before = nullptr);

    // `child` is the new node; if nothing was made, the existing one, or null if the entry is no child.
    Added AddChildEntry(std::u16string_view key, std::u16string_view childType, bool childOrdered, ResTreeNode*& child,
                        const String* before = nullptr);

    // Store an entry without a test, and raise nothing. `position` is where to insert in an ordered node and only a
    // hint in an unordered one. The node takes `child`.
    EntryIterator InsertEntry(EntryIterator position, std::u16string_view key, EntryKind kind,
                              std::u16string_view text);
    EntryIterator InsertEntry(EntryIterator position, std::u16string_view key, std::unique_ptr<ResTreeNode> child);

    // Removes an entry. The nodes of a child's subtree hear NodeDeleting from the top down, then NodeDeleted from the
    // bottom up; then this node hears of the removal.
    void RemoveEntry(EntryIterator iterator);
    void RemoveEntry(NodeEntry* entry);

    // The same by name, after a deferred load if need be; a missing entry does nothing.
    void RemoveEntryByName(HashedKey key);

    // Removes every child entry. Texts and links stay.
    void RemoveChildNodes();

    // Changes the key of an entry, not the name of its node. False if there is no `oldKey`. In an unordered node that
    // has `newKey` already the entry is lost, what it held is never released, and the result is false.
    bool RenameEntry(std::u16string_view oldKey, std::u16string_view newKey);

    // Renames the node, and its entry in the parent. False if RenameEntry of the parent says so; the node then keeps
    // its name.
    bool Rename(std::u16string_view newName);

    // Makes an empty collection of the other form. Only for a node that has no entries yet.
    void SetOrdered(bool ordered);

    // Removes the entry `name`: always when `unconditional`, else unless it is a child of just this type and order.
    void RemoveIfMismatched(bool unconditional, HashedKey entryName, std::u16string_view entryType, bool entryOrdered);

    // Copies the entries of `source`, as they stand, to the end of this node; children deeply, links re-expressed
    // from here. Texts that are there already are overwritten on demand. A node may be merged with one of its own
    // ancestors: what is being filled is not copied into itself.
    void MergeFrom(ResTreeNode& source, bool overwrite);

    // MergeFrom, and then ApplyParameters. In one walk where that makes no difference, which is nearly always: it saves
    // a second walk, and a copy of each text that holds "#{".
    void MergeExpanded(ResTreeNode& source, bool overwrite, const Parameters& parameters);

    // Makes `source` or its contents the child `key` at `position`, and gives that child. An entry of that name goes,
    // except that with `overwrite` a child of the same type and order stays and receives the merge. Null and the end
    // if an observer has removed the child meanwhile.
    EntryIterator CloneSubtreeInto(EntryIterator position, std::u16string_view key, ResTreeNode& source, bool overwrite,
                                   ResTreeNode*& child);

    // The same behind the entry `behind`, or at the end if that has left the node, and then ApplyParameters of the
    // copy. Gives the entry of the copy; null if an observer has removed it before its texts were expanded.
    NodeEntry* CloneExpandedBehind(const NodeEntry* behind, std::u16string_view key, ResTreeNode& source,
                                   bool overwrite, const Parameters& parameters);

    // A detached copy with its own type table, if this node has one. The caller owns it.
    std::unique_ptr<ResTreeNode> Clone();

    // --- Types ---

    // True if `typeName` is the node's type or one that it inherits from.
    bool IsA(std::u16string_view typeName) const;

    // True if `text` is empty, if IsA(text), or if it stands in the comma list "Protocols", there letter by letter.
    bool Supports(std::u16string_view text);

    // Appends the type, all types that it inherits from (repetitions stay) and the pieces of "Protocols".
    void GetProtocols(std::vector<String>& list);

    // Gives the node a copy of the type table that holds for it, unless it has one of its own.
    void MakeTypeTableLocal();

    // This node's own table, or null; and the nearest one on the way up, or null.
    TypeTable* GetTypeTable() const;
    const TypeTable* NearestTypeTable() const;

    // --- Change notices ---

    // Lets `observer` hear of the changes in `mask`; a second call with the same `context` replaces the mask, and a
    // `context` of -1 stands for any. Contexts 1 and 2 are taken by nodes that watch each other. With AncestorChanged
    // all nodes above are watched too, with ReservationChanged all nodes that "Reserves" names, at any distance.
    // The observer isn't owned (but see DeleteWithNode): remove it before it dies.
    // True if something new was registered, here or on a node that this one watches in turn. After an exception a new
    // observer isn't registered.
    bool AddObserver(ResTreeNodeChangeObserver* observer, uint32_t mask, int32_t context);

    // Ends what AddObserver began; a `context` of -1 stands for all. With `recursive` on all nodes below too, which
    // loads deferred contents. True if anything was removed. Without `recursive` no lack of memory keeps it from that.
    bool RemoveObserver(ResTreeNodeChangeObserver* observer, int32_t context, bool recursive);

    // Hold delivery back; nests. BeginChanges gives the flags raised so far and clears them. EndChanges puts `saved`
    // in place of what was raised since (`replace`) or adds it, and delivers when the last bracket closes.
    uint32_t BeginChanges();
    void EndChanges(uint32_t saved, bool replace);

    bool HasNoPendingChanges() const { return pendingChanges == 0; }

    // Delivers what is pending of `mask`, in passes, until nothing of it is left.
    void DispatchChanges(uint32_t mask);

    // Notes `changes`, and delivers at once unless delivery is held back.
    void Raise(uint32_t changes) {
        if (MayBeHeard()) {
            RaiseObserved(changes);
        }
    }

    // A watched node changed: raises on this node what concerns it.
    void OnNodeChanged(ResTreeNode* node, uint32_t changes, int32_t context) override;

    // --- Reservations ---
    //
    // A node can be held by several owners. The nodes that its "Reserves" names are its dependants: they are taken
    // along, before it, and so are theirs. A node that a walk over dependants is just about is not entered again, so
    // lists that lead round in a circle are harmless. The text "ZKHWReservation" shows who holds the node; it is
    // there as long as anybody does, and changes without a notice of its own: ReservationChanged tells of it.
    //
    // Results of type uint32_t are sets of ReservationFlags. An owner may be any text; two that differ in case alone
    // are one. A refusal tells nobody why. A throw (no memory, an observer) leaves what was taken until then taken:
    // Release drops it; each single node is either changed or as it was. Observers may do what they like from inside:
    // a node that has left its tree when its turn comes is passed over, and one that leaves while its dependants are
    // taken counts as refused. A record costs logarithmic time to find, and where it isn't the last one, the time to
    // move what follows it in "ZKHWReservation".

    // Takes the node and its dependants, or nothing. Gives what ReserveOne gives for the node; 0 for a refusal, and
    // then `owner` holds nothing any more on the nodes that were taken, not even what it had held there before.
    uint32_t Reserve(const String& owner, uint32_t mode);

    // Takes this node alone. 0, and nothing changes, if it is held exclusively, or written by anybody (also `owner`)
    // and `mode` has ReserveWrite. ReserveExclusive drops all holders and gives `mode`. Otherwise `mode` replaces what
    // `owner` had, and the result is that of all holders before, with `mode`. A `mode` of 0 on a node that nobody
    // holds gives 0 all the same, but leaves a record, which the text shows from its next change on.
    uint32_t ReserveOne(const String& owner, uint32_t mode);

    // Takes the dependants, or nothing; false for a refusal. True also if there are none.
    bool ReserveDependants(const String& owner, uint32_t mode);

    // Takes all of CollectMatchingDescendants with their dependants, or nothing; false for a refusal.
    bool ReserveAll(const String& owner, uint32_t mode, const String& filter);

    // Drop what `owner` holds: here and on the dependants, from the last to the first; here alone; on the dependants
    // alone; on all of CollectMatchingDescendants with their dependants. True if there was anything. Looking for
    // "Reserves" never loads, and of the four only ReleaseAll loads what it walks over.
    bool Release(const String& owner);
    bool ReleaseOne(const String& owner);
    bool ReleaseDependants(const String& owner);
    bool ReleaseAll(const String& owner, const String& filter);

    // How this node and all dependants are held: GetOwnReservationFlags of each, in one set. `owners` is a comma list,
    // or null. May load.
    uint32_t GetReservationFlags(const String* owners, bool except);

    // How this node is held: by everybody, if `owners` is null; else the mode of the first record, and of that alone,
    // whose owner is one of them, or with `except` is none of them. 0 if there is none.
    uint32_t GetOwnReservationFlags(const std::set<String>* owners, bool except) const;

    // Appends the owners of this node in order of their arrival or, if that gives nothing, those of the first
    // dependant that has any; nothing if `list` isn't empty. With `activeOnly` without those whose mode has no flag.
    // May load.
    void GetReservationOwners(std::vector<String>& list, bool activeOnly);

    // The records of this node, in order of arrival. Good until the next change of them.
    const std::vector<Reservation>& GetReservations() const;

    // Appends the nodes that "Reserves" names; paths that lead nowhere are left out. Unless `raw`, a miss may load.
    // Looking the paths up may load as well. What a load removes on the way is not given.
    void GetDependants(std::vector<ResTreeNode*>& list, bool raw);

    // Appends the child nodes that support `filter` (see Supports; all of them if it is empty) and, below each of
    // these, the same again, parents first. Links are not followed. Loads.
    void CollectMatchingDescendants(const String& filter, std::vector<ResTreeNode*>& list);

    // Makes "ZKHWReservation" show the records, or removes it if there are none. An entry of that name that is no text
    // stays as it is while there are records. Whatever this raises on the node goes unreported.
    void RefreshReservationProperty();

    // --- Paths ---

    // The node at `path`, or null. "/" climbs to the root first, "#{document-root}/" starts at `documentRoot` if given.
    // Follows links, 256 at most. May load.
    ResTreeNode* Lookup(std::u16string_view path, ResTreeNode* documentRoot);

    // The path of the node from its root, and the same with display names. Built anew at each call.
    String GetPath() const;
    String GetDisplayPath();

    // The display path of the node behind an entry of this node; empty if there is none. May load.
    String GetEntryDisplayPath(EntryIterator iterator, const String& parentDisplayPath);

    // --- Loading ---

    // Reads a resource file into the tree. With `asChild` the document element becomes a child of this node or merges
    // into one of the same name; otherwise it stands for this node. `node`, if given, gets the node of the document
    // element, or null. 0, or 0x80004005 if the file can't be opened or isn't well formed: what was read before the
    // fault stays, and a report stands in "XMLParseErrors". Changes are delivered in one go at the end.
    // `path` is in code page 0.
    int32_t LoadResourceFile(const NarrowString& path, bool asChild, ResTreeNode** node);

    // The same from text.
    int32_t LoadResourceText(const String& text, bool asChild, ResTreeNode** node);

    // Appends a report to "XMLParseErrors": where `stack` stands, what libexpat says or `message` instead, and the
    // text around. In place, so many reports take time in proportion to their text.
    void ReportParseError(const ParseStack& stack, const NarrowString* fileName, const String* message);

    // If the entry ":DeferredLoadPath" is there, removes it and loads the files that it names into this node. False
    // if at least one was read. Failures are silent, but for the reports of a file that isn't well formed.
    bool EnsureDeferredLoaded();

    // Expands "#{name}" in all texts of the subtree, after deferred loads. Takes no time for a subtree without "#{".
    void ApplyParameters(const Parameters& parameters);

    // ApplyParameters with "name" and, unless `variable` is empty, the loop variable.
    void ApplyInstance(std::u16string_view instanceName, std::u16string_view variable, int32_t index);

  private:
    friend class ChangeDispatch;
    friend class ElementReader;
    friend class ReleaseScope;
    friend class ReservationWalk;
    static constexpr HashedKey deferredPathKey{u":DeferredLoadPath"};
    struct Attachments;
    struct ExpansionWalk;
    struct MergeWalk;

    Attachments& GetAttachments();
    Added Store(EntryPosition position, NodeEntry* entry, uint32_t change, bool holdsVariables);
    void RaiseTextChange(const NodeEntry& entry);
    EntryPosition PositionBefore(const String* before);
    EntryPosition PlaceInFront(std::u16string_view key) const;
    // AddTextEntry or AddLinkEntry, for who knows whether there is "#{" in the text.
    Added AddText(HashedKey key, std::u16string_view text, EntryKind kind, uint32_t change, const String* before,
                  bool holdsVariables);
    Added AddChildAt(EntryPosition position, HashedKey hashed, NameAndType&& childTexts, bool childOrdered,
                     ResTreeNode*& child);
    Added ReplaceChild(bool unconditional, NameAndType&& childTexts, uint8_t keyHash, bool childOrdered,
                       ResTreeNode*& child, const String* before);
    Added MakeChildAt(EntryPosition position, uint8_t keyHash, NameAndType&& childTexts, bool childOrdered,
                      ResTreeNode*& child);
    static bool IsChildOfKind(const NodeEntry& entry, std::u16string_view entryType, bool entryOrdered);
    ResTreeNode* PrepareClone(EntryPosition position, HashedKey key, ResTreeNode& source, bool overwrite,
                              NodeEntry*& entry);

    bool MayExpandWhileMerging(const ResTreeNode& source) const;

    void FinishRemoval(NodeEntry* entry);
    std::vector<NodeEntry*> ChildEntriesInRemovalOrder() const;
    void RetireDescendants();
    bool StillHolds(const NodeEntry* entry) const;
    void TearDown() noexcept;
    void EndQuietly() noexcept;
    void ReleaseLostEntries();
    void ReleaseObservers();
    static void ReleaseNode(ResTreeNode* node) noexcept;
    static void DestroySubtree(ResTreeNode* top) noexcept;

    ReservationList& MakeReservations();
    ReservationList* OwnReservations() const;
    void MirrorReservations();
    template <typename Undo>
    void RefreshReservations(Undo undo);
    template <typename Visit>
    static void VisitWithDependants(ResTreeNode& top, Visit visit);

    // False if there is nobody to tell of a change, now or when delivery is held back no longer.
    bool MayBeHeard() const { return attachments || suspendCount != 0; }
    void RaiseObserved(uint32_t changes);
    bool Register(ResTreeNodeChangeObserver* observer, uint32_t mask, int32_t context, ResTreeNode* chained);
    bool Unregister(ResTreeNodeChangeObserver* observer, int32_t context);
    bool WatchAncestors();
    bool WatchDependants();
    static bool RemoveRecords(ResTreeNode& node, ResTreeNodeChangeObserver* observer, int32_t context);
    static bool UnregisterAll(ResTreeNode& node, ResTreeNodeChangeObserver* observer, int32_t context);
    static void EndWatchesOf(ResTreeNode& top);
    void ForgetWatching() noexcept;
    static void EndWatch(ObserverRecord& record) noexcept;
    bool AnyActiveObserver(uint32_t mask) const;
    void LookUpAll(const std::vector<String>& paths, std::vector<ResTreeNode*>& list);

    int32_t LoadIncludedFile(const NarrowString& path, bool asChild, ResTreeNode** node, const LoadChain& includer);
    int32_t LoadFile(const NarrowString& path, bool asChild, ResTreeNode** node, const LoadChain& chain);
    void TakeOrder(bool ordered);
    // Changes name and type, and not the key of the node's entry.
    void TakeTexts(NameAndType&& newTexts);
    void OwnKeyInParent();
    // Have to hear of each entry that comes in, and of each new key. A node above one with deferred contents knows of
    // them, so that who copies need not look for them.
    void NoteKey(const NodeEntry& entry) {
        if (deferredPathKey.MayEqual(entry.KeyHash())) {
            NoteUnusualKey(entry);
        }
    }
    void NoteUnusualKey(const NodeEntry& entry);
    void NoteDeferredContents();

    // "#{" may stand in the text of `entry`, or below it; null stands for any entry. Has to be called for each text
    // that has one, as long as it stands in this node. Mostly one test.
    void NoteVariables(const NodeEntry* entry) noexcept;
    const NodeEntry* EntryOfChild(const ResTreeNode& child) const noexcept;
    bool HasDeferredContents() const;
    bool TakeDeferredPaths(std::vector<String>& paths);

    NameAndType texts;
    ResTreeNode* parent;  // Null for a root and a detached clone.
    [[no_unique_address]] EntryList entries;
    // In the byte that the list leaves free at its end:
    bool isDefunct : 1 = false;                // Torn down; only the memory is left (ReleaseScope).
    bool isKept : 1 = false;                   // Has left its tree, whole or torn down, and is kept by a ReleaseScope.
    bool mayBeDeferred : 1 = false;            // Here or below there is, or has been, an entry ":DeferredLoadPath".
    bool mayHoldVariables : 1 = false;         // Here or below "#{" may stand in a text.
    std::unique_ptr<Attachments> attachments;  // What few nodes have: a type table, observers.
    uint32_t pendingChanges = 0;               // Raised and not yet delivered: ChangeFlags, and what a host adds.
    uint32_t suspendCount = 0;                 // Nonzero while delivery is held back.
};

}  // namespace zkhw
