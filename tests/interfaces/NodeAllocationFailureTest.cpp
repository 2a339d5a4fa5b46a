// Every operation of a node's view with every single allocation failing in turn: of texts, of nodes, of views and of
// the ordinary heap. A call may succeed, give E_OUTOFMEMORY or throw bad_alloc; nothing leaks, no reference is lost,
// and the tree answers as before.

#include <gtest/gtest.h>

#include <functional>
#include <new>

#include "interfaces/support/ForeignNode.h"
#include "interfaces/support/NodeViewTest.h"
#include "interfaces/support/ProjectItems.h"
#include "support/AllocationFaultScope.h"
#include "support/FaultyFileSystem.h"
#include "support/TemporaryFolder.h"
#include "zkfpga/tree_owner.h"

namespace zkhw {
namespace {

using support::AllocationFaultScope;

class SilentObserver final : public StackObject<IzkhwResourceTreeNodeObserver> {
  public:
    HRESULT STDMETHODCALLTYPE NodeChanged(IzkhwResourceTreeNode*, ULONG, ULONG) override { return S_OK; }
};

// A file that stubs name.
class StubFile {
  public:
    StubFile() : scope(files) {
        files.SetExecutablePath(folder.System(u"host.exe"));
        folder.WriteFile("stub.xml", "<T name=\"Stub\"><Far>file</Far><Part name=\"Child\"><Deep>1</Deep></Part></T>");
    }

  private:
    qn::dsc::osdep::TemporaryFolder folder;
    qn::dsc::osdep::FaultyFileSystem files;
    qn::dsc::osdep::FileSystemScope scope;
};

// A small tree with everything that an operation may meet: a stub, links, reservations, localised and long texts.
struct SmallTree {
    SmallTree() {
        ResTreeNode* const stub = AddChild(*root, u"Stub");
        AddText(*stub, u":DeferredLoadPath", u"stub.xml");
        AddText(*n, u"DisplayName", u"A rather long name that is shown in the place of the key");
        AddText(*n, u"Protocols", u"P,Q");
        AddText(*n, u"SupportedValues", u"a,b");
        AddText(*n, u"Reserves", u"../Partner");
        AddText(*n, u"Loc", u"x", LocalizedTextEntry);
        AddText(*AddChild(*n, u"with/slash"), u"P", u"1");
        AddLink(*n, u"Link", u"../Partner");
        AddLink(*n, u"ToStub", u"../Stub");
        partner->ReserveOne(u"{AAAAAAAA-0000-0000-0000-000000000001}", 1);
        partner->ReserveOne(u"{BBBBBBBB-0000-0000-0000-000000000002}", 1);
        partner->ReserveOne(u"{CCCCCCCC-0000-0000-0000-000000000003}", 1);
        locator.answers[u"{AAAAAAAA-0000-0000-0000-000000000001}"] = {&item, S_OK};
        locator.answers[u"{BBBBBBBB-0000-0000-0000-000000000002}"] = {&item, S_OK};
        locator.answers[u"{CCCCCCCC-0000-0000-0000-000000000003}"] = {&item, E_FAIL};
        locator.asked.reserve(16);
        view = MakeView(*n, observers);
        EXPECT_EQ(view->CloneDetached(In(u"Twin"), twin.Receive()), S_OK);
    }

