// The texts of values: what is cut off, and how paths, reference lists and language lists are read; and how a value
// meets what is there already.

#include <string>

#include <gtest/gtest.h>

#include "restree/ReadTree.h"

namespace zkhw {
namespace {

// The dump of the one value in a document.
std::string ValueOf(const std::string& element) {
    auto root = MakeUnnamedRoot();
    std::string dump = Load(*root, "<R>" + element + "</R>");
    const std::string heading = "\nR:R\n  ";
    EXPECT_EQ(dump.substr(0, heading.size()), heading);
    return dump.substr(heading.size(), dump.size() - heading.size() - 1);
}

// --- White space ---

TEST(ElementValues, TextIsTrimmed) {
    EXPECT_EQ(ValueOf("<A> x </A>"), "A=x");
    EXPECT_EQ(ValueOf("<A>\n\t x y \r\n</A>"), "A=x y");
}

TEST(ElementValues, PreservedSpaceStays) {
    EXPECT_EQ(ValueOf("<A xml:space='preserve'> x </A>"), "A= x ");
    EXPECT_EQ(ValueOf("<A xml:space='preserve'>\n\t</A>"), "A={000A}{0009}");
}

TEST(ElementValues, AnyOtherWordForSpaceTrims) {
    for (const char* word : {"default", "", "preserve ", "keep"}) {
        EXPECT_EQ(ValueOf("<A xml:space='" + std::string(word) + "'> x </A>"), "A=x") << word;
    }
}

TEST(ElementValues, WordForSpaceIsBlindToCase) {
    EXPECT_EQ(ValueOf("<A XML:SPACE='PreServe'> x </A>"), "A= x ");
}

TEST(ElementValues, WordForSpaceIsComparedByTheLanguage) {
    // A soft hyphen counts for nothing, any other one counts.
    EXPECT_EQ(ValueOf("<A xml:space='pre&#173;serve'> x </A>"), "A= x ");
    EXPECT_EQ(ValueOf("<A xml:space='pre-serve'> x </A>"), "A=x");
}

// Windows has an order of its own outside printable ASCII: docs/platforms.md lists where it differs.
TEST(ElementValues, DeleteCharactersAndWidthLeaveTheWordForSpaceAsOnlyLinuxOrdersSo) {
    EXPECT_EQ(ValueOf("<A xml:space='pre&#127;serve'> x </A>"), "A= x ");
    EXPECT_EQ(ValueOf("<A xml:space='\xEF\xBD\x90reserve'> x </A>"), "A= x ");
}

TEST(ElementValues, TextMayHaveAnyLength) {
    for (size_t length = 0; length <= 70; ++length) {
        const std::string text(length, 'x');
        EXPECT_EQ(ValueOf("<A> " + text + " </A>"), "A=" + text);
        EXPECT_EQ(ValueOf("<A> " + text + "\xC3\xA9 </A>"), "A=" + text + "{00E9}");
        EXPECT_EQ(ValueOf("<A>\xC3\xA9" + text + "</A>"), "A={00E9}" + text);
    }
}

TEST(ElementValues, TextOfWhiteSpaceAloneIsEmpty) {
    EXPECT_EQ(ValueOf("<A> \n </A>"), "A=");
}

TEST(ElementValues, WhiteSpaceOfReferencesAndCdataIsTrimmedToo) {
    EXPECT_EQ(ValueOf("<A>&#13;&#9; x&#10;</A>"), "A=x");
    EXPECT_EQ(ValueOf("<A><![CDATA[ x ]]></A>"), "A=x");
}

TEST(ElementValues, OtherBlanksStay) {
    EXPECT_EQ(ValueOf("<A>\xC2\xA0x\xE3\x80\x80</A>"), "A={00A0}x{3000}");
}

// --- Pieces of text ---

TEST(ElementValues, TextOnBothSidesOfACommentRunsTogether) {
    EXPECT_EQ(ValueOf("<A>a<!-- no -->b</A>"), "A=ab");
}

TEST(ElementValues, TextCdataAndInstructionsRunTogether) {
    EXPECT_EQ(ValueOf("<A>a<?p d?>b<![CDATA[<c>&amp;]]]]>d<![CDATA[]]></A>"), "A=ab<c>&amp;]]d");
}

TEST(ElementValues, ProcessingInstructionsHaveNoEffectAnywhere) {
    ASSERT_TREE("<?xml version='1.0'?><?a b?><R><?a b?><C name='x'><?a b?></C><?a b?><V>1</V><?a?></R><?a b?>", R"(
R:R
  V=1
  x:C
)");
}

TEST(ElementValues, CommentsHaveNoEffectAnywhere) {
    ASSERT_TREE("<!-- a --><R><!-- a --><C name='x'><!-- a --></C><!-- a --><V>1</V><!-- a --></R><!-- a -->", R"(
R:R
  V=1
  x:C
)");
}

TEST(ElementValues, ReferencesAreReplaced) {
    EXPECT_EQ(ValueOf("<A>&lt;&gt;&amp;&apos;&quot;&#65;&#x20AC;</A>"), "A=<>&'\"A{20AC}");
}

TEST(ElementValues, EntitiesOfTheDocumentAreReplaced) {
    ASSERT_TREE("<!DOCTYPE R [<!ENTITY e 'x&#38;amp;y'><!ENTITY m '<B>1</B><C name=\"c\"/>'>]><R><A>1&e;2</A>&m;</R>",
                R"(
R:R
  A=1x&y2
  B=1
  c:C
)");
}

TEST(ElementValues, LineEndsAreLineFeeds) {
    EXPECT_EQ(ValueOf("<A>a\r\nb\rc\nd</A>"), "A=a{000A}b{000A}c{000A}d");
}

TEST(ElementValues, ReferenceToAReturnStays) {
    EXPECT_EQ(ValueOf("<A>a&#13;b</A>"), "A=a{000D}b");
}

TEST(ElementValues, LettersOfAllScriptsStay) {
    EXPECT_EQ(ValueOf("<A>\xC3\xA9\xE5\x90\x8D\xEF\xBF\xBD</A>"), "A={00E9}{540D}{FFFD}");
}

// --- Paths ---

TEST(ElementValues, PathsArePiecesJoinedByBackslashes) {
    EXPECT_EQ(ValueOf("<LogPath>a/b/c</LogPath>"), "LogPath=a\\b\\c");
    EXPECT_EQ(ValueOf("<LogDir>a/b/c</LogDir>"), "LogDir=a\\b\\c");
}

TEST(ElementValues, OtherTextsKeepTheirSlashes) {
    for (const char* name : {"Log", "Paths", "DirX", "Pathe", "LogDire", "Pat", "LogDi"}) {
        const std::string text(name);
        EXPECT_EQ(ValueOf("<" + text + ">a/b/c</" + text + ">"), text + "=a/b/c");
    }
}

TEST(ElementValues, EndOfTheNameIsBlindToCase) {
    for (const char* name : {"Path", "PATH", "logpath", "Dir", "DIR", "subdir", "\xC3\xA9PaTh"}) {
        const std::string text(name);
        const std::string dump = ValueOf("<" + text + ">a/b</" + text + ">");
        EXPECT_EQ(dump.substr(dump.find('=')), "=a\\b") << name;
    }
}

TEST(ElementValues, TypePathMakesAPath) {
    EXPECT_EQ(ValueOf("<Log type='path'>a/b</Log>"), "Log=a\\b");
    EXPECT_EQ(ValueOf("<Log TYPE='PATH'>a/b</Log>"), "Log=a\\b");
}

TEST(ElementValues, AnyOtherTypeWinsOverTheNameOfAPath) {
    for (const char* type : {"string", "", "ref-list", "paths", "dir"}) {
        EXPECT_EQ(ValueOf("<LogPath type='" + std::string(type) + "'>a/b</LogPath>"), "LogPath=a/b") << type;
    }
}

TEST(ElementValues, SlashesInOddPlacesOfAPath) {
    struct Row {
        const char* text;
        const char* path;
    };
    const Row rows[] = {
        {"", ""},
        {"a", "a"},
        {"/", ""},
        {"/a/b", "a\\b"},
        {"//a", "a"},
        {"a/b/", "a\\b\\"},
        {"a//b", "a\\b"},
        {"a///b", "a\\b"},
        {"a//", "a\\"},
        {"///", ""},
        {"/ /", " \\"},
        {"//a//b//", "a\\b\\"},
        {"0123456789abcde/0123456789abcdef/0123456789abcdefg", "0123456789abcde\\0123456789abcdef\\0123456789abcdefg"},
        {"\\", "\\"},
        {"a\\", "a\\"},
        {"a/b\\", "a\\b\\"},
        {"C:", "C:"},
        {"a/C:/b", "a\\C:\\b"},
        {"a / b", "a \\ b"},
        {"a\\b/c", "a\\b\\c"},
        {"a\\/b/c", "a/b\\c"},
        {"a\\\\b", "a\\b"},
        {"a\\\\/b", "a\\b"},
        {"../x/./y", "..\\x\\.\\y"},
        {"C:/x/y", "C:\\x\\y"},
        {"a/C:\\x/y", "C:\\x\\y"},
        {"\\\\\\\\s/x", "\\\\s\\x"},
    };
    for (const Row& row : rows) {
        EXPECT_EQ(ValueOf("<P type='path'>" + std::string(row.text) + "</P>"), "P=" + std::string(row.path))
            << row.text;
    }
}

TEST(ElementValues, PathMayHoldLettersOfAllScripts) {
    EXPECT_EQ(ValueOf("<P type='path'>/\xC3\xA9//\xE5\x90\x8D/</P>"), "P={00E9}\\{540D}\\");
}

TEST(ElementValues, PathIsTrimmedAsAWholeUnlessItsSpaceIsPreserved) {
    EXPECT_EQ(ValueOf("<P type='path'>\n a/b \n</P>"), "P=a\\b");
    EXPECT_EQ(ValueOf("<P type='path' xml:space='preserve'> a/b </P>"), "P= a\\b ");
}

TEST(ElementValues, ParametersOfAPathAreReplacedBehindItsSeparators) {
    ASSERT_TREE("<R Sub='x/y'><LogPath>a/#{Sub}/b</LogPath></R>", R"(
R:R
  LogPath=a\x/y\b
)");
}

// --- Reference lists ---

TEST(ElementValues, ReservesIsMadeRelativeToItsNode) {
    ASSERT_TREE("<R><A><B><Reserves> /A/C , D/E ,/A/B/F,../G,</Reserves></B></A></R>", R"(
R:R
  A:A
    B:B
      Reserves=../C,D/E,F,../G,
)");
}

TEST(ElementValues, NameOfReservesIsBlindToCase) {
    ASSERT_TREE("<R><A><RESERVES>/C</RESERVES></A></R>", R"(
R:R
  A:A
    RESERVES=../C
)");
}

TEST(ElementValues, ReservesInTheRootClimbsOutOfIt) {
    // The root's path has an empty component behind its slash.
    ASSERT_TREE("<R><Reserves>/A/B</Reserves></R>", R"(
R:R
  Reserves=../A/B
)");
}

TEST(ElementValues, TypeRefListMakesAReferenceList) {
    ASSERT_TREE("<R><A><X type='ref-list'>/C</X><Y type='REF-LIST'>/C</Y><Z type='reflist'>/C</Z></A></R>", R"(
R:R
  A:A
    X=../C
    Y=../C
    Z=/C
)");
}

TEST(ElementValues, AnyOtherTypeWinsOverReserves) {
    ASSERT_TREE("<R><A><Reserves type='string'>/C,/D</Reserves></A></R>", R"(
R:R
  A:A
    Reserves=/C,/D
)");
    ASSERT_TREE("<R><A><Reserves type='path'>a/b</Reserves></A></R>", R"(
R:R
  A:A
    Reserves=a\b
)");
}

TEST(ElementValues, EscapesInAReferenceListAreEscapedOnceMore) {
    ASSERT_TREE("<R><A><B><Reserves>/A/x\\/y,p\\,q,/A/B/s\\/t</Reserves></B></A></R>", R"(
R:R
  A:A
    B:B
      Reserves=../x\\/y,p\,q,s/t
)");
}

TEST(ElementValues, ReferenceToTheNodeItselfIsEmpty) {
    ASSERT_TREE("<R><A><Reserves>/A,/B</Reserves></A></R>", R"(
R:R
  A:A
    Reserves=,../B
)");
}

TEST(ElementValues, ParametersOfAReferenceListAreReplacedFirst) {
    ASSERT_TREE("<R To='/A/C,/A/D'><A><B><Reserves>#{To},#{Unknown}</Reserves></B></A></R>", R"(
R:R
  A:A
    B:B
      Reserves=../C,../D,#{Unknown}
)");
}

TEST(ElementValues, ReservesEndsNeitherInPathNorDirSoTypeDecidesAlone) {
    ASSERT_TREE("<R><A><ReservesPath>/x/y</ReservesPath></A></R>", R"(
R:R
  A:A
    ReservesPath=x\y
)");
}

// --- Localised values ---

TEST(ElementValues, LocalizedValueHoldsTheTextANulAndTheList) {
    EXPECT_EQ(ValueOf("<T localize='true'>eng=A,jpn=B</T>"), "T~A{0000}eng=A,jpn=B");
}

TEST(ElementValues, LocalizedValueWithoutALanguageHoldsTheListAlone) {
    EXPECT_EQ(ValueOf("<T localize='true'>jpn=B</T>"), "T~jpn=B");
    EXPECT_EQ(ValueOf("<T localize='true'></T>"), "T~");
}

TEST(ElementValues, LocalizeIsABoolean) {
    EXPECT_EQ(ValueOf("<T LOCALIZE='Yes'>eng=A</T>"), "T~A{0000}eng=A");
    EXPECT_EQ(ValueOf("<T localize='no'>eng=A</T>"), "T=eng=A");
    EXPECT_EQ(ValueOf("<T localize=''>eng=A</T>"), "T=eng=A");
}

TEST(ElementValues, LocalizedPathIsAPathFirst) {
    EXPECT_EQ(ValueOf("<LogPath localize='1'>eng=a/b</LogPath>"), "LogPath~a\\b{0000}eng=a\\b");
}

TEST(ElementValues, ParametersOfALocalizedValueAreReplacedFirst) {
    EXPECT_EQ(ValueOf("<T localize='1' Word='Clock,jpn=X'>eng=#{Word}</T>"), "T~Clock{0000}eng=Clock,jpn=X");
}

// --- What is there already ---

TEST(ElementValues, RepeatedValueOverwritesInAnUnorderedNode) {
    ASSERT_TREE("<R><Name>a</Name><NAME>b</NAME></R>", R"(
R:R
  Name=b
)");
}

TEST(ElementValues, RepeatedValueIsDroppedUnderReplace) {
    ASSERT_TREE("<R replace='true'><Name>a</Name><Name>b</Name></R>", R"(
R:R
  Name=a
)");
}

TEST(ElementValues, RepeatedValuesStandSideBySideInAnOrderedNode) {
    ASSERT_TREE("<RList><Name>a</Name><Name>b</Name></RList>", R"(
RList:RList ordered
  Name=a
  Name=b
)");
    ASSERT_TREE("<RList replace='1'><Name>a</Name><Name localize='1'>eng=b</Name></RList>", R"(
RList:RList ordered
  Name=a
  Name~b{0000}eng=b
)");
}

TEST(ElementValues, ValueCannotDisplaceAChild) {
    ASSERT_TREE("<R><C><V>1</V></C><C>5</C></R>", R"(
R:R
  C:C
    V=1
)");
    ASSERT_TREE("<R replace='true'><C><V>1</V></C><C>5</C></R>", R"(
R:R
  C:C
    V=1
)");
}

TEST(ElementValues, ValueStandsBesideAChildInAnOrderedNode) {
    ASSERT_TREE("<RList><C><V>1</V></C><C>5</C></RList>", R"(
RList:RList ordered
  C:C
    V=1
  C=5
)");
}

TEST(ElementValues, ValueCannotDisplaceALink) {
    ASSERT_TREE("<R><A><T name='t'/><:Link name='l'>t</:Link><l>5</l></A></R>", R"(
R:R
  A:A
    l->t
    t:T
)");
}

TEST(ElementValues, PlainValueLeavesTheKindOfALocalizedOne) {
    ASSERT_TREE("<R><V localize='1'>eng=A</V><V>x</V></R>", R"(
R:R
  V~x
)");
}

TEST(ElementValues, LocalizedValueChangesTheKindOfAPlainOne) {
    ASSERT_TREE("<R><V>x</V><V localize='1'>eng=A</V></R>", R"(
R:R
  V~A{0000}eng=A
)");
}

TEST(ElementValues, LocalizedValueUnderReplaceChangesNothing) {
    ASSERT_TREE("<R replace='1'><V>x</V><V localize='1'>eng=A</V></R>", R"(
R:R
  V=x
)");
}

TEST(ElementValues, LocalizedValueLeavesAChildAsItIs) {
    ASSERT_TREE("<R><C><V>1</V></C><C localize='1'>eng=A</C></R>", R"(
R:R
  C:C
    V=1
)");
}

TEST(ElementValues, LocalizedValueLeavesALinkAsItIs) {
    ASSERT_TREE("<R><A><T name='t'/><:Link name='l'>t</:Link><l localize='1'>eng=A</l></A></R>", R"(
R:R
  A:A
    l->t
    t:T
)");
}

TEST(ElementValues, SecondFileOverwritesTheValuesOfTheFirst) {
    auto root = MakeUnnamedRoot();
    Load(*root, "<R><V>1</V><U>1</U><C name='x'><V>1</V></C></R>");
    EXPECT_EQ(Load(*root, "<Other><V>2</V><W>2</W><C name='x'><V>2</V><W>2</W></C></Other>"), R"(
R:R
  U=1
  V=2
  W=2
  x:C
    V=2
    W=2
)");
}

TEST(ElementValues, SecondFileUnderReplaceLeavesTheValuesAndMakesTheChildrenAnew) {
    auto root = MakeUnnamedRoot();
    Load(*root, "<R><V>1</V><U>1</U><C name='x'><V>1</V></C></R>");
    EXPECT_EQ(Load(*root, "<R replace='true'><V>2</V><W>2</W><C name='x'><W>2</W></C></R>"), R"(
R:R
  U=1
  V=1
  W=2
  x:C
    W=2
)");
}

TEST(ElementValues, SecondFileAddsToAnOrderedNode) {
    auto root = MakeUnnamedRoot();
    Load(*root, "<RList><V>1</V><C name='c'><V>1</V></C></RList>");
    EXPECT_EQ(Load(*root, "<RList><V>2</V><C name='c'><V>2</V></C></RList>"), R"(
RList:RList ordered
  V=1
  c:C
    V=1
  V=2
  c:C
    V=2
)");
}

}  // namespace
}  // namespace zkhw
