#pragma once

// One named entry of a node: a text, a child node or a link. A NodeEntry lives on the heap, at one place from
// its making to its release, so a pointer to it stays good while its neighbours come and go.
// The entry owns its payload.

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string_view>

#include "qn/dsc/StringBase.h"
#include "restree/HashedKey.h"
#include "restree/NameAndType.h"
#include "restree/TextPair.h"

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
    // A text or link entry. Throws bad_alloc, and OutOfRange for a key or a text that no String can hold.
    static NodeEntry* MakeText(HashedKey key, EntryKind kind, std::u16string_view text);

    // A child entry that takes `child`, whose name in `texts` is its key, and which keeps that name until it goes, or
    // somebody calls OwnKey. Throws bad_alloc; then `child` is still the caller's.
    static NodeEntry* MakeChild(const NameAndType& texts, uint8_t keyHash, ResTreeNode* child);
    // The same with a key that isn't the name of `child`. Throws bad_alloc; then `key` is as it was, too.
    static NodeEntry* MakeChild(String&& key, ResTreeNode* child);

    // Frees the entry. A child must have been taken out with TakeChild.
    static void Release(NodeEntry* entry) noexcept;

    NodeEntry(const NodeEntry&) = delete;
    NodeEntry& operator=(const NodeEntry&) = delete;

    // Good until the entry gets another key.
    inline std::u16string_view Key() const;
    uint8_t KeyHash() const { return keyHash; }
    EntryKind Kind() const { return kind; }
    bool IsText() const { return kind == TextEntry || kind == LocalizedTextEntry; }

    // The value of a text entry of either kind; none for any other. Good until the text or the key is changed.
    std::optional<std::u16string_view> Text() const { return IsText() ? std::optional(Payload()) : std::nullopt; }

    // Assigns the text of a text entry; `text` may be a part of the entry's own. Throws bad_alloc, and OutOfRange for
    // a text that no String can hold; then nothing has changed. A node has to hear of what is written into its texts
    // (ResTreeNode::NoteVariables); the same holds for EditText.
    void SetText(std::u16string_view text);

    // The text of a text entry in a form that can be changed in place, and grows in linear time. It costs memory, so
    // it is meant for texts that are written piece by piece. Throws bad_alloc. Good as long as Text.
    String& EditText();

    // A mark on the text as it stands: it is gone as soon as the text is assigned, or asked for by EditText.
    void MarkText() { textMarked = true; }
    bool IsTextMarked() const { return textMarked; }

    // The path of a link; none for any other kind. Good as long as Text.
    std::optional<std::u16string_view> LinkPath() const {
        return kind == LinkEntry ? std::optional(Payload()) : std::nullopt;
    }

    // The node of a child entry; null for any other kind. Owned by the entry.
    ResTreeNode* Child() const { return kind == ChildEntry ? ChildPayload() : nullptr; }

    // Turns a text entry into one of the other text kind.
    void SetTextKind(EntryKind textKind) { kind = textKind; }

    // Gives the child to the caller and leaves the entry empty. Its key lives as long as the child, unless it has one
    // of its own.
    ResTreeNode* TakeChild();

    // Gives the entry a key that can be changed, equal to the one that it has. Throws bad_alloc.
    void OwnKey();

    // Leaves a text or link entry empty.
    void ReleaseText();

  private:
    friend class EntryList;
    friend class EntryPieces;

    // What stands behind the common head; the kind may have become EmptyEntry since.
    enum class Shape : uint8_t {
        Packed,      // Key and text in the entry's own block, as nearly always: most are never changed.
        Unpacked,    // Key and text as Strings.
        Child,       // The key is the child's name, as nearly always: a node's name changes by a renaming alone.
        KeyedChild,  // The key is the entry's.
    };

    struct TextShape;
    struct ChildShape;

    NodeEntry(uint8_t keyHash, EntryKind kind, Shape shape) : keyHash(keyHash), kind(kind), shape(shape) {}
    ~NodeEntry() = default;

    inline std::u16string_view Payload() const;
    inline ResTreeNode* ChildPayload() const;

    void Unpack(std::u16string_view text);

    // Swaps the key for `key`. Only behind OwnKey.
    void SwapKey(String& key, uint8_t hash) noexcept;

    uint32_t pieceNumber = 0;  // Of the piece of a long list that holds the entry (EntryPieces.h); 0 in a short list.
    uint8_t keyHash;           // HashKey of the key.
    EntryKind kind;
    Shape shape;
    bool textMarked = false;
};

struct NodeEntry::TextShape : NodeEntry {
    struct Strings {
        String key;
        String text;
    };

    TextShape(HashedKey key, EntryKind kind, std::u16string_view text)
        : NodeEntry(key.hash, kind, Shape::Packed), packed(key.text, text) {}

    union {
        TextPair packed;   // The last field: the texts stand behind it.
        Strings* strings;  // Of an Unpacked one.
    };
};

struct NodeEntry::ChildShape : NodeEntry {
    ChildShape(const NameAndType* texts, uint8_t keyHash, ResTreeNode* child)
        : NodeEntry(keyHash, ChildEntry, Shape::Child), child(child), texts(texts) {}

    ResTreeNode* child;
    union {
        const NameAndType* texts;
        String* ownKey;  // Of a KeyedChild.
    };
};

inline std::u16string_view NodeEntry::Key() const {
    if (shape == Shape::Packed) {
        return static_cast<const TextShape*>(this)->packed.First();
    }
    if (shape == Shape::Unpacked) {
        return static_cast<const TextShape*>(this)->strings->key.View();
    }
    const auto& entry = static_cast<const ChildShape&>(*this);
    return shape == Shape::Child ? entry.texts->Name() : entry.ownKey->View();
}

inline std::u16string_view NodeEntry::Payload() const {
    const auto& entry = static_cast<const TextShape&>(*this);
    return shape == Shape::Packed ? entry.packed.Second() : entry.strings->text.View();
}

inline ResTreeNode* NodeEntry::ChildPayload() const {
    return static_cast<const ChildShape*>(this)->child;
}

}  // namespace zkhw
