#include "qn/dsc/exception/Exception.h"

#include <gtest/gtest.h>

#include <cstring>
#include <memory>
#include <new>
#include <string>
#include <type_traits>
#include <vector>

#include "support/AllocationFaultScope.h"

namespace qn::dsc::exception {
namespace {

struct Row {
    const char* name;
    std::shared_ptr<Exception> object;
    const char* what;
    uint32_t code;
};

template <class Failure, class... Arguments>
std::shared_ptr<Exception> Make(Arguments... arguments) {
    return std::make_shared<Failure>(arguments...);
}

std::vector<Row> AllClasses() {
    return {
        {"Exception", Make<Exception>(), "unspecified exception", 0xFFFFFFFF},
        {"OutOfRange", Make<OutOfRange>(), "Out of range", 0x8ABC7007},
        {"OutOfRange2", Make<OutOfRange2>(NarrowString("more to say")), "Out of range: more to say", 0x8ABC7007},
        {"ObjectAlreadyExists", Make<ObjectAlreadyExists>(), "Object already exists", 0x8ABC7009},
        {"NonexistentException", Make<NonexistentException>(), "The object does not exist", 0x8ABC700A},
        {"InvalidArgument", Make<InvalidArgument>(), "Invalid argument(s)", 0x8ABC700F},
        {"FileWriteFailed", Make<FileWriteFailed>(), "Write file operation failed", 0x8ABC7011},
        {"FileReadFailed", Make<FileReadFailed>(), "Read file operation failed", 0x8ABC7012},
        {"BufferOverflow", Make<BufferOverflow>(), "Buffer overflowed", 0x8ABC7017},
        {"AccessDenied", Make<AccessDenied>(String(u"C:\\opt\\x")), "Access denied: C:\\opt\\x", 0x8ABC7019},
        {"FileAlreadyExists", Make<FileAlreadyExists>(), "File already exists", 0x8ABC701B},
        {"InvalidLocale", Make<InvalidLocale>(), "Invalid locale", 0x8ABC7024},
        {"InvalidSequence", Make<InvalidSequence>(), "Invalid UTF8 encoding sequence", 0x8ABC7030},
        {"BadGuidString", Make<BadGuidString>(), "Badly formatted Guid string.", 0x8ABC7032},
        {"UnableToConvert", Make<UnableToConvert>(), "Unable to convert.", 0x8ABC7034},
    };
}

TEST(Exception, EachClassHasItsText) {
    for (const Row& row : AllClasses()) {
        EXPECT_STREQ(row.object->what(), row.what) << row.name;
    }
}

TEST(Exception, EachClassHasItsCode) {
    for (const Row& row : AllClasses()) {
        EXPECT_EQ(static_cast<uint32_t>(row.object->GetErrorCode()), row.code) << row.name;
    }
}

TEST(Exception, TheBaseClassIsUnspecifiedWithCodeMinusOne) {
    const Exception failure;
    EXPECT_STREQ(failure.what(), "unspecified exception");
    EXPECT_EQ(failure.GetErrorCode(), -1);
}

TEST(Exception, BeginsWithoutAPlace) {
    for (const Row& row : AllClasses()) {
        EXPECT_EQ(row.object->GetLine(), 0) << row.name;
        EXPECT_EQ(row.object->GetFile(), nullptr) << row.name;
    }
}

TEST(Exception, HoldsLineThenFileBehindItsTable) {
    struct Expected {
        void* table;
        int32_t line;
        const char* file;
    };
    ASSERT_EQ(sizeof(Exception), sizeof(Expected));
    const char* file = "qn/dsc/Anything";
    Exception failure;
    failure.SetLine(77);
    failure.SetFile(file);
    Expected fields;
    std::memcpy(&fields, static_cast<const void*>(&failure), sizeof(fields));
    EXPECT_EQ(fields.line, 77);
    EXPECT_EQ(fields.file, file);
}

TEST(Exception, AllDeriveDirectlyFromTheBaseButOne) {
    EXPECT_TRUE((std::is_base_of_v<std::exception, Exception>));
    EXPECT_TRUE((std::is_base_of_v<OutOfRange, OutOfRange2>));
    EXPECT_FALSE((std::is_base_of_v<OutOfRange, BufferOverflow>));
    EXPECT_FALSE((std::is_base_of_v<ObjectAlreadyExists, FileAlreadyExists>));
}

TEST(Exception, PlaceIsNoPartOfTheText) {
    OutOfRange failure;
    failure.SetLine(12);
    failure.SetFile("qn/dsc/Anything");
    EXPECT_STREQ(failure.what(), "Out of range");
}

TEST(Exception, CopyKeepsThePlace) {
    InvalidArgument failure;
    failure.SetLine(345);
    failure.SetFile("qn/dsc/Anything");
    const InvalidArgument copy(failure);
    EXPECT_EQ(copy.GetLine(), 345);
    EXPECT_STREQ(copy.GetFile(), "qn/dsc/Anything");
}

TEST(Exception, CopyKeepsTextAndPlace) {
    OutOfRange2 failure(NarrowString("this"));
    failure.SetLine(7);
    failure.SetFile("qn/dsc/Anything");
    const OutOfRange2 copy(failure);
    EXPECT_STREQ(copy.what(), "Out of range: this");
    EXPECT_STREQ(failure.what(), "Out of range: this");
    EXPECT_EQ(copy.GetLine(), 7);
    EXPECT_STREQ(copy.GetFile(), "qn/dsc/Anything");
}

TEST(ThrowAt, RecordsThePlace) {
    try {
        ThrowAt(BufferOverflow(), "qn/dsc/Anything", 99);
        FAIL() << "nothing thrown";
    } catch (const Exception& failure) {
        EXPECT_STREQ(failure.what(), "Buffer overflowed");
        EXPECT_EQ(failure.GetLine(), 99);
        EXPECT_STREQ(failure.GetFile(), "qn/dsc/Anything");
    }
}

TEST(ThrowAt, KeepsTheText) {
    try {
        ThrowAt(AccessDenied(String(u"C:\\x")), "qn/dsc/Anything", 5);
        FAIL() << "nothing thrown";
    } catch (const std::exception& failure) {
        EXPECT_STREQ(failure.what(), "Access denied: C:\\x");
    }
}

TEST(ThrowBadAllocation, ThrowsTheStandardClassWithAFixedText) {
    try {
        ThrowBadAllocation();
        FAIL() << "nothing thrown";
    } catch (const std::bad_alloc& failure) {
        EXPECT_STREQ(failure.what(), "bad allocation");
    }
}

TEST(OutOfRange2, IsCaughtAsOutOfRangeWithTheLongerText) {
    try {
        throw OutOfRange2("String offset out of range");
    } catch (const OutOfRange& failure) {
        EXPECT_STREQ(failure.what(), "Out of range: String offset out of range");
        EXPECT_EQ(static_cast<uint32_t>(failure.GetErrorCode()), 0x8ABC7007U);
    }
}

TEST(OutOfRange2, OfAnEmptyTextHasThePrefixAlone) {
    EXPECT_STREQ(OutOfRange2(NarrowString()).what(), "Out of range: ");
}

TEST(AccessDenied, HasThePathAsNarrowText) {
    EXPECT_STREQ(AccessDenied(String(u"C:\\Z\u00FCrich\\\u20AC")).what(),
                 "Access denied: C:\\Z\xC3\xBCrich\\\xE2\x82\xAC");
}

TEST(AccessDenied, OfAPairHasOneSequenceOfFourBytes) {
    EXPECT_STREQ(AccessDenied(String(u"\U0001F600")).what(), "Access denied: \xF0\x9F\x98\x80");
}

TEST(OutOfRange2, WithoutMemoryIsABadAllocation) {
    const NarrowString text("a text that needs a buffer of its own");
    const support::AllocationFaultScope fault(1, true);
    EXPECT_THROW(OutOfRange2{text}, std::bad_alloc);
}

TEST(AccessDenied, WithoutMemoryIsABadAllocation) {
    const String path(u"C:\\a path that needs a buffer of its own");
    const support::AllocationFaultScope fault(1, true);
    EXPECT_THROW(AccessDenied{path}, std::bad_alloc);
}

TEST(OutOfRange2, CopiedWithoutMemoryIsABadAllocation) {
    const OutOfRange2 failure("String offset out of range");
    const support::AllocationFaultScope fault(1, true);
    EXPECT_THROW(OutOfRange2{failure}, std::bad_alloc);
}

}  // namespace
}  // namespace qn::dsc::exception
