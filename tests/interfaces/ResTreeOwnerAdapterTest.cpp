// The owner as a host sees it, and the host's object that it stands for.

#include <memory>

#include <gtest/gtest.h>

#include "interfaces/support/HostProject.h"
#include "interfaces/support/OwnedTree.h"
#include "restree/AdapterFactory.h"
#include "support/ProcessEnd.h"
#include "zkfpga/tree_owner.h"

namespace zkhw {
namespace {

using OwnerPointer = InterfacePointer<IzkhwResourceTreeOwner>;

class ResTreeOwnerAdapterTest : public ::testing::Test {
  protected:
    HRESULT Query(IzkHostContext* context, IzkProjectItem* item) {
        return owner->QueryTreeInterface(IID_IzkhwResourceTreeOwner, context, item, object.ReceiveAny());
    }
    void TearDown() override {
        object.Reset();
        owner.reset();
    }

    HostObject<IUnknown> inner;
    HostObject<IUnknown> node;
    HostContext context;
    HostProject project;
    HostItem item;
    std::unique_ptr<TestOwner> owner = std::make_unique<TestOwner>();
    OwnerPointer object;
};

OwnerPointer MakeOwnerObject(IUnknown* inner) {
    OwnerPointer object;
    IUnknown* made = nullptr;
    EXPECT_EQ(CreateOwnerAdapter(inner, &made), S_OK);
    made->QueryInterface(IID_IzkhwResourceTreeOwner, object.ReceiveAny());
    made->Release();
    return object;
}

TEST_F(ResTreeOwnerAdapterTest, GetRootNodeAsksTheHostsObjectForTheNode) {
    inner.Answer(IID_IzkhwResourceTreeNode, &node);
    const OwnerPointer made = MakeOwnerObject(&inner);
    EXPECT_EQ(inner.References(), 1);
    IzkhwResourceTreeNode* root = nullptr;
    EXPECT_EQ(made->GetRootNode(&root), S_OK);
    EXPECT_EQ(static_cast<void*>(root), static_cast<void*>(&node));
    EXPECT_EQ(node.References(), 1);
    node.Release();
}

TEST_F(ResTreeOwnerAdapterTest, GetRootNodeHandsTheHostsFailureOn) {
    const OwnerPointer made = MakeOwnerObject(&inner);
    auto* root = reinterpret_cast<IzkhwResourceTreeNode*>(&node);
    EXPECT_EQ(made->GetRootNode(&root), E_NOINTERFACE);
    EXPECT_EQ(root, nullptr);
}

TEST_F(ResTreeOwnerAdapterTest, GetRootNodeOfNullIsAnError) {
    const OwnerPointer made = MakeOwnerObject(&inner);
    EXPECT_EQ(made->GetRootNode(nullptr), E_POINTER);
    EXPECT_TRUE(inner.asked.empty());
    // Also without an object.
    EXPECT_EQ(MakeOwnerObject(nullptr)->GetRootNode(nullptr), E_POINTER);
}

TEST_F(ResTreeOwnerAdapterTest, GetRootNodeWithoutAnObjectTraps) {
    const OwnerPointer made = MakeOwnerObject(nullptr);
    IzkhwResourceTreeNode* root = nullptr;
    EXPECT_EXIT(made->GetRootNode(&root), qn::dsc::osdep::EndsByTrap, "");
}

TEST_F(ResTreeOwnerAdapterTest, TheObjectKnowsItsOwnIdAndIUnknown) {
    const OwnerPointer made = MakeOwnerObject(&inner);
    OwnerPointer again;
    EXPECT_EQ(made->QueryInterface(IID_IUnknown, again.ReceiveAny()), S_OK);
    EXPECT_EQ(again.Get(), made.Get());
    EXPECT_EQ(made->QueryInterface(IID_IzkhwResourceTreeNode, again.ReceiveAny()), E_NOINTERFACE);
    EXPECT_FALSE(again);
}

TEST_F(ResTreeOwnerAdapterTest, ItsTableHasGetRootNodeInTheFourthSlot) {
    inner.Answer(IID_IzkhwResourceTreeNode, &node);
    const OwnerPointer made = MakeOwnerObject(&inner);
    using Operation = HRESULT (*)(void*, IzkhwResourceTreeNode**);
    const auto table = *reinterpret_cast<Operation**>(made.Get());
    IzkhwResourceTreeNode* root = nullptr;
    EXPECT_EQ(table[3](made.Get(), &root), S_OK);
    EXPECT_EQ(static_cast<void*>(root), static_cast<void*>(&node));
    node.Release();
}

TEST_F(ResTreeOwnerAdapterTest, WithoutAnItemTheContextIsAskedForIUnknown) {
    ASSERT_EQ(Query(&context, nullptr), S_OK);
    ASSERT_EQ(context.asked.size(), 1U);
    EXPECT_TRUE(context.asked[0] == IID_IUnknown);
    EXPECT_EQ(context.References(), 1);
    IzkhwResourceTreeNode* root = nullptr;
    EXPECT_EQ(object->GetRootNode(&root), E_NOINTERFACE);
}

TEST_F(ResTreeOwnerAdapterTest, WithAnItemItsProjectIsAsked) {
    item.id = {0x11223344, 5, 6, {7, 8, 9, 10, 11, 12, 13, 14}};
    item.infoGiven = E_FAIL;
    item.project = &project;
    project.object = &inner;
    inner.Answer(IID_IzkhwResourceTreeNode, &node);
    ASSERT_EQ(Query(&context, &item), S_OK);
    EXPECT_TRUE(item.wasZeroed);
    EXPECT_TRUE(project.asked == item.id);
    EXPECT_TRUE(project.References() == 0 && item.References() == 0 && context.References() == 0);
    EXPECT_TRUE(project.asked == item.id && context.asked.empty());
    EXPECT_EQ(inner.References(), 1);
    IzkhwResourceTreeNode* root = nullptr;
    EXPECT_EQ(object->GetRootNode(&root), S_OK);
    node.Release();
}

TEST_F(ResTreeOwnerAdapterTest, TheObjectIsMadeOnce) {
    HostContext later;
    Query(&context, nullptr);
    const IUnknown* const first = object.Get();
    EXPECT_EQ(Query(&later, &item), S_OK);
    EXPECT_EQ(object.Get(), first);
    EXPECT_TRUE(later.asked.empty());
    EXPECT_EQ(Query(nullptr, nullptr), S_OK);
}

TEST_F(ResTreeOwnerAdapterTest, WithNeitherContextNorItemThereIsNoObject) {
    EXPECT_EQ(Query(nullptr, nullptr), E_POINTER);
    EXPECT_FALSE(object);
    EXPECT_EQ(Query(&context, nullptr), S_OK);
}

TEST_F(ResTreeOwnerAdapterTest, AFailureOfGetProjectIsGivenBackAndTriedAgain) {
    item.project = &project;
    item.projectGiven = E_INVALIDARG;
    EXPECT_EQ(Query(&context, &item), E_INVALIDARG);
    EXPECT_FALSE(object);
    EXPECT_EQ(project.References(), 0);
    EXPECT_EQ(project.calls, 0);
    item.projectGiven = S_OK;
    project.object = &inner;
    EXPECT_EQ(Query(&context, &item), S_OK);
}

TEST_F(ResTreeOwnerAdapterTest, AnItemWithoutAProjectIsAFailure) {
    EXPECT_EQ(Query(&context, &item), E_FAIL);
    EXPECT_FALSE(object);
}

TEST_F(ResTreeOwnerAdapterTest, AFailureOfGetItemObjectIsGivenBackAndWhatCameIsReleased) {
    item.project = &project;
    project.object = &inner;
    project.given = E_INVALIDARG;
    EXPECT_EQ(Query(&context, &item), E_INVALIDARG);
    EXPECT_FALSE(object);
    EXPECT_EQ(inner.References(), 0);
}

}  // namespace
}  // namespace zkhw
