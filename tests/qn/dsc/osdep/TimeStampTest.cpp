#include "qn/dsc/osdep/TimeStamp.h"

#include <gtest/gtest.h>

namespace qn::dsc::osdep {

namespace {

// 1904-01-01 in 100 ns ticks since 1601.
constexpr uint64_t ticksTo1904 = 0x0153B281E0FB4000;

TEST(TimeStamp, IsZeroAtFirst) {
    EXPECT_EQ(TimeStamp().seconds, 0);
    EXPECT_EQ(TimeStamp().fraction, 0u);
}

TEST(TimeStamp, CountsFromTheStartOf1904) {
    EXPECT_EQ(TimeStamp::FromFileTime(ticksTo1904), TimeStamp());
    EXPECT_EQ(TimeStamp::FromFileTime(ticksTo1904 + 10000000), (TimeStamp{1, 0}));
    // 1970-01-01: 66 years with 17 leap days, 24107 days.
    EXPECT_EQ(TimeStamp::FromFileTime(116444736000000000), (TimeStamp{24107 * 86400LL, 0}));
}

TEST(TimeStamp, FractionsAreBinary) {
    EXPECT_EQ(TimeStamp::FromFileTime(ticksTo1904 + 5000000), (TimeStamp{0, 0x8000000000000000}));
    EXPECT_EQ(TimeStamp::FromFileTime(ticksTo1904 + 12500000), (TimeStamp{1, 0x4000000000000000}));
}

TEST(TimeStamp, TheFractionGoesThroughDoublePrecision) {
    // 0.1 as a double is 0x1.999999999999Ap-4: its bits end 56 places behind the point.
    EXPECT_EQ(TimeStamp::FromFileTime(ticksTo1904 + 1000000), (TimeStamp{0, 0x1999999999999A00}));
    // 1e-7 as a double is 0x1.AD7F29ABCAF48p-24.
    EXPECT_EQ(TimeStamp::FromFileTime(ticksTo1904 + 1), (TimeStamp{0, 0x000001AD7F29ABCAu}));
}

TEST(TimeStamp, TimesBefore1904AreNegative) {
    EXPECT_EQ(TimeStamp::FromFileTime(ticksTo1904 - 10000000), (TimeStamp{-1, 0}));
    EXPECT_EQ(TimeStamp::FromFileTime(ticksTo1904 - 5000000), (TimeStamp{-1, 0x8000000000000000}));
    EXPECT_EQ(TimeStamp::FromFileTime(ticksTo1904 - 12500000), (TimeStamp{-2, 0xC000000000000000}));
    EXPECT_EQ(TimeStamp::FromFileTime(0), (TimeStamp{-9561628800, 0}));
}

TEST(TimeStamp, OneTickMakesADifference) {
    const uint64_t ticks = 132000000000000000;
    EXPECT_LT(TimeStamp::FromFileTime(ticks), TimeStamp::FromFileTime(ticks + 1));
    EXPECT_EQ(TimeStamp::FromFileTime(ticks), TimeStamp::FromFileTime(ticks));
    EXPECT_LT(TimeStamp::FromFileTime(ticks + 9999999), TimeStamp::FromFileTime(ticks + 10000000));
}

TEST(TimeStamp, SecondsAreComparedSignedBeforeTheFraction) {
    EXPECT_LT((TimeStamp{-1, UINT64_MAX}), (TimeStamp{0, 0}));
    EXPECT_LT((TimeStamp{1, UINT64_MAX}), (TimeStamp{2, 0}));
    EXPECT_GT((TimeStamp{0, 1}), TimeStamp());
}

TEST(TimeStamp, TheFractionIsComparedUnsigned) {
    EXPECT_LT((TimeStamp{5, 1}), (TimeStamp{5, 0x8000000000000000}));
    EXPECT_LT((TimeStamp{5, 0x7FFFFFFFFFFFFFFF}), (TimeStamp{5, UINT64_MAX}));
    EXPECT_NE((TimeStamp{5, 0}), (TimeStamp{5, 1}));
}

TEST(TimeStamp, ZeroIsEarlierThanAnyTimeOfToday) {
    EXPECT_LT(TimeStamp(), TimeStamp::FromFileTime(116444736000000000));
}

}  // namespace

}  // namespace qn::dsc::osdep
