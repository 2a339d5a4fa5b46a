#include <gtest/gtest.h>

#include "host/LoadedRuntime.h"
#include "library/HostInstallation.h"

namespace {

// The program says which slot gave something else than it should.
TEST(Slots, HostThatKnowsOnlyIdsAndNumbersOfSlotsFindsEverything) {
    const HostInstallation installation;
    const qn::dsc::osdep::ProgramResult result = installation.RunAsHost(SLOTS_HOST, {ZKFPGA_LIBRARY}, "/");
    EXPECT_EQ(result.end, "exit 0");
    EXPECT_EQ(result.output, "all slots\n");
    EXPECT_EQ(result.errors, "");
}

}  // namespace
