#pragma once

// Task memory from size classes (SizeClass.h), with the contract of TaskMemory.h. For many small blocks that live long:
// a block has no header, and allocating or freeing one is a handful of instructions without a lock.
//
// Memory comes from the system in regions of 4 MB, aligned to their size, cut into spans of 32 KB; all blocks of a span
// are of one class, which a table at the head of the region tells from the block's address. Each thread has, for each
// class, a list of free blocks and a span from which new blocks are cut in ascending order, so that what is allocated
// together lies together and untouched pages stay unused. A freed block goes to the list of the thread that frees it.
// A list that grows long is handed over, whole, to a common store (FreeLists), from which any thread takes before it
// cuts a new span; at its end a thread hands over all its lists. Spans never change their class, and nothing is given
// back to the system. Blocks above the greatest class come from malloc.

// The operations stand in the header so that TaskMemory_pool.cpp takes them in without a further call.

#include <array>
#include <atomic>
#include <cstddef>
#include <cstdint>

#include "qn/dsc/osdep/AllocationFault.h"
#include "qn/dsc/osdep/SizeClass.h"

namespace qn::dsc::osdep {

class PoolAllocator {
  public:
    static void* Allocate(size_t size);
    static void* Reallocate(void* block, size_t size);
    static void Free(void* block);

  private:
    static constexpr uint32_t regionShift = 22;
    static constexpr size_t regionSize = size_t{1} << regionShift;
    static constexpr uint32_t spanShift = 15;
    static constexpr size_t spanSize = size_t{1} << spanShift;
    static constexpr size_t spansPerRegion = regionSize / spanSize;
    static constexpr size_t populateStep = 8 * spanSize;
    // User addresses have 47 bits.
    static constexpr uint32_t addressBits = 47;

    // What stands at the head of a region, in its first span: the class of each span.
    struct Region {
        std::array<uint8_t, spansPerRegion> spanClasses;
    };

    struct FreeBlock {
        FreeBlock* next;
    };

    // What a thread has of one class.
    struct ClassCache {
        FreeBlock* freeBlocks = nullptr;
        // The part of the present span that no block has been cut from yet.
        char* fresh = nullptr;
        char* freshEnd = nullptr;
        // How many more blocks may be freed before the list goes to the common store.
        int32_t room = 0;
        // Of the class; set with the first span.
        uint32_t blockSize = 0;
    };

    struct ThreadCache {
        std::array<ClassCache, sizeClassCount> classes;
        // Of a cache without a thread: the next one.
        ThreadCache* nextIdle = nullptr;
    };

    class FreeLists;
    struct Store;
    struct ThreadEnd;

    static Region* RegionOf(const void* block) {
        return reinterpret_cast<Region*>(reinterpret_cast<uintptr_t>(block) & ~(regionSize - 1));
    }

    static bool IsPooled(const void* block) {
        const uintptr_t number = reinterpret_cast<uintptr_t>(block) >> regionShift;
        // Whoever has the block has it from a thread that saw the bit set.
        return ((std::atomic_ref(regionBits[number / 64]).load(std::memory_order_relaxed) >> (number % 64)) & 1U) != 0;
    }

    static uint32_t ClassOfBlock(const void* block) {
        return RegionOf(block)->spanClasses[(reinterpret_cast<uintptr_t>(block) >> spanShift) % spansPerRegion];
    }

    // A block that `cache` has; what `getMore` gives if it has none.
    template <typename GetMore>
    static void* TakeBlock(ClassCache& cache, GetMore getMore) {
        if (FreeBlock* block = cache.freeBlocks; block != nullptr) {
            cache.freeBlocks = block->next;
            ++cache.room;
            return block;
        }
        if (cache.fresh != cache.freshEnd) {
            void* block = cache.fresh;
            cache.fresh += cache.blockSize;
            return block;
        }
        return getMore();
    }
    static void* TakeBlock(ClassCache& cache) {
        return TakeBlock(cache, [] { return nullptr; });
    }

    static void PutBlock(ClassCache& cache, void* memory) {
        auto* block = static_cast<FreeBlock*>(memory);
        block->next = cache.freeBlocks;
        cache.freeBlocks = block;
        --cache.room;
    }

    static void* AllocateFine(size_t size);
    static void* AllocateUncounted(size_t size);
    static void* AllocateCounted(size_t size);
    static void* AllocateSlowly(size_t size);
    static void FreeSlowly(void* block);

    // The calling thread's cache; emptyCache before its first use and after its end. Read on every call, so it must not
    // cost a call itself: hence the model, which suits a library that is loaded late too, since it is one pointer.
    [[gnu::tls_model("initial-exec")]] static constinit thread_local ThreadCache* currentCache;

    // Has no blocks and no room for any, and so sends every call the slow way. Never written.
    static ThreadCache emptyCache;

    // One bit for each place where a region can be: set if there is one. 4 MB, but only the pages that stand for
    // addresses in use are ever touched. Accessed atomically.
    using RegionBits = std::array<uint64_t, (size_t{1} << (addressBits - regionShift)) / 64>;
    static RegionBits regionBits;
};

// `size` is one of the fine classes.
inline void* PoolAllocator::AllocateFine(size_t size) {
    return TakeBlock(currentCache->classes[detail::fineClasses[(size + 7) / 8]],
                     [size] { return AllocateSlowly(size); });
}

inline void* PoolAllocator::AllocateUncounted(size_t size) {
    return size <= maximumFineSize ? AllocateFine(size) : AllocateSlowly(size);
}

inline void* PoolAllocator::Allocate(size_t size) {
    if (!IsQuickAllocation(size)) [[unlikely]] {
        return AllocateCounted(size);
    }
    return AllocateFine(size);
}

inline void PoolAllocator::Free(void* block) {
    // Null belongs to no region.
    if (!IsPooled(block)) [[unlikely]] {
        FreeSlowly(block);
        return;
    }
    ClassCache& classCache = currentCache->classes[ClassOfBlock(block)];
    if (classCache.room <= 0) [[unlikely]] {
        FreeSlowly(block);
        return;
    }
    PutBlock(classCache, block);
}

}  // namespace qn::dsc::osdep
