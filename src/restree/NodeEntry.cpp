#include "restree/NodeEntry.h"

#include <new>
#include <utility>

#include "qn/dsc/osdep/TaskMemory.h"
#include "restree/HashedKey.h"

namespace zkhw {

namespace {

void* Allocate(size_t size) {
    void* memory = qn::dsc::osdep::TaskMemAlloc(size);
    if (memory == nullptr) {
        throw std::bad_alloc();
    }
    return memory;
}

}  // namespace

NodeEntry* NodeEntry::MakeText(String&& key, EntryKind kind, String&& text) {
    const uint8_t keyHash = HashKey(key.View());
    return MakeText(std::move(key), keyHash, kind, std::move(text));
}

NodeEntry* NodeEntry::MakeText(String&& key, uint8_t keyHash, EntryKind kind, String&& text) {
    // Both shapes fill a size class: any further field costs a tree 8 bytes an entry.
    static_assert(sizeof(void*) != 8 || (sizeof(TextShape) == 56 && sizeof(ChildShape) == 24));
    return new (Allocate(sizeof(TextShape))) TextShape(std::move(key), keyHash, kind, std::move(text));
}

NodeEntry* NodeEntry::CopyText(const NodeEntry& source, String&& text) {
    return MakeText(String(source.Key()), source.keyHash, source.kind, std::move(text));
}

NodeEntry* NodeEntry::MakeChild(const String& name, uint8_t keyHash, ResTreeNode* child) {
    return new (Allocate(sizeof(ChildShape))) ChildShape(&name, keyHash, Shape::Child, child);
}

NodeEntry* NodeEntry::MakeChild(String&& key, ResTreeNode* child) {
    const uint8_t keyHash = HashKey(key.View());
    NodeEntry* entry = MakeChild(key, keyHash, child);
    try {
        static_cast<ChildShape*>(entry)->key = new String(std::move(key));
    } catch (...) {
        Release(entry);
        throw;
    }
    entry->shape = Shape::KeyedChild;
    return entry;
}

NodeEntry::ChildShape::~ChildShape() {
    if (shape == Shape::KeyedChild) {
        delete key;
    }
}

void NodeEntry::Release(NodeEntry* entry) noexcept {
    if (entry->shape == Shape::Text) {
        static_cast<TextShape*>(entry)->~TextShape();
    } else {
        static_cast<ChildShape*>(entry)->~ChildShape();
    }
    qn::dsc::osdep::TaskMemFree(entry);
}

ResTreeNode* NodeEntry::TakeChild() {
    kind = EmptyEntry;
    return std::exchange(static_cast<ChildShape*>(this)->child, nullptr);
}

void NodeEntry::OwnKey() {
    if (shape == Shape::Child) {
        auto& entry = static_cast<ChildShape&>(*this);
        entry.key = new String(*entry.key);
        shape = Shape::KeyedChild;
    }
}

void NodeEntry::SwapKey(String& key, uint8_t hash) noexcept {
    // An entry that owns its key made it as one that may change.
    const_cast<String&>(Key()).Swap(key);
    keyHash = hash;
}

void NodeEntry::ReleaseText() {
    kind = EmptyEntry;
    static_cast<TextShape*>(this)->text.Erase(0, String::npos, false);
}

}  // namespace zkhw
