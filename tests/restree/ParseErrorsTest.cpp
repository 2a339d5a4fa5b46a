// The reports in "XMLParseErrors": line, column, what is wrong, and the text around.

#include <string>

#include <gtest/gtest.h>

#include "restree/ReadTree.h"
#include "support/StrayByte.h"

namespace zkhw {
namespace {

// The reports after a load that must fail.
std::string ErrorsOf(const std::string& xml) {
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(Wide(xml), false, nullptr), loadFailed);
    return Errors(*root);
}

// --- The whole report ---

TEST(ParseErrors, ReportOfATextHasNoFileName) {
    EXPECT_EQ(ErrorsOf("<A><B></A>"),
              "Error on line 1 at column 8\n"
              "   mismatched tag\n"
              "   <A><B></A>\n");
}

TEST(ParseErrors, EmptyTextHasNoContext) {
    EXPECT_EQ(ErrorsOf(""),
              "Error on line 1 at column 0\n"
              "   no element found\n"
              "   \n");
}

TEST(ParseErrors, ReportsAccumulate) {
    auto root = MakeRoot();
    EXPECT_EQ(root->LoadResourceText(u"<A><B></A>", false, nullptr), loadFailed);
    EXPECT_EQ(root->LoadResourceText(u"", false, nullptr), loadFailed);
    EXPECT_EQ(root->LoadResourceText(u"<A></C>", true, nullptr), loadFailed);
    EXPECT_EQ(Errors(*root),
              "Error on line 1 at column 8\n"
              "   mismatched tag\n"
              "   <A><B></A>\n"
              "Error on line 1 at column 0\n"
              "   no element found\n"
              "   \n"
              "Error on line 1 at column 5\n"
              "   mismatched tag\n"
              "   <A></C>\n");
}

TEST(ParseErrors, ReportsOfANodeWithoutATypeAccumulateToo) {
    // The first load fails before its document element gives the node a type and an order.
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(u"", false, nullptr), loadFailed);
    EXPECT_EQ(root->LoadResourceText(u"<AList><B/></C>", false, nullptr), loadFailed);
    EXPECT_EQ("\n" + DumpTree(*root),
              R"(
AList:AList ordered
  XMLParseErrors=Error on line 1 at column 0{000A}   no element found{000A}   {000A})"
              R"(Error on line 1 at column 13{000A}   mismatched tag{000A}   <AList><B/></C>{000A}
  B=
)");
}

TEST(ParseErrors, LoadThatWorksClearsNothing) {
    auto root = MakeRoot();
    EXPECT_EQ(root->LoadResourceText(u"<A></C>", false, nullptr), loadFailed);
    const std::string before = Errors(*root);
    EXPECT_EQ(root->LoadResourceText(u"<A><V>1</V></A>", false, nullptr), 0);
    EXPECT_EQ(Errors(*root), before);
}

TEST(ParseErrors, ReportIsAppendedToATextThatIsThere) {
    auto root = MakeRoot();
    EXPECT_EQ(root->LoadResourceText(u"<A><xmlparseerrors>mine </xmlparseerrors></B>", false, nullptr), loadFailed);
    EXPECT_EQ("\n" + DumpTree(*root), R"(
Root:Root
  xmlparseerrors=mineError on line 1 at column 43{000A}   mismatched tag{000A})"
                                      R"(   <A><xmlparseerrors>mine </xmlparseerrors></B>{000A}
)");
}

TEST(ParseErrors, ReportIsLostIfTheEntryIsNoText) {
    auto root = MakeRoot();
    EXPECT_EQ(root->LoadResourceText(u"<A><C name='XMLParseErrors'><V>1</V></C></B>", false, nullptr), loadFailed);
    EXPECT_EQ("\n" + DumpTree(*root), R"(
Root:Root
  XMLParseErrors:C
    V=1
)");
}

TEST(ParseErrors, ReportOfAnOrderedNodeGoesToItsFirstEntryOfTheName) {
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(u"<AList><XMLParseErrors>1</XMLParseErrors><XMLParseErrors>2</XMLParseErrors></A>",
                                     false, nullptr),
              loadFailed);
    EXPECT_EQ(TextAt(*root, u"XMLParseErrors").substr(0, 16), "1Error on line 1");
    const EntryIterator last = ++root->Begin();
    EXPECT_EQ(qn::dsc::ExactText(*last->Text()), "2");
}

TEST(ParseErrors, WhatWasReadBeforeTheFaultStays) {
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(u"<R><A><V>1</V><C name='c'/><W>2</X></A></R>", false, nullptr), loadFailed);
    root->RemoveEntryByName(u"XMLParseErrors");
    EXPECT_EQ("\n" + DumpTree(*root), R"(
R:R
  A:A
    c:C
    V=1
)");
}

