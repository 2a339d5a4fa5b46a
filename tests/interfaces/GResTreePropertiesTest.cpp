// Properties, asked of the whole tree.

#include <string>

#include <gtest/gtest.h>

#include "interfaces/support/GivenTexts.h"
#include "interfaces/support/OwnedTree.h"

namespace zkhw {
namespace {

std::string Pair(const std::string& name, const std::string& value) {
    return "\n<Cluster><Name></Name><NumElts>2</NumElts><String><Name>name</Name><Val>" + name +
           "</Val></String><String><Name>value</Name><Val>" + value + "</Val></String></Cluster>";
}

class GResTreePropertiesTest : public ::testing::Test {
  protected:
    // /a with p and q, /a/b of type Foo with r, /a/c with p; the root has top.
    GResTreePropertiesTest() {
        ResTreeNode& root = tree.Root();
        AddText(root, u"top", u"0");
        a = AddChild(root, u"a");
        AddText(*a, u"p", u"1");
        AddText(*a, u"q", u"2");
        b = AddChild(*a, u"b", u"Foo");
        AddText(*b, u"r", u"3");
        c = AddChild(*a, u"c");
        AddText(*c, u"p", u"4");
        queries = tree.Tree();
    }

    HRESULT Ask(const char16_t* path, const char16_t* options) {
        ULONG* const count = names.Count();
        return queries->GetMultiplePropertyNames(Text(path), Text(options), count, names.Array());
    }
    std::string Names(const char16_t* path, const char16_t* options) {
        EXPECT_EQ(Ask(path, options), S_OK);
        return names.Lines();
    }
    std::string Values(const char16_t* path, const char16_t* options) {
        ULONG* const count = names.Count();
        EXPECT_EQ(queries->GetMultipleProperties(Text(path), Text(options), count, names.Array()), S_OK);
        return names.Lines();
    }
    // "(miss)" if there is none, and then nothing is stored.
    std::string Property(const char16_t* path) {
        BSTR value = reinterpret_cast<BSTR>(&names);
        const HRESULT given = queries->GetProperty(Text(path), Text(u"recurse=true"), &value);
        if (given != S_OK) {
            EXPECT_EQ(given, S_FALSE);
            EXPECT_EQ(value, reinterpret_cast<BSTR>(&names));
            return "(miss)";
        }
        const OwnedBstr owned(value);
        return qn::dsc::ExactText(owned.View());
    }

