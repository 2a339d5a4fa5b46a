#include <memory>
#include <string>

#include <gtest/gtest.h>

#include "restree/ResTreeNode.h"
#include "support/ExactText.h"
#include "support/TreeMaking.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;

//     Root
//       A
//         B
//           C
//         up -> ".."
//       M
//         c
//       N
//         L -> "../M"
//       a text "T"
class Paths : public ::testing::Test {
  protected:
    Paths() {
        a = AddChild(*root, u"A");
        b = AddChild(*a, u"B");
        c = AddChild(*b, u"C");
        AddLink(*a, u"up", u"..");
        m = AddChild(*root, u"M");
        mc = AddChild(*m, u"c");
        n = AddChild(*root, u"N");
        AddLink(*n, u"L", u"../M");
        AddText(*root, u"T", u"A");
    }

    std::unique_ptr<ResTreeNode> root = MakeRootNode();
    ResTreeNode* a;
    ResTreeNode* b;
    ResTreeNode* c;
    ResTreeNode* m;
    ResTreeNode* mc;
    ResTreeNode* n;
};

// --- Lookup ---

TEST_F(Paths, EmptyPathAndDotAreTheNodeItself) {
    EXPECT_EQ(a->Lookup(u"", nullptr), a);
    EXPECT_EQ(a->Lookup(u".", nullptr), a);
    EXPECT_EQ(a->Lookup(u"./././B/.", nullptr), b);
}

TEST_F(Paths, SlashIsTheRoot) {
    EXPECT_EQ(c->Lookup(u"/", nullptr), root.get());
    EXPECT_EQ(root->Lookup(u"/", nullptr), root.get());
    EXPECT_EQ(c->Lookup(u"/M/c", nullptr), mc);
}

TEST_F(Paths, OtherPathsStartAtTheNode) {
    EXPECT_EQ(a->Lookup(u"B/C", nullptr), c);
    EXPECT_EQ(a->Lookup(u"A", nullptr), nullptr);
}

TEST_F(Paths, NamesAreBlindToCase) {
    EXPECT_EQ(root->Lookup(u"a/b/c", nullptr), c);
    EXPECT_EQ(root->Lookup(u"a\u00AD/B", nullptr), b);
}

// Windows has an order of its own outside printable ASCII: docs/platforms.md lists where it differs.
TEST_F(Paths, NamesAreBlindToWidthAsOnlyLinuxOrdersSo) {
    EXPECT_EQ(root->Lookup(u"\uFF41/B", nullptr), b);
}

TEST_F(Paths, TwoDotsLeadToTheParent) {
    EXPECT_EQ(c->Lookup(u"..", nullptr), b);
    EXPECT_EQ(c->Lookup(u"../../../M", nullptr), m);
}

TEST_F(Paths, AboveTheRootIsNothing) {
    EXPECT_EQ(root->Lookup(u"..", nullptr), nullptr);
    EXPECT_EQ(a->Lookup(u"../..", nullptr), nullptr);
    EXPECT_EQ(a->Lookup(u"../../M", nullptr), nullptr);
    EXPECT_EQ(a->Lookup(u"/../M", nullptr), nullptr);
}

TEST_F(Paths, MissingNameIsNothing) {
    EXPECT_EQ(root->Lookup(u"X", nullptr), nullptr);
    EXPECT_EQ(root->Lookup(u"A/X/..", nullptr), nullptr);
}

TEST_F(Paths, TextIsNoNode) {
    EXPECT_EQ(root->Lookup(u"T", nullptr), nullptr);
    EXPECT_EQ(root->Lookup(u"T/B", nullptr), nullptr);
}

TEST_F(Paths, LinkIsResolvedFromTheNodeThatHoldsIt) {
    EXPECT_EQ(n->Lookup(u"L", nullptr), m);
    EXPECT_EQ(n->Lookup(u"L/c", nullptr), mc);
    EXPECT_EQ(root->Lookup(u"N/L/c", nullptr), mc);
    EXPECT_EQ(root->Lookup(u"N/L/../A", nullptr), a);
}

