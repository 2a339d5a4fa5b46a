// Copies of prototypes and instances that come into a node with observers. Elsewhere a text is expanded on its way into
// the copy; where somebody looks on, the copy is first filled with the texts as the pattern has them, and expanded when
// it is complete.

#include <functional>
#include <memory>
#include <string>

#include <gtest/gtest.h>

#include "restree/ReadTree.h"
#include "support/ChangeLog.h"
#include "support/TreeDump.h"

namespace zkhw {
namespace {

// /P is a pattern with a parameter in it and in its child, /Shelf an empty node with an observer. The parameter of the
// test is whether the shelf keeps its order.
class CopiesUnderObservers : public ::testing::TestWithParam<bool> {
  protected:
    CopiesUnderObservers() {
        Load(*root, "<Root><T name='P'><K>#{x}</K><L>plain</L><T name='Q'><V>#{x}</V></T></T>" + Shelf("") + "</Root>");
        shelf = &At(*root, u"Shelf");
    }
    ~CopiesUnderObservers() override { root->RemoveObserver(&outer, -1, true); }

    static std::string Shelf(const std::string& contents) {
        return std::string("<Shelf name='Shelf' ordered='") + (GetParam() ? "true" : "false") + "'>" + contents +
               "</Shelf>";
    }
    void ReadIntoShelf(const std::string& contents) { Load(*root, "<Root>" + Shelf(contents) + "</Root>"); }
    std::string DumpShelf() { return "\n" + DumpTree(*shelf); }
    static std::string Head() { return std::string("\nShelf:Shelf") + (GetParam() ? " ordered" : "") + "\n"; }

    // Whenever a child comes onto the shelf.
    void AtNewChild(std::function<void()> action) {
        shelf->AddObserver(&outer, ChildAdded, 5);
        outer.reaction = [action = std::move(action)](ResTreeNode&, uint32_t) { action(); };
    }
    // Lets `inner` hear of `changes` of the child `name` from the moment on when it comes.
    void WatchNewChild(const char16_t* name, uint32_t changes) {
        AtNewChild([this, name, changes] {
            if (ResTreeNode* child = shelf->Lookup(name, nullptr)) {
                child->AddObserver(&inner, changes, 6);
            }
        });
    }

