#pragma once

// The entries of a long ordered list sorted by key, equal keys in the order of the list, so that the first entry of
// a key is found without a walk.

#include <string_view>

#include "restree/EntryPieces.h"

namespace zkhw {

class OrderedKeyIndex {
  public:
    // Indexes the whole of `list`, which must outlive the index. Throws bad_alloc.
    explicit OrderedKeyIndex(const EntryPieces& list);

    // The first entry of this key, or null.
    NodeEntry* Find(std::u16string_view key) const;

    // `entry` has just been put into the list. `atEnd`: nothing stands behind it there. Throws bad_alloc.
    void Add(NodeEntry* entry, bool atEnd);

    // `entry` is about to leave the list, or to change its key.
    void Remove(const NodeEntry* entry) noexcept;

  private:
    bool StandsBefore(const NodeEntry& left, const NodeEntry& right) const;

    const EntryPieces& list;
    EntryPieces sorted{false};
};

}  // namespace zkhw