TEST_F(Paths, LinkUpwardIsFollowed) {
    EXPECT_EQ(root->Lookup(u"A/up/M", nullptr), m);
    EXPECT_EQ(root->Lookup(u"A/up/A/up/A/up", nullptr), root.get());
}

TEST_F(Paths, LinkThatLeadsNowhereIsNothing) {
    AddLink(*root, u"dead", u"A/X");
    AddLink(*root, u"above", u"../..");
    EXPECT_EQ(root->Lookup(u"dead", nullptr), nullptr);
    EXPECT_EQ(root->Lookup(u"dead/..", nullptr), nullptr);
    EXPECT_EQ(root->Lookup(u"above", nullptr), nullptr);
}

TEST_F(Paths, LinkWithAnEmptyPathIsItsHolder) {
    AddLink(*a, u"self", u"");
    EXPECT_EQ(root->Lookup(u"A/self/B", nullptr), b);
}

TEST_F(Paths, AbsoluteLinkStartsAtTheRoot) {
    AddLink(*c, u"top", u"/N/L");
    EXPECT_EQ(c->Lookup(u"top/c", nullptr), mc);
}

TEST_F(Paths, LinkMayLeadOverOtherLinks) {
    AddLink(*root, u"first", u"A/second/C");
    AddLink(*a, u"second", u"third");
    AddLink(*a, u"third", u"./B");
    EXPECT_EQ(root->Lookup(u"first", nullptr), c);
    EXPECT_EQ(root->Lookup(u"first/../C", nullptr), c);
}

TEST_F(Paths, EmptyComponentIsAnEmptyName) {
    EXPECT_EQ(root->Lookup(u"A/", nullptr), nullptr);
    EXPECT_EQ(root->Lookup(u"A//B", nullptr), nullptr);
    ResTreeNode* nameless = AddChild(*a, u"");
    ResTreeNode* below = AddChild(*nameless, u"B");
    EXPECT_EQ(root->Lookup(u"A/", nullptr), nameless);
    EXPECT_EQ(root->Lookup(u"A//B", nullptr), below);
}

TEST_F(Paths, ComponentsAreUnescaped) {
    ResTreeNode* odd = AddChild(*root, u"x/y\\z");
    EXPECT_EQ(root->Lookup(u"x\\/y\\\\z", nullptr), odd);
    EXPECT_EQ(root->Lookup(u"x/y\\z", nullptr), nullptr);
    // A backslash before anything else stands for itself.
    EXPECT_EQ(root->Lookup(u"x\\/y\\z", nullptr), odd);
}

TEST_F(Paths, BlanksBelongToTheNames) {
    ResTreeNode* blank = AddChild(*root, u" x ");
    EXPECT_EQ(root->Lookup(u" x ", nullptr), blank);
    EXPECT_EQ(root->Lookup(u"x", nullptr), nullptr);
}

TEST_F(Paths, FirstOfEqualNamesIsTaken) {
    const auto ordered = MakeRootNode(true);
    AddText(*ordered, u"other", u"");
    ResTreeNode* first = AddChild(*ordered, u"x");
    AddChild(*ordered, u"X");
    EXPECT_EQ(ordered->Lookup(u"X", nullptr), first);
}

TEST_F(Paths, TextInFrontHidesANodeOfItsName) {
    const auto ordered = MakeRootNode(true);
    AddText(*ordered, u"x", u"");
    AddChild(*ordered, u"x");
    EXPECT_EQ(ordered->Lookup(u"x", nullptr), nullptr);
}

// --- Anchors ---

TEST_F(Paths, DocumentRootAnchorsAPath) {
    EXPECT_EQ(n->Lookup(u"#{document-root}/B", a), b);
    EXPECT_EQ(n->Lookup(u"#{DOCUMENT-ROOT}/B", a), b);
}

TEST_F(Paths, WithoutADocumentRootTheAnchorIsTheNodeItself) {
    EXPECT_EQ(a->Lookup(u"#{document-root}/B", nullptr), b);
    EXPECT_EQ(n->Lookup(u"#{document-root}/B", nullptr), nullptr);
}

TEST_F(Paths, UnknownAnchorIsTheNodeItself) {
    EXPECT_EQ(a->Lookup(u"#{other}/B", n), b);
    EXPECT_EQ(a->Lookup(u"#{}/B", n), b);
    EXPECT_EQ(a->Lookup(u"#{document-root }/B", n), b);
}

