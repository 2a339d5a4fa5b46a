#pragma once

// A stack for a walk over levels of a tree: any depth, and no memory from the heap for the few levels that most walks
// have.

#include <array>
#include <cstddef>
#include <memory_resource>
#include <utility>
#include <vector>

namespace zkhw {

template <typename Level>
class LevelStack {
  public:
    LevelStack() { levels.reserve(levelsInPlace); }
    LevelStack(const LevelStack&) = delete;
    LevelStack& operator=(const LevelStack&) = delete;

    bool IsEmpty() const { return levels.empty(); }

    // Good until the next Push or Pop.
    Level& Top() { return levels.back(); }

    // Throws bad_alloc; then nothing has changed.
    void Push(Level&& level) { levels.push_back(std::move(level)); }
    void Pop() { levels.pop_back(); }

  private:
    static constexpr size_t levelsInPlace = 6;

    alignas(Level) std::array<std::byte, levelsInPlace * sizeof(Level)> place;
    std::pmr::monotonic_buffer_resource memory{place.data(), place.size()};
    std::pmr::vector<Level> levels{&memory};
};

}  // namespace zkhw
