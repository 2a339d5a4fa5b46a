#pragma once

// A walk over the entries of a list that may change between its steps: observers are called and files are loaded on
// the way. It goes on behind the entry it has given last, and where that has left the list, with what has moved up to
// its place. Only while a ReleaseScope stands, so that an entry that leaves keeps its memory.

#include "restree/EntryList.h"

namespace zkhw {

class EntryWalk {
  public:
    // The next entry of `list`, at each call the same list; null at the end, and the walk is over then.
    NodeEntry* Next(const EntryList& list) {
        position = last == nullptr ? list.Begin() : list.Following(position, last);
        last = position.IsEnd() ? nullptr : list.At(position);
        return last;
    }

  private:
    EntryPosition position;
    NodeEntry* last = nullptr;  // Stood at `position` when it was given; null before the first.
};

}  // namespace zkhw
