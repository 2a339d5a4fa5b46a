#pragma once

// A position in the entries of a node, in either form of the collection. Any insertion or removal on the node
// invalidates it, but stepping on from there still leads to an entry of the node or to its end.

#include <type_traits>

#include "restree/EntryList.h"

namespace zkhw {

template <typename Entry>
class BasicEntryIterator {
  public:
    BasicEntryIterator(const EntryList& list, EntryPosition position) : list(&list), position(position) {}

    bool IsEnd() const { return position.IsEnd(); }
    EntryPosition Position() const { return position; }

    std::u16string_view Key() const { return list->At(position)->Key(); }
    Entry& operator*() const { return *list->At(position); }
    Entry* operator->() const { return list->At(position); }
    BasicEntryIterator& operator++() {
        position = list->Next(position);
        return *this;
    }

    // Only iterators of one node compare in a meaningful way.
    friend bool operator==(const BasicEntryIterator& left, const BasicEntryIterator& right) {
        return left.position == right.position;
    }

  private:
    const EntryList* list;
    EntryPosition position;
};

using EntryIterator = BasicEntryIterator<NodeEntry>;
using ConstEntryIterator = BasicEntryIterator<const NodeEntry>;

}  // namespace zkhw
