#include "hostbridge/HostString.h"

#include <cstring>
#include <new>

#include "host/HostTest.h"
#include "qn/dsc/zk/ThrowIfZKError.h"
#include "support/AllocationFaultScope.h"
#include "support/ExactText.h"
#include "support/StrayByte.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;
using qn::dsc::NarrowString;
using qn::dsc::String;
using qn::dsc::zk::ZKErrorException;
using Calls = std::vector<std::string>;

class HostStringTest : public HostTest {
  protected:
    HostStringTest() { host.errorTexts[42] = "Host says no."; }
    ~HostStringTest() override {
        if (text != nullptr) {
            DisposeHostString(text);
        }
    }

    // The whole block, length included.
    std::string Block() const { return std::string(*text, host.blockSizes.at(text)); }

    void Make(const std::string& bytes) {
        StoreInHostString(bytes.data(), static_cast<uint32_t>(bytes.size()), text);
        host.calls.clear();
    }

    HostHandle text = nullptr;
};

std::string Bytes(const NarrowString& text) {
    return std::string(text.CStr(), text.Length());
}

TEST_F(HostStringTest, NoHandleIsTheEmptyText) {
    EXPECT_EQ(Bytes(HostStringToNarrow(nullptr)), "");
    EXPECT_EQ(ExactText(HostStringToString(nullptr)), "");
}

TEST_F(HostStringTest, LengthZeroIsTheEmptyText) {
    Make("");
    ASSERT_NE(text, nullptr);
    EXPECT_EQ(Bytes(HostStringToNarrow(text)), "");
    EXPECT_EQ(ExactText(HostStringToString(text)), "");
}

TEST_F(HostStringTest, EndsWhereItsLengthSaysAndNotAtANul) {
    Make(std::string("a\0b", 3));
    EXPECT_EQ(Bytes(HostStringToNarrow(text)), std::string("a\0b", 3));
}

TEST_F(HostStringTest, WideningEndsAtANul) {
    Make(std::string("a\0b", 3));
    EXPECT_EQ(ExactText(HostStringToString(text)), "a");
}

TEST_F(HostStringTest, WidenedByTheDefaultCodePage) {
    Make("Z\xC3\xBCrich \xE2\x82\xAC \xF0\x9F\x98\x80 \xFF");
    EXPECT_EQ(ExactText(HostStringToString(text)), "Z{00FC}rich {20AC} {D83D}{DE00} " + StrayByte(0xFF));
}

TEST_F(HostStringTest, NarrowTextIsStoredWithItsLength) {
    StoreInHostString(NarrowString("abc"), text);
    EXPECT_EQ(Block(), std::string("\3\0\0\0abc", 7));
    EXPECT_EQ(TakeCalls(), Calls{"HostResizeArray 5 1 3"});
}

TEST_F(HostStringTest, NarrowTextKeepsItsNuls) {
    StoreInHostString(NarrowString("a\0b", 3), text);
    EXPECT_EQ(Block(), std::string("\3\0\0\0a\0b", 7));
}

TEST_F(HostStringTest, WideTextIsStoredInTheDefaultCodePage) {
    StoreInHostString(String(u"\u20AC\U0001F600"), text);
    EXPECT_EQ(Block(), "\7" + std::string(3, '\0') + "\xE2\x82\xAC\xF0\x9F\x98\x80");
}

TEST_F(HostStringTest, WideTextIsStoredUpToItsFirstNul) {
    StoreInHostString(String(u"a\0b", 3), text);
    EXPECT_EQ(Block(), std::string("\1\0\0\0a", 5));
}

TEST_F(HostStringTest, BytesAreStoredAsTheyAre) {
    StoreInHostString("\xFF\0\x01", 3, text);
    EXPECT_EQ(Block(), std::string("\3\0\0\0\xFF\0\1", 7));
}

TEST_F(HostStringTest, StoringReplacesAShorterAndALongerText) {
    Make("abc");
    StoreInHostString(NarrowString("a much longer text"), text);
    EXPECT_EQ(Bytes(HostStringToNarrow(text)), "a much longer text");
    StoreInHostString(NarrowString("x"), text);
    EXPECT_EQ(Block(), std::string("\1\0\0\0x", 5));
    EXPECT_EQ(host.LiveHandleCount(), 1u);
}

TEST_F(HostStringTest, HandleStaysWhenItsTextChanges) {
    Make("abc");
    HostHandle before = text;
    StoreInHostString(NarrowString("other"), text);
    EXPECT_EQ(text, before);
}

TEST_F(HostStringTest, LongTextIsStoredInOneStep) {
    const std::string bytes(1000000, 'x');
    StoreInHostString(bytes.data(), 1000000, text);
    EXPECT_EQ(Bytes(HostStringToNarrow(text)), bytes);
    EXPECT_EQ(TakeCalls(), Calls{"HostResizeArray 5 1 1000000"});
}