TEST(ParseErrors, ReportStandsInTheLoadingNode) {
    auto root = MakeRoot();
    LoadChild(*root, "<C name='c'/>");
    EXPECT_EQ(At(*root, u"c").LoadResourceText(u"<A><B><D></B></A>", false, nullptr), loadFailed);
    EXPECT_EQ(Errors(*root), "(none)");
    EXPECT_EQ(Errors(At(*root, u"c")), "Error on line 1 at column 11\n   mismatched tag\n   <A><B><D></B></A>\n");
}

// --- The text around ---

TEST(ParseErrors, ContextEndsBehindTheSecondLineFeed) {
    EXPECT_EQ(ErrorsOf("<A></B>\nsecond\nthird\nfourth"),
              "Error on line 1 at column 5\n"
              "   mismatched tag\n"
              "   <A></B>\nsecond\n\n");
}

TEST(ParseErrors, ContextOfFewerLinesGoesToTheEnd) {
    EXPECT_EQ(ErrorsOf("<A></B>\nsecond"),
              "Error on line 1 at column 5\n"
              "   mismatched tag\n"
              "   <A></B>\nsecond\n");
}

TEST(ParseErrors, ContextOfTheSecondLineBeginsWithTheFirst) {
    EXPECT_EQ(ErrorsOf("<A>\n<B></C>\n</A>\n"),
              "Error on line 2 at column 5\n"
              "   mismatched tag\n"
              "   <A>\n<B></C>\n</A>\n\n");
}

TEST(ParseErrors, ContextKeepsTheLineFeedThatItStartsWith) {
    EXPECT_EQ(ErrorsOf("<A>\n<V>1</V>\n<B></C>\n</A>\n<!-- -->\n"),
              "Error on line 3 at column 5\n"
              "   mismatched tag\n"
              "   \n<V>1</V>\n<B></C>\n</A>\n\n");
}

TEST(ParseErrors, ContextOfALineFeedAtTheVeryBeginningStartsThere) {
    EXPECT_EQ(ErrorsOf("\n<A></B>"),
              "Error on line 2 at column 5\n"
              "   mismatched tag\n"
              "   \n<A></B>\n");
    EXPECT_EQ(ErrorsOf("\n<A>\n</B>"),
              "Error on line 3 at column 2\n"
              "   mismatched tag\n"
              "   \n<A>\n</B>\n");
}

TEST(ParseErrors, ContextCountsEmptyLines) {
    EXPECT_EQ(ErrorsOf("<A>\n\n</B>\n\n\n"),
              "Error on line 3 at column 2\n"
              "   mismatched tag\n"
              "   \n\n</B>\n\n\n");
}

TEST(ParseErrors, ContextKeepsReturns) {
    EXPECT_EQ(ErrorsOf("<A>\r\n<B/>\r\n</C>\r\n\r\n"),
              "Error on line 3 at column 2\n"
              "   mismatched tag\n"
              "   \n<B/>\r\n</C>\r\n\r\n\n");
}

TEST(ParseErrors, ColumnsCountCharacters) {
    EXPECT_EQ(ErrorsOf("<A>\xC3\xA9\xE5\x90\x8D</B>"),
              "Error on line 1 at column 7\n"
              "   mismatched tag\n"
              "   <A>{00E9}{540D}</B>\n");
}

// Windows puts its default character in the place of what is no text.
TEST(ParseErrors, HalvesOfPairsAreNotWellFormedAsOnlyLinuxKeepsBytes) {
    // They are written as three bytes each, which aren't UTF-8: every one stands as itself in the context.
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(u"<A>\xD83D\xDE00</A>", false, nullptr), loadFailed);
    EXPECT_EQ(Errors(*root),
              "Error on line 1 at column 3\n"
              "   not well-formed (invalid token)\n"
              "   <A>{DCED}{DCA0}{DCBD}{DCED}{DCB8}{DC80}</A>\n");
}

// --- Every kind of fault ---

struct Fault {
    const char* xml;
    const char* message;
    uint32_t line;
    uint32_t column;
};

