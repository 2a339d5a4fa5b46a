#include "restree/NodeEntry.h"

#include <cstring>
#include <memory>
#include <new>
#include <utility>

#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/TaskMemory.h"

namespace zkhw {

namespace {

constexpr const char* moduleName = "restree/NodeEntry";

void* Allocate(size_t size) {
    void* memory = qn::dsc::osdep::TaskMemAlloc(size);
    if (memory == nullptr) {
        throw std::bad_alloc();
    }
    return memory;
}

void CopyUnits(char16_t* target, std::u16string_view units) {
    if (!units.empty()) {
        std::memmove(target, units.data(), units.size() * sizeof(char16_t));
    }
}

}  // namespace

// --- Texts and links ---

NodeEntry::TextShape::TextShape(HashedKey key, EntryKind kind, std::u16string_view text)
    : NodeEntry(key.hash, kind, Shape::Packed),
      lengths{static_cast<uint32_t>(key.text.size()), static_cast<uint32_t>(text.size())} {
    CopyUnits(Units(), key.text);
    CopyUnits(Units() + key.text.size(), text);
}

NodeEntry* NodeEntry::MakeText(HashedKey key, EntryKind kind, std::u16string_view text) {
    static_assert(sizeof(void*) != 8 || (sizeof(TextShape) == 16 && sizeof(ChildShape) == 24));
    if (key.text.size() > String::npos || text.size() > String::npos) [[unlikely]] {
        qn::dsc::exception::ThrowAt(qn::dsc::exception::OutOfRange(), moduleName, __LINE__);
    }
    return new (Allocate(TextShape::SizeFor(key.text.size(), text.size()))) TextShape(key, kind, text);
}

// Makes Strings of the key and of `text`, which need not be the entry's present one.
void NodeEntry::Unpack(std::u16string_view text) {
    auto strings = std::make_unique<TextShape::Strings>(TextShape::Strings{String(Key()), String(text)});
    static_cast<TextShape*>(this)->strings = strings.release();
    shape = Shape::Unpacked;
}

void NodeEntry::SetText(std::u16string_view text) {
    auto& entry = static_cast<TextShape&>(*this);
    if (shape == Shape::Unpacked) {
        entry.strings->text.Assign(text);
    } else if (text.size() <= entry.lengths.text) {
        CopyUnits(entry.Units() + entry.lengths.key, text);
        entry.lengths.text = static_cast<uint32_t>(text.size());
    } else {
        Unpack(text);
    }
    textMarked = false;
}

String& NodeEntry::EditText() {
    if (shape == Shape::Packed) {
        Unpack(Payload());
    }
    textMarked = false;
    return static_cast<TextShape*>(this)->strings->text;
}

void NodeEntry::ReleaseText() {
    kind = EmptyEntry;
    auto& entry = static_cast<TextShape&>(*this);
    if (shape == Shape::Unpacked) {
        entry.strings->text.Erase(0, String::npos, false);
    } else {
        entry.lengths.text = 0;
    }
}

// --- Children ---

NodeEntry* NodeEntry::MakeChild(const String& name, uint8_t keyHash, ResTreeNode* child) {
    return new (Allocate(sizeof(ChildShape))) ChildShape(&name, keyHash, child);
}

NodeEntry* NodeEntry::MakeChild(String&& key, ResTreeNode* child) {
    const uint8_t keyHash = HashKey(key.View());
    NodeEntry* entry = MakeChild(key, keyHash, child);
    try {
        static_cast<ChildShape*>(entry)->ownKey = new String(std::move(key));
    } catch (...) {
        Release(entry);
        throw;
    }
    entry->shape = Shape::KeyedChild;
    return entry;
}

ResTreeNode* NodeEntry::TakeChild() {
    kind = EmptyEntry;
    return std::exchange(static_cast<ChildShape*>(this)->child, nullptr);
}

// --- Both ---

void NodeEntry::OwnKey() {
    if (shape == Shape::Packed) {
        Unpack(Payload());
    } else if (shape == Shape::Child) {
        auto& entry = static_cast<ChildShape&>(*this);
        entry.ownKey = new String(*entry.name);
        shape = Shape::KeyedChild;
    }
}

void NodeEntry::SwapKey(String& key, uint8_t hash) noexcept {
    if (shape == Shape::Unpacked) {
        static_cast<TextShape*>(this)->strings->key.Swap(key);
    } else {
        static_cast<ChildShape*>(this)->ownKey->Swap(key);
    }
    keyHash = hash;
}

void NodeEntry::Release(NodeEntry* entry) noexcept {
    if (entry->shape == Shape::Unpacked) {
        delete static_cast<TextShape*>(entry)->strings;
    } else if (entry->shape == Shape::KeyedChild) {
        delete static_cast<ChildShape*>(entry)->ownKey;
    }
    qn::dsc::osdep::TaskMemFree(entry);
}

}  // namespace zkhw
