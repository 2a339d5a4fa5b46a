#include "hostbridge/HostStringArray.h"

#include "host/HostTest.h"
#include "hostbridge/HostString.h"
#include "qn/dsc/zk/ThrowIfZKError.h"

namespace zkhw {
namespace {

using qn::dsc::String;
using qn::dsc::zk::ZKErrorException;
using Calls = std::vector<std::string>;
using Texts = std::vector<std::string>;

// Of an array block with that many elements, where pointers have 64 bits.
static_assert(sizeof(void*) != 8 || offsetof(HostStringArrayBlock, elements) == 8);

class HostStringArrayTest : public HostTest {
  protected:
    ~HostStringArrayTest() override {
        if (array != nullptr) {
            host.faults.clear();
            ResizeHostStringArray(0, array);
            HostDisposeHandle(array);
        }
    }

    // Strings "0", "1", ...
    void Make(int32_t count) {
        ResizeHostStringArray(count, array);
        for (uint32_t i = 0; i < static_cast<uint32_t>(count); ++i) {
            StoreInHostStringArray(String(std::to_string(i).c_str()), array, i);
        }
        host.calls.clear();
    }

    // "null" for a string that isn't there.
    Texts Strings() const {
        Texts texts;
        for (int32_t i = 0; i < GetHostStringArrayCount(array); ++i) {
            HostHandle element = GetHostStringArrayElement(array, static_cast<uint32_t>(i));
            texts.push_back(element == nullptr ? "null" : HostStringToNarrow(element).CStr());
        }
        return texts;
    }

    // The code of what ResizeHostStringArray throws; 0 if nothing.
    int32_t Resize(int32_t newSize) {
        try {
            ResizeHostStringArray(newSize, array);
        } catch (const ZKErrorException& failure) {
            return failure.GetErrorCode();
        }
        return 0;
    }

