// Operations of the boundary with every single allocation failing in turn. Each ends with E_OUTOFMEMORY or with
// bad_alloc, or it has no need of that memory; nothing leaks, no reference is lost, and the tree answers as before.

#include <functional>
#include <new>
#include <string>

#include <gtest/gtest.h>

#include "interfaces/support/GivenTexts.h"
#include "interfaces/support/HostObserver.h"
#include "interfaces/support/HostProject.h"
#include "interfaces/support/OwnedTree.h"
#include "support/AllocationFaultScope.h"

namespace zkhw {
namespace {

using support::AllocationCounter;
using support::AllocationFaultScope;

constexpr HRESULT thrown = 0x7777;

// The result, or `thrown` for bad_alloc.
template <typename Operation>
HRESULT OutcomeOf(const Operation& operation) {
    try {
        return operation();
    } catch (const std::bad_alloc&) {
        return thrown;
    }
}

// Runs `operation`, which has to succeed, with its n-th allocation failing, for all n; `check` behind each run.
void FailEachInTurn(const std::function<HRESULT()>& operation, const std::function<void(HRESULT)>& check) {
    // The first run fills what stays.
    ASSERT_GE(operation(), 0);
    check(S_OK);
    uint64_t total = 0;
    {
        const AllocationCounter counter;
        ASSERT_GE(operation(), 0);
        total = counter.Count();
    }
    check(S_OK);
    ASSERT_GT(total, 0U);
    uint64_t failures = 0;
    for (const bool fromThenOn : {false, true}) {
        for (uint64_t nth = 1; nth <= total; ++nth) {
            HRESULT outcome = S_OK;
            {
                const AllocationFaultScope fault(nth, fromThenOn);
                outcome = OutcomeOf(operation);
            }
            EXPECT_TRUE(outcome >= 0 || outcome == E_OUTOFMEMORY) << outcome << " at " << nth;
            failures += outcome == E_OUTOFMEMORY || outcome == thrown ? 1 : 0;
            check(outcome);
        }
    }
    EXPECT_GT(failures, 0U);
}

class BoundaryFailureTest : public ::testing::Test {
  protected:
    BoundaryFailureTest() {
        context.locator = &locator;
        top.items = {&linked.item};
        a = AddChild(tree.Root(), u"a");
        b = AddChild(*a, u"b");
        AddText(*a, u"p", u"a value that does not fit into anything small");
        AddText(*b, u"DisplayName", u"a name to be shown in place of the other");
        AddLink(tree.Root(), u"way", u"/a/b");
        queries = tree.Tree(&context, &top);
    }
    void TearDown() override {
        queries.Reset();
        tree.End();
    }

    using ListOperation = HRESULT (STDMETHODCALLTYPE IzkEIOGResourceTree::*)(LPCWSTR, LPCWSTR, ULONG*, BSTR**);

    void FailList(ListOperation operation, const char16_t* options) {
        ULONG count = 0;
        BSTR* array = nullptr;
        const auto ask = [&] { return (queries.Get()->*operation)(Text(u"/a"), Text(options), &count, &array); };
        ASSERT_EQ(ask(), S_OK);
        const ULONG complete = count;
        FreeTexts(count, array);
        FailEachInTurn(ask, [&](HRESULT outcome) {
            if (outcome == S_OK) {
                EXPECT_EQ(count, complete);
                FreeTexts(count, array);
            } else {
                EXPECT_EQ(count, 0U);
                EXPECT_EQ(array, nullptr);
            }
            EXPECT_EQ(linked.found.References() + linked.item.References() + linked.link.References(), 0);
        });
    }