    ChangeLog log;
    LoggingObserver outer{log, "o"};
    LoggingObserver inner{log, "i"};
    std::unique_ptr<ResTreeNode> root = MakeUnnamedRoot();
    ResTreeNode* shelf;
};

INSTANTIATE_TEST_SUITE_P(BothForms, CopiesUnderObservers, ::testing::Bool(),
                         [](const auto& form) { return std::string(form.param ? "Ordered" : "Unordered"); });

// --- Of a prototype ---

TEST_P(CopiesUnderObservers, PrototypeIsCopiedAsItStandsAndThenExpanded) {
    WatchNewChild(u"A", PropertyAdded | PropertyChanged | ChildAdded);
    inner.reaction = [this](ResTreeNode& node, uint32_t) { log.Add("K=" + TextAt(node, u"K")); };
    ReadIntoShelf("<T name='A' prototype='../P' x='1'/>");
    EXPECT_EQ(log.Take(),
              "o: Shelf ChildAdded #5\n"
              "i: A PropertyAdded #6\nK=#{x}\n"
              "i: A PropertyAdded #6\nK=#{x}\n"
              "i: A ChildAdded #6\nK=#{x}\n"
              "i: A PropertyChanged #6\nK=1\n");
    EXPECT_EQ(DumpShelf(), Head() + "  A:T\n    K=1\n    L=plain\n    Q:T\n      V=1\n");
}

TEST_P(CopiesUnderObservers, CopyIsTheSameAsWhereNobodyLooksOn) {
    auto unobserved = MakeUnnamedRoot();
    Load(*unobserved, "<Root><T name='P'><K>#{x}</K><L>plain</L><T name='Q'><V>#{x}</V></T></T></Root>");
    const std::string contents = "<T name='A' prototype='../P' x='a'/><T names='N[i=1..2]'><U>#{i}</U></T>";
    AtNewChild([] {});
    ReadIntoShelf(contents);
    Load(*unobserved, "<Root>" + Shelf(contents) + "</Root>");
    EXPECT_EQ(DumpShelf(), "\n" + DumpTree(At(*unobserved, u"Shelf")));
    EXPECT_EQ(DumpShelf(), Head() +
                               "  A:T\n    K=a\n    L=plain\n    Q:T\n      V=a\n"
                               "  N1:T\n    U=1\n  N2:T\n    U=2\n");
}

TEST_P(CopiesUnderObservers, TextThatAnObserverPutsIntoTheCopyIsExpandedToo) {
    AtNewChild([this] { At(*shelf, u"A").SetProperty(u"M", u"<#{x}>"); });
    ReadIntoShelf("<T name='A' prototype='../P' x='1'/>");
    EXPECT_EQ(TextAt(At(*shelf, u"A"), u"M"), "<1>");
}

TEST_P(CopiesUnderObservers, CopyOfAPrototypeMayGoWhileItIsFilled) {
    WatchNewChild(u"A", PropertyAdded);
    inner.reaction = [this](ResTreeNode&, uint32_t) { shelf->RemoveEntryByName(u"A"); };
    ReadIntoShelf("<T name='A' prototype='../P' x='1'/><T name='B' prototype='../P' x='2'/>");
    EXPECT_EQ(DumpShelf(), Head() + "  B:T\n    K=2\n    L=plain\n    Q:T\n      V=2\n");
}

TEST_P(CopiesUnderObservers, CopyOfAPrototypeMayGoWhileItIsExpanded) {
    WatchNewChild(u"A", PropertyChanged);
    inner.reaction = [this](ResTreeNode&, uint32_t) { shelf->RemoveEntryByName(u"A"); };
    ReadIntoShelf("<T name='A' prototype='../P' x='1'/><T name='B' prototype='../P' x='2'/>");
    EXPECT_EQ(DumpShelf(), Head() + "  B:T\n    K=2\n    L=plain\n    Q:T\n      V=2\n");
}

TEST_P(CopiesUnderObservers, PrototypeMayGoWhileItIsCopied) {
    AtNewChild([this] { root->RemoveEntryByName(u"P"); });
    ReadIntoShelf("<T name='A' prototype='../P' x='1'/>");
    EXPECT_EQ(root->FindRaw(u"P"), nullptr);
    ASSERT_NE(shelf->FindRaw(u"A"), nullptr);
    EXPECT_EQ(Errors(*shelf), "(none)");
}

// --- Of instances ---

TEST_P(CopiesUnderObservers, InstanceIsCopiedAsItStandsAndThenExpanded) {
    WatchNewChild(u"B", PropertyAdded | PropertyChanged);
    inner.reaction = [this](ResTreeNode& node, uint32_t) { log.Add("K=" + TextAt(node, u"K")); };
    ReadIntoShelf("<T names='A,B'><K>#{name}</K></T>");
    EXPECT_EQ(log.Take(),
              "o: Shelf ChildAdded #5\n"
              "o: Shelf ChildAdded #5\n"
              "i: B PropertyAdded #6\nK=#{name}\n"
              "i: B PropertyChanged #6\nK=B\n");
    EXPECT_EQ(DumpShelf(), Head() + "  A:T\n    K=A\n  B:T\n    K=B\n");
}

TEST_P(CopiesUnderObservers, InstanceMayGoAtOnce) {
    AtNewChild([this] { shelf->RemoveEntryByName(u"B"); });
    ReadIntoShelf("<T names='A,B,C'><K>#{name}</K></T>");
    EXPECT_EQ(DumpShelf(), Head() + "  A:T\n    K=A\n  C:T\n    K=C\n");
}

TEST_P(CopiesUnderObservers, InstanceMayGoWhileItIsFilled) {
    WatchNewChild(u"B", PropertyAdded);
    inner.reaction = [this](ResTreeNode&, uint32_t) { shelf->RemoveEntryByName(u"B"); };
    ReadIntoShelf("<T names='A,B,C'><K>#{name}</K></T>");
    EXPECT_EQ(DumpShelf(), Head() + "  A:T\n    K=A\n  C:T\n    K=C\n");
}

TEST_P(CopiesUnderObservers, InstanceMayGoWhileItIsExpanded) {
    WatchNewChild(u"B", PropertyChanged);
    inner.reaction = [this](ResTreeNode&, uint32_t) { shelf->RemoveEntryByName(u"B"); };
    ReadIntoShelf("<T names='A,B,C'><K>#{name}</K></T>");
    EXPECT_EQ(DumpShelf(), Head() + "  A:T\n    K=A\n  C:T\n    K=C\n");
}

TEST_P(CopiesUnderObservers, PatternOfInstancesMayGoWithTheFirstCopy) {
    AtNewChild([this] {
        if (shelf->FindRaw(u"B") != nullptr) {
            shelf->RemoveEntryByName(u"A");
        }
    });
    ReadIntoShelf("<T names='A,B'><K>#{name}</K></T><T name='Z'/>");
    EXPECT_EQ(shelf->FindRaw(u"A"), nullptr);
    EXPECT_NE(shelf->FindRaw(u"B"), nullptr);
    EXPECT_NE(shelf->FindRaw(u"Z"), nullptr);
}

}  // namespace
}  // namespace zkhw
