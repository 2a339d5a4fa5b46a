#include "qn/dsc/NumericCast.h"

#include <gtest/gtest.h>

namespace qn::dsc {
namespace {

TEST(NumericCast, KeepsWhatIsNotNegative) {
    EXPECT_EQ(NumericCast(0), 0U);
    EXPECT_EQ(NumericCast(1), 1U);
    EXPECT_EQ(NumericCast(INT32_MAX), 0x7FFFFFFFU);
}

TEST(NumericCast, RefusesANegativeValue) {
    EXPECT_THROW(NumericCast(-1), exception::OutOfRange);
    EXPECT_THROW(NumericCast(INT32_MIN), exception::OutOfRange);
}

TEST(NumericCast, RecordsWhereItThrew) {
    try {
        NumericCast(-1);
        FAIL() << "nothing thrown";
    } catch (const exception::Exception& failure) {
        EXPECT_STREQ(failure.what(), "Out of range");
        EXPECT_STREQ(failure.GetFile(), "qn/dsc/NumericCast");
        EXPECT_GT(failure.GetLine(), 0);
    }
}

}  // namespace
}  // namespace qn::dsc
