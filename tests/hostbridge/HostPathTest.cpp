#include "hostbridge/HostPath.h"

#include "host/HostTest.h"
#include "hostbridge/HostString.h"
#include "qn/dsc/osdep/_GetExeFullPath.h"
#include "qn/dsc/zk/ThrowIfZKError.h"
#include "support/AllocationFaultScope.h"
#include "support/ExactText.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;
using qn::dsc::String;
using qn::dsc::osdep::GetExecutableDir;
using qn::dsc::zk::ZKErrorException;
using Calls = std::vector<std::string>;

// The host's own idea of the path.
const std::string& TextOf(const HostPath& path) {
    return static_cast<StandInPath*>(path.Get())->text;
}

using HostPathTest = HostTest;

TEST_F(HostPathTest, IsEmptyAtFirstAndGoesBackToTheHost) {
    {
        const HostPath path;
        EXPECT_NE(path.Get(), nullptr);
        EXPECT_EQ(TextOf(path), "");
    }
    EXPECT_EQ(TakeCalls(), (Calls{"HostEmptyPath", "HostDestroyPath"}));
}

TEST_F(HostPathTest, OfAnEmptyTextIsEmptyAndTheHostHearsNothingOfIt) {
    const HostPath path{String()};
    EXPECT_EQ(TextOf(path), "");
    EXPECT_EQ(TakeCalls(), Calls{"HostEmptyPath"});
}

TEST_F(HostPathTest, OfATextTakesItInTheFormOfTheFileSystem) {
    const HostPath path{String(u"C:\\Z\u00FCrich\\\u20AC")};
    EXPECT_EQ(TextOf(path), "C:\\Z\xC3\xBCrich\\\xE2\x82\xAC");
    EXPECT_EQ(TakeCalls(), (Calls{"HostEmptyPath", "HostSystemTextToPath C:\\Z\xC3\xBCrich\\\xE2\x82\xAC"}));
}

TEST_F(HostPathTest, OfATextThatTheHostRefusesIsEmpty) {
    host.Fail("HostSystemTextToPath", 1);
    {
        const HostPath path{String(u"bad")};
        EXPECT_EQ(TextOf(path), "");
    }
    EXPECT_EQ(host.LivePathCount(), 0u);
}

TEST_F(HostPathTest, OfATextWithoutMemoryIsEmpty) {
    const String text(u"C:\\a path that needs a buffer of its own");
    const support::AllocationFaultScope fault(1, true);
    const HostPath path(text);
    EXPECT_EQ(TextOf(path), "");
    EXPECT_EQ(TakeCalls(), Calls{"HostEmptyPath"});
}

TEST_F(HostPathTest, RefusalWithoutMemoryForItsWordsIsCaughtAsWell) {
    const String text(u"C:\\bad");
    host.Fail("HostSystemTextToPath", 1);
    // The first allocation is the narrow text.
    const support::AllocationFaultScope fault(2, true);
    const HostPath path(text);
    EXPECT_EQ(TextOf(path), "");
}

TEST_F(HostPathTest, TextInTheFormOfTheSystemIsGivenAsItIs) {
    HostPath path{String(u"C:\\opt\\host")};
    String text(u"before");
    EXPECT_TRUE(path.GetText(text));
    EXPECT_EQ(ExactText(text), "C:\\opt\\host");
}

// On Windows paths are in the system's form from the outset.
TEST_F(HostPathTest, TextIsGivenInTheFormOfTheSystemAsOnlyLinuxHasNativePaths) {
    HostPath path{String(u"/opt/host")};
    String text(u"before");
    EXPECT_TRUE(path.GetText(text));
    EXPECT_EQ(ExactText(text), "C:\\opt\\host");
}

TEST_F(HostPathTest, TextThatTheHostCannotGiveLeavesTheResultAlone) {
    host.Fail("HostPathToString", 1);
    HostPath path;
    String text(u"before");
    EXPECT_FALSE(path.GetText(text));
    EXPECT_EQ(ExactText(text), "before");
}

TEST_F(HostPathTest, TextMayBeAskedForAgain) {
    HostPath path{String(u"C:\\one")};
    String text;
    path.GetText(text);
    StoreInHostPath(u"C:\\another", HostPathForm::FileSystem, path.Get());
    path.GetText(text);
    EXPECT_EQ(ExactText(text), "C:\\another");
    EXPECT_EQ(host.LiveHandleCount(), 1u);
}

TEST_F(HostPathTest, TextGoesBackToTheHostBeforeThePath) {
    {
        HostPath path;
        String text;
        path.GetText(text);
    }
    EXPECT_EQ(TakeCalls(), (Calls{"HostEmptyPath", "HostPathToString", "HostDisposeHandle", "HostDestroyPath"}));
}

TEST_F(HostPathTest, RefusedDisposalOfTheTextIsDroppedAndThePathGoesBack) {
    {
        HostPath path;
        String text;
        path.GetText(text);
        host.Fail("HostDisposeHandle", 42);
    }
    EXPECT_EQ(host.LivePathCount(), 0u);
    // What the stand-in kept when it failed.
    ASSERT_EQ(host.LiveHandleCount(), 1u);
    HostDisposeHandle(host.blockSizes.begin()->first);
}