TEST_F(Paths, AnchorAloneIsWhereItLeads) {
    EXPECT_EQ(n->Lookup(u"#{document-root}", a), a);
    EXPECT_EQ(n->Lookup(u"#{document-root}/", a), a);
    EXPECT_EQ(n->Lookup(u"#{document-root}", nullptr), n);
}

TEST_F(Paths, UnitBehindTheAnchorIsSkippedWhateverItIs) {
    EXPECT_EQ(n->Lookup(u"#{document-root}xB", a), b);
}

TEST_F(Paths, SlashBehindTheAnchorsSeparatorIsAnEmptyName) {
    EXPECT_EQ(n->Lookup(u"#{document-root}//M", a), nullptr);
}

TEST_F(Paths, AnchorThatIsNotClosedLeavesAllButItsFirstUnit) {
    ResTreeNode* odd = AddChild(*a, u"{document-root");
    ResTreeNode* other = AddChild(*n, u"{name");
    EXPECT_EQ(n->Lookup(u"#{document-root", a), odd);
    EXPECT_EQ(n->Lookup(u"#{name", a), other);
    EXPECT_EQ(n->Lookup(u"#{document-root/x", a), nullptr);
}

TEST_F(Paths, AnchorStandsOnlyAtTheFront) {
    ResTreeNode* odd = AddChild(*n, u"#{document-root}");
    EXPECT_EQ(root->Lookup(u"N/#{document-root}", a), odd);
    EXPECT_EQ(root->Lookup(u"/#{document-root}", a), nullptr);
    ResTreeNode* hash = AddChild(*n, u"#");
    EXPECT_EQ(n->Lookup(u"#", a), hash);
}

TEST_F(Paths, AnchorInALinkHasNoDocumentRoot) {
    AddLink(*n, u"anchored", u"#{document-root}/L");
    EXPECT_EQ(root->Lookup(u"#{document-root}/anchored", n), m);
    EXPECT_EQ(root->Lookup(u"N/anchored", a), m);
}

TEST_F(Paths, DocumentRootMayBelongToAnotherTree) {
    const auto other = MakeRootNode();
    ResTreeNode* x = AddChild(*other, u"x");
    EXPECT_EQ(root->Lookup(u"#{document-root}/x", other.get()), x);
}

// --- Chains of links ---

// "0" is a child, and each number links to the one before.
std::unique_ptr<ResTreeNode> MakeLinkChain(int length) {
    auto root = MakeRootNode();
    AddChild(*root, u"0");
    for (int i = 1; i <= length; ++i) {
        const std::string from = std::to_string(i);
        const std::string to = std::to_string(i - 1);
        root->AddLinkEntry(std::u16string(from.begin(), from.end()), std::u16string(to.begin(), to.end()));
    }
    return root;
}

TEST(LinkChain, LookupRunsThrough256Links) {
    const auto root = MakeLinkChain(300);
    EXPECT_EQ(root->Lookup(u"256", nullptr), root->Lookup(u"0", nullptr));
    EXPECT_NE(root->Lookup(u"256", nullptr), nullptr);
    EXPECT_EQ(root->Lookup(u"257", nullptr), nullptr);
    EXPECT_EQ(root->Lookup(u"300", nullptr), nullptr);
}

TEST(LinkChain, LinksOneBehindTheOtherCountTogether) {
    auto root = MakeRootNode();
    AddLink(*root, u"self", u".");
    std::u16string path(u"self");
    for (int i = 1; i < 256; ++i) {
        path += u"/self";
    }
    EXPECT_EQ(root->Lookup(path, nullptr), root.get());
    EXPECT_EQ(root->Lookup(path + u"/self", nullptr), nullptr);
}

TEST(LinkChain, CycleIsNothing) {
    auto root = MakeRootNode();
    AddLink(*root, u"a", u"b");
    AddLink(*root, u"b", u"a");
    AddLink(*root, u"c", u"c");
    AddLink(*root, u"d", u"./d/d/d");
    EXPECT_EQ(root->Lookup(u"a", nullptr), nullptr);
    EXPECT_EQ(root->Lookup(u"c", nullptr), nullptr);
    EXPECT_EQ(root->Lookup(u"d", nullptr), nullptr);
    EXPECT_EQ(root->ResolveEntry(root->FindEntry(u"a")), nullptr);
}

