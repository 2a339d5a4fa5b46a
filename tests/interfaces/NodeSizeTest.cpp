// Deep trees where the stack is small, and nodes with many entries.

#include <gtest/gtest.h>

#include "interfaces/support/NodeViewTest.h"
#include "interfaces/support/ProjectItems.h"
#include "support/SmallStack.h"

namespace zkhw {
namespace {

using qn::dsc::osdep::RunOnSmallStack;

constexpr ULONG levels = 100'000;
constexpr ULONG width = 100'000;

void Free(ULONG count, BSTR* array) {
    for (ULONG i = 0; i < count; ++i) {
        SysFreeString(array[i]);
    }
    CoTaskMemFree(array);
}

void Free(ULONG count, IzkhwResourceTreeNode** array) {
    for (ULONG i = 0; i < count; ++i) {
        array[i]->Release();
    }
    CoTaskMemFree(array);
}

std::u16string Numbered(const char16_t* prefix, ULONG number) {
    return prefix + std::u16string(String(std::to_string(number).c_str()).CStr());
}

// A chain of nodes named "n" of type "T" below the root.
class DeepNode : public NodeViewTest {
  protected:
    DeepNode() {
        for (ULONG i = 0; i < levels; ++i) {
            deepest = AddChild(*deepest, u"n");
        }
    }

