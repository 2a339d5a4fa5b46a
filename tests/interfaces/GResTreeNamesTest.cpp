// Names of nodes, and a node as text, asked of the whole tree.

#include <string>

#include <gtest/gtest.h>

#include "interfaces/support/GivenTexts.h"
#include "interfaces/support/HostProject.h"
#include "interfaces/support/OwnedTree.h"

namespace zkhw {
namespace {

std::string Cluster(const std::string& resource, const std::string& alias, const std::string& display) {
    return "\n<Cluster><Name></Name><NumElts>3</NumElts><String><Name>resource</Name><Val>" + resource +
           "</Val></String><String><Name>alias</Name><Val>" + alias +
           "</Val></String><String><Name>display name</Name><Val>" + display + "</Val></String></Cluster>";
}

class GResTreeNamesTest : public ::testing::Test {
  protected:
    // /a with the children b (of type Foo, with a child x), c, and the properties p and q.
    GResTreeNamesTest() {
        context.locator = &locator;
        a = AddChild(tree.Root(), u"a");
        b = AddChild(*a, u"b", u"Foo");
        x = AddChild(*b, u"x");
        c = AddChild(*a, u"c");
        AddText(*a, u"p", u"1");
    }
    void TearDown() override {
        queries.Reset();
        tree.End();
    }

    HRESULT Ask(const char16_t* path, const char16_t* options) {
        if (!queries) {
            queries = tree.Tree(&context, item);
        }
        ULONG* const count = names.Count();
        return queries->GetDescendantNames(Text(path), Text(options), count, names.Array());
    }
    // The names of a query that has to succeed.
    std::string Names(const char16_t* path, const char16_t* options) {
        EXPECT_EQ(Ask(path, options), S_OK);
        return names.Lines();
    }