// --- GetPath ---

TEST_F(Paths, RootIsASlashWhateverItsName) {
    EXPECT_EQ(ExactText(root->GetPath()), "/");
}

TEST_F(Paths, PathHasTheNamesBelowTheRoot) {
    EXPECT_EQ(ExactText(a->GetPath()), "/A");
    EXPECT_EQ(ExactText(c->GetPath()), "/A/B/C");
}

TEST_F(Paths, NameWithASlashIsEscapedAndFoundAgain) {
    ResTreeNode* odd = AddChild(*root, u"a/b");
    ResTreeNode* below = AddChild(*odd, u"c\\d/");
    EXPECT_EQ(ExactText(odd->GetPath()), "/a\\/b");
    EXPECT_EQ(ExactText(below->GetPath()), "/a\\/b/c\\\\d\\/");
    EXPECT_EQ(c->Lookup(odd->GetPath().View(), nullptr), odd);
    EXPECT_EQ(root->Lookup(below->GetPath().View(), nullptr), below);
}

TEST_F(Paths, EmptyNameDirectlyBelowTheRootLeavesNoTrace) {
    // "/" and an empty name is "/" again, which the next name takes for the root.
    ResTreeNode* nameless = AddChild(*root, u"");
    EXPECT_EQ(ExactText(nameless->GetPath()), "/");
    EXPECT_EQ(ExactText(AddChild(*nameless, u"x")->GetPath()), "/x");
}

TEST_F(Paths, EmptyNameFurtherDownLeavesASlash) {
    ResTreeNode* nameless = AddChild(*a, u"");
    EXPECT_EQ(ExactText(nameless->GetPath()), "/A/");
    EXPECT_EQ(ExactText(AddChild(*nameless, u"x")->GetPath()), "/A//x");
}

TEST_F(Paths, NameOfUnitsThatDoNotCountIsTakenForTheRoot) {
    // A soft hyphen has no weight, so "/" with it is "/" to the next name.
    ResTreeNode* hyphen = AddChild(*root, u"\u00AD");
    EXPECT_EQ(ExactText(hyphen->GetPath()), "/{00AD}");
    EXPECT_EQ(ExactText(AddChild(*hyphen, u"x")->GetPath()), "/x");
}

TEST_F(Paths, FirstNameMayBeginWithAnyUnit) {
    // A hyphen and an apostrophe make a difference from "/", a soft hyphen makes none.
    for (const char16_t* name : {u"-", u"'", u" ", u"\u00e9", u"\u0301q", u"\u00adq"}) {
        ResTreeNode* odd = AddChild(*root, name);
        const std::string expected = "/" + ExactText(std::u16string_view(name));
        EXPECT_EQ(ExactText(odd->GetPath()), expected);
        EXPECT_EQ(ExactText(AddChild(*odd, u"x")->GetPath()), expected + "/x");
    }
}

TEST_F(Paths, NameOfADeleteCharacterIsTakenForTheRootAsOnlyLinuxOrdersSo) {
    ResTreeNode* odd = AddChild(*root, u"\x7fq");
    EXPECT_EQ(ExactText(odd->GetPath()), "/\x7Fq");
    EXPECT_EQ(ExactText(AddChild(*odd, u"x")->GetPath()), "/\x7Fq/x");
    ResTreeNode* uncounted = AddChild(*root, u"\x7f");
    EXPECT_EQ(ExactText(AddChild(*uncounted, u"x")->GetPath()), "/x");
}

TEST_F(Paths, PathMayHaveAnyLength) {
    for (size_t length = 240; length <= 270; ++length) {
        const std::u16string name(length, u'n');
        ResTreeNode* named = AddChild(*root, name.c_str());
        const std::string expected = "/" + std::string(length, 'n');
        EXPECT_EQ(ExactText(named->GetPath()), expected);
        EXPECT_EQ(ExactText(AddChild(*named, u"x")->GetPath()), expected + "/x");
        EXPECT_EQ(ExactText(AddChild(*AddChild(*named, u""), u"/")->GetPath()), expected + "//\\/");
    }
}