    ResTreeNode* deepest = root.get();
};

TEST_F(DeepNode, IsWalkedByTheOperationsOnDescendants) {
    RunOnSmallStack([this] {
        const NodeView view = Root();
        ULONG count = 0;
        IzkhwResourceTreeNode** nodes = nullptr;
        EXPECT_EQ(view->GetDescendantsOfType(In(u"T"), &count, &nodes), S_OK);
        EXPECT_EQ(count, levels);
        Free(count, nodes);
        BSTR* names = nullptr;
        EXPECT_EQ(view->GetDescendantNamesEx(nullptr, In(u"T"), 0, In(u"Hide"), &count, &names, nullptr), S_OK);
        EXPECT_EQ(count, levels);
        Free(count, names);
    });
}

TEST_F(DeepNode, IsWalkedBehindALink) {
    AddLink(*root, u"L", u"n");
    AddLink(*deepest, u"Up", u"/");
    RunOnSmallStack([this] {
        const NodeView view = Root();
        ULONG count = 0;
        BSTR* names = nullptr;
        EXPECT_EQ(view->GetDescendantNamesEx(nullptr, nullptr, 0, nullptr, &count, &names, nullptr), S_OK);
        EXPECT_EQ(count, 2 * levels);
        Free(count, names);
    });
}

TEST_F(DeepNode, IsReservedAndReleased) {
    RunOnSmallStack([this] {
        const NodeView view = Root();
        EXPECT_EQ(view->ReserveDescendants(In(u"me"), 2, In(u"T")), S_OK);
        EXPECT_EQ(deepest->GetOwnReservationFlags(nullptr, false), 2U);
        EXPECT_EQ(view->ReserveDescendants(In(u"you"), 2, In(u"T")), S_FALSE);
        EXPECT_EQ(view->UnreserveDescendants(In(u"me"), In(u"T")), S_OK);
        EXPECT_EQ(deepest->GetOwnReservationFlags(nullptr, false), 0U);
    });
}

TEST_F(DeepNode, IsFoundAndNamedByItsPath) {
    RunOnSmallStack([this] {
        const NodeView view = View(*deepest);
        BSTR path = nullptr;
        ASSERT_EQ(view->GetPath(&path), S_OK);
        EXPECT_EQ(SysStringLen(path), 2 * levels);
        InterfacePointer<IzkhwResourceTreeNode> found;
        EXPECT_EQ(Root()->FindNode(path, nullptr, nullptr, found.Receive()), S_OK);
        SysFreeString(path);
        EXPECT_EQ(static_cast<ResTreeNodeAdapter*>(found.Get())->GetNode(), deepest);
        EXPECT_EQ(view->GetDisplayPath(&path), S_OK);
        EXPECT_EQ(SysStringLen(path), 2 * levels);
        SysFreeString(path);
    });
}

TEST_F(DeepNode, IsCopiedComparedAndDestroyed) {
    AddText(*deepest, u"P", u"1");
    RunOnSmallStack([this] {
        const NodeView view = Root();
        InterfacePointer<IzkhwResourceTreeNode> copy;
        ASSERT_EQ(view->CloneDetached(In(u"Copy"), copy.Receive()), S_OK);
        BOOL result = -1;
        EXPECT_EQ(view->IsCompatibleWith(copy.Get(), &result), S_OK);
        EXPECT_EQ(result, 1);
        deepest->SetProperty(u"P", u"2");
        EXPECT_EQ(view->IsCompatibleWithEx(copy.Get(), &result, 1), S_OK);
        EXPECT_EQ(result, 0);
        copy.Reset();
    });
}

TEST_F(DeepNode, IsRemoved) {
    RunOnSmallStack([this] { EXPECT_EQ(Root()->RemoveEntry(In(u"n")), S_OK); });
    EXPECT_EQ(root->FindRaw(u"n"), nullptr);
}

// The indent makes the text quadratic in the depth, so the XML is that of a less deep chain.
TEST_F(NodeViewTest, ADeepNodeIsFilteredAndWritten) {
    constexpr unsigned int depth = 1'000;
    ResTreeNode* node = root.get();
    for (unsigned int i = 0; i < depth; ++i) {
        node = AddChild(*node, u"n");
    }
    AddText(*node, u"P", u"1");
    RunOnSmallStack([this] {
        LPCWSTR names[] = {In(u"n")};
        BSTR xml = nullptr;
        EXPECT_EQ(Root()->GetFilteredXml(1, names, 0, nullptr, &xml), S_OK);
        // Without P: a line feed and ("<Root ordered="true">" and "</Root>") for the root; for each level d its indent
        // of 3 d units, a line feed and `<T name="n">` or "</T>".
        const unsigned int rootLength = 1 + 21 + 1 + 7;
        const unsigned int indents = 2 * 3 * (depth * (depth + 1) / 2);
        EXPECT_EQ(SysStringLen(xml), rootLength + indents + depth * (1 + 12 + 1 + 4));
        SysFreeString(xml);
    });
}

TEST_F(DeepNode, IsFilteredAwayFromTheTop) {
    RunOnSmallStack([this] {
        LPCWSTR names[] = {In(u"T")};
        BSTR xml = nullptr;
        EXPECT_EQ(Root()->GetFilteredXmlEx(0, 1, names, 0, nullptr, &xml), S_OK);
        EXPECT_EQ(TakeText(xml), "\n<Root ordered=\"true\">\n</Root>");
    });
}

TEST_F(DeepNode, LoadContentGoesAsDeepAsItsText) {
    std::u16string fragment;
    for (ULONG i = 0; i < levels; ++i) {
        fragment += u"<a>";
    }
    fragment += u"1";
    for (ULONG i = 0; i < levels; ++i) {
        fragment += u"</a>";
    }
    RunOnSmallStack([&] { EXPECT_EQ(View(*deepest)->LoadContent(In(fragment.c_str())), S_OK); });
    EXPECT_NE(deepest->FindRaw(u"a"), nullptr);
}

TEST_F(NodeViewTest, ALongChainOfDependantsIsResolved) {
    for (ULONG i = 0; i < levels; ++i) {
        ResTreeNode* const node = AddChild(*root, Numbered(u"n", i).c_str());
        AddText(*node, u"Reserves", Numbered(u"../n", i + 1).c_str());
    }
    ResTreeNode* const last = AddChild(*root, Numbered(u"n", levels).c_str());
    last->ReserveOne(u"{AAAAAAAA-0000-0000-0000-000000000001}", 1);
    RunOnSmallStack([this] {
        FakeLocator locator;
        ULONG foundCount = 0;
        IUnknown** found = nullptr;
        ULONG missingCount = 0;
        BSTR* missing = nullptr;
        const NodeView view = View(*root->Begin()->Child());
        EXPECT_EQ(view->ResolveReservations(&locator, &foundCount, &found, &missingCount, &missing, 0), S_OK);
        EXPECT_EQ(locator.asked.size(), 1U);
        EXPECT_EQ(GivenNumber([&](ULONG* mode) { return view->GetReservation(nullptr, mode); }), "S_OK 1");
    });
}

// --- Many entries ---

class WideNode : public ::testing::TestWithParam<bool> {
  protected:
    WideNode() {
        for (ULONG i = 0; i < width; ++i) {
            AddText(*root, Numbered(u"p", i).c_str(), u"v");
            AddChild(*root, Numbered(u"c", i).c_str());
        }
        view = MakeView(*root, observers);
    }

