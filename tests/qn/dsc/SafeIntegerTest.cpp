#include "qn/dsc/SafeInteger.h"

#include <gtest/gtest.h>

namespace qn::dsc {
namespace {

TEST(SafeInteger, AddsUpToTheLargestValue) {
    EXPECT_EQ((SafeInteger(2) + SafeInteger(3)).Value(), 5U);
    EXPECT_EQ((SafeInteger(0) + SafeInteger(0)).Value(), 0U);
    EXPECT_EQ((SafeInteger(0xFFFFFFFE) + SafeInteger(1)).Value(), 0xFFFFFFFFU);
    EXPECT_EQ((SafeInteger(0xFFFFFFFF) + SafeInteger(0)).Value(), 0xFFFFFFFFU);
    EXPECT_EQ((SafeInteger(0x80000000) + SafeInteger(0x7FFFFFFF)).Value(), 0xFFFFFFFFU);
}

TEST(SafeInteger, RefusesASumAboveTheLargestValue) {
    EXPECT_THROW(SafeInteger(0xFFFFFFFF) + SafeInteger(1), exception::OutOfRange);
    EXPECT_THROW(SafeInteger(1) + SafeInteger(0xFFFFFFFF), exception::OutOfRange);
    EXPECT_THROW(SafeInteger(0x80000000) + SafeInteger(0x80000000), exception::OutOfRange);
    EXPECT_THROW(SafeInteger(0xFFFFFFFF) + SafeInteger(0xFFFFFFFF), exception::OutOfRange);
}

TEST(SafeInteger, DoublesWithoutTheTopBit) {
    EXPECT_EQ(SafeInteger(0).Doubled().Value(), 0U);
    EXPECT_EQ(SafeInteger(21).Doubled().Value(), 42U);
    EXPECT_EQ(SafeInteger(0x7FFFFFFF).Doubled().Value(), 0xFFFFFFFEU);
}

TEST(SafeInteger, RefusesToDoubleTheTopBit) {
    EXPECT_THROW(static_cast<void>(SafeInteger(0x80000000).Doubled()), exception::OutOfRange);
    EXPECT_THROW(static_cast<void>(SafeInteger(0xFFFFFFFF).Doubled()), exception::OutOfRange);
}

TEST(SafeInteger, RecordsWhereItThrew) {
    try {
        static_cast<void>(SafeInteger(0xFFFFFFFF).Doubled());
        FAIL() << "nothing thrown";
    } catch (const exception::Exception& failure) {
        EXPECT_STREQ(failure.what(), "Out of range");
        EXPECT_STREQ(failure.GetFile(), "qn/dsc/SafeInteger");
        EXPECT_GT(failure.GetLine(), 0);
    }
}

// In a constant expression as well.
static_assert((SafeInteger(2) + SafeInteger(3)).Doubled().Value() == 10);

}  // namespace
}  // namespace qn::dsc
