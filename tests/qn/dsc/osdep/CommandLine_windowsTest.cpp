// An argument is in the system's form already.

#include "qn/dsc/osdep/CommandLine.h"

#include <gtest/gtest.h>

#include "support/ExactText.h"

namespace qn::dsc::osdep {
namespace {

TEST(PathFromArgumentOnWindows, AnArgumentStaysAsItIs) {
    for (const char* argument : {"C:\\opt\\host", "c:\\opt\\\\host\\", "Targets\\QN", "\\\\server\\share", "..\\x",
                                 "C:", "/opt/host", "C:/opt", "Targets/QN", ".", ""}) {
        EXPECT_EQ(ExactText(PathFromArgument(argument)), argument);
    }
}

TEST(PathFromArgumentOnWindows, NothingStaysNothing) {
    EXPECT_EQ(ExactText(PathFromArgument(nullptr)), "");
}

TEST(PathFromArgumentOnWindows, BytesAreReadInTheCodePage) {
    EXPECT_EQ(ExactText(PathFromArgument("C:\\Z\xC3\xBCrich\\\xF0\x9F\x98\x80")), "C:\\Z{00FC}rich\\{D83D}{DE00}");
}

}  // namespace
}  // namespace qn::dsc::osdep
