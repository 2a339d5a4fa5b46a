// Trees of 100,000 levels, and of 100,000 entries, on a stack of 256 KB. Whatever recursed over them would end the
// process here, and whatever were quadratic would not end.

#include <memory>
#include <new>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "restree/ReadTree.h"
#include "restree/ResTreeNode.h"
#include "support/ChangeLog.h"
#include "support/SmallStack.h"
#include "support/TreeMaking.h"

namespace zkhw {
namespace {

using qn::dsc::osdep::RunOnSmallStack;

constexpr int levels = 100'000;

struct DeepTree {
    explicit DeepTree(bool ordered = false, const char16_t* name = u"x") : root(MakeRootNode(ordered)) {
        nodes.reserve(levels + 1);
        nodes.push_back(root.get());
        for (int i = 0; i < levels; ++i) {
            nodes.push_back(AddChild(*nodes.back(), name, u"T", ordered));
        }
    }
    ResTreeNode* Deepest() const { return nodes.back(); }

    std::unique_ptr<ResTreeNode> root;
    std::vector<ResTreeNode*> nodes;  // From the root down.
};

// How many levels there are below a node, by its first child each time.
int DepthBelow(ResTreeNode* node) {
    int depth = -1;
    while (node != nullptr) {
        ++depth;
        ResTreeNode* child = nullptr;
        for (EntryIterator entry = node->Begin(); !entry.IsEnd() && child == nullptr; ++entry) {
            child = entry->Child();
        }
        node = child;
    }
    return depth;
}

std::u16string DeepPath(const char16_t* name = u"x") {
    std::u16string path;
    for (int i = 0; i < levels; ++i) {
        path += u'/';
        path += name;
    }
    return path;
}

TEST(DeepTree, IsDestroyed) {
    RunOnSmallStack([] {
        for (const bool ordered : {false, true}) {
            DeepTree tree(ordered);
            tree.root.reset();
        }
    });
}

TEST(DeepTree, IsRemoved) {
    RunOnSmallStack([] {
        DeepTree tree;
        tree.root->RemoveEntryByName(u"x");
        EXPECT_TRUE(tree.root->Begin().IsEnd());
    });
}

TEST(DeepTree, IsRemovedUnderTheEyesOfAnObserverAtItsEnd) {
    RunOnSmallStack([] {
        CountingObserver observer;
        DeepTree tree;
        tree.Deepest()->AddObserver(&observer, NodeDeleting | NodeDeleted, 5);
        tree.root->RemoveEntryByName(u"x");
        EXPECT_EQ(observer.calls, 2u);
    });
}

TEST(DeepTree, IsRemovedWithAnObserverOnEveryNode) {
    RunOnSmallStack([] {
        CountingObserver observer;
        DeepTree tree;
        for (ResTreeNode* node : tree.nodes) {
            node->AddObserver(&observer, allChanges & ~static_cast<uint32_t>(AncestorChanged | ReservationChanged), 5);
        }
        tree.root->RemoveChildNodes();
        // Each but the root is told of its deletion twice, and each but the deepest of a child that went.
        EXPECT_EQ(observer.calls, 3u * levels);
    });
}

TEST(DeepTree, IsDestroyedWithAnObserverOnEveryNode) {
    RunOnSmallStack([] {
        CountingObserver observer;
        DeepTree tree(true);
        for (ResTreeNode* node : tree.nodes) {
            node->AddObserver(&observer, NodeDeleted, 5);
        }
        tree.root.reset();
        EXPECT_EQ(observer.calls, static_cast<uint64_t>(levels));
    });
}

TEST(DeepTree, IsDestroyedWithNodesLostInsideEachOther) {
    for (const bool observed : {false, true}) {
        RunOnSmallStack([observed] {
            CountingObserver observer;
            DeepTree tree;
            if (observed) {
                tree.Deepest()->AddObserver(&observer, NodeDeleted, 5);
            }
            for (size_t i = 0; i + 1 < tree.nodes.size(); ++i) {
                AddText(*tree.nodes[i], u"y", u"");
            }
            for (size_t i = 1; i < tree.nodes.size(); ++i) {
                EXPECT_FALSE(tree.nodes[i]->Rename(u"y"));
            }
            tree.root.reset();
        });
    }
}

TEST(DeepTree, IsMerged) {
    RunOnSmallStack([] {
        for (const bool overwrite : {false, true}) {
            const DeepTree source;
            DeepTree target;
            AddText(*source.Deepest(), u"deep", u"1");
            target.root->MergeFrom(*source.root, overwrite);
            EXPECT_EQ(DepthBelow(target.root.get()), levels);
            // Without overwriting the old nodes are gone.
            EXPECT_NE(target.root->Lookup(DeepPath().substr(1) + u"/..", nullptr), nullptr);
        }
    });
}

TEST(DeepTree, IsMergedUnderTheEyesOfAnObserver) {
    RunOnSmallStack([] {
        CountingObserver observer;
        const DeepTree source;
        DeepTree target;
        target.root->AddObserver(&observer, ChildAdded | ChildRemoved, 5);
        target.root->MergeFrom(*source.root, false);
        EXPECT_EQ(observer.calls, 2u);
        EXPECT_EQ(DepthBelow(target.root.get()), levels);
    });
}

TEST(DeepTree, IsCloned) {
    RunOnSmallStack([] {
        const DeepTree tree(true);
        AddText(*tree.Deepest(), u"deep", u"1");
        const std::unique_ptr<ResTreeNode> clone = tree.root->Clone();
        EXPECT_EQ(DepthBelow(clone.get()), levels);
        ResTreeNode* deepest = clone->Lookup(DeepPath(), nullptr);
        ASSERT_NE(deepest, nullptr);
        EXPECT_EQ(TextAt(*deepest, u"deep"), "1");
    });
}

TEST(DeepTree, IsClonedIntoItsOwnEnd) {
    RunOnSmallStack([] {
        const DeepTree tree;
        ResTreeNode* child = nullptr;
        tree.Deepest()->CloneSubtreeInto(tree.Deepest()->End(), u"copy", *tree.root, false, child);
        EXPECT_EQ(DepthBelow(tree.root.get()), levels + 1 + levels);
    });
}

TEST(DeepTree, RenamingTheTopIsHeardAtTheEnd) {
    RunOnSmallStack([] {
        CountingObserver observer;
        DeepTree tree;
        EXPECT_TRUE(tree.Deepest()->AddObserver(&observer, NodeNameChanged | AncestorChanged, 5));
        EXPECT_FALSE(tree.Deepest()->AddObserver(&observer, NodeNameChanged | AncestorChanged, 5));
        tree.root->Rename(u"new");
        tree.nodes[1]->Rename(u"new");
        EXPECT_EQ(observer.calls, 2u);
        EXPECT_TRUE(tree.Deepest()->RemoveObserver(&observer, 5, false));
        tree.root->Rename(u"newer");
        EXPECT_EQ(observer.calls, 2u);
    });
}

TEST(DeepTree, WatchedChainIsDestroyed) {
    RunOnSmallStack([] {
        CountingObserver observer;
        DeepTree tree;
        tree.Deepest()->AddObserver(&observer, NodeNameChanged | AncestorChanged | NodeDeleted, 5);
        tree.root.reset();
        EXPECT_EQ(observer.calls, 1u);
    });
}

TEST(DeepTree, ThrowAtTheEndOfAChainPassesThrough) {
    RunOnSmallStack([] {
        ChangeLog log;
        LoggingObserver observer(log, "o");
        DeepTree tree;
        tree.Deepest()->AddObserver(&observer, NodeNameChanged | AncestorChanged, 5);
        observer.reaction = [](ResTreeNode&, uint32_t) { throw std::bad_alloc(); };
        EXPECT_THROW(tree.root->Rename(u"new"), std::bad_alloc);
        observer.reaction = nullptr;
        tree.Deepest()->RemoveObserver(&observer, 5, false);
    });
}

TEST(DeepTree, ObserversAreRemovedFromAllNodes) {
    RunOnSmallStack([] {
        CountingObserver observer;
        DeepTree tree;
        for (ResTreeNode* node : tree.nodes) {
            node->AddObserver(&observer, PropertyAdded, 5);
        }
        EXPECT_TRUE(tree.root->RemoveObserver(&observer, -1, true));
        AddText(*tree.Deepest(), u"a", u"1");
        AddText(*tree.root, u"a", u"1");
        EXPECT_EQ(observer.calls, 0u);
    });
}

TEST(DeepTree, ReservationsPassOverAChainOfDependants) {
    RunOnSmallStack([] {
        CountingObserver observer;
        DeepTree tree;
        for (ResTreeNode* node : tree.nodes) {
            AddText(*node, u"Reserves", u"x");
        }
        EXPECT_TRUE(tree.root->AddObserver(&observer, ReservationChanged, 5));
        const uint32_t saved = tree.Deepest()->BeginChanges();
        tree.Deepest()->EndChanges(saved | ReservationChanged, true);
        EXPECT_EQ(observer.calls, 1u);
        EXPECT_TRUE(tree.root->RemoveObserver(&observer, 5, false));
        tree.Deepest()->BeginChanges();
        tree.Deepest()->EndChanges(ReservationChanged, true);
        EXPECT_EQ(observer.calls, 1u);
    });
}

TEST(DeepTree, PathLeadsToTheEndAndBack) {
    RunOnSmallStack([] {
        const DeepTree tree;
        const std::u16string path = DeepPath();
        EXPECT_EQ(tree.Deepest()->GetPath().View(), path);
        EXPECT_EQ(tree.root->Lookup(path, nullptr), tree.Deepest());
        EXPECT_EQ(tree.Deepest()->Lookup(path, nullptr), tree.Deepest());
        EXPECT_EQ(tree.Deepest()->GetDisplayPath().View(), path);
        std::u16string up(u"..");
        for (int i = 1; i < levels; ++i) {
            up += u"/..";
        }
        EXPECT_EQ(tree.Deepest()->Lookup(up, nullptr), tree.root.get());
        EXPECT_EQ(tree.Deepest()->Lookup(up + u"/..", nullptr), nullptr);
    });
}

TEST(DeepTree, PathOutsideAsciiTakesLinearTime) {
    RunOnSmallStack([] {
        const DeepTree tree(false, u"\u00E4");
        EXPECT_EQ(tree.Deepest()->GetPath().View(), DeepPath(u"\u00E4"));
        EXPECT_EQ(tree.Deepest()->GetDisplayPath().View(), DeepPath(u"\u00E4"));
    });
}

TEST(DeepTree, TypeQuestionsClimbToTheRoot) {
    RunOnSmallStack([] {
        const DeepTree tree;
        ResTreeNode* module = AddChild(*tree.Deepest(), u"m", u"Module");
        EXPECT_TRUE(module->IsA(u"ResourceList"));
        EXPECT_TRUE(module->Supports(u"ResourceList"));
        std::vector<String> protocols;
        module->GetProtocols(protocols);
        EXPECT_EQ(protocols.size(), 3u);
        module->MakeTypeTableLocal();
        EXPECT_NE(module->GetTypeTable(), nullptr);
    });
}

TEST(DeepTree, ParametersReachTheEnd) {
    RunOnSmallStack([] {
        const DeepTree tree;
        AddText(*tree.Deepest(), u"V", u"#{name}");
        tree.root->ApplyInstance(u"filled", u"", 0);
        EXPECT_EQ(TextAt(*tree.Deepest(), u"V"), "filled");
    });
}

TEST(DeepTree, DeferredLoadIsPassedUpOverAllNodes) {
    RunOnSmallStack([] {
        const DeepTree tree;
        for (ResTreeNode* node : tree.nodes) {
            AddText(*node, u":DeferredLoadPath", u"..");
        }
        EXPECT_TRUE(tree.Deepest()->EnsureDeferredLoaded());
        EXPECT_EQ(tree.root->FindRaw(u":DeferredLoadPath"), nullptr);
    });
}

TEST(DeepTree, ObserverRemovesTheTreeFromItsEnd) {
    RunOnSmallStack([] {
        ChangeLog log;
        LoggingObserver observer(log, "o");
        DeepTree tree;
        tree.Deepest()->AddObserver(&observer, PropertyAdded | AncestorChanged, 5);
        observer.reaction = [&](ResTreeNode&, uint32_t) { tree.root->RemoveChildNodes(); };
        AddText(*tree.Deepest(), u"a", u"1");
        EXPECT_EQ(log.Take(), "o: x PropertyAdded #5\n");
        EXPECT_TRUE(tree.root->Begin().IsEnd());
    });
}

// --- Width ---

constexpr int width = 100'000;

std::u16string NumberedKey(int number) {
    const std::string digits = std::to_string(number);
    return u"k" + std::u16string(digits.begin(), digits.end());
}

TEST(WideTree, ManyChildrenAreMergedClonedAndRemoved) {
    for (const bool ordered : {false, true}) {
        const auto root = MakeRootNode(ordered);
        for (int i = 0; i < width; ++i) {
            AddChild(*root, NumberedKey(i).c_str());
        }
        const std::unique_ptr<ResTreeNode> clone = root->Clone();
        clone->MergeFrom(*root, false);
        int children = 0;
        for (EntryIterator entry = clone->Begin(); !entry.IsEnd(); ++entry) {
            ++children;
        }
        EXPECT_EQ(children, width);
        for (int i = 0; i < width; i += 2) {
            clone->RemoveEntryByName(NumberedKey(i));
        }
        EXPECT_EQ(clone->Lookup(u"k1000", nullptr), nullptr);
        EXPECT_NE(clone->Lookup(u"k1001", nullptr), nullptr);
        clone->RemoveChildNodes();
        EXPECT_TRUE(clone->Begin().IsEnd());
    }
}

TEST(WideTree, ManyOrderedChildrenAreReplacedInFrontOfEachOther) {
    const auto root = MakeRootNode(true);
    ResTreeNode source(u"S", u"U", false, noTable);
    for (int i = 0; i < 20'000; ++i) {
        AddChild(*root, NumberedKey(i).c_str());
    }
    for (int i = 19'999; i >= 0; --i) {
        ResTreeNode* child = nullptr;
        root->CloneSubtreeInto(root->Begin(), NumberedKey(i), source, false, child);
        ASSERT_NE(child, nullptr);
    }
    int index = 0;
    for (EntryIterator entry = root->Begin(); !entry.IsEnd(); ++entry, ++index) {
        ASSERT_EQ(entry.Key(), NumberedKey(index));
        ASSERT_EQ(qn::dsc::ExactText(entry->Child()->GetType()), "U");
    }
    EXPECT_EQ(index, 20'000);
}

TEST(WideTree, OneNodeIsWatchedByManyOthers) {
    CountingObserver observer;
    const auto root = MakeRootNode();
    std::vector<ResTreeNode*> children;
    for (int i = 0; i < 5000; ++i) {
        children.push_back(AddChild(*root, NumberedKey(i).c_str()));
        children.back()->AddObserver(&observer, NodeNameChanged | AncestorChanged, 5);
    }
    root->Rename(u"new");
    EXPECT_EQ(observer.calls, 5000u);
    root->RemoveChildNodes();
    root->Rename(u"newer");
    EXPECT_EQ(observer.calls, 5000u);
}

TEST(WideTree, ManyDependantsAreWatched) {
    CountingObserver observer;
    const auto root = MakeRootNode();
    std::u16string reserves;
    for (int i = 0; i < 20'000; ++i) {
        AddChild(*root, NumberedKey(i).c_str());
        reserves += NumberedKey(i) + u",";
    }
    ResTreeNode* center = AddChild(*root, u"center");
    root->SetProperty(u"Reserves", reserves);
    center->SetProperty(u"Reserves", u"..");
    center->AddObserver(&observer, ReservationChanged, 5);
    ResTreeNode* last = root->Lookup(u"k19999", nullptr);
    last->BeginChanges();
    last->EndChanges(ReservationChanged, true);
    EXPECT_EQ(observer.calls, 1u);
    root->RemoveEntryByName(u"center");
}

}  // namespace
}  // namespace zkhw
