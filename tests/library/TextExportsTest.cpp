// The exported conversions of host strings, byte by byte.

#include "library/ExportsTest.h"
#include "qn/dsc/exception/Exception.h"

namespace {

using Calls = std::vector<std::string>;
using Conversion = int32_t (*)(ZkStringHandle, ZkStringHandle);

struct ConversionCase {
    const char* what;
    std::string source;
    std::string result;
};

// With the NULs inside.
template <size_t Size>
std::string Bytes(const char (&text)[Size]) {
    return {text, Size - 1};
}

// The runtime must be there, the tree need not.
class TextExports : public HostTest {
  protected:
    static void Check(Conversion convert, const std::vector<ConversionCase>& cases) {
        for (const ConversionCase& row : cases) {
            const HostText source(row.source);
            const HostText destination("before and longer than any of the results");
            EXPECT_EQ(convert(source.Get(), destination.Get()), 0) << row.what;
            EXPECT_EQ(destination.Bytes(), row.result) << row.what;
            EXPECT_EQ(source.Bytes(), row.source) << row.what;
            // The other way round: a string that grows, and is source and destination at once.
            EXPECT_EQ(convert(source.Get(), source.Get()), 0) << row.what;
            EXPECT_EQ(source.Bytes(), row.result) << row.what;
        }
    }
};

TEST_F(TextExports, NarrowTextBecomesUnitsOfTwoBytes) {
    Check(&FPGA_mbstowcs, {
                              {"empty", "", ""},
                              {"ASCII", "aZ", Bytes("a\0Z\0")},
                              {"two bytes", "\xC3\x84", Bytes("\xC4\x00")},
                              {"three bytes", "\xE2\x82\xAC", Bytes("\xAC\x20")},
                              {"four bytes", "\xF0\x9F\x98\x80", Bytes("\x3D\xD8\x00\xDE")},
                              {"NUL inside", Bytes("a\0b"), Bytes("a\0")},
                              {"NUL first", Bytes("\0b"), ""},
                          });
}

// Windows puts its default character in the place of what is no text.
TEST_F(TextExports, NarrowTextThatIsNoUtf8BecomesUnitsAsOnlyLinuxKeepsBytes) {
    Check(&FPGA_mbstowcs, {
                              {"no UTF-8", "a\xFF", Bytes("a\0\xFF\xDC")},
                              {"cut off", "\xE2\x82", Bytes("\xE2\xDC\x82\xDC")},
                          });
}

TEST_F(TextExports, UnitsOfTwoBytesBecomeNarrowText) {
    Check(&FPGA_wcstombs, {
                              {"empty", "", ""},
                              {"ASCII", Bytes("a\0Z\0"), "aZ"},
                              {"two bytes", Bytes("\xC4\x00"), "\xC3\x84"},
                              {"three bytes", Bytes("\xAC\x20"), "\xE2\x82\xAC"},
                              {"pair", Bytes("\x3D\xD8\x00\xDE"), "\xF0\x9F\x98\x80"},
                              {"NUL inside", Bytes("a\0\0\0b\0"), "a"},
                              {"NUL byte but no NUL unit", Bytes("\x00\x61"), "\xE6\x84\x80"},
                              {"odd byte at the end", Bytes("a\0b"), "a"},
                              {"one byte", "a", ""},
                          });
}

TEST_F(TextExports, HalvesOfPairsBecomeNarrowTextAsOnlyLinuxKeepsBytes) {
    Check(&FPGA_wcstombs, {
                              {"byte that was no UTF-8", Bytes("\xFF\xDC\x80\xDC"), "\xFF\x80"},
                              {"low surrogate below those", Bytes("\x7F\xDC"), "?"},
                              {"low surrogate above those", Bytes("\x00\xDD"), "?"},
                              {"high surrogate at the end", Bytes("a\0\x00\xD8"), "a?"},
                              {"high surrogate in front of a letter", Bytes("\x00\xD8\x61\x00"), "?a"},
                              {"pair the wrong way round", Bytes("\x00\xDE\x3D\xD8"), "??"},
                          });
}

TEST_F(TextExports, NarrowTextBecomesUtf8OfAtMostThreeBytesEach) {
    Check(&FPGA_MbsToUtf8, {
                               {"empty", "", ""},
                               {"ASCII", "aZ", "aZ"},
                               {"two bytes", "\xC3\x84", "\xC3\x84"},
                               {"three bytes", "\xE2\x82\xAC", "\xE2\x82\xAC"},
                               {"four bytes", "\xF0\x9F\x98\x80", "\xED\xA0\xBD\xED\xB8\x80"},
                               {"NUL inside", Bytes("a\0b"), "a"},
                           });
}

TEST_F(TextExports, NarrowTextThatIsNoUtf8BecomesUtf8AsOnlyLinuxKeepsBytes) {
    Check(&FPGA_MbsToUtf8, {
                               {"no UTF-8", "a\xFF", "a\xED\xB3\xBF"},
                               {"surrogate", "\xED\xA0\xBD", "\xED\xB3\xAD\xED\xB2\xA0\xED\xB2\xBD"},
                           });
}

TEST_F(TextExports, Utf8BecomesNarrowText) {
    Check(&FPGA_Utf8ToMbs, {
                               {"empty", "", ""},
                               {"ASCII", "aZ", "aZ"},
                               {"two bytes", "\xC3\x84", "\xC3\x84"},
                               {"three bytes", "\xE2\x82\xAC", "\xE2\x82\xAC"},
                               {"pair of surrogates", "\xED\xA0\xBD\xED\xB8\x80", "\xF0\x9F\x98\x80"},
                               {"NUL inside", Bytes("a\0b"), "a"},
                           });
}

TEST_F(TextExports, HalvesOfPairsInUtf8BecomeNarrowTextAsOnlyLinuxKeepsBytes) {
    Check(&FPGA_Utf8ToMbs, {
                               {"lone surrogate", "\xED\xA0\xBD", "?"},
                               {"byte that was no UTF-8", "a\xED\xB3\xBF", "a\xFF"},
                           });
}

TEST_F(TextExports, BytesThatAreNotTheSystemsUtf8LeaveAsAnException) {
    for (const std::string& bytes :
         {Bytes("\xF0\x9F\x98\x80"), Bytes("\xC0\x80"), Bytes("\xE0\x80\x80"), Bytes("a\x80"), Bytes("\xE2\x82"),
          // All of the source is read, also behind a NUL.
          Bytes("a\0\xFF")}) {
        const HostText source(bytes);
        const HostText destination("before");
        TakeCalls();
        EXPECT_THROW(FPGA_Utf8ToMbs(source.Get(), destination.Get()), qn::dsc::exception::InvalidSequence);
        EXPECT_EQ(TakeCalls(), Calls{});
        EXPECT_EQ(destination.Bytes(), "before");
    }
}

TEST_F(TextExports, ConversionOfALongTextLosesNothing) {
    std::string narrow;
    std::string wide;
    for (int i = 0; i < 100000; ++i) {
        narrow += "a\xE2\x82\xAC";
        wide += Bytes("a\0\xAC\x20");
    }
    Check(&FPGA_mbstowcs, {{"long", narrow, wide}});
    Check(&FPGA_wcstombs, {{"long", wide, narrow}});
    Check(&FPGA_MbsToUtf8, {{"long", narrow, narrow}});
    Check(&FPGA_Utf8ToMbs, {{"long", narrow, narrow}});
}

TEST_F(TextExports, DestinationIsResizedToTheLengthInBytes) {
    const HostText source("a\xE2\x82\xAC");
    const HostText destination;
    TakeCalls();
    FPGA_mbstowcs(source.Get(), destination.Get());
    EXPECT_EQ(TakeCalls(), Calls{"HostResizeArray 5 1 4"});
    FPGA_MbsToUtf8(source.Get(), destination.Get());
    EXPECT_EQ(TakeCalls(), Calls{"HostResizeArray 5 1 4"});
    FPGA_Utf8ToMbs(source.Get(), destination.Get());
    EXPECT_EQ(TakeCalls(), Calls{"HostResizeArray 5 1 4"});
    FPGA_wcstombs(source.Get(), destination.Get());  // The units E261 and AC82.
    EXPECT_EQ(TakeCalls(), Calls{"HostResizeArray 5 1 6"});
}

TEST_F(TextExports, NullSourceIsTheEmptyText) {
    for (const Conversion convert : {&FPGA_mbstowcs, &FPGA_wcstombs, &FPGA_MbsToUtf8, &FPGA_Utf8ToMbs}) {
        const HostText destination("before");
        EXPECT_EQ(convert(nullptr, destination.Get()), 0);
        EXPECT_EQ(destination.Bytes(), "");
    }
}

TEST_F(TextExports, NullDestinationIsPassedOver) {
    const HostText source("a");
    TakeCalls();
    for (const Conversion convert : {&FPGA_mbstowcs, &FPGA_wcstombs, &FPGA_MbsToUtf8, &FPGA_Utf8ToMbs}) {
        EXPECT_EQ(convert(source.Get(), nullptr), 0);
    }
    EXPECT_EQ(TakeCalls(), Calls{});
}

TEST_F(TextExports, ErrorOfTheHostLeavesAsAnExceptionAndTheDestinationStays) {
    for (const Conversion convert : {&FPGA_mbstowcs, &FPGA_wcstombs, &FPGA_MbsToUtf8, &FPGA_Utf8ToMbs}) {
        const HostText source("ab");
        const HostText destination("before");
        host.Fail("HostResizeArray", -5);
        EXPECT_EQ(ErrorOf([&] { convert(source.Get(), destination.Get()); }),
                  "-5 | Error Code: -5 (fffffffb): Unknown error code or error text unavailable.");
        EXPECT_EQ(destination.Bytes(), "before");
    }
}

}  // namespace
