#pragma once

// Objects that a host would implement. They live in the test, which says what they answer; nothing frees them. Each
// counts its references, and at its end fails the test if one was not given back, or one too many was.

#include <functional>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include "zkfpga/ids.h"
#include "zkfpga/types.h"

namespace zkhw {

template <typename Interface>
class HostObject : public Interface {
  public:
    HostObject() { asked.reserve(16); }
    HostObject(const HostObject&) = delete;
    HostObject& operator=(const HostObject&) = delete;
    virtual ~HostObject() { EXPECT_EQ(references, 0) << "references are left"; }

    // Besides IUnknown, which is the object itself: what the object gives for `id`.
    void Answer(REFIID id, IUnknown* object) { answers.emplace_back(id, object); }

    HRESULT STDMETHODCALLTYPE QueryInterface(REFIID id, void** result) override {
        asked.push_back(id);
        *result = nullptr;
        if (id == IID_IUnknown) {
            return Give(this, result);
        }
        for (const auto& [known, object] : answers) {
            if (known == id) {
                return Give(object, result);
            }
        }
        return E_NOINTERFACE;
    }

    ULONG STDMETHODCALLTYPE AddRef() override { return static_cast<ULONG>(++references); }

    ULONG STDMETHODCALLTYPE Release() override {
        const int left = --references;
        EXPECT_GE(left, 0) << "released once too often";
        if (left == 0 && whenUnreferenced) {
            whenUnreferenced();
        }
        return static_cast<ULONG>(left);
    }

    int References() const { return references; }

    std::function<void()> whenUnreferenced;
    std::vector<IID> asked;  // The ids that QueryInterface has got.

  private:
    static HRESULT Give(IUnknown* object, void** result) {
        object->AddRef();
        *result = object;
        return S_OK;
    }

    int references = 0;
    std::vector<std::pair<IID, IUnknown*>> answers;
};

}  // namespace zkhw
