#pragma once

// The attributes and loop variables of the open elements by name, blind to letter case, so that a text deep down in a
// document needs no walk over all that is open above it.
//
// Nothing is gathered until somebody asks. From then on frames are taken in from the bottom up, and each leaves when
// what it holds may change: a frame that lies under another one doesn't change.

#include <map>
#include <set>
#include <string_view>
#include <vector>

#include "qn/dsc/StringBase.h"
#include "restree/AttributeList.h"

namespace zkhw {

struct ParseFrame;

class OpenAttributes {
  public:
    // The value of an attribute of a frame; `frame` is null for none.
    struct Place {
        const ParseFrame* frame = nullptr;
        AttributeList::Place place = AttributeList::nowhere;
    };

    // Takes in `frame` and the frames below it, as far as they are not in. Throws bad_alloc; then the whole stack is
    // fit only for being released.
    void Add(ParseFrame* frame);

    // Takes out a frame that is in, the last one that came in of those that are. Needs no memory: it is done on the way
    // out of a failure, too.
    void Remove(ParseFrame& frame) noexcept;

    // True if what is in has neither attributes nor loop variables.
    bool IsEmpty() const { return attributes.empty() && loopVariables.empty(); }

    // The attribute `name` of the outermost frame that has it; within a frame the first of equal names.
    Place Find(std::u16string_view name) const;

    bool IsLoopVariable(std::u16string_view name) const;

    // True if some attribute is neither a loop variable nor called `hidden`.
    bool HasAnyBut(std::u16string_view hidden) const;

  private:
    using Attributes = std::map<String, Place>;
    using LoopVariables = std::multiset<String>;

    // What was in before a frame came in.
    struct Mark {
        size_t attributes;
        size_t loopVariables;
    };

    Attributes attributes;
    LoopVariables loopVariables;  // One for each frame that has it.
    // In the order in which they came in; frames leave in the reverse order.
    std::vector<Attributes::iterator> enteredAttributes;
    std::vector<LoopVariables::iterator> enteredLoopVariables;
    std::vector<Mark> marks;  // One for each frame that is in.
};

}  // namespace zkhw
