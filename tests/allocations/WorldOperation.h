#pragma once

// Operations that are called in a World.

#include "allocations/Given.h"
#include "allocations/Operation.h"
#include "allocations/World.h"

namespace allocations {

using WorldCall = HRESULT (*)(World& world, Given& given);

// A line of a table. `prepare`, if any, makes the world what the call needs; the node's contents may be read by that.
struct WorldOperation {
    const char* name;
    WorldCall call;
    const char* answer;
    std::vector<std::string> withoutMemory;
    Effect effect = Effect::None;
    void (*prepare)(World& world) = nullptr;
    // Null: as `answer`.
    const char* answerFromFile = nullptr;
};

std::vector<Operation> OperationsOf(const std::vector<WorldOperation>& table);

// What operations give without memory for a text, an array or a node.
inline constexpr char noText[] = "E_OUTOFMEMORY null";
inline constexpr char noArray[] = "E_OUTOFMEMORY []";
inline constexpr char noNode[] = "E_OUTOFMEMORY null";
// Where they have cleared it before memory ran out.
inline constexpr char thrownNull[] = "bad_alloc null";
inline constexpr char thrownArray[] = "bad_alloc []";

}  // namespace allocations
