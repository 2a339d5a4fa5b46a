#pragma once

// Holds one reference to an object, and gives it back at the end.

#include <utility>

#include "zkfpga/types.h"

namespace zkhw {

template <typename T>
class InterfacePointer {
  public:
    InterfacePointer() = default;

    // Takes over a reference that the caller has.
    explicit InterfacePointer(T* object) : object(object) {}
    InterfacePointer(const InterfacePointer&) = delete;
    InterfacePointer& operator=(const InterfacePointer&) = delete;
    InterfacePointer(InterfacePointer&& other) noexcept : object(std::exchange(other.object, nullptr)) {}
    InterfacePointer& operator=(InterfacePointer&& other) noexcept {
        std::swap(object, other.object);
        return *this;
    }
    ~InterfacePointer() { Reset(); }

    // With a reference of its own.
    static InterfacePointer Share(T* object) {
        if (object != nullptr) {
            object->AddRef();
        }
        return InterfacePointer(object);
    }

    T* Get() const { return object; }
    T* operator->() const { return object; }
    explicit operator bool() const { return object != nullptr; }

    // Where an operation may store a pointer with a reference; drops what was there.
    T** Receive() {
        Reset();
        return &object;
    }
    void** ReceiveAny() {
        Reset();
        return reinterpret_cast<void**>(&object);
    }

    // Gives the reference to the caller.
    T* Detach() { return std::exchange(object, nullptr); }

    void Reset() {
        if (object != nullptr) {
            std::exchange(object, nullptr)->Release();
        }
    }

  private:
    T* object = nullptr;
};

}  // namespace zkhw
