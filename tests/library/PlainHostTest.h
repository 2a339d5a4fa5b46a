#pragma once

// A test in the process of a host that keeps its memory to itself, so that it goes on working where the library has
// none. Afterwards the host must have all its handles back.

#include "library/ExportsTest.h"

class PlainHostTest : public testing::Test {
  protected:
    PlainHostTest() {
        folder.WriteFile("Targets/QN/FPGA/a_resource.xml",
                         "<Board name=\"a\"><b>plain</b><Sub name=\"s\"><d>deep</d></Sub></Board>");
        folder.WriteFile("Targets/QN/FPGA/c_resource.xml", "<Board name=\"c\"><DisplayName>C</DisplayName></Board>");
        const qn::dsc::NarrowString targets(folder.System(u"Targets"));
        targets.View().copy(static_cast<char*>(qn::dsc::osdep::FindInModule(module, "specialFolder")), 4095);
        zkhw::runtimeModule = module;
    }
    ~PlainHostTest() override {
        EXPECT_EQ(LiveHandles(), 0);
        zkhw::runtimeModule = nullptr;
    }

    int LiveHandles() const { return *static_cast<int*>(qn::dsc::osdep::FindInModule(module, "liveHandles")); }

    void* const module = LoadModule(PLAIN_RUNTIME);
    const qn::dsc::osdep::TemporaryFolder folder;
};