    AdapterObserverSet observers;  // Outlives the tree.
    std::unique_ptr<ResTreeNode> root = MakeRootNode(GetParam());
    NodeView view;
};

TEST_P(WideNode, GivesAllOfItsEntries) {
    ULONG count = 0;
    BSTR* texts = nullptr;
    EXPECT_EQ(view->GetPropertyNames(&count, &texts), S_OK);
    EXPECT_EQ(count, width);
    Free(count, texts);
    IzkhwResourceTreeNode** nodes = nullptr;
    EXPECT_EQ(view->GetChildren(&count, &nodes), S_OK);
    EXPECT_EQ(count, width);
    Free(count, nodes);
    EXPECT_EQ(view->GetDescendantsOfType(nullptr, &count, &nodes), S_OK);
    EXPECT_EQ(count, width);
    Free(count, nodes);
    BSTR* displays = nullptr;
    EXPECT_EQ(view->GetChildNames(In(u"/x"), 1, &count, &texts, &displays), S_OK);
    EXPECT_EQ(count, width);
    Free(count, texts);
    Free(count, displays);
    EXPECT_EQ(view->GetDescendantNames(nullptr, nullptr, 1, &count, &texts, &displays), S_OK);
    EXPECT_EQ(count, width);
    Free(count, texts);
    Free(count, displays);
}

TEST_P(WideNode, IsComparedWithItsCopyAndFiltered) {
    InterfacePointer<IzkhwResourceTreeNode> copy;
    ASSERT_EQ(view->CloneDetached(nullptr, copy.Receive()), S_OK);
    BOOL result = -1;
    EXPECT_EQ(view->IsCompatibleWithEx(copy.Get(), &result, 1), S_OK);
    EXPECT_EQ(result, 1);
    BSTR xml = nullptr;
    EXPECT_EQ(view->GetFilteredXml(0, nullptr, 0, nullptr, &xml), S_OK);
    EXPECT_EQ(TakeText(xml), GetParam() ? "\n<Root ordered=\"true\">\n</Root>" : "\n<Root>\n</Root>");
    EXPECT_EQ(view->ReserveDescendants(In(u"me"), 1, nullptr), S_OK);
    EXPECT_EQ(view->UnreserveDescendants(In(u"me"), nullptr), S_OK);
}

INSTANTIATE_TEST_SUITE_P(OrderedAndNot, WideNode, ::testing::Bool());

TEST_F(NodeViewTest, LongListsOfSupportedValuesAreCompared) {
    std::u16string values;
    for (ULONG i = 0; i < width; ++i) {
        values += Numbered(u"v", i) + u",";
    }
    ResTreeNode* const a = AddChild(*root, u"a");
    ResTreeNode* const b = AddChild(*root, u"b");
    AddText(*a, u"SupportedValues", values.c_str());
    AddText(*b, u"SupportedValues", (values + u"last").c_str());
    BOOL result = -1;
    // The list of "a" ends in an empty piece, which "b" hasn't.
    EXPECT_EQ(View(*a)->IsCompatibleWith(View(*b).Get(), &result), S_OK);
    EXPECT_EQ(result, 0);
    b->SetProperty(u"SupportedValues", values + u",last");
    EXPECT_EQ(View(*a)->IsCompatibleWith(View(*b).Get(), &result), S_OK);
    EXPECT_EQ(result, 1);
}

}  // namespace
}  // namespace zkhw
