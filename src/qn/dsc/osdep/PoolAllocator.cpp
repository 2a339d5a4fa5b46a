#include "qn/dsc/osdep/PoolAllocator.h"

#include <algorithm>
#include <array>
#include <atomic>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <mutex>
#include <new>

#include "qn/dsc/osdep/AllocationFault.h"
#include "qn/dsc/osdep/PageMemory.h"
#include "qn/dsc/osdep/SizeClass.h"

namespace qn::dsc::osdep {

namespace {

constexpr uint32_t regionShift = 22;
constexpr size_t regionSize = size_t{1} << regionShift;
constexpr uint32_t spanShift = 15;
constexpr size_t spanSize = size_t{1} << spanShift;
constexpr size_t spansPerRegion = regionSize / spanSize;

// What stands at the head of a region, in its first span: the class of each span.
struct Region {
    std::array<uint8_t, spansPerRegion> spanClasses;
};
static_assert(sizeof(Region) % 16 == 0 && sizeClassCount <= 256);

// User addresses have 47 bits. One bit for each place where a region can be: set, if there is one. 4 MB, but only the
// pages around the addresses in use are ever touched.
constexpr uint32_t addressBits = 47;
std::array<std::atomic<uint64_t>, (size_t{1} << (addressBits - regionShift)) / 64> regionBits;

struct FreeBlock {
    FreeBlock* next;
    // Of the first block of a list in the common store: the first block of the next list there.
    FreeBlock* nextList;
};
static_assert(sizeof(FreeBlock) <= SizeOfClass(1));

struct ClassCache {
    FreeBlock* freeBlocks = nullptr;
    // The part of the present span that no block has been cut from yet.
    char* fresh = nullptr;
    char* freshEnd = nullptr;
    // How many more blocks may be freed before the list goes to the common store.
    int32_t room = 0;
};

struct ThreadCache {
    std::array<ClassCache, sizeClassCount> classes;
    // Of a cache without a thread: the next one.
    ThreadCache* nextIdle = nullptr;
};

// The common store. All of it is used under the mutex.
std::mutex storeMutex;
std::array<FreeBlock*, sizeClassCount> storedLists;
// The caches of threads that have ended; they still hold the rests of their spans.
ThreadCache* idleCaches = nullptr;
// Serves threads that are past the end of their thread-local objects.
ThreadCache sharedCache;
// The part of the present region that is not cut into spans yet.
char* freshSpans = nullptr;
char* freshSpansEnd = nullptr;

// The calling thread's cache; null before its first use and after its end. Read on every call, so it must not cost a
// call itself: hence the model, which also suits a library that is loaded late, since it is one pointer.
[[gnu::tls_model("initial-exec")]] thread_local ThreadCache* currentCache = nullptr;
[[gnu::tls_model("initial-exec")]] thread_local bool isThreadEnding = false;

// Some 64 KB of blocks, 2 of the greatest.
constexpr int32_t RoomOf(uint32_t sizeClass) {
    return static_cast<int32_t>(size_t{65536} / SizeOfClass(sizeClass));
}

Region* RegionOf(void* block) {
    return reinterpret_cast<Region*>(reinterpret_cast<uintptr_t>(block) & ~(regionSize - 1));
}

bool IsPooled(const void* block) {
    const uintptr_t number = reinterpret_cast<uintptr_t>(block) >> regionShift;
    // Whoever has the block has it from a thread that saw the bit set.
    return ((regionBits[number / 64].load(std::memory_order_relaxed) >> (number % 64)) & 1U) != 0;
}

uint32_t ClassOfBlock(void* block) {
    return RegionOf(block)->spanClasses[(reinterpret_cast<uintptr_t>(block) >> spanShift) % spansPerRegion];
}

bool MapRegion() {
    void* pages = MapPages(regionSize, regionSize);
    if (pages == nullptr) {
        return false;
    }
    const uintptr_t number = reinterpret_cast<uintptr_t>(pages) >> regionShift;
    regionBits[number / 64].fetch_or(uint64_t{1} << (number % 64), std::memory_order_relaxed);
    freshSpans = static_cast<char*>(pages);
    freshSpansEnd = freshSpans + regionSize;
    return true;
}

// Gives `cache` a new span for the class. The caller has the mutex, as below.
bool CutSpan(ClassCache& cache, uint32_t sizeClass) {
    const size_t blockSize = SizeOfClass(sizeClass);
    while (true) {
        if (freshSpans == freshSpansEnd && !MapRegion()) {
            return false;
        }
        char* span = freshSpans;
        freshSpans += spanSize;
        Region* region = RegionOf(span);
        const size_t head = span == reinterpret_cast<char*>(region) ? sizeof(Region) : 0;
        const size_t blockCount = (spanSize - head) / blockSize;
        // The first span of a region has no place for a block of the greatest class.
        if (blockCount != 0) {
            region->spanClasses[static_cast<size_t>(span - reinterpret_cast<char*>(region)) / spanSize] =
                static_cast<uint8_t>(sizeClass);
            cache.fresh = span + head;
            cache.freshEnd = cache.fresh + blockCount * blockSize;
            return true;
        }
    }
}

// Gives `cache`, which has no free block of the class, some.
bool Refill(ClassCache& cache, uint32_t sizeClass) {
    FreeBlock* list = storedLists[sizeClass];
    if (list == nullptr) {
        return CutSpan(cache, sizeClass);
    }
    storedLists[sizeClass] = list->nextList;
    cache.freeBlocks = list;
    // Not as if the list were full: the next block freed must not send it straight back.
    cache.room = RoomOf(sizeClass) / 2;
    return true;
}

// A block that `cache` has; null if it has none.
void* TakeBlock(ClassCache& cache, size_t blockSize) {
    if (FreeBlock* block = cache.freeBlocks; block != nullptr) {
        cache.freeBlocks = block->next;
        ++cache.room;
        return block;
    }
    if (cache.fresh != cache.freshEnd) {
        void* block = cache.fresh;
        cache.fresh += blockSize;
        return block;
    }
    return nullptr;
}

void StoreList(ClassCache& cache, uint32_t sizeClass) {
    if (cache.freeBlocks != nullptr) {
        cache.freeBlocks->nextList = storedLists[sizeClass];
        storedLists[sizeClass] = cache.freeBlocks;
        cache.freeBlocks = nullptr;
    }
    cache.room = RoomOf(sizeClass);
}

void PutBlock(ClassCache& cache, void* memory) {
    auto* block = static_cast<FreeBlock*>(memory);
    block->next = cache.freeBlocks;
    cache.freeBlocks = block;
    --cache.room;
}

void* AllocateShared(uint32_t sizeClass) {
    ClassCache& cache = sharedCache.classes[sizeClass];
    void* block = TakeBlock(cache, SizeOfClass(sizeClass));
    if (block == nullptr && Refill(cache, sizeClass)) {
        block = TakeBlock(cache, SizeOfClass(sizeClass));
    }
    return block;
}

// Hands the thread's lists over when the thread ends.
struct ThreadEnd {
    ThreadEnd() = default;
    ThreadEnd(const ThreadEnd&) = delete;
    ThreadEnd& operator=(const ThreadEnd&) = delete;

