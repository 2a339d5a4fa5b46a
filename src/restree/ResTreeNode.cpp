#include "restree/ResTreeNode.h"

#include <new>
#include <utility>

#include "qn/dsc/FindUnit.h"
#include "qn/dsc/osdep/Compare.h"
#include "qn/dsc/osdep/TaskMemory.h"
#include "restree/NodeAttachments.h"
#include "restree/Parameters.h"
#include "restree/ReleaseScope.h"
#include "restree/TextList.h"

namespace zkhw {

using qn::dsc::osdep::Compare;

namespace {

constexpr std::u16string_view displayNameKey = u"DisplayName";
constexpr std::u16string_view protocolsKey = u"Protocols";

struct TypeRelation {
    std::u16string_view type;
    std::u16string_view base;
};

constexpr TypeRelation builtInRelations[] = {
    {u"Resource", u""},           {u"IOResource", u"Resource"},    {u"ResourceList", u""},
    {u"Target", u"ResourceList"}, {u"Connector", u"ResourceList"}, {u"Module", u"Resource"},
    {u"Module", u"ResourceList"},
};

}  // namespace

ResTreeNode::ResTreeNode(std::u16string_view name, std::u16string_view type, bool ordered)
    : texts(name, type), parent(nullptr), entries(ordered) {
    auto table = std::make_unique<TypeTable>();
    for (const TypeRelation& relation : builtInRelations) {
        table->AddTypeRelation(relation.type, relation.base);
    }
    GetAttachments().typeTable = std::move(table);
}

ResTreeNode::ResTreeNode(NameAndType&& texts, bool ordered, ResTreeNode* parent)
    : texts(std::move(texts)), parent(parent), entries(ordered) {}

ResTreeNode::ResTreeNode(std::u16string_view name, std::u16string_view type, bool ordered, const TypeTable* sourceTable)
    : texts(name, type), parent(nullptr), entries(ordered) {
    if (sourceTable != nullptr) {
        GetAttachments().typeTable = sourceTable->Copy();
    }
}

// Any further field costs a tree 8 bytes a node.
static_assert(sizeof(void*) != 8 || sizeof(ResTreeNode) == 56);

void* ResTreeNode::operator new(size_t size) {
    if (void* memory = qn::dsc::osdep::TaskMemAlloc(size)) {
        return memory;
    }
    throw std::bad_alloc();
}

void* ResTreeNode::operator new(size_t size, const std::nothrow_t&) noexcept {
    return qn::dsc::osdep::TaskMemAlloc(size);
}

void ResTreeNode::operator delete(void* memory) noexcept {
    qn::dsc::osdep::TaskMemFree(memory);
}

void ResTreeNode::operator delete(void* memory, const std::nothrow_t&) noexcept {
    qn::dsc::osdep::TaskMemFree(memory);
}

ResTreeNode::Attachments& ResTreeNode::GetAttachments() {
    if (!attachments) {
        attachments = std::make_unique<Attachments>();
    }
    return *attachments;
}

// --- Reading ---

EntryIterator ResTreeNode::BeginLoaded() {
    EnsureDeferredLoaded();
    return Begin();
}

EntryIterator ResTreeNode::FindEntryRaw(std::u16string_view key) {
    const NodeEntry* entry = FindRaw(key);
    return entry == nullptr ? End() : PositionOf(entry);
}

EntryIterator ResTreeNode::FindEntry(std::u16string_view key) {
    const NodeEntry* entry = Find(key);
    return entry == nullptr ? End() : PositionOf(entry);
}

NodeEntry* ResTreeNode::Find(HashedKey key) {
    if (NodeEntry* entry = FindRaw(key)) {
        return entry;
    }
    if (!HasDeferredContents()) {
        return nullptr;
    }
    // The load may remove this very node.
    const ReleaseScope scope;
    EnsureDeferredLoaded();
    return FindRaw(key);
}

std::optional<std::u16string_view> ResTreeNode::GetProperty(HashedKey key) {
    const NodeEntry* entry = Find(key);
    return entry == nullptr ? std::nullopt : entry->Text();
}

std::u16string_view ResTreeNode::GetPropertyOrEmpty(HashedKey key) {
    return GetProperty(key).value_or(std::u16string_view());
}

ResTreeNode* ResTreeNode::ResolveEntry(EntryIterator iterator) {
    return iterator.IsEnd() ? nullptr : ResolveEntry(&*iterator);
}

ResTreeNode* ResTreeNode::ResolveEntry(NodeEntry* entry) {
    if (entry == nullptr) {
        return nullptr;
    }
    if (const auto link = entry->LinkPath()) {
        // A load on the way may change the entry.
        const String path(*link);
        return Lookup(path.View(), nullptr);
    }
    return entry->Child();
}

// --- Changing ---

bool ResTreeNode::SetProperty(std::u16string_view key, std::u16string_view value) {
    if (NodeEntry* entry = Find(key)) {
        return SetEntryText(entry, value);
    }
    AddTextEntry(key, value, TextEntry);
    return true;
}

bool ResTreeNode::SetEntryText(EntryIterator iterator, std::u16string_view value) {
    return !iterator.IsEnd() && SetEntryText(&*iterator, value);
}

bool ResTreeNode::SetEntryText(NodeEntry* entry, std::u16string_view value) {
    if (entry == nullptr || !entry->IsText()) {
        return false;
    }
    entry->SetText(value);
    if (FindVariable(value) != std::u16string_view::npos) {
        NoteVariables(entry);
    }
    RaiseTextChange(*entry);
    return true;
}

void ResTreeNode::RaiseTextChange(const NodeEntry& entry) {
    if (!MayBeHeard() && (parent == nullptr || !parent->MayBeHeard())) {
        return;
    }
    const bool isDisplayName = Compare(entry.Key(), displayNameKey) == 0;
    const ReleaseScope scope;
    Raise(PropertyChanged);
    if (isDisplayName) {
        Raise(NodeNameChanged);
        if (parent != nullptr) {
            parent->Raise(ChildNameChanged);
        }
    }
}

EntryPosition ResTreeNode::PositionBefore(const String* before) {
    if (before == nullptr) {
        return EntryList::End();
    }
    const NodeEntry* entry = Find(before->View());
    return entry == nullptr ? EntryList::End() : entries.Locate(entry);
}

ResTreeNode::Added ResTreeNode::Store(EntryPosition position, NodeEntry* entry, uint32_t change, bool holdsVariables) {
    try {
        entries.Insert(position, entry);
    } catch (...) {
        delete entry->Child();
        NodeEntry::Release(entry);
        throw;
    }
    NoteKey(*entry);
    if (holdsVariables) {
        NoteVariables(entry);
    }
    Raise(change);
    return {entry, true};
}

ResTreeNode::Added ResTreeNode::AddTextEntry(std::u16string_view key, std::u16string_view value, EntryKind kind,
                                             const String* before) {
    const bool holdsVariables = FindVariable(value) != std::u16string_view::npos;
    return AddText(key, value, kind, PropertyAdded, before, holdsVariables);
}

ResTreeNode::Added ResTreeNode::AddLinkEntry(std::u16string_view key, std::u16string_view path, const String* before) {
    return AddText(key, path, LinkEntry, ChildAdded, before, false);
}

ResTreeNode::Added ResTreeNode::AddText(HashedKey key, std::u16string_view text, EntryKind kind, uint32_t change,
                                        const String* before, bool holdsVariables) {
    EntryPosition position = PositionBefore(before);
    if (!IsOrdered()) {
        const EntryList::Place place = entries.FindPlace(key);
        if (place.entry != nullptr) {
            return {place.entry, false};
        }
        position = place.position;
    }
    return Store(position, NodeEntry::MakeText(key, kind, text), change, holdsVariables);
}

ResTreeNode::Added ResTreeNode::AddChildEntry(std::u16string_view key, std::u16string_view childType, bool childOrdered,
                                              ResTreeNode*& child, const String* before) {
    const EntryPosition position = PositionBefore(before);
    return AddChildAt(position, key, NameAndType(key, childType), childOrdered, child);
}

ResTreeNode::Added ResTreeNode::AddChildAt(EntryPosition position, HashedKey key, NameAndType&& childTexts,
                                           bool childOrdered, ResTreeNode*& child) {
    if (!IsOrdered()) {
        const EntryList::Place place = entries.FindPlace(key);
        if (place.entry != nullptr) {
            child = place.entry->Child();
            return {place.entry, false};
        }
        position = place.position;
    }
    return MakeChildAt(position, key.hash, std::move(childTexts), childOrdered, child);
}

ResTreeNode::Added ResTreeNode::MakeChildAt(EntryPosition position, uint8_t keyHash, NameAndType&& childTexts,
                                            bool childOrdered, ResTreeNode*& child) {
    auto made = std::make_unique<ResTreeNode>(std::move(childTexts), childOrdered, this);
    NodeEntry* entry = NodeEntry::MakeChild(made->texts, keyHash, made.get());
    child = made.release();
    return Store(position, entry, ChildAdded, false);
}

// RemoveIfMismatched and AddChildEntry in one, with one search where one is enough.
ResTreeNode::Added ResTreeNode::ReplaceChild(bool unconditional, NameAndType&& childTexts, uint8_t keyHash,
                                             bool childOrdered, ResTreeNode*& child, const String* before) {
    const HashedKey key(childTexts.Name(), keyHash);
    if (unconditional || IsOrdered() || before != nullptr) {
        RemoveIfMismatched(unconditional, key, childTexts.Type(), childOrdered);
    } else {
        const EntryList::Place place = entries.FindPlace(key);
        if (place.entry == nullptr) {
            return MakeChildAt(place.position, keyHash, std::move(childTexts), childOrdered, child);
        }
        if (IsChildOfKind(*place.entry, childTexts.Type(), childOrdered)) {
            child = place.entry->Child();
            return {place.entry, false};
        }
        RemoveEntry(place.entry);
    }
    const EntryPosition position = PositionBefore(before);
    return AddChildAt(position, key, std::move(childTexts), childOrdered, child);
}

// Where an unordered node takes an entry with this key: in front of the one that has it, if there is one.
EntryPosition ResTreeNode::PlaceInFront(std::u16string_view key) const {
    const EntryList::Place place = entries.FindPlace(key);
    return place.entry == nullptr ? place.position : entries.Locate(place.entry);
}

EntryIterator ResTreeNode::InsertEntry(EntryIterator position, std::u16string_view key, EntryKind kind,
                                       std::u16string_view text) {
    const EntryPosition place = IsOrdered() ? position.Position() : PlaceInFront(key);
    NodeEntry* entry = NodeEntry::MakeText(key, kind, text);
    try {
        entries.Insert(place, entry);
    } catch (...) {
        NodeEntry::Release(entry);
        throw;
    }
    NoteKey(*entry);
    if (entry->IsText() && FindVariable(text) != std::u16string_view::npos) {
        NoteVariables(entry);
    }
    return {entries, entries.Locate(entry)};
}

EntryIterator ResTreeNode::InsertEntry(EntryIterator position, std::u16string_view key,
                                       std::unique_ptr<ResTreeNode> child) {
    const EntryPosition place = IsOrdered() ? position.Position() : PlaceInFront(key);
    NodeEntry* entry = qn::dsc::HasSameUnits(key, child->GetName())
                           ? NodeEntry::MakeChild(child->texts, HashKey(key), child.get())
                           : NodeEntry::MakeChild(String(key), child.get());
    try {
        entries.Insert(place, entry);
    } catch (...) {
        NodeEntry::Release(entry);
        throw;
    }
    child->parent = this;
    NoteKey(*entry);
    if (child->mayHoldVariables) {
        NoteVariables(entry);
    }
    if (child.release()->mayBeDeferred) {
        NoteDeferredContents();
    }
    return {entries, entries.Locate(entry)};
}

bool ResTreeNode::RenameEntry(std::u16string_view oldKey, std::u16string_view newKey) {
    NodeEntry* entry = Find(oldKey);
    if (entry == nullptr) {
        return false;
    }
    String key(newKey);
    entry->OwnKey();
    if (IsOrdered()) {
        entries.AssignKey(entry, std::move(key));
        NoteKey(*entry);
        return true;
    }
    std::vector<NodeEntry*>& lost = GetAttachments().lostEntries;
    lost.push_back(entry);
    entries.Detach(entries.Locate(entry));
    entries.AssignKey(entry, std::move(key));
    const EntryList::Place place = entries.FindPlace(newKey);
    if (place.entry != nullptr) {
        // Lost on purpose, with all that it holds: whoever cares tests first.
        return false;
    }
    entries.Insert(place.position, entry);
    lost.pop_back();
    NoteKey(*entry);
    if (mayHoldVariables) {
        entries.NoteVariables(entry);
    }
    return true;
}

bool ResTreeNode::Rename(std::u16string_view newName) {
    const ReleaseScope scope;
    NameAndType renamed(newName, GetType());
    if (parent != nullptr) {
        // Of equal names in an ordered node the first is renamed, which need not be that of this node.
        OwnKeyInParent();
        // A load on the way may rename the node.
        const String oldName(GetName());
        if (!parent->RenameEntry(oldName.View(), newName)) {
            return false;
        }
    }
    texts = std::move(renamed);
    Raise(NodeNameChanged);
    if (parent != nullptr) {
        parent->Raise(ChildNameChanged);
    }
    return true;
}

void ResTreeNode::TakeTexts(NameAndType&& newTexts) {
    if (parent != nullptr) {
        OwnKeyInParent();
    }
    texts = std::move(newTexts);
}

// Ahead of a change of the name that isn't one of the entry's key.
void ResTreeNode::OwnKeyInParent() {
    NodeEntry* own = parent->FindRaw(GetName());
    if (own == nullptr || own->Child() != this) {
        own = nullptr;
        parent->entries.VisitUnordered([&](NodeEntry* entry) { own = entry->Child() == this ? entry : own; });
    }
    if (own != nullptr) {
        own->OwnKey();
    }
}

void ResTreeNode::SetOrdered(bool ordered) {
    entries.Reset(ordered);
}

void ResTreeNode::RemoveIfMismatched(bool unconditional, HashedKey entryName, std::u16string_view entryType,
                                     bool entryOrdered) {
    if (unconditional) {
        RemoveEntryByName(entryName);
        return;
    }
    NodeEntry* entry = FindRaw(entryName);
    if (entry == nullptr) {
        return;
    }
    if (!IsChildOfKind(*entry, entryType, entryOrdered)) {
        RemoveEntry(entry);
    }
}

// Whether the entry is a child of just this type and order.
bool ResTreeNode::IsChildOfKind(const NodeEntry& entry, std::u16string_view entryType, bool entryOrdered) {
    const ResTreeNode* child = entry.Child();
    return child != nullptr && child->IsOrdered() == entryOrdered && Compare(child->GetType(), entryType) == 0;
}

// --- Types ---

TypeTable* ResTreeNode::GetTypeTable() const {
    return attachments ? attachments->typeTable.get() : nullptr;
}

const TypeTable* ResTreeNode::NearestTypeTable() const {
    for (const ResTreeNode* node = this; node != nullptr; node = node->parent) {
        if (const TypeTable* table = node->GetTypeTable()) {
            return table;
        }
    }
    return nullptr;
}

bool ResTreeNode::IsA(std::u16string_view typeName) const {
    if (Compare(typeName, GetType()) == 0) {
        return true;
    }
    const TypeTable* table = NearestTypeTable();
    const TypeRecord* record = table == nullptr ? nullptr : table->Find(GetType());
    return record != nullptr && record->IsA(typeName);
}

bool ResTreeNode::Supports(std::u16string_view text) {
    if (text.empty() || IsA(text)) {
        return true;
    }
    const std::u16string_view value = GetPropertyOrEmpty(protocolsKey);
    for (size_t hit = value.find(text); hit != std::u16string_view::npos; hit = value.find(text, hit + 1)) {
        const size_t end = hit + text.size();
        if ((hit == 0 || value[hit - 1] == u',') && (end == value.size() || value[end] == u',')) {
            return true;
        }
    }
    return false;
}

namespace {

void AppendBaseNames(const TypeRecord& record, std::vector<String>& list) {
    for (const TypeRecord* base : record.bases) {
        list.push_back(base->name);
        AppendBaseNames(*base, list);
    }
}

}  // namespace

void ResTreeNode::GetProtocols(std::vector<String>& list) {
    list.emplace_back(GetType());
    const TypeTable* table = NearestTypeTable();
    if (const TypeRecord* record = table == nullptr ? nullptr : table->Find(GetType())) {
        AppendBaseNames(*record, list);
    }
    SplitList(GetPropertyOrEmpty(protocolsKey), u',', list, true);
}

void ResTreeNode::MakeTypeTableLocal() {
    if (GetTypeTable() != nullptr) {
        return;
    }
    if (const TypeTable* table = NearestTypeTable()) {
        GetAttachments().typeTable = table->Copy();
    }
}

}  // namespace zkhw
