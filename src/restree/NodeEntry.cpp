#include "restree/NodeEntry.h"

#include <memory>
#include <new>
#include <utility>

#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/TaskMemory.h"

namespace zkhw {

namespace {

void* Allocate(size_t size) {
    void* memory = qn::dsc::osdep::TaskMemAlloc(size);
    if (memory == nullptr) {
        qn::dsc::exception::ThrowBadAllocation();
    }
    return memory;
}

}  // namespace

// --- Texts and links ---

NodeEntry* NodeEntry::MakeText(HashedKey key, EntryKind kind, std::u16string_view text) {
    static_assert(sizeof(void*) != 8 ||
                  (sizeof(TextShape) == sizeof(NodeEntry) + sizeof(TextPair) && sizeof(ChildShape) == 24));
    const size_t size = sizeof(NodeEntry) + TextPair::SizeFor(key.text, text);
    return new (Allocate(size)) TextShape(key, kind, text);
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
        String& own = entry.strings->text;
        if (text.data() == own.CStr()) {
            // Assign would leave all of it.
            own.Erase(static_cast<uint32_t>(text.size()), String::npos, false);
        } else {
            own.Assign(text);
        }
    } else if (!entry.packed.AssignSecond(text)) {
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
        entry.packed.AssignSecond({});
    }
}

// --- Children ---

NodeEntry* NodeEntry::MakeChild(const NameAndType& texts, uint8_t keyHash, ResTreeNode* child) {
    return new (Allocate(sizeof(ChildShape))) ChildShape(&texts, keyHash, child);
}

NodeEntry* NodeEntry::MakeChild(String&& key, ResTreeNode* child) {
    auto ownKey = std::make_unique<String>(String::WithoutBuffer());
    auto* entry = new (Allocate(sizeof(ChildShape))) ChildShape(nullptr, HashKey(key.View()), child);
    ownKey->Swap(key);
    entry->ownKey = ownKey.release();
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
        entry.ownKey = new String(entry.texts->Name());
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
