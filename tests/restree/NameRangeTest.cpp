#include "restree/NameRange.h"

#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "restree/ReadTree.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;

// "name variable index" of each record, with commas between; no variable is "-".
std::string Shown(const std::vector<InstanceRecord>& records) {
    std::string shown;
    for (const InstanceRecord& record : records) {
        shown += shown.empty() ? "" : ", ";
        shown += ExactText(record.name) + " " + (record.variable.empty() ? "-" : ExactText(record.variable)) + " " +
                 std::to_string(record.index);
    }
    return shown;
}

// The loop variables of a list, with commas between.
std::string VariablesOf(const char16_t* names) {
    std::vector<InstanceRecord> records;
    std::vector<String> loopVariables;
    ParseNames(names, records, loopVariables);
    std::string shown;
    for (const String& variable : loopVariables) {
        shown += (shown.empty() ? "" : ", ") + ExactText(variable);
    }
    return shown;
}

// What a range stands for; "no range" if the item isn't one.
std::string RangeOf(const char16_t* item) {
    std::vector<InstanceRecord> records;
    const bool isRange = ParseNameRange(item, records);
    EXPECT_TRUE(isRange || records.empty());
    return isRange ? Shown(records) : "no range";
}

std::string NamesOf(const char16_t* names) {
    std::vector<InstanceRecord> records;
    std::vector<String> loopVariables;
    ParseNames(names, records, loopVariables);
    return Shown(records);
}

TEST(NameRange, GivesARecordPerValue) {
    EXPECT_EQ(RangeOf(u"Bank[i=0..3]"), "Bank0 i 0, Bank1 i 1, Bank2 i 2, Bank3 i 3");
}

TEST(NameRange, MayHaveNoVariable) {
    EXPECT_EQ(RangeOf(u"Port[1..2]A"), "Port1A - 1, Port2A - 2");
    EXPECT_EQ(RangeOf(u"Port[=1..2]A"), "Port1A - 1, Port2A - 2");
}

TEST(NameRange, MayHaveNoPrefix) {
    EXPECT_EQ(RangeOf(u"[i=8..9]"), "8 i 8, 9 i 9");
}

TEST(NameRange, LeadingZerosAreNotKept) {
    EXPECT_EQ(RangeOf(u"P[i=03..04]"), "P3 i 3, P4 i 4");
}

TEST(NameRange, CountsAcrossTheNumberOfDigits) {
    EXPECT_EQ(RangeOf(u"P[9..11]"), "P9 - 9, P10 - 10, P11 - 11");
}

TEST(NameRange, OneValueIsARange) {
    EXPECT_EQ(RangeOf(u"P[i=7..7]"), "P7 i 7");
}

TEST(NameRange, LowAboveHighIsARangeWithoutValues) {
    EXPECT_EQ(RangeOf(u"P[i=2..1]"), "");
}

TEST(NameRange, EmptyBoundIsZero) {
    EXPECT_EQ(RangeOf(u"P[..1]"), "P0 - 0, P1 - 1");
    EXPECT_EQ(RangeOf(u"P[i=..1]"), "P0 i 0, P1 i 1");
    EXPECT_EQ(RangeOf(u"P[..]"), "P0 - 0");
    EXPECT_EQ(RangeOf(u"P[0..]"), "P0 - 0");
    EXPECT_EQ(RangeOf(u"P[1..]"), "");
}

TEST(NameRange, OtherFormsAreNoRange) {
    for (const char16_t* item : {u"",
                                 u"P",
                                 u"P]",
                                 u"P[",
                                 u"P[]",
                                 u"P[1",
                                 u"P[1]",
                                 u"P[1.",
                                 u"P[1.2]",
                                 u"P[1..",
                                 u"P[1..2",
                                 u"P[1..2)",
                                 u"P[1..2x]",
                                 u"P[1...2]",
                                 u"P[a..b]",
                                 u"P[i]",
                                 u"P[i=]",
                                 u"P[i=1]",
                                 u"P[-1..2]",
                                 u"P[1..-2]",
                                 u"P[+1..2]",
                                 u"P[ 1..2]",
                                 u"P[1 ..2]",
                                 u"P[1.. 2]",
                                 u"P[1..2 ]",
                                 u"P[i= 1..2]",
                                 u"P[i=j=1..2]",
                                 u"P[x][1..2]",
                                 u"P[0x1..2]",
                                 u"P[\uFF11..\uFF12]",
                                 u"P[1,2]",
                                 u"P[1\u2025"
                                 u"2]",
                                 u"P(1..2)"}) {
        EXPECT_EQ(RangeOf(item), "no range") << ExactText(std::u16string_view(item));
    }
}

TEST(NameRange, VariableIsTakenAsItStands) {
    EXPECT_EQ(RangeOf(u"P[ a b =1..1]"), "P1  a b  1");
    EXPECT_EQ(RangeOf(u"P[[=1..1]"), "P1 [ 1");
}

