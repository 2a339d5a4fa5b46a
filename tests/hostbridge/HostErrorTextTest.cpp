#include "qn/dsc/zk/HostErrorText.h"

#include <new>

#include "host/HostTest.h"
#include "qn/dsc/zk/ThrowIfZKError.h"
#include "support/AllocationFaultScope.h"

namespace qn::dsc::zk {
namespace {

using HostErrorText = HostTest;
using Calls = std::vector<std::string>;

TEST_F(HostErrorText, IsTheHostsOwn) {
    host.errorTexts[7] = "File not found.";
    EXPECT_STREQ(GetHostErrorText(7).CStr(), "File not found.");
    EXPECT_EQ(TakeCalls(), (Calls{"HostGetErrorText 7", "HostDisposeHandle"}));
}

TEST_F(HostErrorText, OfAnUnknownCodeHasFixedWords) {
    EXPECT_STREQ(GetHostErrorText(-12345).CStr(), "Unknown error code or error text unavailable.");
    EXPECT_EQ(TakeCalls(), Calls{"HostGetErrorText -12345"});
}

TEST_F(HostErrorText, IsEmptyIfTheHostGivesTrueAndNoString) {
    host.errorTextAnswer = StandInRuntime::ErrorText::TrueWithoutText;
    EXPECT_STREQ(GetHostErrorText(7).CStr(), "");
    EXPECT_EQ(TakeCalls(), Calls{"HostGetErrorText 7"});
}

TEST_F(HostErrorText, IsEmptyIfTheHostsStringIs) {
    host.errorTexts[7] = "";
    EXPECT_STREQ(GetHostErrorText(7).CStr(), "");
}

TEST_F(HostErrorText, StringThatComesWithFalseIsDisposedOfUnread) {
    host.errorTexts[7] = "File not found.";
    host.errorTextAnswer = StandInRuntime::ErrorText::FalseWithText;
    EXPECT_STREQ(GetHostErrorText(7).CStr(), "Unknown error code or error text unavailable.");
    EXPECT_EQ(TakeCalls(), (Calls{"HostGetErrorText 7", "HostDisposeHandle"}));
}

TEST_F(HostErrorText, ResultOfTheDisposalIsNotLookedAt) {
    host.errorTexts[7] = "File not found.";
    host.Fail("HostDisposeHandle", 42);
    EXPECT_STREQ(GetHostErrorText(7).CStr(), "File not found.");
    // What the stand-in kept when it failed.
    ASSERT_EQ(host.LiveHandleCount(), 1u);
    reinterpret_cast<int32_t (*)(char**)>(qn::dsc::osdep::FindInModule(module, "HostDisposeHandle"))(
        host.blockSizes.begin()->first);
}

TEST_F(HostErrorText, WithoutMemoryTheStringIsDisposedOfAllTheSame) {
    host.errorTexts[7] = "File not found.";
    const support::AllocationFaultScope fault(1);
    EXPECT_THROW(GetHostErrorText(7), std::bad_alloc);
    EXPECT_EQ(host.LiveHandleCount(), 0u);
}

TEST_F(HostErrorText, GoesIntoTheException) {
    host.errorTexts[-1] = "No r\xC3\xA9sum\xC3\xA9.";
    const ZKErrorException failure(-1);
    EXPECT_STREQ(failure.what(), "Error Code: -1 (ffffffff): No r\xC3\xA9sum\xC3\xA9.");
    EXPECT_EQ(failure.GetErrorCode(), -1);
}

TEST_F(HostErrorText, UnknownCodeHasItsFixedWordsInTheException) {
    EXPECT_STREQ(ZKErrorException(2).what(), "Error Code: 2 (00000002): Unknown error code or error text unavailable.");
}

TEST_F(HostErrorText, CodeAloneIsThrownFromAPlaceOfItsOwn) {
    host.errorTexts[42] = "Generic error.";
    try {
        ThrowIfZKError(42);
        FAIL() << "nothing thrown";
    } catch (const ZKErrorException& failure) {
        EXPECT_STREQ(failure.what(), "Error Code: 42 (0000002a): Generic error.");
        EXPECT_STREQ(failure.GetFile(), "qn/dsc/zk/ThrowIfZKError");
        EXPECT_EQ(failure.GetLine(), 75);
    }
}

TEST_F(HostErrorText, CallersTextAsksNothingOfTheHost) {
    EXPECT_THROW(ThrowIfZKError(42, "words"), ZKErrorException);
    EXPECT_EQ(TakeCalls(), Calls{});
}

TEST_F(HostErrorText, SuccessAsksNothingOfTheHost) {
    ThrowIfZKError(0);
    EXPECT_EQ(TakeCalls(), Calls{});
}

TEST(HostErrorTextDeathTest, IsFatalWithoutAHost) {
    EXPECT_EXIT(GetHostErrorText(7), testing::ExitedWithCode(1),
                "^Fatal Error: ZARVIKV\\.LIB was not called from a Zarvik process\\.\n$");
}

}  // namespace
}  // namespace qn::dsc::zk
