#include "hostbridge/HostPath.h"

#include "hostbridge/LoadedRuntime.h"
#include "qn/dsc/osdep/_GetExeFullPath.h"
#include "support/ExactText.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;
using qn::dsc::osdep::GetExecutableDir;

TEST(HostSpecialDirectory, TargetsStandBesideTheExecutableWithoutAHost) {
    EXPECT_EQ(ExactText(GetHostSpecialDir(24)), ExactText(GetExecutableDir()) + "Targets");
}

TEST(HostSpecialDirectory, EveryOtherIsEmptyWithoutAHost) {
    for (const uint32_t number : {0u, 1u, 2u, 23u, 25u, 0xFFFFFFFFu}) {
        EXPECT_EQ(ExactText(GetHostSpecialDir(number)), "") << number;
    }
}

TEST(HostSpecialDirectory, EachNumberHasItsCode) {
    EXPECT_IN_CHILD([] {
        const int32_t codes[] = {0,  1,  3,  4,  5,  6,  7,  8,  9,  10, 13, 14, 15,
                                 16, 17, 18, 19, 21, 22, 23, 24, 25, 26, 27, 28};
        FakeRuntime& runtime = LoadFakeRuntime();
        for (uint32_t number = 0; number <= 24; ++number) {
            GetHostSpecialDir(number);
            if (runtime.askedCode != codes[number]) {
                return false;
            }
        }
        return true;
    });
}

TEST(HostSpecialDirectory, NumberOutOfTheTableIsEmptyAndTheHostIsNotAsked) {
    EXPECT_IN_CHILD([] {
        FakeRuntime& runtime = LoadFakeRuntime();
        runtime.directory = "C:\\host";
        return GetHostSpecialDir(25).IsEmpty() && runtime.askedCode == -1 && runtime.openPaths == 0;
    });
}

TEST(HostSpecialDirectory, TextOfTheHostMayHaveTheFormOfTheSystem) {
    EXPECT_IN_CHILD([] {
        LoadFakeRuntime().directory = "C:\\host\\Targets";
        return ExactText(GetHostSpecialDir(24)) == "C:\\host\\Targets";
    });
}

TEST(HostSpecialDirectory, TextOfTheHostMayBeNative) {
    EXPECT_IN_CHILD([] {
        LoadFakeRuntime().directory = "/opt/host/Targets";
        return ExactText(GetHostSpecialDir(24)) == "C:\\opt\\host\\Targets";
    });
}

TEST(HostSpecialDirectory, EmptyTextOfTheHostStaysEmpty) {
    EXPECT_IN_CHILD([] {
        LoadFakeRuntime().directory = "";
        return GetHostSpecialDir(24).IsEmpty();
    });
}

TEST(HostSpecialDirectory, HostThatDoesNotKnowItGivesTheEmptyText) {
    EXPECT_IN_CHILD([] {
        FakeRuntime& runtime = LoadFakeRuntime();
        runtime.directory = "C:\\host";
        runtime.specialDirectoryError = 7;
        return GetHostSpecialDir(24).IsEmpty() && runtime.openPaths == 0;
    });
}

TEST(HostSpecialDirectory, HostThatCannotGiveTheTextGivesTheEmptyText) {
    EXPECT_IN_CHILD([] {
        FakeRuntime& runtime = LoadFakeRuntime();
        runtime.directory = "C:\\host";
        runtime.pathToStringError = 1;
        return GetHostSpecialDir(24).IsEmpty() && runtime.openPaths == 0;
    });
}

TEST(HostSpecialDirectory, MissingTextIsEmpty) {
    EXPECT_IN_CHILD([] {
        FakeRuntime& runtime = LoadFakeRuntime();
        runtime.givesNoText = true;
        return GetHostSpecialDir(24).IsEmpty() && runtime.openPaths == 0 && runtime.openHandles == 0;
    });
}

TEST(HostSpecialDirectory, PathAndTextAreGivenBackToTheHost) {
    EXPECT_IN_CHILD([] {
        FakeRuntime& runtime = LoadFakeRuntime();
        runtime.directory = "C:\\host";
        GetHostSpecialDir(24);
        return runtime.openPaths == 0 && runtime.openHandles == 0;
    });
}

}  // namespace
}  // namespace zkhw
