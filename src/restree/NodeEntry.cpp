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
    static_assert(sizeof(void*) != 8 || (sizeof(TextShape) == 56 && sizeof(ChildShape) == 40));
    return new (Allocate(sizeof(TextShape))) TextShape(std::move(key), keyHash, kind, std::move(text));
}

NodeEntry* NodeEntry::CopyText(const NodeEntry& source, String&& text) {
    return MakeText(String(source.key), source.keyHash, source.kind, std::move(text));
}

NodeEntry* NodeEntry::MakeChild(String&& key, ResTreeNode* child) {
    const uint8_t keyHash = HashKey(key.View());
    return MakeChild(std::move(key), keyHash, child);
}

NodeEntry* NodeEntry::MakeChild(String&& key, uint8_t keyHash, ResTreeNode* child) {
    return new (Allocate(sizeof(ChildShape))) ChildShape(std::move(key), keyHash, child);
}

void NodeEntry::Release(NodeEntry* entry) noexcept {
    if (entry->textShape) {
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

void NodeEntry::ReleaseText() {
    kind = EmptyEntry;
    static_cast<TextShape*>(this)->text.Erase(0, String::npos, false);
}

}  // namespace zkhw
