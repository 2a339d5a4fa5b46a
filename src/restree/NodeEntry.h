#pragma once

// One named entry of a node: a text, a child node or a link. A NodeEntry lives on the heap, at one place from
// its making to its release, so a pointer to it or to its text stays good while its neighbours come and go.
// The entry owns its payload.

#include <cstddef>
#include <cstdint>

#include "qn/dsc/StringBase.h"

namespace zkhw {

using qn::dsc::String;

class ResTreeNode;

enum EntryKind : uint8_t {
    EmptyEntry = 0,          // The payload has been released.
    TextEntry = 1,           // A plain property value.
    ChildEntry = 2,          // An owned child node.
    LinkEntry = 3,           // A path, looked up whenever the link is followed; the target is not owned.
    LocalizedTextEntry = 4,  // A property value; may hold a NUL and behind it the whole list of languages.
};

class NodeEntry {
  public:
    // A text or link entry. Both strings are moved from. Throws bad_alloc; then both are as they were. `keyHash` is
    // HashKey of the key, for who has it.
    static NodeEntry* MakeText(String&& key, EntryKind kind, String&& text);
    static NodeEntry* MakeText(String&& key, uint8_t keyHash, EntryKind kind, String&& text);

    // An entry of the key and the kind of `source`, a text or link entry, with another text. Throws bad_alloc; then
    // `text` is as it was.
    static NodeEntry* CopyText(const NodeEntry& source, String&& text);

    // A child entry that takes `child`, whose `name` is its key, and which keeps that name until it goes, or somebody
    // calls OwnKey. Throws bad_alloc; then `child` is still the caller's.
    static NodeEntry* MakeChild(const String& name, uint8_t keyHash, ResTreeNode* child);
    // The same with a key that isn't the name of `child`. Throws bad_alloc; then `key` is as it was, too.
    static NodeEntry* MakeChild(String&& key, ResTreeNode* child);

    // Frees the entry. A child must have been taken out with TakeChild.
    static void Release(NodeEntry* entry) noexcept;

    NodeEntry(const NodeEntry&) = delete;
    NodeEntry& operator=(const NodeEntry&) = delete;

    const String& Key() const { return shape == Shape::Text ? TextKey() : *ChildKey(); }
    uint8_t KeyHash() const { return keyHash; }
    EntryKind Kind() const { return kind; }
    bool IsText() const { return kind == TextEntry || kind == LocalizedTextEntry; }

    // The value of a text entry of either kind; null for any other.
    String* Text() {
        textMarked = false;
        return IsText() ? &Payload() : nullptr;
    }
    const String* Text() const { return IsText() ? &Payload() : nullptr; }

    // A mark on the text as it stands: it is gone as soon as the text is asked for in a form for writing.
    void MarkText() { textMarked = true; }
    bool IsTextMarked() const { return textMarked; }

    // The path of a link; null for any other kind.
    const String* LinkPath() const { return kind == LinkEntry ? &Payload() : nullptr; }

    // The node of a child entry; null for any other kind. Owned by the entry.
    ResTreeNode* Child() const { return kind == ChildEntry ? ChildPayload() : nullptr; }

    // Turns a text entry into one of the other text kind.
    void SetTextKind(EntryKind textKind) { kind = textKind; }

    // Gives the child to the caller and leaves the entry empty. Its key lives as long as the child, unless it has one
    // of its own.
    ResTreeNode* TakeChild();

    // Gives the entry a key of its own, equal to the one that it has, if that is the name of its child. Throws
    // bad_alloc.
    void OwnKey();

    // Frees the text of a text or link entry and leaves the entry empty.
    void ReleaseText();

  private:
    friend class EntryList;
    friend class EntryPieces;

    // What was allocated; the kind may have become EmptyEntry since.
    enum class Shape : uint8_t {
        Text,
        Child,       // The key is the child's name, as nearly always: a node's name changes by a renaming alone.
        KeyedChild,  // The key is the entry's.
    };

    // The shapes differ behind the common head, so that a child entry doesn't carry room for a text.
    struct TextShape;
    struct ChildShape;

    NodeEntry(uint8_t keyHash, EntryKind kind, Shape shape) : keyHash(keyHash), kind(kind), shape(shape) {}
    ~NodeEntry() = default;

    inline const String& TextKey() const;
    inline const String* ChildKey() const;
    inline String& Payload();
    inline const String& Payload() const;
    inline ResTreeNode* ChildPayload() const;

    // Swaps the key, which is the entry's own, for `key`.
    void SwapKey(String& key, uint8_t hash) noexcept;

    uint32_t pieceNumber = 0;  // Of the piece of a long list that holds the entry (EntryPieces.h); 0 in a short list.
    uint8_t keyHash;           // HashKey of the key.
    EntryKind kind;
    Shape shape;
    bool textMarked = false;
};

struct NodeEntry::TextShape : NodeEntry {
    TextShape(String&& key, uint8_t keyHash, EntryKind kind, String&& text)
        : NodeEntry(keyHash, kind, Shape::Text), key(static_cast<String&&>(key)), text(static_cast<String&&>(text)) {}
    String key;
    String text;
};

struct NodeEntry::ChildShape : NodeEntry {
    ChildShape(const String* key, uint8_t keyHash, Shape shape, ResTreeNode* child)
        : NodeEntry(keyHash, ChildEntry, shape), child(child), key(key) {}
    ~ChildShape();
    ChildShape(const ChildShape&) = delete;
    ChildShape& operator=(const ChildShape&) = delete;
    ResTreeNode* child;
    const String* key;
};

inline const String& NodeEntry::TextKey() const {
    return static_cast<const TextShape*>(this)->key;
}
inline const String* NodeEntry::ChildKey() const {
    return static_cast<const ChildShape*>(this)->key;
}
inline String& NodeEntry::Payload() {
    return static_cast<TextShape*>(this)->text;
}
inline const String& NodeEntry::Payload() const {
    return static_cast<const TextShape*>(this)->text;
}
inline ResTreeNode* NodeEntry::ChildPayload() const {
    return static_cast<const ChildShape*>(this)->child;
}

}  // namespace zkhw