TEST(NameRange, EqualsSignBeforeTheBracketBelongsToThePrefix) {
    EXPECT_EQ(RangeOf(u"a=b[1..2]"), "a=b1 - 1, a=b2 - 2");
}

TEST(NameRange, EqualsSignBehindTheRangeEndsAVariable) {
    EXPECT_EQ(RangeOf(u"P[1..2]=x"), "no range");
    EXPECT_EQ(RangeOf(u"P[1..2]=3..4]s"), "P3s 1..2] 3, P4s 1..2] 4");
}

TEST(NameRange, SecondRangeBelongsToTheSuffix) {
    EXPECT_EQ(RangeOf(u"P[1..2][3..4]"), "P1[3..4] - 1, P2[3..4] - 2");
}

TEST(NameRange, NumberThatIsTooGreatIsNoRange) {
    EXPECT_EQ(RangeOf(u"P[99999999999..99999999999]"), "no range");
    EXPECT_EQ(RangeOf(u"P[1..99999999999]"), "no range");
}

TEST(NameRange, RangeUpToTheGreatestNumberEnds) {
    EXPECT_EQ(RangeOf(u"P[2147483646..2147483647]"), "P2147483646 - 2147483646, P2147483647 - 2147483647");
}

TEST(NameRange, BoundsAreSigned) {
    EXPECT_EQ(RangeOf(u"P[4294967295..1]"), "P-1 - -1, P0 - 0, P1 - 1");
    EXPECT_EQ(RangeOf(u"P[0..4294967295]"), "");
    EXPECT_EQ(RangeOf(u"P[2147483648..2147483649]"), "P-2147483648 - -2147483648, P-2147483647 - -2147483647");
}

TEST(NameRange, BoundThatWrapsAroundUnnoticedIsWhatItWrapsTo) {
    EXPECT_EQ(RangeOf(u"P[4294967296..4294967297]"), "P0 - 0, P1 - 1");
}

TEST(NameRange, RecordsAreAppended) {
    std::vector<InstanceRecord> records;
    EXPECT_TRUE(ParseNameRange(u"a[1..2]", records));
    EXPECT_FALSE(ParseNameRange(u"b", records));
    EXPECT_TRUE(ParseNameRange(u"c[2..1]", records));
    EXPECT_TRUE(ParseNameRange(u"d[j=3..3]", records));
    EXPECT_EQ(Shown(records), "a1 - 1, a2 - 2, d3 j 3");
}

TEST(NameRange, ListMixesNamesAndRanges) {
    EXPECT_EQ(NamesOf(u"x, P[i=1..2] ,y,Q[2..1],R[a..b]"), "x - 0, P1 i 1, P2 i 2, y - 0, R[a..b] - 0");
}

TEST(NameRange, ListGivesItsLoopVariables) {
    EXPECT_EQ(VariablesOf(u"A[i=0..1],B[j=0..1],C[i=0..1]"), "i, j, i");
    EXPECT_EQ(VariablesOf(u"A[i=0..1],x,B[I=0..1],C[i=0..1]"), "i");
    EXPECT_EQ(VariablesOf(u"A[i=1..0],B[0..1],x,C[j=]"), "");
    EXPECT_EQ(NamesOf(u"A[i=0..0],B[j=1..1],C[k=2..2],D[i=3..4],e,F[5..5]"),
              "A0 i 0, B1 j 1, C2 k 2, D3 i 3, D4 i 4, e - 0, F5 - 5");
}

TEST(NameRange, VariableOfAnItemWithEscapesLastsAsLongAsTheList) {
    EXPECT_EQ(NamesOf(u"a\\,b[x\\,y=1..2],c\\,d[z\\,z=3..3],e"), "a,b1 x,y 1, a,b2 x,y 2, c,d3 z,z 3, e - 0");
}

TEST(NameRange, NamesMayHaveAnyLength) {
    for (size_t length = 0; length <= 40; ++length) {
        const std::u16string part(length, u'n');
        const std::string shown(length, 'n');
        EXPECT_EQ(NamesOf((part + u"[i=9..10]" + part + u"," + part).c_str()),
                  shown + "9" + shown + " i 9, " + shown + "10" + shown + " i 10" +
                      (length == 0 ? ",  - 0" : ", " + shown + " - 0"));
    }
}

TEST(NameRange, EscapedCommasBelongToANameOrRange) {
    EXPECT_EQ(NamesOf(u"a\\,b,c\\,[1..2]\\,d"), "a,b - 0, c,1,d - 1, c,2,d - 2");
}

TEST(NameRange, EmptyPiecesAreNames) {
    EXPECT_EQ(NamesOf(u",x,"), " - 0, x - 0,  - 0");
    EXPECT_EQ(NamesOf(u" "), " - 0");
    EXPECT_EQ(NamesOf(u""), "");
}

}  // namespace
}  // namespace zkhw