    HostLocator locator;
    HostContext context;
    HostItem top;
    IzkProjectItem* item = nullptr;
    OwnedTree tree;
    InterfacePointer<IzkEIOGResourceTree2> queries;
    GivenTexts names;
    ResTreeNode* a;
    ResTreeNode* b;
    ResTreeNode* x;
    ResTreeNode* c;
};

TEST_F(GResTreeNamesTest, AloneItGivesTheNamesOfTheNextNodes) {
    EXPECT_EQ(Names(u"/a", u""), "\nb\nc");
    EXPECT_EQ(Names(u"a", nullptr), "\nb\nc");
}

TEST_F(GResTreeNamesTest, NoPathIsTheRoot) {
    EXPECT_EQ(Names(u"", u""), "\na");
    EXPECT_EQ(Names(nullptr, nullptr), "\na");
    EXPECT_EQ(Names(u"/", u""), "\na");
    EXPECT_EQ(Names(u"", u"includePath=true"), "\n/a");
    EXPECT_EQ(Names(nullptr, u"includePath=true"), "\n/a");
    EXPECT_EQ(Names(u"/", u"includePath=true"), "\n/a");
}

TEST_F(GResTreeNamesTest, APathThatLeadsNowhereIsAMiss) {
    for (const char16_t* path : {u"/none", u"/a/none", u"/a/p", u"/a/", u"//a", u".."}) {
        EXPECT_EQ(Ask(path, u"recurse=true"), S_FALSE);
        EXPECT_TRUE(names.IsCleared());
    }
}

TEST_F(GResTreeNamesTest, NullOutputsAreAnError) {
    queries = tree.Tree();
    ULONG count = 7;
    BSTR* array = nullptr;
    EXPECT_EQ(queries->GetDescendantNames(Text(u"none"), nullptr, nullptr, &array), E_POINTER);
    EXPECT_EQ(queries->GetDescendantNames(Text(u"none"), nullptr, &count, nullptr), E_POINTER);
}

TEST_F(GResTreeNamesTest, ANodeWithoutChildrenGivesNoArray) {
    EXPECT_EQ(Ask(u"/a/c", u""), S_OK);
    EXPECT_TRUE(names.IsCleared());
}

TEST_F(GResTreeNamesTest, WithRecurseItGivesAllBelowAParentFirst) {
    EXPECT_EQ(Names(u"/a", u"recurse=true"), "\nb\nx\nc");
    EXPECT_EQ(Names(u"/a", u"recurse=true,includePath=true"), "\n/a/b\n/a/b/x\n/a/c");
    EXPECT_EQ(Names(u"", u"recurse=true"), "\na\nb\nx\nc");
}

TEST_F(GResTreeNamesTest, OnlyNodesOfTheProtocolAreNamed) {
    EXPECT_EQ(Names(u"/a", u"protocol=foo"), "\nb");
    EXPECT_EQ(Names(u"/a", u"protocol=T"), "\nc");
    // Below a node of another type the walk goes on.
    EXPECT_EQ(Names(u"", u"protocol=T,recurse=true"), "\na\nx\nc");
    EXPECT_EQ(Names(u"/a", u"protocol=None"), "");
}

TEST_F(GResTreeNamesTest, AnExclusionCountsOnlyWithRecurse) {
    AddText(*b, u"Hidden", u"on");
    EXPECT_EQ(Names(u"/a", u"exclusionProperty=Hidden"), "\nb\nc");
    EXPECT_EQ(Names(u"/a", u"exclusionProperty=Hidden,recurse=true"), "\nx\nc");
    b->SetProperty(u"Hidden", u"");
    EXPECT_EQ(Names(u"/a", u"exclusionProperty=hidden,recurse=true"), "\nx\nc");
    b->SetProperty(u"Hidden", u"off");
    EXPECT_EQ(Names(u"/a", u"exclusionProperty=Hidden,recurse=true"), "\nb\nx\nc");
}

TEST_F(GResTreeNamesTest, WithIncludePathTheNextNodesStandBehindThePathAsItWasGiven) {
    EXPECT_EQ(Names(u"a", u"includePath=true"), "\na/b\na/c");
    // But a plain node below is named by its own path.
    EXPECT_EQ(Names(u"a", u"includePath=true,recurse=true"), "\n/a/b\n/a/b/x\n/a/c");
}

TEST_F(GResTreeNamesTest, SlashesAndBackslashesInNamesAreEscapedInPaths) {
    AddChild(*c, u"s/t");
    AddChild(*c, u"u\\v");
    EXPECT_EQ(Names(u"/a/c", u""), "\ns/t\nu\\v");
    EXPECT_EQ(Names(u"/a/c", u"includePath=true"), "\n/a/c/s\\/t\n/a/c/u\\\\v");
    AddChild(*c->FindRaw(u"s/t")->Child(), u"deep");
    EXPECT_EQ(Names(u"/a/c/s\\/t", u""), "\ndeep");
}

TEST_F(GResTreeNamesTest, ALinkIsNamedByItsNodeAndItsPathByItsKey) {
    AddLink(tree.Root(), u"way", u"/a/b");
    EXPECT_EQ(Names(u"", u""), "\na\nb");
    EXPECT_EQ(Names(u"", u"includePath=true"), "\n/a\n/way");
    EXPECT_EQ(Names(u"/way", u"includePath=true"), "\n/way/x");
    EXPECT_EQ(Names(u"", u"includePath=true,recurse=true"), "\n/a\n/a/b\n/a/b/x\n/a/c\n/way\n/way/x");
}

TEST_F(GResTreeNamesTest, BehindALinkLaterEntriesStandBehindWhatTheWalkHasHandedOn) {
    // In an ordered tree: n holds a link and then a plain child. The walk comes to n by a plain entry, and so with an
    // empty text.
    OwnedTree ordered(true);
    ResTreeNode* const n = AddChild(ordered.Root(), u"n", u"T", true);
    AddChild(ordered.Root(), u"m");
    AddChild(*n, u"before");
    AddLink(*n, u"way", u"/m");
    AddChild(*n, u"behind");
    const auto tree2 = ordered.Tree();
    ULONG* const count = names.Count();
    tree2->GetDescendantNames(Text(u""), Text(u"includePath=true,recurse=true"), count, names.Array());
    EXPECT_EQ(names.Lines(), "\n/n\n/n/before\n/n/way\n/behind\n/m");
}

// --- stripPathPrefix ---

TEST_F(GResTreeNamesTest, APrefixIsCutOffWithTheSlashBehindIt) {
    EXPECT_EQ(Names(u"/a", u"stripPathPrefix=/a"), "\nb\nc");
    EXPECT_EQ(Names(u"/a", u"stripPathPrefix=/a,recurse=true"), "\nb\nb/x\nc");
}

TEST_F(GResTreeNamesTest, WithoutPathsNoSlashGoesWithThePrefix) {
    EXPECT_EQ(Names(u"", u"stripPathPrefix=x,includePath=false"), "\na");
    AddChild(tree.Root(), u"name");
    EXPECT_EQ(Names(u"", u"includePath=false,stripPathPrefix=xx"), "\na\nme");
}

TEST_F(GResTreeNamesTest, AWrongPrefixCutsAllTheSame) {
    EXPECT_EQ(Names(u"/a", u"stripPathPrefix=q"), "\n/b\n/c");
}

TEST_F(GResTreeNamesTest, ANameOfWhichNothingIsLeftStaysWhole) {
    EXPECT_EQ(Names(u"/a", u"stripPathPrefix=/a/b"), "\n/a/b\n/a/c");
    EXPECT_EQ(Names(u"/a", u"stripPathPrefix=/a/longer than that"), "\n/a/b\n/a/c");
    EXPECT_EQ(Names(u"/a", u"stripPathPrefix=/a/b,recurse=true"), "\n/a/b\nx\n/a/c");
    // "/a/b" has one character more than the prefix: the one that would be the slash.
    EXPECT_EQ(Names(u"/a", u"stripPathPrefix=/a/"), "\n/a/b\n/a/c");
}

TEST_F(GResTreeNamesTest, AnEmptyPrefixCutsNothing) {
    EXPECT_EQ(Names(u"/a", u"stripPathPrefix="), "\n/a/b\n/a/c");
}

// --- Clusters ---

TEST_F(GResTreeNamesTest, WithIncludeAliasesAndNoItemTheAliasesAreEmpty) {
    EXPECT_EQ(Names(u"/a", u"includeAliases=true"), Cluster("b", "", "") + Cluster("c", "", ""));
}

TEST_F(GResTreeNamesTest, AliasesAreFoundByTheFullNameBlindToLetterCase) {
    LinkedItem one(locator, 1, u"/A/B", u"R&D <'\">");
    LinkedItem two(locator, 2, u"c", u"never");
    top.items = {&one.item, &two.item};
    item = &top;
    EXPECT_EQ(Names(u"/a", u"includeAliases=true,stripPathPrefix=/a"),
              Cluster("b", "R&amp;D &lt;'\"&gt;", "") + Cluster("c", "", ""));
    EXPECT_EQ(top.selections, 1);
    // Without paths the full name is the bare one.
    EXPECT_EQ(Names(u"/a", u"includeAliases=true"), Cluster("b", "", "") + Cluster("c", "never", ""));
    TearDown();
}

TEST_F(GResTreeNamesTest, TheHostIsAskedForAliasesOnlyIfTheyAreWanted) {
    item = &top;
    Names(u"/a", u"includeDisplayNames=true");
    Names(u"/a", u"recurse=true");
    EXPECT_EQ(Ask(u"/none", u"includeAliases=true"), S_FALSE);
    EXPECT_EQ(top.selections, 0);
    Names(u"/a/c", u"includeAliases=true");
    EXPECT_EQ(top.selections, 1);
}

TEST_F(GResTreeNamesTest, WithDisplayNamesTheResourceIsTheBareNameAndTheDisplayNameAPath) {
    AddText(*a, u"DisplayName", u"First");
    AddText(*b, u"DisplayName", u"B/&");
    AddText(*c, u"DisplayName", u"");
    EXPECT_EQ(Names(u"/a", u"includeDisplayNames=true"),
              Cluster("b", "", "/First/B\\/&amp;") + Cluster("c", "", "/First"));
    EXPECT_EQ(
        Names(u"/a", u"includeDisplayNames=true,recurse=true,stripPathPrefix=/a"),
        Cluster("b", "", "/First/B\\/&amp;") + Cluster("b/x", "", "/First/B\\/&amp;/x") + Cluster("c", "", "/First"));
}

TEST_F(GResTreeNamesTest, ALocalisedDisplayNameEndsThePathAtItsText) {
    a->AddTextEntry(u"DisplayName", std::u16string_view(u"One\0jpn;Eins", 12), LocalizedTextEntry);
    EXPECT_EQ(Names(u"", u"includeDisplayNames=true"), Cluster("a", "", "/One"));
    // What stands behind the NUL hides what would follow.
    EXPECT_EQ(Names(u"/a", u"includeDisplayNames=true"), Cluster("b", "", "/One") + Cluster("c", "", "/One"));
}

TEST_F(GResTreeNamesTest, AClusterMayHaveAnEmptyResource) {
    EXPECT_EQ(Names(u"/a", u"stripPathPrefix=/a/b,includeAliases=true"), Cluster("", "", "") + Cluster("", "", ""));
}

TEST_F(GResTreeNamesTest, NamesAreEscapedInClusters) {
    AddChild(*c, u"<&'\">");
    EXPECT_EQ(Names(u"/a/c", u"includeAliases=true"), Cluster("&lt;&amp;'\"&gt;", "", ""));
}

TEST_F(GResTreeNamesTest, TheHostMayChangeTheTreeWhileItOffersItsItems) {
    top.whenSelecting = [&](IzkProjectItemSelector&) { tree.Root().RemoveEntryByName(u"a"); };
    item = &top;
    EXPECT_EQ(Names(u"/a", u"includeAliases=true"), Cluster("b", "", "") + Cluster("c", "", ""));
    EXPECT_EQ(Ask(u"/a", u""), S_FALSE);
}

// --- GetFilteredXml, and the table ---

TEST_F(GResTreeNamesTest, AFilteredNodeIsThatOfTheNodeInterface) {
    queries = tree.Tree();
    LPCWSTR nodes[] = {Text(u"B"), Text(u"x")};
    LPCWSTR properties[] = {Text(u"P")};
    for (const char16_t* path : {u"/a", u"a"}) {
        OwnedBstr whole;
        OwnedBstr direct;
        EXPECT_EQ(queries->GetFilteredXml(Text(path), 2, nodes, 1, properties, whole.Receive()), S_OK);
        EXPECT_EQ(tree.At(u"a")->GetFilteredXml(2, nodes, 1, properties, direct.Receive()), S_OK);
        EXPECT_EQ(whole.View(), direct.View());
        EXPECT_NE(whole.View().find(u"name=\"x\""), std::u16string_view::npos);
        EXPECT_EQ(whole.View().find(u"name=\"c\""), std::u16string_view::npos);
    }
}

TEST_F(GResTreeNamesTest, AFilteredPathMayBeEmptyOrMissing) {
    queries = tree.Tree();
    for (const char16_t* path : {u"", static_cast<const char16_t*>(nullptr), u"/"}) {
        OwnedBstr root;
        EXPECT_EQ(queries->GetFilteredXml(Text(path), 0, nullptr, 0, nullptr, root.Receive()), S_OK);
        EXPECT_NE(root.View().find(u"<Root"), std::u16string_view::npos);
        EXPECT_EQ(root.View().find(u"name=\"a\""), std::u16string_view::npos);
    }
    OwnedBstr none;
    EXPECT_EQ(queries->GetFilteredXml(Text(u"/a/none"), 0, nullptr, 0, nullptr, none.Receive()), S_FALSE);
    EXPECT_EQ(none.Get(), nullptr);
}

TEST_F(GResTreeNamesTest, BothTreeIdsAnswerWithTheTableInItsOrder) {
    a->SetProperty(u"p", u"v");
    const auto object = tree.Tree();
    void** const table = *reinterpret_cast<void***>(object.Get());
    using ListOperation = HRESULT (*)(void*, LPCWSTR, LPCWSTR, ULONG*, BSTR**);
    const auto list = [&](int slot) {
        ULONG* const count = names.Count();
        EXPECT_EQ(reinterpret_cast<ListOperation>(table[slot])(object.Get(), Text(u"a"), nullptr, count, names.Array()),
                  S_OK);
        return names.Lines();
    };
    EXPECT_EQ(list(3), "\nb\nc");
    EXPECT_EQ(list(4), "\np");
    EXPECT_EQ(list(5),
              "\n<Cluster><Name></Name><NumElts>2</NumElts><String><Name>name</Name><Val>p</Val></String>"
              "<String><Name>value</Name><Val>v</Val></String></Cluster>");
    using ValueOperation = HRESULT (*)(void*, LPCWSTR, LPCWSTR, BSTR*);
    OwnedBstr value;
    EXPECT_EQ(reinterpret_cast<ValueOperation>(table[6])(object.Get(), Text(u"a/p"), nullptr, value.Receive()), S_OK);
    EXPECT_EQ(value.View(), u"v");
    using XmlOperation = HRESULT (*)(void*, LPCWSTR, ULONG, LPCWSTR*, ULONG, LPCWSTR*, BSTR*);
    OwnedBstr xml;
    EXPECT_EQ(
        reinterpret_cast<XmlOperation>(table[7])(object.Get(), Text(u"none"), 0, nullptr, 0, nullptr, xml.Receive()),
        S_FALSE);
}

}  // namespace
}  // namespace zkhw
