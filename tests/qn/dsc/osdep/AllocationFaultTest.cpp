#include "qn/dsc/osdep/AllocationFault.h"

#include <gtest/gtest.h>

#include <vector>

namespace qn::dsc::osdep {
namespace {

std::vector<bool> NextAnswers(int count) {
    std::vector<bool> answers;
    for (int number = 0; number < count; ++number) {
        answers.push_back(ShouldFailAllocation());
    }
    return answers;
}

TEST(AllocationFault, NothingFailsByDefault) {
    EXPECT_FALSE(IsAllocationFaultSet());
    EXPECT_EQ(NextAnswers(3), (std::vector<bool>{false, false, false}));
}

TEST(AllocationFault, TheNthAloneFails) {
    FailAllocation(2, false);
    EXPECT_EQ(NextAnswers(4), (std::vector<bool>{false, true, false, false}));
    ClearAllocationFault();
}

TEST(AllocationFault, AllFromTheNthOnFail) {
    FailAllocation(3, true);
    EXPECT_EQ(NextAnswers(5), (std::vector<bool>{false, false, true, true, true}));
    ClearAllocationFault();
}

TEST(AllocationFault, CountsFromItsOwnBeginning) {
    FailAllocation(UINT64_MAX, false);
    NextAnswers(4);
    EXPECT_EQ(AllocationCount(), 4U);
    FailAllocation(UINT64_MAX, false);
    NextAnswers(2);
    EXPECT_EQ(AllocationCount(), 2U);
    ClearAllocationFault();
    NextAnswers(5);
    EXPECT_EQ(AllocationCount(), 2U);
}

TEST(AllocationFault, ClearedMakesNothingFail) {
    FailAllocation(1, true);
    ClearAllocationFault();
    EXPECT_EQ(NextAnswers(2), (std::vector<bool>{false, false}));
}

}  // namespace
}  // namespace qn::dsc::osdep
