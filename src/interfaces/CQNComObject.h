#pragma once

// Objects of the boundary. A concrete class T derives from its interface first and then from CQNComObjectRootEx of its
// thread model, so that the interface's table is the object's only one, and has an interface map as its static
// `interfaceMap`. CQNComObject<T> is the leaf that lives: made by Create with a count of 0, it dies at the last
// Release.

#include <atomic>
#include <cstdint>
#include <new>

#include "interfaces/CQNComObjectRootBase.h"
#include "qn/dsc/osdep/DebugTrap.h"
#include "zkfpga/types.h"

namespace zkhw {

// How a count is read and changed; each gives what the count is then. Behind the greatest signed count comes the least:
// an AddRef there is sound, if only AddRefs follow.
struct CQNComSingleThreadModel {
    static int32_t Read(const int32_t& count) { return count; }
    static int32_t Increment(int32_t& count) { return Change(count, 1); }
    static int32_t Decrement(int32_t& count) { return Change(count, 0xFFFFFFFF); }

  private:
    static int32_t Change(int32_t& count, uint32_t by) {
        return count = static_cast<int32_t>(static_cast<uint32_t>(count) + by);
    }
};

// Protects the count alone.
struct CQNComMultiThreadModelNoCS {
    static int32_t Read(int32_t& count) { return std::atomic_ref(count).load(); }
    static int32_t Increment(int32_t& count) { return Change(count, 1); }
    static int32_t Decrement(int32_t& count) { return Change(count, -1); }

  private:
    static int32_t Change(int32_t& count, int32_t by) {
        const int32_t before = std::atomic_ref(count).fetch_add(by);
        return static_cast<int32_t>(static_cast<uint32_t>(before) + static_cast<uint32_t>(by));
    }
};

template <typename ThreadModel>
class CQNComObjectRootEx : public CQNComObjectRootBase {
  protected:
    CQNComObjectRootEx() = default;
    ~CQNComObjectRootEx() = default;

    // Trap at the greatest count there is: the next would be 0 again.
    ULONG InternalAddRef() {
        if (static_cast<uint32_t>(ThreadModel::Read(count)) == 0xFFFFFFFF) {
            qn::dsc::osdep::DebugTrap();
        }
        return static_cast<ULONG>(ThreadModel::Increment(count));
    }

    // Trap if there is no reference. At 0 the object has to go.
    ULONG InternalRelease() {
        if (ThreadModel::Read(count) < 1) {
            qn::dsc::osdep::DebugTrap();
        }
        return static_cast<ULONG>(ThreadModel::Decrement(count));
    }
};

template <typename T>
class CQNComObject final : public T {
  public:
    using T::T;

    // S_OK and a new object with a count of 0 and all fields as their class makes them, for the caller to fill in and
    // then ask for an interface. E_OUTOFMEMORY and null.
    static HRESULT Create(CQNComObject** result) {
        *result = new (std::nothrow) CQNComObject;
        return *result != nullptr ? S_OK : E_OUTOFMEMORY;
    }

    HRESULT STDMETHODCALLTYPE QueryInterface(REFIID id, void** result) override {
        // A caller that goes through the table can bring a null here, and no compiler may take that for impossible.
        const volatile void* volatile object = this;
        return T::InternalQueryInterface(object, T::interfaceMap, id, result);
    }

    ULONG STDMETHODCALLTYPE AddRef() override { return T::InternalAddRef(); }

    ULONG STDMETHODCALLTYPE Release() override {
        const ULONG left = T::InternalRelease();
        if (left == 0) {
            delete this;
        }
        return left;
    }

    // A reference that is taken and given back while the object is destroyed must not bring it here again.
    ~CQNComObject() override {
        this->count = 1;
        T::FinalRelease();
    }

    // Nothing to do. Behind the destructor in the table of every object.
    virtual HRESULT OnCreate(void*, void*) { return S_OK; }
};

}  // namespace zkhw
