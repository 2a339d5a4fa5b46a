#include "qn/dsc/osdep/OSException.h"

#include <gtest/gtest.h>

#include <atomic>
#include <cerrno>
#include <cstring>
#include <new>
#include <string>
#include <thread>

#include "qn/dsc/osdep/SystemError.h"
#include "support/AllocationFaultScope.h"

namespace qn::dsc::osdep {
namespace {

WinError WinErrorOf(uint32_t number) {
    SetLastSystemError(number);
    return WinError();
}

PosixError PosixErrorOf(int number) {
    errno = number;
    return PosixError();
}

struct CodeRow {
    uint32_t number;
    uint32_t code;
};

TEST(OSException, IsUnknownByDefault) {
    const OSException failure;
    EXPECT_STREQ(failure.what(), "Unknown error");
    EXPECT_EQ(failure.GetSystemError(), 0U);
    EXPECT_EQ(failure.GetErrorCode(), 42);
    EXPECT_EQ(failure.GetLine(), 0);
    EXPECT_EQ(failure.GetFile(), nullptr);
}

TEST(WinError, MapsEachKnownNumberToItsCode) {
    constexpr CodeRow rows[] = {
        {0, 0},
        {2, 7},
        {3, 7},
        {15, 7},
        {4, 11},
        {5, 0x80070005},
        {6, 1},
        {87, 1},
        {8, 2},
        {14, 2},
        {11, 23},
        {16, 8},
        {19, 8},
        {32, 8},
        {33, 8},
        {20, 37},
        {38, 4},
        {39, 9},
        {23, static_cast<uint32_t>(-508)},
        {80, static_cast<uint32_t>(-98)},
    };
    for (const CodeRow& row : rows) {
        const WinError failure = WinErrorOf(row.number);
        EXPECT_EQ(static_cast<uint32_t>(failure.GetErrorCode()), row.code) << row.number;
        EXPECT_EQ(failure.GetSystemError(), row.number);
    }
}

TEST(WinError, MapsEveryOtherNumberTo42) {
    for (const uint32_t number : {1U,  7U,  9U,  10U, 12U, 13U, 17U, 18U,  21U,  22U,         24U,        31U,
                                  34U, 37U, 40U, 79U, 81U, 86U, 88U, 112U, 183U, 0x7FFFFFFFU, 0xFFFFFFFFU}) {
        EXPECT_EQ(WinErrorOf(number).GetErrorCode(), 42) << number;
    }
}

// Wine words the errors of the system in its own way.
TEST(WinError, HasTheMessageWithoutStopAndLineBreakAsOnlyLinuxHasTheseWords) {
    const WinError failure = WinErrorOf(2);
    EXPECT_STREQ(failure.what(), "The system cannot find the file specified");
    EXPECT_EQ(failure.GetErrorCode(), 7);
}

TEST(WinError, HasTheSystemsTextsAsOnlyLinuxHasTheseWords) {
    EXPECT_STREQ(WinErrorOf(0).what(), "The operation completed successfully");
    EXPECT_STREQ(WinErrorOf(3).what(), "The system cannot find the path specified");
    EXPECT_STREQ(WinErrorOf(5).what(), "Access is denied");
    EXPECT_STREQ(WinErrorOf(6).what(), "The handle is invalid");
    EXPECT_STREQ(WinErrorOf(15).what(), "The system cannot find the drive specified");
    EXPECT_STREQ(WinErrorOf(19).what(), "The media is write protected");
    EXPECT_STREQ(WinErrorOf(32).what(),
                 "The process cannot access the file because it is being used by another process");
    EXPECT_STREQ(WinErrorOf(80).what(), "The file exists");
    EXPECT_STREQ(WinErrorOf(87).what(), "The parameter is incorrect");
    EXPECT_STREQ(WinErrorOf(1113).what(),
                 "No mapping for the Unicode character exists in the target multi-byte code page");
}

TEST(WinError, OfANumberWithoutATextIsUnknown) {
    const WinError failure = WinErrorOf(0x20000001);
    EXPECT_STREQ(failure.what(), "Unknown error");
    EXPECT_EQ(failure.GetSystemError(), 0x20000001U);
    EXPECT_EQ(failure.GetErrorCode(), 42);
}

TEST(WinError, TakesTheNumberOfItsOwnThread) {
    // Each waits for the other without a call of the system, which could have a number of its own.
    std::atomic<int> step = 0;
    uint32_t numberElsewhere = 1;
    std::thread other([&] {
        while (step != 1) {
        }
        SetLastSystemError(2);
        step = 2;
        while (step != 3) {
        }
        numberElsewhere = WinError().GetSystemError();
    });
    SetLastSystemError(5);
    step = 1;
    while (step != 2) {
    }
    const uint32_t numberHere = LastSystemError();
    step = 3;
    other.join();
    EXPECT_EQ(numberHere, 5U);
    EXPECT_EQ(numberElsewhere, 2U);
}

// On Windows a thread has made calls of the system before it begins.
TEST(WinError, ANewThreadHasNoNumberAsOnlyLinuxStartsThreadsSo) {
    SetLastSystemError(5);
    uint32_t numberElsewhere = 1;
    std::thread([&numberElsewhere] { numberElsewhere = LastSystemError(); }).join();
    EXPECT_EQ(numberElsewhere, 0U);
    EXPECT_EQ(WinError().GetSystemError(), 5U);
}

TEST(WinError, CopyKeepsEverything) {
    WinError failure = WinErrorOf(2);
    failure.SetLine(3);
    failure.SetFile("qn/dsc/osdep/path");
    const WinError copy(failure);
    SetLastSystemError(5);
    EXPECT_STREQ(copy.what(), WinErrorOf(2).what());
    EXPECT_EQ(copy.GetSystemError(), 2U);
    EXPECT_EQ(copy.GetLine(), 3);
    EXPECT_STREQ(copy.GetFile(), "qn/dsc/osdep/path");
}

TEST(WinError, IsCaughtAsAnExceptionOfTheSystem) {
    SetLastSystemError(87);
    try {
        exception::ThrowAt(WinError(), "qn/dsc/osdep/path", 10);
        FAIL() << "nothing thrown";
    } catch (const OSException& failure) {
        EXPECT_EQ(failure.GetSystemError(), 87U);
        EXPECT_EQ(failure.GetErrorCode(), 1);
        EXPECT_EQ(failure.GetLine(), 10);
    }
}

TEST(WinError, WithoutMemoryIsABadAllocation) {
    SetLastSystemError(2);
    const support::AllocationFaultScope fault(1, true);
    EXPECT_THROW(WinError(), std::bad_alloc);
}

TEST(PosixError, WithoutMemoryIsABadAllocation) {
    errno = ENOENT;
    const support::AllocationFaultScope fault(1, true);
    EXPECT_THROW(PosixError(), std::bad_alloc);
}

TEST(PosixError, HasTheTextOfErrno) {
    for (const int number : {ENOENT, EACCES, ENOSPC, EMFILE}) {
        const std::string expected = std::strerror(number);
        const PosixError failure = PosixErrorOf(number);
        EXPECT_EQ(failure.what(), expected);
        EXPECT_EQ(failure.GetSystemError(), static_cast<uint32_t>(number));
    }
}

TEST(PosixError, MapsNoErrorTo0) {
    EXPECT_EQ(PosixErrorOf(0).GetErrorCode(), 0);
}

TEST(PosixError, MapsAMissingFileTo7) {
    EXPECT_EQ(PosixErrorOf(ENOENT).GetErrorCode(), 7);
}

TEST(PosixError, MapsEveryOtherNumberTo42) {
    for (const int number : {1, 3, 4, 5, 13, 17, 20, 28, 87}) {
        EXPECT_EQ(PosixErrorOf(number).GetErrorCode(), 42) << number;
    }
}

TEST(PosixError, CopyKeepsTheMessage) {
    const std::string expected = std::strerror(EACCES);
    const PosixError failure = PosixErrorOf(EACCES);
    errno = ENOENT;
    const PosixError copy(failure);
    EXPECT_EQ(copy.what(), expected);
    EXPECT_EQ(copy.GetSystemError(), static_cast<uint32_t>(EACCES));
}

TEST(SystemError, MessageEndsInStopAndLineBreak) {
    NarrowString text;
    ASSERT_TRUE(GetSystemMessage(2, text));
    const std::string message = text.CStr();
    ASSERT_GT(message.size(), 3U);
    EXPECT_EQ(message.substr(message.size() - 3), ".\r\n");
    EXPECT_EQ(WinErrorOf(2).what(), message.substr(0, message.size() - 3));
}

TEST(SystemError, MessageIsASentenceAsOnlyLinuxHasTheseWords) {
    NarrowString text;
    ASSERT_TRUE(GetSystemMessage(2, text));
    EXPECT_STREQ(text.CStr(), "The system cannot find the file specified.\r\n");
}

TEST(SystemError, MessageOfAnUnknownNumberLeavesTheText) {
    NarrowString text("as it was");
    EXPECT_FALSE(GetSystemMessage(0x20000001, text));
    EXPECT_STREQ(text.CStr(), "as it was");
}

TEST(SystemError, StandsForErrno) {
    struct {
        int posixError;
        uint32_t number;
    } const rows[] = {
        {0, 0},         {ENOENT, 2},   {ENOTDIR, 3},       {EMFILE, 4},
        {EACCES, 5},    {EPERM, 5},    {EBADF, 6},         {ENOMEM, 8},
        {EXDEV, 17},    {EROFS, 19},   {EBUSY, 32},        {EEXIST, 80},
        {EINVAL, 87},   {ENOSPC, 112}, {ENOTEMPTY, 145},   {ENAMETOOLONG, 206},
        {EILSEQ, 1113}, {EIO, 1117},   {EAFNOSUPPORT, 31},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(SystemErrorOf(row.posixError), row.number) << row.posixError;
    }
}

}  // namespace
}  // namespace qn::dsc::osdep
