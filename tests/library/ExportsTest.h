#pragma once

// The exported functions inside the test's own process, with a host, and a small tree that is built once.

#include <cstring>
#include <string>

#include "host/HostTest.h"
#include "hostbridge/HostString.h"
#include "hostbridge/HostStringArray.h"
#include "qn/dsc/zk/ThrowIfZKError.h"
#include "support/TemporaryFolder.h"
#include "zkfpga/exports.h"
#include "zkfpga/memory.h"
#include "zkfpga/tree_node.h"
#include "zkfpga/tree_root.h"

// A string of the stand-in host, its memory included.
class HostText {
  public:
    explicit HostText(const std::string& bytes = {}) {
        zkhw::StoreInHostString(bytes.data(), static_cast<uint32_t>(bytes.size()), handle);
    }
    HostText(const HostText&) = delete;
    HostText& operator=(const HostText&) = delete;
    ~HostText() { zkhw::HostDisposeHandle(handle); }

    ZkStringHandle Get() const { return handle; }
    std::string Bytes() const {
        int32_t length = 0;
        std::memcpy(&length, *handle, sizeof length);
        return {*handle + sizeof length, static_cast<size_t>(length)};
    }

  private:
    ZkStringHandle handle = nullptr;
};

// An array of strings, null at first.
class HostTexts {
  public:
    HostTexts() = default;
    HostTexts(const HostTexts&) = delete;
    HostTexts& operator=(const HostTexts&) = delete;
    ~HostTexts() {
        if (array != nullptr) {
            zkhw::ResizeHostStringArray(0, array);
            zkhw::HostDisposeHandle(array);
        }
    }

    // Makes it hold these texts.
    void Make(const std::vector<std::string>& texts) {
        zkhw::ResizeHostStringArray(static_cast<int32_t>(texts.size()), array);
        for (uint32_t i = 0; i < texts.size(); ++i) {
            zkhw::StoreInHostStringArray(qn::dsc::String(texts[i].c_str()), array, i);
        }
    }
    // "null" for a string that isn't there.
    std::vector<std::string> Texts() const {
        std::vector<std::string> texts;
        for (int32_t i = 0; i < zkhw::GetHostStringArrayCount(array); ++i) {
            const ZkStringHandle element = zkhw::GetHostStringArrayElement(array, static_cast<uint32_t>(i));
            texts.emplace_back(element == nullptr ? "null" : zkhw::HostStringToNarrow(element).CStr());
        }
        return texts;
    }

    ZkStringArrayHandle array = nullptr;
};

class ExportsTest : public HostTest {
  protected:
    ExportsTest() {
        static const bool isBuilt = BuildTree();
        EXPECT_TRUE(isBuilt);
        TakeCalls();
    }
    ~ExportsTest() override { host.faults.clear(); }

    // The root of the tree, with a reference for the caller.
    static IzkhwResourceTreeNode* RootNode() {
        void* root = nullptr;
        QueryResourceTreeInterface(&IID_IzkhwResourceTreeNode, nullptr, nullptr, &root);
        return static_cast<IzkhwResourceTreeNode*>(root);
    }
    static void SetRootProperty(const char16_t* name, const char16_t* value) {
        IzkhwResourceTreeNode* const root = RootNode();
        root->SetProperty(name, value);
        root->Release();
    }

  private:
    // The files are gone when it is done: nothing but the tree in memory answers.
    bool BuildTree() {
        const qn::dsc::osdep::TemporaryFolder folder;
        folder.WriteFile("Targets/QN/FPGA/a_resource.xml", "<Board name=\"a\"><b>plain</b><c>of a</c></Board>");
        folder.WriteFile("Targets/QN/FPGA/ab_resource.xml",
                         "<Board name=\"a/b\"><c>slashed</c><Sub name=\"s\"><d>deep</d></Sub>"
                         "<Part name=\"t\"><DisplayName>T &amp; co</DisplayName></Part></Board>");
        folder.WriteFile("Targets/QN/FPGA/texts_resource.xml",
                         "<Texts><Umlaut>\xC3\x84\xE2\x82\xAC</Umlaut><Empty></Empty>"
                         "<Label localize=\"true\">eng=Clock,jpn=Tokei</Label></Texts>");
        folder.WriteFile("Targets/QN/FPGA/none_resource.xml", "<None><Only name=\"x\"/></None>");
        host.specialDirectories[28] = qn::dsc::NarrowString(folder.System(u"Targets")).CStr();
        IzkhwResourceTreeNode* const root = RootNode();
        if (root == nullptr) {
            return false;
        }
        root->Release();
        return true;
    }
};

// What is thrown by `call`, as code and text; "nothing" if it returns.
template <typename Call>
std::string ErrorOf(Call call) {
    try {
        call();
    } catch (const qn::dsc::zk::ZKErrorException& failure) {
        return std::to_string(failure.GetErrorCode()) + " | " + failure.what();
    }
    return "nothing";
}