    HostHandle array = nullptr;
};

TEST_F(HostStringArrayTest, NoArrayHasTheCountMinusOne) {
    EXPECT_EQ(GetHostStringArrayCount(nullptr), -1);
}

TEST_F(HostStringArrayTest, ResizingNothingToZeroMakesAnEmptyArray) {
    ResizeHostStringArray(0, array);
    ASSERT_NE(array, nullptr);
    EXPECT_EQ(GetHostStringArrayCount(array), 0);
    EXPECT_EQ(TakeCalls(), Calls{"HostNewHandleClear 8"});
}

TEST_F(HostStringArrayTest, ResizingNothingMakesEmptyStrings) {
    ResizeHostStringArray(3, array);
    EXPECT_EQ(Strings(), (Texts{"", "", ""}));
    EXPECT_EQ(host.LiveHandleCount(), 4u);
    EXPECT_EQ(TakeCalls(), (Calls{"HostNewHandleClear 32", "HostResizeArray 5 1 0", "HostResizeArray 5 1 0",
                                  "HostResizeArray 5 1 0"}));
}

TEST_F(HostStringArrayTest, GrowingKeepsTheOldStringsAndAddsEmptyOnes) {
    Make(2);
    ResizeHostStringArray(4, array);
    EXPECT_EQ(Strings(), (Texts{"0", "1", "", ""}));
    EXPECT_EQ(TakeCalls(), (Calls{"HostSetHandleSizeClear 40", "HostResizeArray 5 1 0", "HostResizeArray 5 1 0"}));
}

TEST_F(HostStringArrayTest, EmptyArrayGrows) {
    Make(0);
    ResizeHostStringArray(3, array);
    EXPECT_EQ(Strings(), (Texts{"", "", ""}));
}

TEST_F(HostStringArrayTest, ShrinkingDisposesOfTheLastStringsInAscendingOrder) {
    Make(5);
    HostHandle third = GetHostStringArrayElement(array, 3);
    // The first disposal fails, so what it was for is still there, and the one behind it as well.
    host.Fail("HostDisposeHandle", 42);
    EXPECT_EQ(Resize(3), 42);
    EXPECT_EQ(GetHostStringArrayElement(array, 3), third);
    host.calls.clear();
    ResizeHostStringArray(3, array);
    EXPECT_EQ(Strings(), (Texts{"0", "1", "2"}));
    EXPECT_EQ(host.LiveHandleCount(), 4u);
    EXPECT_EQ(TakeCalls(), (Calls{"HostDisposeHandle", "HostDisposeHandle", "HostSetHandleSizeClear 32"}));
}

TEST_F(HostStringArrayTest, ShrinkingToZeroKeepsTheArray) {
    Make(2);
    HostHandle before = array;
    ResizeHostStringArray(0, array);
    EXPECT_EQ(array, before);
    EXPECT_EQ(GetHostStringArrayCount(array), 0);
    EXPECT_EQ(host.LiveHandleCount(), 1u);
}

TEST_F(HostStringArrayTest, RightSizeNeedsNothing) {
    Make(2);
    ResizeHostStringArray(2, array);
    EXPECT_EQ(TakeCalls(), Calls{});
    EXPECT_EQ(Strings(), (Texts{"0", "1"}));
}

TEST_F(HostStringArrayTest, LargeArrayGrowsAndShrinks) {
    host.movesAllBlocks = false;
    Make(20000);
    EXPECT_STREQ(HostStringToNarrow(GetHostStringArrayElement(array, 19999)).CStr(), "19999");
    ResizeHostStringArray(1, array);
    EXPECT_EQ(Strings(), Texts{"0"});
    EXPECT_EQ(host.LiveHandleCount(), 2u);
}

TEST_F(HostStringArrayTest, NegativeSizeIsThrownBeforeTheHostIsAsked) {
    Make(2);
    for (const int32_t size : {-1, INT32_MIN}) {
        try {
            ResizeHostStringArray(size, array);
            FAIL() << "nothing thrown";
        } catch (const ZKErrorException& failure) {
            EXPECT_STREQ(failure.what(), "Error Code: 1 (00000001): Invalid new_size for array.");
            EXPECT_EQ(failure.GetErrorCode(), 1);
            EXPECT_STREQ(failure.GetFile(), "qn/dsc/zk/ThrowIfZKError");
            EXPECT_EQ(failure.GetLine(), 61);
        }
    }
    EXPECT_EQ(TakeCalls(), Calls{});
    EXPECT_EQ(Strings(), (Texts{"0", "1"}));
}

TEST_F(HostStringArrayTest, NegativeSizeOfNoArrayIsThrownAsWell) {
    EXPECT_EQ(Resize(-1), 1);
    EXPECT_EQ(array, nullptr);
}

TEST_F(HostStringArrayTest, NoMemoryForANewArrayIsCodeTwo) {
    host.errorTexts[2] = "Not enough memory.";
    host.Fail("HostNewHandleClear", 99);
    try {
        ResizeHostStringArray(3, array);
        FAIL() << "nothing thrown";
    } catch (const ZKErrorException& failure) {
        EXPECT_STREQ(failure.what(), "Error Code: 2 (00000002): Not enough memory.");
        EXPECT_EQ(failure.GetErrorCode(), 2);
        EXPECT_EQ(failure.GetLine(), 75);
    }
    EXPECT_EQ(array, nullptr);
    EXPECT_EQ(host.LiveHandleCount(), 0u);
}

TEST_F(HostStringArrayTest, RefusedGrowthKeepsTheArray) {
    Make(2);
    host.Fail("HostSetHandleSizeClear", 42);
    EXPECT_EQ(Resize(4), 42);
    EXPECT_EQ(Strings(), (Texts{"0", "1"}));
}

TEST_F(HostStringArrayTest, RefusedShrinkingLeavesNullsBehindTheStringsThatStay) {
    Make(4);
    host.Fail("HostSetHandleSizeClear", 42);
    EXPECT_EQ(Resize(2), 42);
    EXPECT_EQ(Strings(), (Texts{"0", "1", "null", "null"}));
    EXPECT_EQ(host.LiveHandleCount(), 3u);
}

TEST_F(HostStringArrayTest, RefusedDisposalStopsTheShrinkingWhereItIs) {
    Make(4);
    host.Fail("HostDisposeHandle", 42, 2);
    EXPECT_EQ(Resize(1), 42);
    EXPECT_EQ(Strings(), (Texts{"0", "null", "2", "3"}));
}

TEST_F(HostStringArrayTest, RefusedNewStringGivesBackThoseBeforeIt) {
    Make(2);
    for (uint64_t nth = 1; nth <= 3; ++nth) {
        host.Fail("HostResizeArray", 42, nth);
        EXPECT_EQ(Resize(5), 42) << nth;
        EXPECT_EQ(Strings(), (Texts{"0", "1"})) << nth;
        EXPECT_EQ(host.LiveHandleCount(), 3u) << nth;
    }
    EXPECT_EQ(Resize(5), 0);
    EXPECT_EQ(Strings(), (Texts{"0", "1", "", "", ""}));
}

TEST_F(HostStringArrayTest, RefusedNewStringOfANewArrayLeavesItEmpty) {
    host.Fail("HostResizeArray", 42, 3);
    EXPECT_EQ(Resize(3), 42);
    ASSERT_NE(array, nullptr);
    EXPECT_EQ(GetHostStringArrayCount(array), 0);
    EXPECT_EQ(host.LiveHandleCount(), 1u);
}

TEST_F(HostStringArrayTest, StoringReplacesOneString) {
    Make(3);
    StoreInHostStringArray(u"\u20AC and more", array, 1);
    EXPECT_EQ(Strings(), (Texts{"0", "\xE2\x82\xAC and more", "2"}));
    EXPECT_EQ(host.LiveHandleCount(), 4u);
}

TEST_F(HostStringArrayTest, StoringFillsAStringThatIsNull) {
    Make(2);
    DisposeHostStringArrayElement(array, 0);
    EXPECT_EQ(Strings(), (Texts{"null", "1"}));
    StoreInHostStringArray(u"new", array, 0);
    EXPECT_EQ(Strings(), (Texts{"new", "1"}));
}

TEST_F(HostStringArrayTest, RefusedStoringKeepsTheString) {
    Make(2);
    host.Fail("HostResizeArray", 42);
    EXPECT_THROW(StoreInHostStringArray(u"longer", array, 1), ZKErrorException);
    EXPECT_EQ(Strings(), (Texts{"0", "1"}));
}

TEST_F(HostStringArrayTest, RefusedDisposalKeepsTheString) {
    Make(2);
    host.Fail("HostDisposeHandle", 42);
    EXPECT_THROW(DisposeHostStringArrayElement(array, 1), ZKErrorException);
    EXPECT_EQ(Strings(), (Texts{"0", "1"}));
}

class HostStringArrayBounds : public HostStringArrayTest {
  protected:
    template <typename Access>
    static void ExpectOutOfBounds(Access access) {
        try {
            access();
            ADD_FAILURE() << "nothing thrown";
        } catch (const ZKErrorException& failure) {
            EXPECT_STREQ(failure.what(), "Error Code: 1 (00000001): Array index out of bounds.");
            EXPECT_EQ(failure.GetErrorCode(), 1);
            EXPECT_STREQ(failure.GetFile(), "qn/dsc/zk/ThrowIfZKError");
            EXPECT_EQ(failure.GetLine(), 61);
        }
    }
};

TEST_F(HostStringArrayBounds, IndexAtTheCountAndBehindItIsThrown) {
    Make(2);
    for (const uint32_t index : {2u, 3u, 0x80000000u, 0xFFFFFFFFu}) {
        ExpectOutOfBounds([&] { GetHostStringArrayElement(array, index); });
        ExpectOutOfBounds([&] { StoreInHostStringArray(u"x", array, index); });
        ExpectOutOfBounds([&] { DisposeHostStringArrayElement(array, index); });
    }
    EXPECT_EQ(TakeCalls(), Calls{});
}

TEST_F(HostStringArrayBounds, EmptyArrayHasNoElement) {
    Make(0);
    ExpectOutOfBounds([&] { GetHostStringArrayElement(array, 0); });
}

TEST_F(HostStringArrayBounds, NoArrayHasNoElement) {
    ExpectOutOfBounds([&] { GetHostStringArrayElement(nullptr, 0); });
}

}  // namespace
}  // namespace zkhw