TEST_F(HostStringTest, TextGoesIntoAStringThatWasGivenByValue) {
    Make("old");
    StoreInGivenHostString(String(u"new one"), text);
    EXPECT_EQ(Bytes(HostStringToNarrow(text)), "new one");
    StoreInGivenHostString("a\0b", 3, text);
    EXPECT_EQ(Bytes(HostStringToNarrow(text)), std::string("a\0b", 3));
}

TEST_F(HostStringTest, WithoutAStringThatWasGivenByValueTheHostIsNotAsked) {
    TakeCalls();
    StoreInGivenHostString(String(u"new one"), nullptr);
    StoreInGivenHostString("bytes", 5, nullptr);
    EXPECT_EQ(TakeCalls(), Calls());
}

TEST_F(HostStringTest, ClearingMakesAnEmptyStringOfNothing) {
    ClearHostString(text);
    ASSERT_NE(text, nullptr);
    EXPECT_EQ(Block(), std::string(4, '\0'));
    EXPECT_EQ(TakeCalls(), Calls{"HostResizeArray 5 1 0"});
}

TEST_F(HostStringTest, ClearingEmptiesAText) {
    Make("abc");
    ClearHostString(text);
    EXPECT_EQ(Block(), std::string(4, '\0'));
}

TEST_F(HostStringTest, DisposingGivesTheHandleBackAndForgetsIt) {
    Make("abc");
    DisposeHostString(text);
    EXPECT_EQ(text, nullptr);
    EXPECT_EQ(host.LiveHandleCount(), 0u);
}

TEST_F(HostStringTest, DisposingOfNothingAsksTheHostAllTheSame) {
    DisposeHostString(text);
    EXPECT_EQ(text, nullptr);
    EXPECT_EQ(TakeCalls(), Calls{"HostDisposeHandle"});
}

TEST_F(HostStringTest, RefusedDisposalIsThrownAndKeepsTheHandle) {
    Make("abc");
    host.Fail("HostDisposeHandle", 42);
    EXPECT_THROW(DisposeHostString(text), ZKErrorException);
    ASSERT_NE(text, nullptr);
    EXPECT_EQ(Bytes(HostStringToNarrow(text)), "abc");
}

TEST_F(HostStringTest, RefusedStoringIsThrownWithTheHostsWords) {
    Make("abc");
    host.Fail("HostResizeArray", 42);
    try {
        StoreInHostString(NarrowString("longer than before"), text);
        FAIL() << "nothing thrown";
    } catch (const ZKErrorException& failure) {
        EXPECT_STREQ(failure.what(), "Error Code: 42 (0000002a): Host says no.");
        EXPECT_EQ(failure.GetErrorCode(), 42);
        EXPECT_STREQ(failure.GetFile(), "qn/dsc/zk/ThrowIfZKError");
        EXPECT_EQ(failure.GetLine(), 75);
    }
    EXPECT_EQ(Bytes(HostStringToNarrow(text)), "abc");
    EXPECT_EQ(host.LiveHandleCount(), 1u);
}

TEST_F(HostStringTest, EveryFormOfStoringThrowsWhatTheHostRefuses) {
    host.Fail("HostResizeArray", 2, 1);
    host.Fail("HostResizeArray", 2, 2);
    host.Fail("HostResizeArray", 2, 3);
    host.Fail("HostResizeArray", 2, 4);
    EXPECT_THROW(StoreInHostString(NarrowString("x"), text), ZKErrorException);
    EXPECT_THROW(StoreInHostString(String(u"x"), text), ZKErrorException);
    EXPECT_THROW(StoreInHostString("x", 1, text), ZKErrorException);
    EXPECT_THROW(ClearHostString(text), ZKErrorException);
    EXPECT_EQ(text, nullptr);
    EXPECT_EQ(host.LiveHandleCount(), 0u);
}

TEST_F(HostStringTest, NoMemoryToNarrowATextLeavesTheStringAlone) {
    Make("abc");
    const String wide(u"a text that needs a buffer of its own");
    {
        const support::AllocationFaultScope fault(1, true);
        EXPECT_THROW(StoreInHostString(wide, text), std::bad_alloc);
    }
    EXPECT_EQ(TakeCalls(), Calls{});
    EXPECT_EQ(Bytes(HostStringToNarrow(text)), "abc");
}

TEST(HostStringDeathTest, StoringWithoutAHostIsFatal) {
    HostHandle text = nullptr;
    EXPECT_EXIT(ClearHostString(text), testing::ExitedWithCode(1),
                "^Fatal Error: ZARVIKV\\.LIB was not called from a Zarvik process\\.\n$");
}

}  // namespace
}  // namespace zkhw
