// What a host asks of a deep tree, where the stack is small: the queries of the whole tree, and observers.

#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "interfaces/support/GivenTexts.h"
#include "interfaces/support/HostObserver.h"
#include "interfaces/support/OwnedTree.h"
#include "support/SmallStack.h"

namespace zkhw {
namespace {

using qn::dsc::osdep::RunOnSmallStack;

constexpr ULONG levels = 100'000;
// Where the operation itself names every node by its whole path, and so has to write a square of the depth.
constexpr ULONG levelsWithPaths = 3'000;

// A chain of nodes named "n" of type "T" below the root, with the property P at its end.
class DeepQueries : public ::testing::Test {
  protected:
    void Grow(ULONG depth) {
        for (ULONG i = 0; i < depth; ++i) {
            deepest = AddChild(*deepest, u"n");
            path += u"/n";
        }
        AddText(*deepest, u"P", u"1");
    }
    void TearDown() override {
        RunOnSmallStack([this] { tree.End(); });
    }

    // How many texts a query gives, all of them the same.
    static ULONG CountOf(ULONG count, BSTR* texts, std::u16string_view each) {
        ULONG equal = 0;
        for (ULONG i = 0; i < count; ++i) {
            equal += ViewOf(texts[i]) == each ? 1U : 0U;
        }
        FreeTexts(count, texts);
        return equal;
    }

    OwnedTree tree;
    ResTreeNode* deepest = &tree.Root();
    std::u16string path;
};

TEST_F(DeepQueries, NamesOfAllNodesAreGiven) {
    Grow(levels);
    RunOnSmallStack([this] {
        ULONG count = 0;
        BSTR* names = nullptr;
        EXPECT_EQ(tree.Tree()->GetDescendantNames(nullptr, Text(u"recurse=true,includePath=false"), &count, &names),
                  S_OK);
        EXPECT_EQ(CountOf(count, names, u"n"), levels);
    });
}

TEST_F(DeepQueries, PropertyAtTheEndIsFound) {
    Grow(levels);
    RunOnSmallStack([this] {
        BSTR value = nullptr;
        ASSERT_EQ(tree.Tree()->GetProperty(Text((path + u"/P").c_str()), nullptr, &value), S_OK);
        EXPECT_EQ(ViewOf(value), u"1");
        SysFreeString(value);
    });
}

TEST_F(DeepQueries, PropertiesOfTheLastNodeAreGiven) {
    Grow(levels);
    RunOnSmallStack([this] {
        GivenTexts names;
        ULONG* const count = names.Count();
        EXPECT_EQ(
            tree.Tree()->GetMultiplePropertyNames(Text(path.c_str()), Text(u"recurse=true"), count, names.Array()),
            S_OK);
        EXPECT_EQ(names.Lines(), "\nP");
    });
}

TEST_F(DeepQueries, PropertiesOfAllNodesAreGiven) {
    Grow(levelsWithPaths);
    RunOnSmallStack([this] {
        GivenTexts names;
        ULONG* const count = names.Count();
        EXPECT_EQ(tree.Tree()->GetMultiplePropertyNames(nullptr, Text(u"recurse=true"), count, names.Array()), S_OK);
        EXPECT_EQ(names.Lines(), "\nP");
    });
}

TEST_F(DeepQueries, LastNodeIsWritten) {
    Grow(levels);
    RunOnSmallStack([this] {
        BSTR xml = nullptr;
        ASSERT_EQ(tree.Tree()->GetFilteredXml(Text(path.c_str()), 0, nullptr, 0, nullptr, &xml), S_OK);
        SysFreeString(xml);
    });
}

TEST_F(DeepQueries, TypesOfTheLastNodeAreToldByTheRoot) {
    Grow(levels);
    RunOnSmallStack([this] {
        const View view = tree.At(path.c_str());
        EXPECT_EQ(view->IsOfType(Text(u"T")), S_OK);
        EXPECT_EQ(view->IsOfType(Text(u"U")), S_FALSE);
        GivenTexts types;
        ULONG* const count = types.Count();
        EXPECT_EQ(view->GetTypes(count, types.Array()), S_OK);
        EXPECT_EQ(types.Lines(), "\nT");
    });
}

TEST_F(DeepQueries, ObserverAtTheEndHearsOfTheTopAndIsTakenFromTheTop) {
    Grow(levels);
    HostObserver observer;
    RunOnSmallStack([this, &observer] {
        const View view = tree.At(path.c_str());
        EXPECT_EQ(view->Advise(&observer, NodeNameChanged | AncestorChanged, 7), S_OK);
        EXPECT_EQ(tree.At(u"/n")->SetName(Text(u"m")), S_OK);
        EXPECT_EQ(observer.calls, 1U);
        EXPECT_EQ(tree.RootView()->Unadvise(&observer, 7, 1), S_OK);
        EXPECT_EQ(tree.At(u"/m")->SetName(Text(u"o")), S_OK);
        EXPECT_EQ(observer.calls, 1U);
    });
}

TEST_F(DeepQueries, ViewsOfAllNodesAreGivenUpBehindTheTree) {
    Grow(levels);
    RunOnSmallStack([this] {
        std::vector<IzkhwResourceTreeNode*> views;
        ULONG count = 0;
        IzkhwResourceTreeNode** children = nullptr;
        ASSERT_EQ(tree.RootView()->GetChildren(&count, &children), S_OK);
        while (children != nullptr) {
            ASSERT_EQ(count, 1U);
            views.push_back(children[0]);
            CoTaskMemFree(children);
            children = nullptr;
            if (views.size() < levels) {
                ASSERT_EQ(views.back()->GetChildren(&count, &children), S_OK);
            }
        }
        EXPECT_EQ(views.size(), levels);
        tree.End();
        for (IzkhwResourceTreeNode* const view : views) {
            EXPECT_EQ(view->Release(), 0U);
        }
    });
}

TEST_F(DeepQueries, ChangesOfAllNodesAreHeldBackAndDelivered) {
    Grow(levels);
    RunOnSmallStack([this] {
        HostObserver observer;
        const View view = tree.RootView();
        ASSERT_EQ(view->Advise(&observer, ChildAdded | ChildRemoved, 1), S_OK);
        ULONG pending = 0;
        ASSERT_EQ(view->BeginChange(&pending), S_OK);
        EXPECT_EQ(view->RemoveEntry(Text(u"n")), S_OK);
        EXPECT_EQ(observer.calls, 0U);
        EXPECT_EQ(view->EndChange(pending, 0), S_OK);
        EXPECT_EQ(observer.calls, 1U);
        EXPECT_EQ(view->Unadvise(&observer, 1, 0), S_OK);
    });
}

}  // namespace
}  // namespace zkhw
