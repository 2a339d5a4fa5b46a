#include "qn/dsc/osdep/PageMemory.h"

#include <sys/mman.h>

#include <cstdint>

namespace qn::dsc::osdep {

namespace {

char* Map(size_t size) {
    void* pages = mmap(nullptr, size, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0);
    return pages == MAP_FAILED ? nullptr : static_cast<char*>(pages);
}

bool IsAligned(const char* pages, size_t alignment) {
    return (reinterpret_cast<uintptr_t>(pages) & (alignment - 1)) == 0;
}

}  // namespace

void* MapPages(size_t size, size_t alignment) {
    // Linux puts one mapping right below the other, so all but the first are usually aligned as they come.
    char* pages = Map(size);
    if (pages == nullptr || IsAligned(pages, alignment)) {
        return pages;
    }
    munmap(pages, size);

    if (size > SIZE_MAX - alignment) {
        return nullptr;
    }
    pages = Map(size + alignment);
    if (pages == nullptr) {
        return nullptr;
    }
    const size_t before = (alignment - reinterpret_cast<uintptr_t>(pages) % alignment) % alignment;
    if (before != 0) {
        munmap(pages, before);
    }
    munmap(pages + before + size, alignment - before);
    return pages + before;
}

void PopulatePages(void* pages, size_t size) {
    madvise(pages, size, MADV_POPULATE_WRITE);
}

}  // namespace qn::dsc::osdep