TEST_F(Paths, EscapedNameMayStandAnywhere) {
    ResTreeNode* first = AddChild(*root, u"first");
    ResTreeNode* second = AddChild(*first, u"a name of more than eight units and a /");
    ResTreeNode* third = AddChild(*second, u"third");
    EXPECT_EQ(ExactText(second->GetPath()), "/first/a name of more than eight units and a \\/");
    EXPECT_EQ(ExactText(third->GetPath()), "/first/a name of more than eight units and a \\//third");
}

TEST_F(Paths, PathFollowsTheNames) {
    b->Rename(u"new");
    EXPECT_EQ(ExactText(c->GetPath()), "/A/new/C");
}

// --- GetDisplayPath ---

TEST_F(Paths, DisplayNamesStandForNames) {
    AddText(*b, u"DisplayName", u"Bee/B");
    EXPECT_EQ(ExactText(root->GetDisplayPath()), "/");
    EXPECT_EQ(ExactText(a->GetDisplayPath()), "/A");
    EXPECT_EQ(ExactText(b->GetDisplayPath()), "/A/Bee\\/B");
    EXPECT_EQ(ExactText(c->GetDisplayPath()), "/A/Bee\\/B/C");
}

TEST_F(Paths, EmptyDisplayNameLeavesNoTrace) {
    AddText(*b, u"DisplayName", u"");
    EXPECT_EQ(ExactText(b->GetDisplayPath()), "/A");
    EXPECT_EQ(ExactText(c->GetDisplayPath()), "/A/C");
    AddText(*a, u"displayname", u"", LocalizedTextEntry);
    EXPECT_EQ(ExactText(a->GetDisplayPath()), "/");
    EXPECT_EQ(ExactText(c->GetDisplayPath()), "/C");
}

TEST_F(Paths, DisplayNameOfTheRootDoesNotCount) {
    AddText(*root, u"DisplayName", u"Top");
    EXPECT_EQ(ExactText(a->GetDisplayPath()), "/A");
}

TEST_F(Paths, DisplayNameThatIsNoTextDoesNotCount) {
    AddLink(*a, u"DisplayName", u"x");
    EXPECT_EQ(ExactText(a->GetDisplayPath()), "/A");
}

// --- GetEntryDisplayPath ---

TEST_F(Paths, EntryOfAChildGivesItsDisplayPath) {
    const String above(u"/above");
    EXPECT_EQ(ExactText(a->GetEntryDisplayPath(a->FindEntry(u"B"), above)), "/above/B");
    AddText(*b, u"DisplayName", u"Bee");
    EXPECT_EQ(ExactText(a->GetEntryDisplayPath(a->FindEntry(u"B"), above)), "/above/Bee");
    EXPECT_EQ(ExactText(a->GetEntryDisplayPath(a->FindEntry(u"B"), String(u"/"))), "/Bee");
    b->SetProperty(u"DisplayName", u"");
    EXPECT_EQ(ExactText(a->GetEntryDisplayPath(a->FindEntry(u"B"), above)), "/above");
}

TEST_F(Paths, EntryOfALinkGivesTheNameOfItsTarget) {
    EXPECT_EQ(ExactText(n->GetEntryDisplayPath(n->FindEntry(u"L"), String(u"/p"))), "/p/M");
    AddText(*m, u"DisplayName", u"Em");
    EXPECT_EQ(ExactText(n->GetEntryDisplayPath(n->FindEntry(u"L"), String(u"/p"))), "/p/Em");
}

TEST_F(Paths, EntryWithoutANodeGivesAnEmptyPath) {
    AddLink(*root, u"dead", u"X");
    EXPECT_EQ(ExactText(root->GetEntryDisplayPath(root->FindEntry(u"dead"), String(u"/p"))), "");
    EXPECT_EQ(ExactText(root->GetEntryDisplayPath(root->FindEntry(u"T"), String(u"/p"))), "");
    EXPECT_EQ(ExactText(root->GetEntryDisplayPath(root->End(), String(u"/p"))), "");
}

}  // namespace
}  // namespace zkhw
