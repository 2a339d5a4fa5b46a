#include "restree/ResTreeOwner.h"

#include <gtest/gtest.h>

#include "restree/ResTreeNode.h"

namespace zkhw {
namespace {

constexpr int32_t failure = static_cast<int32_t>(0x80004005);

// Does what a test tells it to, and counts.
class ScriptedOwner : public ResTreeOwner {
  public:
    int32_t CreateRootNode(ResTreeNode*& root) override {
        ++created;
        if (makesNode) {
            root = new ResTreeNode(u"", u"Root", false);
            made = root;
        }
        return createResult;
    }
    int32_t OnRootNodeCreated(ResTreeNode* root) override {
        ++announced;
        EXPECT_EQ(root, made);
        return announceResult;
    }

    bool makesNode = true;
    int32_t createResult = 0;
    int32_t announceResult = 0;
    int created = 0;
    int announced = 0;
    ResTreeNode* made = nullptr;
};

// Counts the nodes that die.
class DeathCounter : public ResTreeNodeChangeObserver {
  public:
    explicit DeathCounter(int& counter) : deaths(counter) {}
    ~DeathCounter() override { ++deaths; }
    void OnNodeChanged(ResTreeNode*, uint32_t, int32_t) override {}
    bool DeleteWithNode() override { return true; }

  private:
    int& deaths;
};

TEST(ResTreeOwner, MakesNothingUntilItIsAsked) {
    const ScriptedOwner owner;
    EXPECT_EQ(owner.created, 0);
}

TEST(ResTreeOwner, FirstUseMakesTheRootAndAnnouncesIt) {
    ScriptedOwner owner;
    ResTreeNode* root = nullptr;
    EXPECT_EQ(owner.GetRootNode(root), 0);
    EXPECT_EQ(root, owner.made);
    EXPECT_EQ(owner.created, 1);
    EXPECT_EQ(owner.announced, 1);
}

TEST(ResTreeOwner, LaterUsesGiveTheSameRoot) {
    ScriptedOwner owner;
    ResTreeNode* first = nullptr;
    ResTreeNode* second = nullptr;
    ASSERT_EQ(owner.GetRootNode(first), 0);
    EXPECT_EQ(owner.GetRootNode(second), 0);
    EXPECT_EQ(second, first);
    EXPECT_EQ(owner.created, 1);
    EXPECT_EQ(owner.announced, 1);
}

TEST(ResTreeOwner, FailureWithoutANodeLeavesTheOwnerFreeToTryAnew) {
    ScriptedOwner owner;
    owner.makesNode = false;
    owner.createResult = static_cast<int32_t>(0x8007000E);
    ResTreeNode* root = nullptr;
    EXPECT_EQ(owner.GetRootNode(root), static_cast<int32_t>(0x8007000E));
    EXPECT_EQ(root, nullptr);
    EXPECT_EQ(owner.announced, 0);
    owner.makesNode = true;
    owner.createResult = 0;
    EXPECT_EQ(owner.GetRootNode(root), 0);
    EXPECT_EQ(root, owner.made);
    EXPECT_EQ(owner.created, 2);
}

TEST(ResTreeOwner, FailureWithANodeIsReportedOnceAndTheNodeStays) {
    ScriptedOwner owner;
    owner.createResult = failure;
    ResTreeNode* root = nullptr;
    EXPECT_EQ(owner.GetRootNode(root), failure);
    EXPECT_EQ(root, nullptr);
    EXPECT_EQ(owner.GetRootNode(root), 0);
    EXPECT_EQ(root, owner.made);
    EXPECT_EQ(owner.created, 1);
    EXPECT_EQ(owner.announced, 0);
}

TEST(ResTreeOwner, SuccessWithoutANodeIsAFailure) {
    ScriptedOwner owner;
    owner.makesNode = false;
    ResTreeNode* root = nullptr;
    EXPECT_EQ(owner.GetRootNode(root), failure);
    EXPECT_EQ(owner.announced, 0);
}

TEST(ResTreeOwner, RefusedAnnouncementIsReportedOnceAndTheNodeStays) {
    ScriptedOwner owner;
    owner.announceResult = static_cast<int32_t>(0x80070057);
    ResTreeNode* root = nullptr;
    EXPECT_EQ(owner.GetRootNode(root), static_cast<int32_t>(0x80070057));
    EXPECT_EQ(owner.GetRootNode(root), 0);
    EXPECT_EQ(root, owner.made);
    EXPECT_EQ(owner.announced, 1);
}

TEST(ResTreeOwner, PositiveResultsAreSuccess) {
    ScriptedOwner owner;
    owner.createResult = 1;
    owner.announceResult = 1;
    ResTreeNode* root = nullptr;
    EXPECT_EQ(owner.GetRootNode(root), 0);
    EXPECT_EQ(root, owner.made);
}

TEST(ResTreeOwner, AnnouncementDoesNothingByDefault) {
    struct PlainOwner : ResTreeOwner {
        int32_t CreateRootNode(ResTreeNode*& root) override {
            root = new ResTreeNode(u"", u"Root", false);
            return 0;
        }
    } owner;
    ResTreeNode* root = nullptr;
    EXPECT_EQ(owner.GetRootNode(root), 0);
    EXPECT_EQ(owner.OnRootNodeCreated(root), 0);
    EXPECT_TRUE(root->Begin().IsEnd());
}

TEST(ResTreeOwner, RootDiesWithItsOwner) {
    int deaths = 0;
    {
        ScriptedOwner owner;
        ResTreeNode* root = nullptr;
        ASSERT_EQ(owner.GetRootNode(root), 0);
        root->AddObserver(new DeathCounter(deaths), allChanges, 7);
        EXPECT_EQ(deaths, 0);
    }
    EXPECT_EQ(deaths, 1);
}

}  // namespace
}  // namespace zkhw
