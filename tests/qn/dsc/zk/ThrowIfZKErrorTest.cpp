#include "qn/dsc/zk/ThrowIfZKError.h"

#include <cstring>
#include <new>
#include <type_traits>

#include <gtest/gtest.h>

#include "support/AllocationFaultScope.h"

// The forms that ask the host for its words are tested where there is a host, in tests/hostbridge.

namespace qn::dsc::zk {
namespace {

TEST(ZKErrorException, SaysItsCodeInBothFormsAndThenTheText) {
    EXPECT_STREQ(ZKErrorException(1, "Some text.").what(), "Error Code: 1 (00000001): Some text.");
}

TEST(ZKErrorException, NegativeCodeIsASignedDecimalAndEightDigits) {
    EXPECT_STREQ(ZKErrorException(-1, "x").what(), "Error Code: -1 (ffffffff): x");
    EXPECT_STREQ(ZKErrorException(INT32_MIN, "x").what(), "Error Code: -2147483648 (80000000): x");
}

TEST(ZKErrorException, GreatestCodeHasAllItsDigits) {
    EXPECT_STREQ(ZKErrorException(INT32_MAX, "x").what(), "Error Code: 2147483647 (7fffffff): x");
}

TEST(ZKErrorException, CodeMayBeZero) {
    EXPECT_STREQ(ZKErrorException(0, "x").what(), "Error Code: 0 (00000000): x");
}

TEST(ZKErrorException, NullTextCountsAsEmpty) {
    EXPECT_STREQ(ZKErrorException(2, nullptr).what(), "Error Code: 2 (00000002): ");
}

TEST(ZKErrorException, TextIsTakenAsItIsAndAtAnyLength) {
    const NarrowString text(1000, '%');
    EXPECT_EQ(std::strlen(ZKErrorException(2, text.CStr()).what()), std::strlen("Error Code: 2 (00000002): ") + 1000);
}

TEST(ZKErrorException, GivesItsCode) {
    const ZKErrorException failure(-508, "x");
    EXPECT_EQ(failure.GetErrorCode(), -508);
    EXPECT_EQ(static_cast<const exception::Exception&>(failure).GetErrorCode(), -508);
}

TEST(ZKErrorException, BelongsToTheTreeOfTheFoundation) {
    EXPECT_TRUE((std::is_base_of_v<exception::Exception, ZKErrorException>));
}

TEST(ZKErrorException, CopyKeepsTextCodeAndPlace) {
    ZKErrorException failure(7, "gone");
    failure.SetLine(5);
    failure.SetFile("qn/dsc/Anything");
    const ZKErrorException copy(failure);
    EXPECT_STREQ(copy.what(), "Error Code: 7 (00000007): gone");
    EXPECT_EQ(copy.GetErrorCode(), 7);
    EXPECT_EQ(copy.GetLine(), 5);
    EXPECT_STREQ(copy.GetFile(), "qn/dsc/Anything");
}

TEST(ZKErrorException, WithoutMemoryIsABadAllocation) {
    const support::AllocationFaultScope fault(1, true);
    EXPECT_THROW(ZKErrorException(7, "gone"), std::bad_alloc);
}

TEST(ThrowIfZKError, SuccessIsNoException) {
    EXPECT_NO_THROW(ThrowIfZKError(0));
    EXPECT_NO_THROW(ThrowIfZKError(0, "a text"));
    EXPECT_NO_THROW(ThrowIfZKError(0, nullptr));
}

TEST(ThrowIfZKError, ThrowsTheCallersTextFromItsOwnPlace) {
    try {
        ThrowIfZKError(1, "Invalid new_size for array.");
        FAIL() << "nothing thrown";
    } catch (const ZKErrorException& failure) {
        EXPECT_STREQ(failure.what(), "Error Code: 1 (00000001): Invalid new_size for array.");
        EXPECT_EQ(failure.GetErrorCode(), 1);
        EXPECT_STREQ(failure.GetFile(), "qn/dsc/zk/ThrowIfZKError");
        EXPECT_EQ(failure.GetLine(), 61);
    }
}

TEST(ThrowIfZKError, NegativeCodesAreErrorsToo) {
    EXPECT_THROW(ThrowIfZKError(-1, "x"), ZKErrorException);
}

}  // namespace
}  // namespace qn::dsc::zk
