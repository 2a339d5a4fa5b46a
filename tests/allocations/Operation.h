#pragma once

// An operation of the boundary that is called over and over with one allocation of it failing, or all from one on, and
// what may come of that.

#include <functional>
#include <memory>
#include <ostream>
#include <string>
#include <vector>

#include "zkfpga/types.h"

namespace allocations {

// What stands in a list of outcomes for std::bad_alloc.
inline constexpr char thrown[] = "bad_alloc";

// A tree, or whatever the operation is about, in which it can be called any number of times.
class Scene {
  public:
    virtual ~Scene() = default;

    // What isn't the operation's own and is used up by a call.
    virtual void GetReady() {}
    // The call alone, with what it gives left in the scene. Nothing else happens while memory is short.
    virtual HRESULT Call() = 0;
    // What was given since the last time, each behind a blank, and as a host frees it: " [a, b] 3".
    virtual std::string Take() = 0;
    // All that an operation may change.
    virtual std::string State() = 0;
    // The part of it that reading the file doesn't change.
    virtual std::string Rest() = 0;
};

// Where the contents of the node stand before the first call: in the tree, or in a file that the node names.
enum class Contents { InMemory, InFile };

enum class Effect {
    None,       // A call leaves the state as it is, but for what it reads from a file.
    Whole,      // The state changes, or, where memory runs out, not at all.
    TakenBack,  // The same, as far as there is memory again for taking back what was done; otherwise as Stepwise.
    Stepwise,   // What was done before memory ran out stays. Another call does the rest.
    Lasting     // The same, but another call does all of it once more.
};

struct Operation {
    // As the headers have it, and after a comma what is particular about the call: "FindNode, with consumed".
    std::string name;
    std::function<std::unique_ptr<Scene>(Contents)> make;
    // The result and what is given where memory isn't short: "S_OK [a, b]".
    std::string answer;
    // What comes in its place: each of these does for some allocation, if the contents are in memory, and nothing else.
    std::vector<std::string> withoutMemory;
    Effect effect = Effect::None;
    // The answer of a call that reads the file first; empty: there is no file.
    std::string answerFromFile;
};

// For messages.
inline std::ostream& operator<<(std::ostream& stream, const Operation& operation) {
    return stream << operation.name;
}

std::vector<Operation> NodeOperations();
std::vector<Operation> TreeOperations();
std::vector<Operation> ExportOperations();

}  // namespace allocations