    ~ThreadEnd() {
        ThreadCache* cache = currentCache;
        currentCache = nullptr;
        isThreadEnding = true;
        const std::lock_guard lock(storeMutex);
        for (uint32_t sizeClass = 1; sizeClass < sizeClassCount; ++sizeClass) {
            StoreList(cache->classes[sizeClass], sizeClass);
        }
        cache->nextIdle = idleCaches;
        idleCaches = cache;
    }
};

// Gives the thread a cache; null if it is ending or there is no memory.
ThreadCache* StartCache() {
    if (isThreadEnding) {
        return nullptr;
    }
    {
        const std::lock_guard lock(storeMutex);
        if (idleCaches != nullptr) {
            currentCache = idleCaches;
            idleCaches = idleCaches->nextIdle;
        } else {
            void* memory = AllocateShared(SizeClassOf(sizeof(ThreadCache)));
            if (memory == nullptr) {
                return nullptr;
            }
            currentCache = new (memory) ThreadCache();
            for (uint32_t sizeClass = 1; sizeClass < sizeClassCount; ++sizeClass) {
                currentCache->classes[sizeClass].room = RoomOf(sizeClass);
            }
        }
    }
    static thread_local const ThreadEnd threadEnd;
    static_cast<void>(threadEnd);
    return currentCache;
}

[[gnu::noinline]] void* AllocateSlowly(size_t size) {
    if (size > maximumClassedSize) {
        return std::malloc(size);
    }
    const uint32_t sizeClass = SizeClassOf(size);
    ThreadCache* cache = currentCache != nullptr ? currentCache : StartCache();
    if (cache == nullptr) {
        const std::lock_guard lock(storeMutex);
        return AllocateShared(sizeClass);
    }
    ClassCache& classCache = cache->classes[sizeClass];
    void* block = TakeBlock(classCache, SizeOfClass(sizeClass));
    if (block == nullptr) {
        const std::lock_guard lock(storeMutex);
        if (Refill(classCache, sizeClass)) {
            block = TakeBlock(classCache, SizeOfClass(sizeClass));
        }
    }
    return block;
}

void* AllocateUncounted(size_t size) {
    ThreadCache* cache = currentCache;
    if (cache == nullptr || size > maximumFineSize) [[unlikely]] {
        return AllocateSlowly(size);
    }
    const uint32_t sizeClass = SizeClassOf(size);
    void* block = TakeBlock(cache->classes[sizeClass], size_t{16} * sizeClass);
    if (block == nullptr) [[unlikely]] {
        return AllocateSlowly(size);
    }
    return block;
}

[[gnu::noinline]] void FreeSlowly(void* block, uint32_t sizeClass) {
    ThreadCache* cache = currentCache != nullptr ? currentCache : StartCache();
    const std::lock_guard lock(storeMutex);
    ClassCache& classCache = (cache != nullptr ? *cache : sharedCache).classes[sizeClass];
    if (classCache.room <= 0) {
        StoreList(classCache, sizeClass);
    }
    PutBlock(classCache, block);
}

}  // namespace

void* PoolAllocator::Allocate(size_t size) {
    if (ShouldFailAllocation()) [[unlikely]] {
        return nullptr;
    }
    return AllocateUncounted(size);
}

void PoolAllocator::Free(void* block) {
    if (block == nullptr) {
        return;
    }
    if (!IsPooled(block)) [[unlikely]] {
        std::free(block);
        return;
    }
    const uint32_t sizeClass = ClassOfBlock(block);
    ThreadCache* cache = currentCache;
    if (cache == nullptr || cache->classes[sizeClass].room <= 0) [[unlikely]] {
        FreeSlowly(block, sizeClass);
        return;
    }
    PutBlock(cache->classes[sizeClass], block);
}

void* PoolAllocator::Reallocate(void* block, size_t size) {
    if (block == nullptr) {
        return Allocate(size);
    }
    if (size == 0) {
        Free(block);
        return nullptr;
    }
    const bool wasPooled = IsPooled(block);
    const uint32_t oldClass = wasPooled ? ClassOfBlock(block) : sizeClassCount;
    const uint32_t newClass = size <= maximumClassedSize ? SizeClassOf(size) : sizeClassCount;
    if (oldClass == newClass && wasPooled) {
        return block;
    }
    if (newClass >= oldClass && ShouldFailAllocation()) [[unlikely]] {
        return nullptr;
    }
    if (oldClass == newClass) {
        return std::realloc(block, size);
    }
    void* moved = AllocateUncounted(size);
    if (moved != nullptr) {
        std::memcpy(moved, block, wasPooled ? std::min(SizeOfClass(oldClass), size) : size);
        Free(block);
    }
    return moved;
}

}  // namespace qn::dsc::osdep