TEST(ParseErrors, EveryKindOfFaultIsReported) {
    const Fault faults[] = {
        {"text <A/>", "syntax error", 1, 0},
        {"text<A/>", "not well-formed (invalid token)", 1, 4},
        {"   ", "no element found", 1, 3},
        {"<!-- -->", "no element found", 1, 8},
        {"<A>text", "no element found", 1, 7},
        {"<A>\n<B>\n", "no element found", 3, 0},
        {"<A b=1/>", "not well-formed (invalid token)", 1, 5},
        {"<A b/>", "not well-formed (invalid token)", 1, 4},
        {"<A>\x01</A>", "not well-formed (invalid token)", 1, 3},
        {"<A>]]></A>", "not well-formed (invalid token)", 1, 5},
        {"<A>& </A>", "not well-formed (invalid token)", 1, 4},
        {"<A>< B/></A>", "not well-formed (invalid token)", 1, 4},
        {"<A b='<'/>", "not well-formed (invalid token)", 1, 6},
        {"<A><!-- -- --></A>", "not well-formed (invalid token)", 1, 10},
        {"<1/>", "not well-formed (invalid token)", 1, 1},
        {"<A><B", "unclosed token", 1, 3},
        {"<A><!-- ", "unclosed token", 1, 3},
        {"<A b='", "unclosed token", 1, 0},
        {"<A><![CDATA[x", "unclosed CDATA section", 1, 13},
        {"<A><B></A>", "mismatched tag", 1, 8},
        {"<A></a>", "mismatched tag", 1, 5},
        {"<A b='1' b='2'/>", "duplicate attribute", 1, 9},
        {"<A/><B/>", "junk after document element", 1, 4},
        {"<A/>text", "junk after document element", 1, 4},
        {"<A>&x;</A>", "undefined entity", 1, 3},
        {"<A b='&x;'/>", "undefined entity", 1, 0},
        {"<A>&#0;</A>", "reference to invalid character number", 1, 3},
        {"<A>&#xD800;</A>", "reference to invalid character number", 1, 3},
        {"<A>&#xFFFE;</A>", "reference to invalid character number", 1, 3},
        {" <?xml version='1.0'?><A/>", "XML or text declaration not at start of entity", 1, 1},
        {"<A><?xml version='1.0'?></A>", "XML or text declaration not at start of entity", 1, 3},
        {"<?xml encoding='utf-8'?><A/>", "XML declaration not well-formed", 1, 6},
        {"<!DOCTYPE A [<!ENTITY a '&b;'><!ENTITY b '&a;'>]><A>&a;</A>", "recursive entity reference", 1, 52},
        {"<!DOCTYPE A [<!ENTITY a '<B>'>]><A>&a;</B></A>", "asynchronous entity", 1, 35},
        {"<!DOCTYPE A [<!NOTATION n SYSTEM 'n'><!ENTITY e SYSTEM 'e' NDATA n>]><A>&e;</A>",
         "reference to binary entity", 1, 72},
        {"<!DOCTYPE A [<!ENTITY e SYSTEM 'e'>]><A b='&e;'/>", "reference to external entity in attribute", 1, 43},
        {"<!DOCTYPE A [<!ENTITY e '%x;'>]><A/>", "illegal parameter entity reference", 1, 25},
        {"<!DOCTYPE A PUBLIC '{' 'x'><A/>", "illegal character(s) in public id", 1, 20},
    };
    for (const Fault& fault : faults) {
        const std::string report = ErrorsOf(fault.xml);
        EXPECT_EQ(report.substr(0, report.find("\n   ", report.find("\n   ") + 1)),
                  "Error on line " + std::to_string(fault.line) + " at column " + std::to_string(fault.column) +
                      "\n   " + fault.message)
            << fault.xml;
    }
}

// --- Files ---

class ParseErrorsOfFiles : public ResourceFiles {
  protected:
    std::string ErrorsOfFile(const std::string& bytes) {
        Write("f.xml", bytes);
        auto root = MakeUnnamedRoot();
        EXPECT_EQ(root->LoadResourceFile(PathOf(u"f.xml"), false, nullptr), loadFailed);
        return Errors(*root);
    }
    // What stands in front of the message in the report of a file.
    std::string Heading(int line, int column) {
        return "Error on line " + std::to_string(line) + " at column " + std::to_string(column) + " of file" +
               Shown(u"f.xml") + "\n   ";
    }
};

TEST_F(ParseErrorsOfFiles, FileNameFollowsWithoutABlank) {
    EXPECT_EQ(ErrorsOfFile("<A>\n<B></A>\n"),
              "Error on line 2 at column 5 of file" + Shown(u"f.xml") + "\n   mismatched tag\n   <A>\n<B></A>\n\n");
}

TEST_F(ParseErrorsOfFiles, EmptyFileFailsOnItsFirstLine) {
    EXPECT_EQ(ErrorsOfFile(""), Heading(1, 0) + "no element found\n   \n");
}

TEST_F(ParseErrorsOfFiles, PartialCharacterAtTheEnd) {
    EXPECT_EQ(ErrorsOfFile("<A>\xC3"), Heading(1, 3) + "partial character\n   <A>" + StrayByte(0xC3) + "\n");
}

