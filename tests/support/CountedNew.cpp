// The ordinary heap takes part in the count of allocations, and in their failure, in every program that this is
// linked into.

#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <new>

#include "qn/dsc/osdep/AllocationFault.h"

namespace {

void* Allocate(std::size_t size) noexcept {
    return qn::dsc::osdep::ShouldFailAllocation() ? nullptr : std::malloc(size == 0 ? 1 : size);
}

// The block that malloc gave stands in front of the aligned one.
void* Allocate(std::size_t size, std::align_val_t alignment) noexcept {
    const std::size_t step = static_cast<std::size_t>(alignment);
    auto* const block = static_cast<char*>(Allocate(size + sizeof(char*) + step));
    if (block == nullptr) {
        return nullptr;
    }
    const uintptr_t past = reinterpret_cast<uintptr_t>(block + sizeof(char*)) % step;
    char* const aligned = block + sizeof(char*) + (past == 0 ? 0 : step - past);
    std::memcpy(aligned - sizeof(char*), &block, sizeof(char*));
    return aligned;
}

void FreeAligned(void* memory) noexcept {
    if (memory != nullptr) {
        char* block = nullptr;
        std::memcpy(&block, static_cast<char*>(memory) - sizeof(char*), sizeof(char*));
        std::free(block);
    }
}

}  // namespace

void* operator new(std::size_t size) {
    if (void* memory = Allocate(size)) {
        return memory;
    }
    throw std::bad_alloc();
}

void* operator new[](std::size_t size) {
    return operator new(size);
}

void* operator new(std::size_t size, const std::nothrow_t&) noexcept {
    return Allocate(size);
}

void* operator new[](std::size_t size, const std::nothrow_t&) noexcept {
    return Allocate(size);
}

void operator delete(void* memory) noexcept {
    std::free(memory);
}

void operator delete[](void* memory) noexcept {
    std::free(memory);
}

void operator delete(void* memory, std::size_t) noexcept {
    std::free(memory);
}

void operator delete[](void* memory, std::size_t) noexcept {
    std::free(memory);
}

// These are what the memory resources of the standard library take theirs from.

void* operator new(std::size_t size, std::align_val_t alignment) {
    if (void* memory = Allocate(size, alignment)) {
        return memory;
    }
    throw std::bad_alloc();
}

void* operator new[](std::size_t size, std::align_val_t alignment) {
    return operator new(size, alignment);
}

void* operator new(std::size_t size, std::align_val_t alignment, const std::nothrow_t&) noexcept {
    return Allocate(size, alignment);
}

void* operator new[](std::size_t size, std::align_val_t alignment, const std::nothrow_t&) noexcept {
    return Allocate(size, alignment);
}

void operator delete(void* memory, std::align_val_t) noexcept {
    FreeAligned(memory);
}

void operator delete[](void* memory, std::align_val_t) noexcept {
    FreeAligned(memory);
}

void operator delete(void* memory, std::size_t, std::align_val_t) noexcept {
    FreeAligned(memory);
}

void operator delete[](void* memory, std::size_t, std::align_val_t) noexcept {
    FreeAligned(memory);
}
