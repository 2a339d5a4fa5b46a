#pragma once

// Takes the place of the process's tree, behind the exported functions: writes down what it is asked, and answers as it
// is told.

#include <string>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include "cachebuilder/FPGAResTree.h"
#include "zkfpga/exports.h"
#include "zkfpga/memory.h"
#include "zkfpga/tree_root.h"

namespace zkhw {

// The owner keeps its interfaces to itself. An explicit instantiation may name what is private.
using OwnerField = IUnknown* ResTreeOwnerBase::*;
OwnerField TreeInterfaceField();
template <OwnerField Field>
struct ExposeTreeInterface {
    friend OwnerField TreeInterfaceField() { return Field; }
};
template struct ExposeTreeInterface<&ResTreeOwnerBase::treeInterface>;

class RecordingTree final : public IzkEIOGResourceTree {
  public:
    // The tree must have been built.
    RecordingTree() : replaced(std::exchange(gFPGAResTree()->*TreeInterfaceField(), this)) {}
    RecordingTree(const RecordingTree&) = delete;
    RecordingTree& operator=(const RecordingTree&) = delete;
    // Every reference must have come back.
    ~RecordingTree() {
        EXPECT_EQ(references, 0);
        gFPGAResTree()->*TreeInterfaceField() = replaced;
    }

    // "GetProperty [path] [options]".
    std::vector<std::string> asked;
    // What every operation gives. Texts are given also with S_FALSE, and nothing with a failure.
    HRESULT result = S_OK;
    std::vector<std::u16string> texts;
    bool givesNullText = false;

    HRESULT QueryInterface(const IID&, void** object) override {
        ++references;
        *object = this;
        return S_OK;
    }
    ULONG AddRef() override { return static_cast<ULONG>(++references); }
    ULONG Release() override { return static_cast<ULONG>(--references); }

    HRESULT GetDescendantNames(LPCWSTR path, LPCWSTR options, ULONG* count, BSTR** names) override {
        return GiveList("GetDescendantNames", path, options, count, names);
    }
    HRESULT GetMultiplePropertyNames(LPCWSTR path, LPCWSTR options, ULONG* count, BSTR** names) override {
        return GiveList("GetMultiplePropertyNames", path, options, count, names);
    }
    HRESULT GetMultipleProperties(LPCWSTR path, LPCWSTR options, ULONG* count, BSTR** values) override {
        return GiveList("GetMultipleProperties", path, options, count, values);
    }
    HRESULT GetProperty(LPCWSTR path, LPCWSTR options, BSTR* value) override {
        Note("GetProperty", path, options);
        if (result >= 0 && !givesNullText && !texts.empty()) {
            *value = SysAllocString(texts[0].c_str());
        }
        return result;
    }

  private:
    void Note(const char* operation, LPCWSTR path, LPCWSTR options) {
        asked.push_back(std::string(operation) + " [" + qn::dsc::NarrowString(path).CStr() + "] [" +
                        qn::dsc::NarrowString(options).CStr() + "]");
    }
    HRESULT GiveList(const char* operation, LPCWSTR path, LPCWSTR options, ULONG* count, BSTR** array) {
        Note(operation, path, options);
        *count = 0;
        *array = nullptr;
        if (result >= 0 && !texts.empty()) {
            *array = static_cast<BSTR*>(CoTaskMemAlloc(texts.size() * sizeof(BSTR)));
            for (const std::u16string& text : texts) {
                (*array)[(*count)++] = givesNullText ? nullptr : SysAllocString(text.c_str());
            }
        }
        return result;
    }

    IUnknown* replaced;
    int references = 0;
};

}  // namespace zkhw