TEST_F(ParseErrorsOfFiles, BytesThatAreNotUtf8StandInTheContextAsTheCodePageHasThem) {
    EXPECT_EQ(ErrorsOfFile("<?xml version='1.0' encoding='ISO-8859-1'?><A>\xE9</A>"),
              Heading(1, 46) + "not well-formed (invalid token)\n   <?xml version='1.0' encoding='ISO-8859-1'?><A>" +
                  StrayByte(0xE9) + "</A>\n");
}

TEST_F(ParseErrorsOfFiles, FourByteCharacterInTheContextIsAPair) {
    EXPECT_EQ(ErrorsOfFile("<A>\xF0\x9F\x98\x80</B>"), Heading(1, 6) + "mismatched tag\n   <A>{D83D}{DE00}</B>\n");
}

TEST_F(ParseErrorsOfFiles, FourByteCharacterInANameIsNotWellFormed) {
    EXPECT_EQ(ErrorsOfFile("<A\xF0\x9F\x98\x80/>"),
              Heading(1, 2) + "not well-formed (invalid token)\n   <A{D83D}{DE00}/>\n");
}

TEST_F(ParseErrorsOfFiles, ContextEndsAtANulOnEitherSide) {
    EXPECT_EQ(ErrorsOfFile(std::string("<A>\n<B>x\0y</B>\n</A>", 19)),
              Heading(2, 4) + "not well-formed (invalid token)\n   <A>\n<B>x\n");
}

TEST_F(ParseErrorsOfFiles, ContextOfUtf16IsItsBytesUpToTheFirstNul) {
    // The mark counts as a column. Before: the mark and "<"; after: "B".
    EXPECT_EQ(ErrorsOfFile(std::string("\xFF\xFE<\0A\0>\0<\0/\0B\0>\0", 16)),
              Heading(1, 6) + "mismatched tag\n   " + StrayByte(0xFF) + StrayByte(0xFE) + "<B\n");
}

TEST_F(ParseErrorsOfFiles, ContextOfUtf16BeginsWithTheDocumentOnAnyLine) {
    EXPECT_EQ(ErrorsOfFile(std::string("\xFF\xFE<\0A\0>\0\n\0<\0C\0>\0\n\0<\0/\0B\0>\0", 26)),
              Heading(3, 2) + "mismatched tag\n   " + StrayByte(0xFF) + StrayByte(0xFE) + "<B\n");
}

TEST_F(ParseErrorsOfFiles, FileWithoutAnElementBehindAFullBlock) {
    const std::string bytes = "<!--" + std::string(4089, 'x') + "-->";
    ASSERT_EQ(bytes.size(), 4096u);
    EXPECT_EQ(ErrorsOfFile(bytes), Heading(1, 4096) + "no element found\n   " + bytes + "\n");
}

TEST_F(ParseErrorsOfFiles, ContextOfTheFirstBlockEndsWithIt) {
    // 3 + 2000 + 2 units stand before the fault; the line goes on in the next block.
    const std::string before = "<A>" + std::string(2000, 'x') + "</";
    const std::string bytes = before + "B>" + std::string(6000, 'y');
    EXPECT_EQ(ErrorsOfFile(bytes), Heading(1, 2005) + "mismatched tag\n   " + bytes.substr(0, 4096) + "\n");
}

TEST_F(ParseErrorsOfFiles, ContextOfALaterBlockBeginsAKilobyteBeforeIt) {
    // All of the first block was taken as text, so the parser keeps its last 1024 bytes.
    const std::string bytes = "<A>" + std::string(5000, 'x') + "</B>" + std::string(9000, 'y');
    EXPECT_EQ(ErrorsOfFile(bytes),
              Heading(1, 5005) + "mismatched tag\n   " + bytes.substr(4096 - 1024, 1024 + 4096) + "\n");
    const std::string later = "<A>" + std::string(13000, 'x') + "</B>" + std::string(9000, 'y');
    EXPECT_EQ(ErrorsOfFile(later),
              Heading(1, 13005) + "mismatched tag\n   " + later.substr(3 * 4096 - 1024, 1024 + 4096) + "\n");
}

TEST_F(ParseErrorsOfFiles, ContextMayBeginInsideACharacter) {
    // Characters of three bytes from byte 4 on: one ends with the block, so byte 3072 is the last one of a character.
    std::string bytes = "<A> ";
    for (int i = 0; i < 1700; ++i) {
        bytes += "\xE5\x90\x8D";
    }
    bytes += "</B>";
    std::string context = StrayByte(0x8D);
    for (int i = 0; i < 677; ++i) {
        context += "{540D}";
    }
    EXPECT_EQ(ErrorsOfFile(bytes), Heading(1, 1706) + "mismatched tag\n   " + context + "</B>\n");
}

}  // namespace
}  // namespace zkhw
