#include "qn/dsc/osdep/PoolAllocator.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <mutex>
#include <new>

#include "qn/dsc/osdep/PageMemory.h"

namespace qn::dsc::osdep {

constinit PoolAllocator::ThreadCache PoolAllocator::emptyCache;
constinit thread_local PoolAllocator::ThreadCache* PoolAllocator::currentCache = &emptyCache;
PoolAllocator::RegionBits PoolAllocator::regionBits;

namespace {

[[gnu::tls_model("initial-exec")]] constinit thread_local bool isThreadEnding = false;

// How long a list of free blocks may get: some 64 KB, 2 of the greatest.
constexpr int32_t RoomOf(uint32_t sizeClass) {
    return static_cast<int32_t>(size_t{65536} / SizeOfClass(sizeClass));
}

}  // namespace

// The lists of free blocks of one class that the threads have handed over.
class PoolAllocator::FreeLists {
  public:
    void Put(FreeBlock* list, uint32_t sizeClass) {
        if (HasRoomForTwo(sizeClass)) {
            static_cast<FirstBlock*>(list)->nextList = first;
        } else {
            LastOf(list)->next = first;
        }
        first = list;
    }

    // Null if there is none.
    FreeBlock* Take(uint32_t sizeClass) {
        FreeBlock* list = first;
        if (list != nullptr && HasRoomForTwo(sizeClass)) {
            first = static_cast<FirstBlock*>(list)->nextList;
        } else if (list != nullptr) {
            // No more than a thread may keep, or the next Put would have all of them to walk over.
            FreeBlock* last = LastOf(list, RoomOf(sizeClass) / 2);
            first = last->next;
            last->next = nullptr;
        }
        return list;
    }

  private:
    struct FirstBlock : FreeBlock {
        // The first block of the next list.
        FreeBlock* nextList;
    };

    // The smallest blocks hold one pointer: their lists are joined into one.
    static constexpr bool HasRoomForTwo(uint32_t sizeClass) { return SizeOfClass(sizeClass) >= sizeof(FirstBlock); }

    // The last block of the list, or the one of that number if it is longer.
    static FreeBlock* LastOf(FreeBlock* list, int32_t count = INT32_MAX) {
        while (list->next != nullptr && --count > 0) {
            list = list->next;
        }
        return list;
    }

    FreeBlock* first = nullptr;
};

// What the threads share. All of it is used under the mutex.
struct PoolAllocator::Store {
    static_assert(sizeof(Region) % 16 == 0 && sizeClassCount <= 256);
    static_assert(sizeof(FreeBlock) <= SizeOfClass(1));

    std::mutex mutex;
    std::array<FreeLists, sizeClassCount> lists = {};
    // The caches of threads that have ended; they still hold the rests of their spans.
    ThreadCache* idleCaches = nullptr;
    // Serves threads that are past the end of their thread-local objects.
    ThreadCache sharedCache;
    // The part of the present region that is not cut into spans yet.
    char* freshSpans = nullptr;
    char* freshSpansEnd = nullptr;

    static Store store;

    bool MapRegion() {
        void* pages = MapPages(regionSize, regionSize);
        if (pages == nullptr) {
            return false;
        }
        const uintptr_t number = reinterpret_cast<uintptr_t>(pages) >> regionShift;
        std::atomic_ref(regionBits[number / 64]).fetch_or(uint64_t{1} << (number % 64), std::memory_order_relaxed);
        freshSpans = static_cast<char*>(pages);
        freshSpansEnd = freshSpans + regionSize;
        return true;
    }

    // Gives `cache` a new span for the class.
    bool CutSpan(ClassCache& cache, uint32_t sizeClass) {
        const size_t blockSize = SizeOfClass(sizeClass);
        while (true) {
            if (freshSpans == freshSpansEnd && !MapRegion()) {
                return false;
            }
            char* span = freshSpans;
            freshSpans += spanSize;
            Region* region = RegionOf(span);
            const auto offset = static_cast<size_t>(span - reinterpret_cast<char*>(region));
            // In steps: 8 % of a run's CPU time was the faults of single pages.
            if (offset % populateStep == 0) {
                PopulatePages(span, populateStep);
            }
            const size_t head = offset == 0 ? sizeof(Region) : 0;
            const size_t blockCount = (spanSize - head) / blockSize;
            // The first span of a region has no place for a block of the greatest class.
            if (blockCount != 0) {
                region->spanClasses[offset / spanSize] = static_cast<uint8_t>(sizeClass);
                cache.blockSize = static_cast<uint32_t>(blockSize);
                cache.fresh = span + head;
                cache.freshEnd = cache.fresh + blockCount * blockSize;
                return true;
            }
        }
    }