    // These outlive the tree.
    AdapterObserverSet observers;
    FakeProjectItem item{{}};
    FakeLocator locator;
    SilentObserver observer;
    std::unique_ptr<ResTreeNode> root = MakeRootNode(true);
    ResTreeNode* n = AddChild(*root, u"N", u"Module", true);
    ResTreeNode* partner = AddChild(*root, u"Partner");
    NodeView view;
    InterfacePointer<IzkhwResourceTreeNode> twin;
};

template <typename Call>
HRESULT TextOf(Call call) {
    auto* text = Untouched<BSTR>();
    const HRESULT result = call(&text);
    EXPECT_EQ(result == S_OK, text != nullptr && text != Untouched<BSTR>());
    EXPECT_TRUE(result != E_OUTOFMEMORY || text == nullptr);
    SysFreeString(text == Untouched<BSTR>() ? nullptr : text);
    return result;
}

void Free(ULONG count, BSTR* array) {
    for (ULONG i = 0; i < count; ++i) {
        SysFreeString(array[i]);
    }
    CoTaskMemFree(array);
}

template <typename Call>
HRESULT TextsOf(Call call) {
    ULONG count = untouchedNumber;
    BSTR* texts = nullptr;
    const HRESULT result = call(&count, &texts);
    if (result == E_OUTOFMEMORY) {
        EXPECT_EQ(count, 0U);
        EXPECT_EQ(texts, nullptr);
    }
    Free(count, texts);
    return result;
}

// With display names.
template <typename Call>
HRESULT NamesOf(Call call) {
    ULONG count = 0;
    BSTR* names = nullptr;
    BSTR* displays = nullptr;
    const HRESULT result = TextsOf([&](ULONG* textCount, BSTR** texts) {
        displays = Untouched<BSTR*>();
        const HRESULT given = call(&count, &names, &displays);
        EXPECT_TRUE(given != E_OUTOFMEMORY || displays == nullptr);
        *textCount = count;
        *texts = names;
        return given;
    });
    Free(count, displays);
    return result;
}

template <typename Call>
HRESULT NodeOf(Call call) {
    IzkhwResourceTreeNode* node = Untouched<IzkhwResourceTreeNode*>();
    const HRESULT result = call(&node);
    EXPECT_TRUE(result != E_OUTOFMEMORY || node == nullptr);
    if (node != nullptr) {
        node->Release();
    }
    return result;
}

template <typename Call>
HRESULT NodesOf(Call call) {
    ULONG count = untouchedNumber;
    IzkhwResourceTreeNode** nodes = nullptr;
    const HRESULT result = call(&count, &nodes);
    if (result == E_OUTOFMEMORY) {
        EXPECT_EQ(count, 0U);
        EXPECT_EQ(nodes, nullptr);
    }
    for (ULONG i = 0; i < count; ++i) {
        nodes[i]->Release();
    }
    CoTaskMemFree(nodes);
    return result;
}

using Operation = std::function<HRESULT(SmallTree&)>;

// Runs the operation on a fresh tree with the first, the second, ... allocation failing, until it needs no more.
void FailEachInTurn(const Operation& operation, bool fromThenOn, bool mayFail) {
    const StubFile file;
    // What lives to the end of the process is made here.
    {
        SmallTree tree;
        const HRESULT sound = operation(tree);
        ASSERT_TRUE(sound == S_OK || sound == S_FALSE);
    }
    bool wasReached = true;
    for (uint64_t nth = 1; wasReached; ++nth) {
        ASSERT_LT(nth, 10'000U);
        SmallTree tree;
        HRESULT result = E_OUTOFMEMORY;
        {
            const AllocationFaultScope fault(nth, fromThenOn);
            try {
                result = operation(tree);
            } catch (const std::bad_alloc&) {
            }
            wasReached = qn::dsc::osdep::AllocationCount() >= nth;
        }
        ASSERT_TRUE(result == S_OK || result == S_FALSE || result == E_OUTOFMEMORY || (mayFail && result == E_FAIL))
            << "allocation " << nth << ": " << ResultName(result);
        ASSERT_EQ(tree.item.references, 0U) << "allocation " << nth;
        ASSERT_EQ(tree.locator.references, 0U) << "allocation " << nth;
        const NodeView top = MakeView(*tree.root, tree.observers);
        ASSERT_EQ(TextOf([&](BSTR* xml) { return top->GetXml(xml); }), S_OK) << "allocation " << nth;
        ASSERT_EQ(TextOf([&](BSTR* path) { return tree.view->GetPath(path); }), S_OK) << "allocation " << nth;
        tree.view->Unadvise(&tree.observer, 7, 0);
        ASSERT_EQ(tree.observer.references, 0U) << "allocation " << nth;
    }
}

void FailEachInTurn(const Operation& operation, bool mayFail = false) {
    FailEachInTurn(operation, false, mayFail);
    FailEachInTurn(operation, true, mayFail);
}

TEST(NodeOutOfMemory, TextsOfANode) {
    FailEachInTurn([](SmallTree& tree) { return TextOf([&](BSTR* text) { return tree.view->GetName(text); }); });
    FailEachInTurn([](SmallTree& tree) { return TextOf([&](BSTR* text) { return tree.view->GetPath(text); }); });
    FailEachInTurn([](SmallTree& tree) { return TextOf([&](BSTR* text) { return tree.view->GetDisplayPath(text); }); });
    FailEachInTurn([](SmallTree& tree) { return TextOf([&](BSTR* text) { return tree.view->GetType(text); }); });
}

TEST(NodeOutOfMemory, SetName) {
    FailEachInTurn([](SmallTree& tree) { return tree.view->SetName(In(u"A new name that is long")); });
}

TEST(NodeOutOfMemory, Types) {
    FailEachInTurn([](SmallTree& tree) {
        return TextsOf([&](ULONG* count, BSTR** types) { return tree.view->GetTypes(count, types); });
    });
    FailEachInTurn([](SmallTree& tree) { return tree.view->IsOfType(In(u"Q")); });
}

TEST(NodeOutOfMemory, Properties) {
    FailEachInTurn([](SmallTree& tree) {
        return TextOf([&](BSTR* value) { return tree.view->GetProperty(In(u"DisplayName"), value); });
    });
    FailEachInTurn(
        [](SmallTree& tree) { return TextOf([&](BSTR* value) { return tree.view->GetPropertyAt(1, value); }); });
    FailEachInTurn([](SmallTree& tree) { return tree.view->SetProperty(In(u"A new key"), In(u"A new long value")); });
    FailEachInTurn([](SmallTree& tree) { return tree.view->SetPropertyAt(0, In(u"A new long value")); });
    FailEachInTurn([](SmallTree& tree) {
        return TextsOf([&](ULONG* count, BSTR** names) { return tree.view->GetPropertyNames(count, names); });
    });
    FailEachInTurn([](SmallTree& tree) { return tree.view->IsLocalizedProperty(In(u"Loc")); });
}

TEST(NodeOutOfMemory, Reservations) {
    FailEachInTurn([](SmallTree& tree) { return tree.view->GetReservation(In(u"a,b"), nullptr); });
    FailEachInTurn([](SmallTree& tree) { return tree.view->GetReservationEx(In(u"a,b"), 1, nullptr); });
    FailEachInTurn([](SmallTree& tree) { return tree.view->Reserve(In(u"me"), 1, nullptr); });
    FailEachInTurn([](SmallTree& tree) { return tree.view->Unreserve(In(u"{AAAAAAAA-0000-0000-0000-000000000001}")); });
    FailEachInTurn([](SmallTree& tree) { return tree.view->ReserveDescendants(In(u"me"), 1, nullptr); });
    FailEachInTurn([](SmallTree& tree) { return tree.view->UnreserveDescendants(In(u"me"), In(u"T")); });
}

TEST(NodeOutOfMemory, ReservationsForItems) {
    FailEachInTurn([](SmallTree& tree) { return tree.view->GetReservationForItem(&tree.item, nullptr); });
    FailEachInTurn([](SmallTree& tree) { return tree.view->ReserveForItem(&tree.item, 1, nullptr); });
    FailEachInTurn([](SmallTree& tree) { return tree.view->UnreserveForItem(&tree.item); });
    FailEachInTurn([](SmallTree& tree) { return tree.view->ReserveDescendantsForItem(&tree.item, 1, nullptr); });
    FailEachInTurn([](SmallTree& tree) { return tree.view->UnreserveDescendantsForItem(&tree.item, nullptr); });
}

TEST(NodeOutOfMemory, ResolveReservations) {
    FailEachInTurn([](SmallTree& tree) {
        ULONG foundCount = untouchedNumber;
        IUnknown** found = nullptr;
        ULONG missingCount = untouchedNumber;
        BSTR* missing = nullptr;
        const HRESULT result =
            tree.view->ResolveReservations(&tree.locator, &foundCount, &found, &missingCount, &missing, 0);
        if (result == E_OUTOFMEMORY) {
            EXPECT_EQ(foundCount, 0U);
            EXPECT_EQ(found, nullptr);
            EXPECT_EQ(missingCount, 0U);
            EXPECT_EQ(missing, nullptr);
        }
        for (ULONG i = 0; i < foundCount; ++i) {
            found[i]->Release();
        }
        CoTaskMemFree(found);
        Free(missingCount, missing);
        return result;
    });
}

TEST(NodeOutOfMemory, Editing) {
    FailEachInTurn([](SmallTree& tree) { return tree.view->LoadContent(In(u"<A>1</A><B name=\"b\"><C>2</C></B>")); },
                   true);
    FailEachInTurn([](SmallTree& tree) { return tree.view->RemoveEntry(In(u"with/slash")); });
    FailEachInTurn([](SmallTree& tree) { return tree.view->Advise(&tree.observer, 0xFFFFFFFF, 7); });
    FailEachInTurn([](SmallTree& tree) {
        ULONG pending = 0;
        tree.view->BeginChange(&pending);
        tree.view->HasPendingChanges();
        return tree.view->EndChange(pending, 0);
    });
}

TEST(NodeOutOfMemory, Neighbours) {
    FailEachInTurn([](SmallTree& tree) {
        return NodeOf([&](IzkhwResourceTreeNode** node) { return tree.view->GetParent(node); });
    });
    FailEachInTurn([](SmallTree& tree) { return tree.view->HasChildren(); });
    FailEachInTurn([](SmallTree& tree) {
        return NodesOf(
            [&](ULONG* count, IzkhwResourceTreeNode*** nodes) { return tree.view->GetChildren(count, nodes); });
    });
    FailEachInTurn([](SmallTree& tree) {
        return NodesOf([&](ULONG* count, IzkhwResourceTreeNode*** nodes) {
            return tree.view->GetChildrenOfType(In(u"T"), count, nodes);
        });
    });
    FailEachInTurn([](SmallTree& tree) {
        return NodesOf([&](ULONG* count, IzkhwResourceTreeNode*** nodes) {
            return tree.view->GetDescendantsOfType(nullptr, count, nodes);
        });
    });
    FailEachInTurn([](SmallTree& tree) {
        return NodeOf([&](IzkhwResourceTreeNode** node) {
            ULONG consumed = 0;
            return tree.view->FindNode(In(u"with\\/slash/P"), &consumed, nullptr, node);
        });
    });
    FailEachInTurn([](SmallTree& tree) {
        return NodeOf([&](IzkhwResourceTreeNode** node) {
            return tree.view->FindNode(In(u"ToStub/Child"), nullptr, nullptr, node);
        });
    });
}

TEST(NodeOutOfMemory, Names) {
    FailEachInTurn([](SmallTree& tree) {
        return NamesOf([&](ULONG* count, BSTR** names, BSTR** displays) {
            return tree.view->GetChildNames(nullptr, 1, count, names, displays);
        });
    });
    FailEachInTurn([](SmallTree& tree) {
        return NamesOf([&](ULONG* count, BSTR** names, BSTR** displays) {
            return tree.view->GetChildNamesOfType(In(u"/path"), In(u"T"), 1, count, names, displays);
        });
    });
    FailEachInTurn([](SmallTree& tree) {
        return NamesOf([&](ULONG* count, BSTR** names, BSTR** displays) {
            return tree.view->GetDescendantNames(nullptr, nullptr, 0, count, names, displays);
        });
    });
    FailEachInTurn([](SmallTree& tree) {
        return NamesOf([&](ULONG* count, BSTR** names, BSTR** displays) {
            return tree.view->GetDescendantNamesEx(In(u"Link/x"), nullptr, 1, In(u"Hide"), count, names, displays);
        });
    });
}

TEST(NodeOutOfMemory, Xml) {
    FailEachInTurn([](SmallTree& tree) { return TextOf([&](BSTR* xml) { return tree.view->GetXml(xml); }); });
    // S_OK with or without a text.
    FailEachInTurn([](SmallTree& tree) {
        LPCWSTR names[] = {In(u"T"), In(u"Part")};
        BSTR xml = nullptr;
        const HRESULT result = tree.view->GetFilteredXml(2, names, 2, names, &xml);
        SysFreeString(xml);
        return result;
    });
    FailEachInTurn([](SmallTree& tree) {
        LPCWSTR names[] = {In(u"T"), In(u"Part")};
        BSTR xml = nullptr;
        const HRESULT result = tree.view->GetFilteredXmlEx(0, 2, names, 2, names, &xml);
        SysFreeString(xml);
        return result;
    });
}

TEST(NodeOutOfMemory, Compatibility) {
    FailEachInTurn([](SmallTree& tree) {
        BOOL isCompatible = -1;
        const HRESULT result = tree.view->IsCompatibleWith(tree.twin.Get(), &isCompatible);
        EXPECT_TRUE(isCompatible == 0 || isCompatible == 1 || result != S_OK);
        return result;
    });
    FailEachInTurn([](SmallTree& tree) {
        ForeignTree foreign;
        BOOL isCompatible = -1;
        HRESULT result = E_OUTOFMEMORY;
        {
            const InterfacePointer<ForeignNode> other(new ForeignNode(foreign, tree.twin.Get()));
            try {
                result = tree.view->IsCompatibleWithEx(other.Get(), &isCompatible, 1);
            } catch (const std::bad_alloc&) {
            }
        }
        EXPECT_EQ(foreign.liveObjects, 0);
        return result;
    });
}

TEST(NodeOutOfMemory, CloneDetached) {
    FailEachInTurn([](SmallTree& tree) {
        return NodeOf([&](IzkhwResourceTreeNode** clone) { return tree.view->CloneDetached(In(u"Copy"), clone); });
    });
}

}  // namespace
}  // namespace zkhw