    HostLocator locator;
    LinkedItem linked{locator, 1, u"/a/b", u"the name that the user has given to it"};
    HostContext context;
    HostItem top;
    HostObserver observer;
    OwnedTree tree;
    InterfacePointer<IzkEIOGResourceTree2> queries;
    ResTreeNode* a;
    ResTreeNode* b;
};

TEST_F(BoundaryFailureTest, GetDescendantNames) {
    FailList(&IzkEIOGResourceTree::GetDescendantNames, u"");
    FailList(&IzkEIOGResourceTree::GetDescendantNames,
             u"recurse=true,includeAliases=true,includeDisplayNames=true,stripPathPrefix=/a");
}

TEST_F(BoundaryFailureTest, GetMultiplePropertyNames) {
    FailList(&IzkEIOGResourceTree::GetMultiplePropertyNames, u"recurse=true,stripPathPrefix=/");
}

TEST_F(BoundaryFailureTest, GetMultipleProperties) {
    FailList(&IzkEIOGResourceTree::GetMultipleProperties, u"recurse=true,includePath=true");
    FailList(&IzkEIOGResourceTree::GetMultipleProperties, u"protocol=None");
}

// On Windows the boundary's memory is the system's: it can't be made to fail, and doesn't trap.
TEST_F(BoundaryFailureTest, GetPropertyAsOnlyLinuxOwnsTheMemory) {
    BSTR value = nullptr;
    FailEachInTurn([&] { return queries->GetProperty(Text(u"/a/p"), nullptr, &value); },
                   [&](HRESULT outcome) {
                       EXPECT_EQ(value != nullptr, outcome == S_OK);
                       SysFreeString(value);
                       value = nullptr;
                   });
}

TEST_F(BoundaryFailureTest, GetFilteredXml) {
    LPCWSTR names[] = {Text(u"b")};
    BSTR xml = nullptr;
    FailEachInTurn([&] { return queries->GetFilteredXml(Text(u"/a"), 1, names, 1, names, &xml); },
                   [&](HRESULT) {
                       SysFreeString(xml);
                       xml = nullptr;
                   });
}

// A registration that fails leaves nothing behind: neither of the observer, nor of what nodes watch for its sake.
TEST_F(BoundaryFailureTest, Advise) {
    const View view = tree.At(u"/a/b");
    AddText(*b, u"Reserves", u"/a");
    HostObserver name("name");
    tree.At(u"a")->Advise(&name, ZkhwNodeNameChanged, 1);
    FailEachInTurn(
        [&] { return view->Advise(&observer, ZkhwPropertyAdded | ZkhwAncestorChanged | ZkhwReservationChanged, 7); },
        [&](HRESULT outcome) {
            EXPECT_EQ(observer.References(), outcome == S_OK ? 1 : 0);
            EXPECT_EQ(ReferencesOf(view.Get()), outcome == S_OK ? 2U : 1U);
            EXPECT_NE(outcome, thrown);
            b->SetProperty(u"new", u"1");
            EXPECT_EQ(observer.Take(), outcome == S_OK ? "observer: PropertyAdded #7\n" : "");
            b->RemoveEntryByName(u"new");
            view->Unadvise(&observer, 7, 0);
            EXPECT_EQ(observer.References(), 0);
        });
    tree.RootView()->SetName(Text(u"other"));
    EXPECT_EQ(name.Take(), "");
    tree.End();
}

// With a single failure nothing passes renamings down any more, either.
TEST_F(BoundaryFailureTest, AdviseOfAncestors) {
    const View view = tree.At(u"/a/b");
    HostObserver name("name");
    tree.At(u"a")->Advise(&name, ZkhwNodeNameChanged, 1);
    for (uint64_t nth = 1; nth < 20; ++nth) {
        HRESULT outcome = S_OK;
        {
            const AllocationFaultScope fault(nth);
            outcome = OutcomeOf([&] { return view->Advise(&observer, ZkhwAncestorChanged, 7); });
        }
        if (outcome == S_OK) {
            view->Unadvise(&observer, 7, 0);
        }
        tree.Root().Rename(u"other");
        EXPECT_EQ(name.Take(), "") << nth;
    }
    tree.End();
}

TEST(OwnerFailureTest, TheInterfacesOfATreeAreTriedAgain) {
    HostItem item;
    HostContext context;
    uint64_t failures = 0;
    for (bool isComplete = false; !isComplete;) {
        TestOwner owner;
        InterfacePointer<IzkEIOGResourceTree> result;
        HRESULT outcome = S_OK;
        {
            const AllocationFaultScope fault(failures + 1);
            outcome = OutcomeOf([&] {
                return owner.QueryTreeInterface(IID_IzkEIOGResourceTree, &context, &item, result.ReceiveAny());
            });
        }
        isComplete = outcome == S_OK;
        if (!isComplete) {
            ++failures;
            EXPECT_TRUE(outcome == E_OUTOFMEMORY || outcome == thrown) << outcome;
            EXPECT_FALSE(result);
            EXPECT_EQ(item.References(), 0);
            EXPECT_EQ(owner.QueryTreeInterface(IID_IzkEIOGResourceTree, &context, &item, result.ReceiveAny()), S_OK);
        }
        EXPECT_EQ(item.References(), 1);
        EXPECT_TRUE(result);
    }
    EXPECT_GT(failures, 3U);
}

TEST(OwnerFailureTest, TheOwnersObjectIsTriedAgain) {
    HostContext context;
    TestOwner owner;
    InterfacePointer<IUnknown> result;
    {
        const AllocationFaultScope fault(1, true);
        EXPECT_EQ(owner.QueryTreeInterface(IID_IzkhwResourceTreeOwner, &context, nullptr, result.ReceiveAny()),
                  E_OUTOFMEMORY);
    }
    EXPECT_EQ(context.References(), 0);
    EXPECT_EQ(owner.QueryTreeInterface(IID_IzkhwResourceTreeOwner, &context, nullptr, result.ReceiveAny()), S_OK);
    EXPECT_EQ(context.References(), 1);
}

}  // namespace
}  // namespace zkhw