    // Gives `cache`, which has no block of the class, some.
    bool Refill(ClassCache& cache, uint32_t sizeClass) {
        FreeBlock* list = lists[sizeClass].Take(sizeClass);
        if (list == nullptr) {
            return CutSpan(cache, sizeClass);
        }
        cache.freeBlocks = list;
        // Not as if the list were full: the next block freed must not send it straight back.
        cache.room = RoomOf(sizeClass) / 2;
        return true;
    }

    void* Allocate(ClassCache& cache, uint32_t sizeClass) {
        void* block = TakeBlock(cache);
        if (block == nullptr && Refill(cache, sizeClass)) {
            block = TakeBlock(cache);
        }
        return block;
    }

    // Takes over the free blocks of `cache`.
    void TakeList(ClassCache& cache, uint32_t sizeClass) {
        if (cache.freeBlocks != nullptr) {
            lists[sizeClass].Put(cache.freeBlocks, sizeClass);
            cache.freeBlocks = nullptr;
        }
        cache.room = RoomOf(sizeClass);
    }

    // A cache for a thread; null if there is no memory.
    ThreadCache* NewCache() {
        if (idleCaches != nullptr) {
            ThreadCache* cache = idleCaches;
            idleCaches = cache->nextIdle;
            return cache;
        }
        const uint32_t sizeClass = SizeClassOf(sizeof(ThreadCache));
        void* memory = Allocate(sharedCache.classes[sizeClass], sizeClass);
        if (memory == nullptr) {
            return nullptr;
        }
        auto* cache = new (memory) ThreadCache();
        for (uint32_t number = 1; number < sizeClassCount; ++number) {
            cache->classes[number].room = RoomOf(number);
        }
        return cache;
    }

    // The calling thread's cache, made if need be; null if the thread is ending or there is no memory.
    ThreadCache* CacheOfThread();
};

constinit PoolAllocator::Store PoolAllocator::Store::store;

// Hands the thread's lists over when the thread ends.
struct PoolAllocator::ThreadEnd {
    ThreadEnd() = default;
    ThreadEnd(const ThreadEnd&) = delete;
    ThreadEnd& operator=(const ThreadEnd&) = delete;

    ~ThreadEnd() {
        ThreadCache* cache = currentCache;
        currentCache = &emptyCache;
        isThreadEnding = true;
        Store& store = Store::store;
        const std::lock_guard lock(store.mutex);
        for (uint32_t sizeClass = 1; sizeClass < sizeClassCount; ++sizeClass) {
            store.TakeList(cache->classes[sizeClass], sizeClass);
        }
        cache->nextIdle = store.idleCaches;
        store.idleCaches = cache;
    }
};

PoolAllocator::ThreadCache* PoolAllocator::Store::CacheOfThread() {
    if (currentCache != &emptyCache) {
        return currentCache;
    }
    if (isThreadEnding) {
        return nullptr;
    }
    ThreadCache* cache = nullptr;
    {
        const std::lock_guard lock(mutex);
        cache = NewCache();
    }
    if (cache != nullptr) {
        currentCache = cache;
        static thread_local const ThreadEnd threadEnd;
        static_cast<void>(threadEnd);
    }
    return cache;
}

void* PoolAllocator::AllocateSlowly(size_t size) {
    if (size > maximumClassedSize) {
        return std::malloc(size);
    }
    const uint32_t sizeClass = SizeClassOf(size);
    Store& store = Store::store;
    ThreadCache* cache = store.CacheOfThread();
    if (cache != nullptr) {
        if (void* block = TakeBlock(cache->classes[sizeClass]); block != nullptr) {
            return block;
        }
    }
    const std::lock_guard lock(store.mutex);
    return store.Allocate((cache != nullptr ? *cache : store.sharedCache).classes[sizeClass], sizeClass);
}

void* PoolAllocator::AllocateCounted(size_t size) {
    return ShouldFailAllocation() ? nullptr : AllocateUncounted(size);
}

void PoolAllocator::FreeSlowly(void* block) {
    if (block == nullptr || !IsPooled(block)) {
        std::free(block);
        return;
    }
    const uint32_t sizeClass = ClassOfBlock(block);
    Store& store = Store::store;
    ThreadCache* cache = store.CacheOfThread();
    const std::lock_guard lock(store.mutex);
    ClassCache& classCache = (cache != nullptr ? *cache : store.sharedCache).classes[sizeClass];
    if (classCache.room <= 0) {
        store.TakeList(classCache, sizeClass);
    }
    PutBlock(classCache, block);
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
    if (wasPooled && oldClass == newClass) {
        return block;
    }
    if (newClass >= oldClass && ShouldFailAllocation()) {
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