    OwnedTree tree;
    InterfacePointer<IzkEIOGResourceTree2> queries;
    GivenTexts names;
    ResTreeNode* a;
    ResTreeNode* b;
    ResTreeNode* c;
};

TEST_F(GResTreePropertiesTest, AloneItGivesTheNamesOfTheNodesProperties) {
    EXPECT_EQ(Names(u"/a", u""), "\np\nq");
    EXPECT_EQ(Names(u"a", nullptr), "\np\nq");
    EXPECT_EQ(Names(u"", u""), "\ntop");
    EXPECT_EQ(Names(nullptr, u""), "\ntop");
}

TEST_F(GResTreePropertiesTest, ValuesComeAsPairs) {
    EXPECT_EQ(Values(u"/a", u""), Pair("p", "1") + Pair("q", "2"));
    a->SetProperty(u"p", u"<&'\">");
    EXPECT_EQ(Values(u"/a", u"includePath=true"), Pair("/a/p", "&lt;&amp;'\"&gt;") + Pair("/a/q", "2"));
}

TEST_F(GResTreePropertiesTest, WithIncludePathThePathOfTheNodeStandsInFront) {
    EXPECT_EQ(Names(u"/a", u"includePath=true"), "\n/a/p\n/a/q");
    EXPECT_EQ(Names(u"a", u"includePath=true"), "\na/p\na/q");
    EXPECT_EQ(Names(u"", u"includePath=true"), "\n/top");
    EXPECT_EQ(Names(u"/", u"includePath=true"), "\n/top");
}

TEST_F(GResTreePropertiesTest, APathThatEndsInAnEscapedSlashGetsOneMore) {
    ResTreeNode* const node = AddChild(tree.Root(), u"s/");
    AddText(*node, u"p", u"1");
    EXPECT_EQ(Names(u"/s\\/", u"includePath=true"), "\n/s\\//p");
    ResTreeNode* const back = AddChild(tree.Root(), u"t\\");
    AddText(*back, u"p", u"1");
    EXPECT_EQ(Names(u"/t\\\\", u"includePath=true"), "\n/t\\\\/p");
}

TEST_F(GResTreePropertiesTest, AnEscapedSlashIsOneAtTheEndOfANameOfAnyLength) {
    AddText(*AddChild(tree.Root(), u"/"), u"p", u"1");
    EXPECT_EQ(Names(u"/\\/", u"includePath=true"), "\n/\\//p");
    AddText(*AddChild(tree.Root(), u"st/"), u"p", u"1");
    EXPECT_EQ(Names(u"/st\\/", u"includePath=true"), "\n/st\\//p");
    AddText(*AddChild(tree.Root(), u"s\\/"), u"p", u"1");
    EXPECT_EQ(Names(u"/s\\\\\\/", u"includePath=true"), "\n/s\\\\\\//p");
}

TEST_F(GResTreePropertiesTest, SlashesAndBackslashesInPropertyNamesAreEscaped) {
    ResTreeNode* const node = AddChild(tree.Root(), u"n");
    AddText(*node, u"x/y\\z", u"1");
    EXPECT_EQ(Names(u"/n", u""), "\nx\\/y\\\\z");
    EXPECT_EQ(Values(u"/n", u""), Pair("x\\/y\\\\z", "1"));
}

TEST_F(GResTreePropertiesTest, WithRecurseTheNodesBelowFollow) {
    EXPECT_EQ(Names(u"/a", u"recurse=true"), "\np\nq\nr\np");
    EXPECT_EQ(Names(u"/a", u"recurse=true,includePath=true"), "\n/a/p\n/a/q\n/a/b/r\n/a/c/p");
    EXPECT_EQ(Values(u"", u"recurse=true,includePath=true"),
              Pair("/top", "0") + Pair("/a/p", "1") + Pair("/a/q", "2") + Pair("/a/b/r", "3") + Pair("/a/c/p", "4"));
}

TEST_F(GResTreePropertiesTest, APrefixIsCutOffThePathAndNotOffTheName) {
    EXPECT_EQ(Names(u"/a", u"recurse=true,stripPathPrefix=/a"), "\np\nq\nb/r\nc/p");
    // Nothing is left of the path; the name stays.
    EXPECT_EQ(Names(u"/a", u"stripPathPrefix=/a/longer"), "\np\nq");
    EXPECT_EQ(Names(u"/a", u"stripPathPrefix=/"), "\n/p\n/q");
    EXPECT_EQ(Names(u"/a", u"stripPathPrefix=x"), "\n/p\n/q");
    EXPECT_EQ(Names(u"/a", u"stripPathPrefix=x,includePath=false"), "\np\nq");
    EXPECT_EQ(Names(u"/a", u"stripPathPrefix="), "\n/a/p\n/a/q");
}

TEST_F(GResTreePropertiesTest, ANodeThatIsNotOfTheProtocolGivesNothing) {
    EXPECT_EQ(Ask(u"/a", u"protocol=Foo"), S_OK);
    EXPECT_TRUE(names.IsEmptyBlock());
    EXPECT_EQ(Names(u"/a/b", u"protocol=Foo"), "\nr");
}

TEST_F(GResTreePropertiesTest, WithRecurseThoseBelowThatAreOfTheProtocolStillCount) {
    EXPECT_EQ(Names(u"/a", u"protocol=Foo,recurse=true"), "\nr");
    EXPECT_EQ(Values(u"", u"protocol=Foo,recurse=true,includePath=true"), Pair("/a/b/r", "3"));
}

TEST_F(GResTreePropertiesTest, AnExclusionCountsOnlyWithRecurseAndNeverForTheNodeItself) {
    AddText(*a, u"Hidden", u"true");
    AddText(*b, u"Hidden", u"true");
    EXPECT_EQ(Names(u"/a/b", u"exclusionProperty=Hidden"), "\nHidden\nr");
    EXPECT_EQ(Names(u"/a", u"exclusionProperty=Hidden,recurse=true"), "\nHidden\np\nq\np");
}

TEST_F(GResTreePropertiesTest, TheKeysOfAliasesMeanNothing) {
    EXPECT_EQ(Names(u"/a", u"includeAliases=true,includeDisplayNames=true"), "\np\nq");
}

TEST_F(GResTreePropertiesTest, LocalisedPropertiesStandInTheirPlaceWithTheirText) {
    OwnedTree ordered(true);
    ordered.Root().AddTextEntry(u"l", std::u16string_view(u"One\0jpn;Eins", 12), LocalizedTextEntry);
    AddChild(ordered.Root(), u"child");
    AddText(ordered.Root(), u"p", u"1");
    AddText(ordered.Root(), u"p", u"2");
    AddLink(ordered.Root(), u"way", u"/child");
    queries = ordered.Tree();
    EXPECT_EQ(Names(u"", u""), "\nl\np\np");
    EXPECT_EQ(Values(u"", u""), Pair("l", "One") + Pair("p", "1") + Pair("p", "2"));
    EXPECT_EQ(Property(u"l"), "One");
    EXPECT_EQ(Property(u"p"), "1");
    queries.Reset();
}

TEST_F(GResTreePropertiesTest, BehindALinkANodeIsFoundByTheWayToIt) {
    AddLink(tree.Root(), u"way", u"/a/b");
    EXPECT_EQ(Names(u"/way", u"includePath=true"), "\n/way/r");
    EXPECT_EQ(Names(u"", u"protocol=Foo,recurse=true,includePath=true"), "\n/a/b/r\n/way/r");
}

TEST_F(GResTreePropertiesTest, AWayThatLeadsNowhereFromTheRootIsPassedOver) {
    // The plain child behind a link of n is named "/behind", which isn't there.
    OwnedTree ordered(true);
    ResTreeNode* const n = AddChild(ordered.Root(), u"n", u"T", true);
    AddText(*AddChild(ordered.Root(), u"m"), u"p", u"1");
    AddLink(*n, u"way", u"/m");
    AddText(*AddChild(*n, u"behind"), u"lost", u"1");
    queries = ordered.Tree();
    EXPECT_EQ(Names(u"", u"recurse=true,includePath=true"), "\n/n/way/p\n/m/p");
    queries.Reset();
}

TEST_F(GResTreePropertiesTest, AnEmptyListIsABlock) {
    EXPECT_EQ(Ask(u"/a", u"protocol=None,recurse=true"), S_OK);
    EXPECT_TRUE(names.IsEmptyBlock());
}

TEST_F(GResTreePropertiesTest, APathThatLeadsNowhereIsAMiss) {
    for (const char16_t* path : {u"/none", u"/a/p", u"/a/"}) {
        EXPECT_EQ(Ask(path, u"recurse=true"), S_FALSE);
        EXPECT_TRUE(names.IsCleared());
    }
}

TEST_F(GResTreePropertiesTest, NullOutputsAreAnError) {
    ULONG count = 7;
    BSTR* array = nullptr;
    EXPECT_EQ(queries->GetMultiplePropertyNames(nullptr, nullptr, nullptr, &array), E_POINTER);
    EXPECT_EQ(queries->GetMultiplePropertyNames(nullptr, nullptr, &count, nullptr), E_POINTER);
    EXPECT_EQ(queries->GetMultipleProperties(nullptr, nullptr, nullptr, &array), E_POINTER);
    EXPECT_EQ(queries->GetMultipleProperties(nullptr, nullptr, &count, nullptr), E_POINTER);
}

// --- GetProperty ---

TEST_F(GResTreePropertiesTest, APropertyIsFoundByItsPath) {
    EXPECT_EQ(Property(u"/a/b/r"), "3");
    EXPECT_EQ(Property(u"a/b/r"), "3");
    EXPECT_EQ(Property(u"A/B/R"), "3");
    EXPECT_EQ(Property(u"top"), "0");
    EXPECT_EQ(Property(u"/top"), "0");
}

TEST_F(GResTreePropertiesTest, WhatIsNoPropertyIsAMiss) {
    for (const char16_t* path : {u"", u"/", u"a", u"/a/b", u"a/none", u"a/none/p", u"a/p/x", u"a/b/"}) {
        EXPECT_EQ(Property(path), "(miss)") << qn::dsc::ExactText(std::u16string_view(path));
    }
    EXPECT_EQ(Property(nullptr), "(miss)");
}

TEST_F(GResTreePropertiesTest, APropertyWithAnEmptyNameIsFoundByAPathOfANode) {
    AddText(*b, u"", u"nameless");
    EXPECT_EQ(Property(u"a/b"), "nameless");
    EXPECT_EQ(Property(u"a/b/"), "nameless");
}

TEST_F(GResTreePropertiesTest, TheNameOfAPropertyStandsAsItIs) {
    AddText(*c, u"x\\y", u"back");
    AddText(*c, u"x\\\\y", u"two");
    AddText(*c, u"s/t", u"slash");
    EXPECT_EQ(Property(u"a/c/x\\y"), "back");
    EXPECT_EQ(Property(u"a/c/x\\\\y"), "two");
    // The name would have to hold the backslash.
    EXPECT_EQ(Property(u"a/c/s\\/t"), "(miss)");
    // What is left is "s/t", for there is no node "s".
    EXPECT_EQ(Property(u"a/c/s/t"), "slash");
}

TEST_F(GResTreePropertiesTest, EscapedSlashesInThePathAreCounted) {
    AddText(*AddChild(*c, u"s/t"), u"p", u"5");
    EXPECT_EQ(Property(u"a/c/s\\/t/p"), "5");
}

TEST_F(GResTreePropertiesTest, AnEscapedBackslashInThePathMakesTheRestBeginTooSoon) {
    ResTreeNode* const node = AddChild(*c, u"s\\t");
    AddText(*node, u"p", u"5");
    EXPECT_EQ(Property(u"a/c/s\\\\t/p"), "(miss)");
    AddText(*node, u"/p", u"6");
    EXPECT_EQ(Property(u"a/c/s\\\\t/p"), "6");
}

TEST_F(GResTreePropertiesTest, APropertyIsFoundThroughALink) {
    AddLink(tree.Root(), u"way", u"/a/b");
    EXPECT_EQ(Property(u"/way/r"), "3");
}

}  // namespace
}  // namespace zkhw
