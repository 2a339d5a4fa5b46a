// How an owner hands out the interfaces of its tree.

#include <memory>
#include <string>

#include <gtest/gtest.h>

#include "interfaces/support/HostObserver.h"
#include "interfaces/support/HostProject.h"
#include "interfaces/support/OwnedTree.h"
#include "support/ProcessEnd.h"
#include "zkfpga/tree_owner.h"

namespace zkhw {
namespace {

constexpr IID unknownId = {0x12345678, 1, 2, {3, 4, 5, 6, 7, 8, 9, 10}};

class TreeQueryTest : public ::testing::Test {
  protected:
    HRESULT Query(REFIID id, IzkHostContext* context = nullptr, IzkProjectItem* item = nullptr) {
        result.Reset();
        void* given = this;
        const HRESULT code = owner->QueryTreeInterface(id, context, item, &given);
        result = InterfacePointer<IUnknown>(static_cast<IUnknown*>(given));
        return code;
    }

    std::unique_ptr<TestOwner> owner = std::make_unique<TestOwner>();
    InterfacePointer<IUnknown> result;
};

TEST_F(TreeQueryTest, TheFiveNodeIdsAreOneObject) {
    ASSERT_EQ(Query(IID_IzkhwResourceTreeNode), S_OK);
    IUnknown* const root = result.Get();
    for (const IID& id : {IID_IzkhwResourceTreeNode2, IID_IzkhwResourceTreeNode3, IID_IzkhwResourceTreeNode4,
                          IID_IzkhwResourceTreeNode5}) {
        ASSERT_EQ(Query(id), S_OK);
        EXPECT_EQ(result.Get(), root);
    }
    EXPECT_EQ(static_cast<IzkhwResourceTreeNode*>(root)->HasParent(), S_FALSE);
}

TEST_F(TreeQueryTest, TheTwoTreeIdsAreOneObject) {
    ASSERT_EQ(Query(IID_IzkEIOGResourceTree2), S_OK);
    IUnknown* const tree = result.Get();
    ASSERT_EQ(Query(IID_IzkEIOGResourceTree), S_OK);
    EXPECT_EQ(result.Get(), tree);
}

TEST_F(TreeQueryTest, AnyOtherIdIsUnknownAndMakesNothing) {
    for (const IID& id : {unknownId, IID_IUnknown, IID_IzkProjectItemSelector, IID_IzkItemMarker}) {
        EXPECT_EQ(Query(id), E_NOINTERFACE);
        EXPECT_FALSE(result);
    }
    EXPECT_EQ(owner->creations, 0);
}

TEST_F(TreeQueryTest, TheCallerGetsOneReference) {
    Query(IID_IzkhwResourceTreeNode);
    // The owner's, that of the tree's queries, and the caller's.
    EXPECT_EQ(ReferencesOf(result.Get()), 3U);
    Query(IID_IzkEIOGResourceTree);
    EXPECT_EQ(ReferencesOf(result.Get()), 2U);
}

TEST_F(TreeQueryTest, TheTreeIsMadeAtTheFirstQuery) {
    EXPECT_EQ(owner->creations, 0);
    Query(IID_IzkEIOGResourceTree);
    Query(IID_IzkhwResourceTreeNode);
    EXPECT_EQ(owner->creations, 1);
    ResTreeNode* root = nullptr;
    owner->GetRootNode(root);
    EXPECT_EQ(owner->announced, root);
}

TEST_F(TreeQueryTest, TheOwnersObjectNeedsNoTree) {
    HostContext context;
    EXPECT_EQ(Query(IID_IzkhwResourceTreeOwner, &context), S_OK);
    EXPECT_EQ(owner->creations, 0);
    result.Reset();
    owner.reset();
}

TEST_F(TreeQueryTest, AFailureOfTheTreeIsGivenBackAndTriedAgain) {
    const auto make = owner->create;
    owner->create = [](ResTreeNode*&) { return static_cast<int32_t>(E_INVALIDARG); };
    EXPECT_EQ(Query(IID_IzkEIOGResourceTree), E_INVALIDARG);
    EXPECT_FALSE(result);
    EXPECT_EQ(owner->announced, nullptr);
    owner->create = make;
    EXPECT_EQ(Query(IID_IzkEIOGResourceTree), S_OK);
    EXPECT_EQ(owner->creations, 2);
}

TEST_F(TreeQueryTest, ASuccessWithoutANodeIsAFailure) {
    const auto make = owner->create;
    owner->create = [](ResTreeNode*&) { return 0; };
    EXPECT_EQ(Query(IID_IzkhwResourceTreeNode), E_FAIL);
    EXPECT_FALSE(result);
    owner->create = make;
    EXPECT_EQ(Query(IID_IzkhwResourceTreeNode), S_OK);
}

TEST_F(TreeQueryTest, AFailedAnnouncementIsGivenBackOnce) {
    owner->announcement = E_INVALIDARG;
    EXPECT_EQ(Query(IID_IzkhwResourceTreeNode), E_INVALIDARG);
    EXPECT_FALSE(result);
    // The node is there: nothing is announced any more.
    EXPECT_EQ(Query(IID_IzkhwResourceTreeNode), S_OK);
    EXPECT_EQ(owner->creations, 1);
}

TEST_F(TreeQueryTest, AResultAboveZeroIsNoFailure) {
    owner->create = [](ResTreeNode*& root) {
        root = MakeRootNode().release();
        return 1;
    };
    owner->announcement = 1;
    EXPECT_EQ(Query(IID_IzkhwResourceTreeNode), S_OK);
}

TEST_F(TreeQueryTest, EveryCallOfGetRootNodeInterfaceGivesAViewOfItsOwn) {
    InterfacePointer<IzkhwResourceTreeNode4> one;
    InterfacePointer<IzkhwResourceTreeNode4> two;
    EXPECT_EQ(owner->GetRootNodeInterface(one.ReceiveAny()), S_OK);
    EXPECT_EQ(owner->GetRootNodeInterface(two.ReceiveAny()), S_OK);
    EXPECT_NE(one.Get(), two.Get());
    EXPECT_EQ(ReferencesOf(one.Get()), 1U);
    one->SetProperty(Text(u"p"), Text(u"1"));
    OwnedBstr value;
    EXPECT_EQ(two->GetProperty(Text(u"p"), value.Receive()), S_OK);
}

TEST_F(TreeQueryTest, TheItemOfTheFirstQueryIsKeptAndLaterOnesAreNot) {
    HostContext context;
    HostItem first;
    HostItem later;
    Query(IID_IzkhwResourceTreeNode, &context, &first);
    EXPECT_EQ(first.References(), 1);
    EXPECT_EQ(context.References(), 0);
    Query(IID_IzkEIOGResourceTree, nullptr, &later);
    EXPECT_EQ(later.References(), 0);
    ULONG count = 0;
    BSTR* names = nullptr;
    static_cast<IzkEIOGResourceTree*>(result.Get())
        ->GetDescendantNames(nullptr, Text(u"includeAliases=true"), &count, &names);
    EXPECT_EQ(first.selections, 1);
    EXPECT_EQ(later.selections, 0);
    result.Reset();
    owner.reset();
    EXPECT_EQ(first.References(), 0);
}

TEST_F(TreeQueryTest, AnItemOfAFailedFirstQueryDoesntCount) {
    HostItem failed;
    HostItem item;
    const auto make = owner->create;
    owner->create = [](ResTreeNode*&) { return static_cast<int32_t>(E_FAIL); };
    Query(IID_IzkEIOGResourceTree, nullptr, &failed);
    EXPECT_EQ(failed.References(), 0);
    owner->create = make;
    Query(IID_IzkEIOGResourceTree, nullptr, &item);
    EXPECT_EQ(item.References(), 1);
    result.Reset();
    owner.reset();
}

TEST_F(TreeQueryTest, WhatTheHostStillHoldsOutlivesTheOwner) {
    HostItem item;
    Query(IID_IzkEIOGResourceTree, nullptr, &item);
    owner.reset();
    EXPECT_EQ(ReferencesOf(result.Get()), 1U);
    EXPECT_EQ(item.References(), 1);
    result.Reset();
    EXPECT_EQ(item.References(), 0);
}

TEST_F(TreeQueryTest, ObserversHearOfTheEndBeforeTheInterfacesGo) {
    HostItem item;
    Query(IID_IzkhwResourceTreeNode, nullptr, &item);
    HostObserver observer;
    static_cast<IzkhwResourceTreeNode*>(result.Get())->Advise(&observer, 0, 1);
    result.Reset();
    int itemReferences = 0;
    observer.reaction = [&](IzkhwResourceTreeNode&, ULONG) { itemReferences = item.References(); };
    owner.reset();
    EXPECT_EQ(itemReferences, 1);
    EXPECT_EQ(item.References(), 0);
}

TEST_F(TreeQueryTest, TheTreeObjectGoesBeforeTheOwnersObject) {
    HostItem item;
    HostContext context;
    Query(IID_IzkEIOGResourceTree, nullptr, &item);
    Query(IID_IzkhwResourceTreeOwner, &context);
    result.Reset();
    std::string order;
    item.whenUnreferenced = [&] { order += "tree "; };
    context.whenUnreferenced = [&] { order += "owner "; };
    owner.reset();
    EXPECT_EQ(order, "tree owner ");
}

TEST_F(TreeQueryTest, ANullResultTraps) {
    EXPECT_EXIT(owner->QueryTreeInterface(IID_IzkhwResourceTreeNode, nullptr, nullptr, nullptr),
                qn::dsc::osdep::EndsByTrap, "");
}

}  // namespace
}  // namespace zkhw
