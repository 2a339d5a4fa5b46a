// How the lists of the exported queries come into arrays of the host, and what is left of them when the host refuses.

#include "library/ExportsTest.h"
#include "library/RecordingTree.h"

namespace zkhw {
namespace {

using Calls = std::vector<std::string>;

constexpr const char* outOfBounds = "1 | Error Code: 1 (00000001): Array index out of bounds.";

class StoreList : public ExportsTest {
  protected:
    StoreList() { host.errorTexts[9] = "words"; }

    HRESULT Store() { return FPGAResTree_GetDescendantNames("a", "", "", &list.array, &found); }
    std::string ErrorOfStoring() {
        return ErrorOf([this] { Store(); });
    }
    // Of the elements that belong to the array's caller.
    void Make(const Calls& texts) {
        list.Make(texts);
        TakeCalls();
    }

    RecordingTree tree;
    HostTexts list;
    unsigned char found = 0xAA;
};

TEST_F(StoreList, NullArrayIsMade) {
    tree.texts = {u"x", u"yz"};
    EXPECT_EQ(Store(), S_OK);
    EXPECT_EQ(TakeCalls(), (Calls{"HostNewHandleClear 24", "HostResizeArray 5 1 0", "HostResizeArray 5 1 0",
                                  "HostResizeArray 5 1 1", "HostResizeArray 5 1 2"}));
    EXPECT_EQ(list.Texts(), (Calls{"x", "yz"}));
}

TEST_F(StoreList, EmptyListMakesAnEmptyArray) {
    EXPECT_EQ(Store(), S_OK);
    EXPECT_EQ(TakeCalls(), Calls{"HostNewHandleClear 8"});
    ASSERT_NE(list.array, nullptr);
    EXPECT_EQ(GetHostStringArrayCount(list.array), 0);
    EXPECT_EQ(found, 1);
}

TEST_F(StoreList, LongerArrayGivesItsLastStringsBack) {
    Make({"a", "b", "c", "d", "e"});
    tree.texts = {u"x", u"y"};
    EXPECT_EQ(Store(), S_OK);
    EXPECT_EQ(TakeCalls(), (Calls{"HostDisposeHandle", "HostDisposeHandle", "HostDisposeHandle",
                                  "HostSetHandleSizeClear 24", "HostResizeArray 5 1 1", "HostResizeArray 5 1 1"}));
    EXPECT_EQ(list.Texts(), (Calls{"x", "y"}));
}

TEST_F(StoreList, ShorterArrayGrows) {
    Make({"a"});
    tree.texts = {u"x", u"y", u"z"};
    EXPECT_EQ(Store(), S_OK);
    EXPECT_EQ(TakeCalls(), (Calls{"HostSetHandleSizeClear 32", "HostResizeArray 5 1 0", "HostResizeArray 5 1 0",
                                  "HostResizeArray 5 1 1", "HostResizeArray 5 1 1", "HostResizeArray 5 1 1"}));
    EXPECT_EQ(list.Texts(), (Calls{"x", "y", "z"}));
}

TEST_F(StoreList, ArrayOfTheRightSizeIsOnlyFilled) {
    Make({"a", "b"});
    tree.texts = {u"x", u"y"};
    EXPECT_EQ(Store(), S_OK);
    EXPECT_EQ(TakeCalls(), (Calls{"HostResizeArray 5 1 1", "HostResizeArray 5 1 1"}));
}

TEST_F(StoreList, EmptyListTakesAllStringsAway) {
    Make({"a", "b"});
    EXPECT_EQ(Store(), S_OK);
    EXPECT_EQ(TakeCalls(), (Calls{"HostDisposeHandle", "HostDisposeHandle", "HostSetHandleSizeClear 8"}));
    EXPECT_EQ(list.Texts(), Calls{});
}

TEST_F(StoreList, LongListIsStoredWhole) {
    host.movesAllBlocks = false;
    Calls expected;
    for (int i = 0; i < 3000; ++i) {
        expected.push_back("name " + std::to_string(i));
        tree.texts.emplace_back(expected.back().begin(), expected.back().end());
    }
    EXPECT_EQ(Store(), S_OK);
    EXPECT_EQ(list.Texts(), expected);
}

// The strings from the failing one down to the first are given back; those behind it stay. Going on below the first is
// what the host gets to hear of.
TEST_F(StoreList, FailureAtAnElementGivesAllUpToItBack) {
    Make({"a", "b", "c"});
    tree.texts = {u"x", u"y", u"z"};
    host.Fail("HostResizeArray", 9, 2);
    EXPECT_EQ(ErrorOfStoring(), outOfBounds);
    EXPECT_EQ(TakeCalls(), (Calls{"HostResizeArray 5 1 1", "HostResizeArray 5 1 1", "HostGetErrorText 9",
                                  "HostDisposeHandle",  // Of the words.
                                  "HostDisposeHandle", "HostDisposeHandle"}));
    EXPECT_EQ(list.Texts(), (Calls{"null", "null", "c"}));
    EXPECT_EQ(found, 1);
}

TEST_F(StoreList, FailureAtTheFirstElementGivesThatBack) {
    Make({"a", "b"});
    tree.texts = {u"x", u"y"};
    host.Fail("HostResizeArray", 9);
    EXPECT_EQ(ErrorOfStoring(), outOfBounds);
    EXPECT_EQ(list.Texts(), (Calls{"null", "b"}));
}

TEST_F(StoreList, FailureAtTheLastElementGivesAllBack) {
    tree.texts = {u"x", u"y", u"z"};
    host.Fail("HostResizeArray", 9, 6);
    EXPECT_EQ(ErrorOfStoring(), outOfBounds);
    EXPECT_EQ(list.Texts(), (Calls{"null", "null", "null"}));
}

TEST_F(StoreList, FailureOfGivingBackIsWhatTheHostHears) {
    Make({"a", "b"});
    tree.texts = {u"x", u"y"};
    host.errorTexts.clear();
    host.Fail("HostResizeArray", 9, 2);
    host.Fail("HostDisposeHandle", 8, 2);
    EXPECT_EQ(ErrorOfStoring(), "8 | Error Code: 8 (00000008): Unknown error code or error text unavailable.");
    EXPECT_EQ(list.Texts(), (Calls{"x", "null"}));
}

TEST_F(StoreList, ArrayCanBeUsedAgainAfterAFailure) {
    Make({"a", "b", "c"});
    tree.texts = {u"x", u"y", u"z"};
    host.Fail("HostResizeArray", 9, 3);
    EXPECT_EQ(ErrorOfStoring(), outOfBounds);
    EXPECT_EQ(Store(), S_OK);
    EXPECT_EQ(list.Texts(), (Calls{"x", "y", "z"}));
}

// Before the first text is stored there is nothing to give back: the host's own error comes out.
TEST_F(StoreList, FailureOfResizingComesOutAsItIs) {
    tree.texts = {u"x", u"y"};
    host.Fail("HostNewHandleClear", 1);
    EXPECT_EQ(ErrorOfStoring(), "2 | Error Code: 2 (00000002): Unknown error code or error text unavailable.");
    EXPECT_EQ(list.array, nullptr);

    host.Fail("HostResizeArray", 9, 2);
    EXPECT_EQ(ErrorOfStoring(), "9 | Error Code: 9 (00000009): words");
    EXPECT_EQ(list.Texts(), Calls{});

    Make({"a"});
    host.Fail("HostSetHandleSizeClear", 9);
    EXPECT_EQ(ErrorOfStoring(), "9 | Error Code: 9 (00000009): words");
    EXPECT_EQ(list.Texts(), Calls{"a"});

    Make({"a", "b", "c", "d"});
    host.Fail("HostDisposeHandle", 9, 2);
    EXPECT_EQ(ErrorOfStoring(), "9 | Error Code: 9 (00000009): words");
    EXPECT_EQ(list.Texts(), (Calls{"a", "b", "null", "d"}));
}

TEST_F(StoreList, EveryCallOfTheHostMayFail) {
    for (const char* function :
         {"HostNewHandleClear", "HostResizeArray", "HostDisposeHandle", "HostSetHandleSizeClear"}) {
        for (uint64_t nth = 1; nth <= 6; ++nth) {
            for (const Calls& before : {Calls{}, Calls{"a"}, Calls{"a", "b", "c", "d", "e"}}) {
                HostTexts texts;
                if (!before.empty()) {
                    texts.Make(before);
                }
                tree.texts = {u"x", u"y", u"z"};
                host.Fail(function, 9, nth);
                const std::string error =
                    ErrorOf([&] { FPGAResTree_GetMultipleProperties("a", "", "", &texts.array, &found); });
                const bool wasReached = host.Count(function) >= host.faults.begin()->first.second;
                EXPECT_EQ(error == "nothing", !wasReached) << function << " " << nth;
                host.faults.clear();
            }
        }
    }
}

}  // namespace
}  // namespace zkhw