TEST_F(HostPathTest, TextInTheHostsFormIsStoredWithItsLength) {
    const HostPath path;
    StoreInHostPath(u"host:\u20AC", HostPathForm::Host, path.Get());
    EXPECT_EQ(TextOf(path), "host:\xE2\x82\xAC");
    EXPECT_EQ(TakeCalls(), (Calls{"HostEmptyPath", "HostTextToPath host:\xE2\x82\xAC"}));
}

TEST_F(HostPathTest, RefusedTextOfEitherFormIsThrown) {
    const HostPath path;
    host.errorTexts[42] = "Bad path.";
    for (const HostPathForm form : {HostPathForm::FileSystem, HostPathForm::Host}) {
        host.Fail(form == HostPathForm::Host ? "HostTextToPath" : "HostSystemTextToPath", 42);
        try {
            StoreInHostPath(u"bad", form, path.Get());
            ADD_FAILURE() << "nothing thrown";
        } catch (const ZKErrorException& failure) {
            EXPECT_STREQ(failure.what(), "Error Code: 42 (0000002a): Bad path.");
            EXPECT_STREQ(failure.GetFile(), "qn/dsc/zk/ThrowIfZKError");
            EXPECT_EQ(failure.GetLine(), 75);
        }
        EXPECT_EQ(TextOf(path), "");
    }
}

TEST(HostSpecialDirectoryWithoutAHost, TargetsStandBesideTheExecutable) {
    EXPECT_EQ(ExactText(GetHostSpecialDir(24)), ExactText(GetExecutableDir()) + "Targets");
}

TEST(HostSpecialDirectoryWithoutAHost, EveryOtherIsEmpty) {
    for (uint32_t number = 0; number <= 26; ++number) {
        if (number != 24) {
            EXPECT_EQ(ExactText(GetHostSpecialDir(number)), "") << number;
        }
    }
    EXPECT_EQ(ExactText(GetHostSpecialDir(0xFFFFFFFF)), "");
}

using HostSpecialDirectory = HostTest;

TEST_F(HostSpecialDirectory, EachNumberHasItsCode) {
    const int32_t codes[] = {0, 1, 3, 4, 5, 6, 7, 8, 9, 10, 13, 14, 15, 16, 17, 18, 19, 21, 22, 23, 24, 25, 26, 27, 28};
    for (int32_t code = 0; code <= 30; ++code) {
        host.specialDirectories[code] = "C:\\directory" + std::to_string(code);
    }
    for (uint32_t number = 0; number <= 24; ++number) {
        EXPECT_EQ(ExactText(GetHostSpecialDir(number)), "C:\\directory" + std::to_string(codes[number])) << number;
    }
}

TEST_F(HostSpecialDirectory, NumberOutOfTheTableIsEmptyAndTheHostIsNotAsked) {
    for (const uint32_t number : {25u, 26u, 0x80000000u, 0xFFFFFFFFu}) {
        EXPECT_EQ(ExactText(GetHostSpecialDir(number)), "") << number;
    }
    EXPECT_EQ(TakeCalls(), Calls{});
}

TEST_F(HostSpecialDirectory, IsAskedForByWayOfAPath) {
    host.specialDirectories[3] = "C:\\opt";
    EXPECT_EQ(ExactText(GetHostSpecialDir(2)), "C:\\opt");
    EXPECT_EQ(TakeCalls(), (Calls{"HostEmptyPath", "HostGetSpecialDir 3", "HostPathToString", "HostDisposeHandle",
                                  "HostDestroyPath"}));
}

TEST_F(HostSpecialDirectory, TextOfTheHostMayHaveTheFormOfTheSystem) {
    host.specialDirectories[28] = "C:\\host\\Targets";
    EXPECT_EQ(ExactText(GetHostSpecialDir(24)), "C:\\host\\Targets");
}

TEST_F(HostSpecialDirectory, TextOfTheHostMayBeNativeAsOnlyLinuxHasNativePaths) {
    host.specialDirectories[28] = "/opt/Z\xC3\xBCrich/Targets/";
    EXPECT_EQ(ExactText(GetHostSpecialDir(24)), "C:\\opt\\Z{00FC}rich\\Targets\\");
}

TEST_F(HostSpecialDirectory, EmptyTextOfTheHostStaysEmpty) {
    host.specialDirectories[28] = "";
    EXPECT_EQ(ExactText(GetHostSpecialDir(24)), "");
}

TEST_F(HostSpecialDirectory, HostThatDoesNotKnowItGivesTheEmptyText) {
    EXPECT_EQ(ExactText(GetHostSpecialDir(24)), "");
    EXPECT_EQ(TakeCalls(), (Calls{"HostEmptyPath", "HostGetSpecialDir 28", "HostDestroyPath"}));
}

TEST_F(HostSpecialDirectory, HostThatCannotGiveTheTextGivesTheEmptyText) {
    host.specialDirectories[28] = "/opt";
    host.Fail("HostPathToString", 1);
    EXPECT_EQ(ExactText(GetHostSpecialDir(24)), "");
}

TEST_F(HostSpecialDirectory, MissingTextIsEmpty) {
    host.specialDirectories[28] = "/opt";
    host.givesNoPathText = true;
    EXPECT_EQ(ExactText(GetHostSpecialDir(24)), "");
}

}  // namespace
}  // namespace zkhw
