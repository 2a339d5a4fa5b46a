// A copy is equal to its original, and each goes its own way from then on. Repeated children of an ordered node are
// left out: a copied child takes the place of what has its name. So are links below anything but a root, which are
// expressed anew from where the copy stands.

#include <gtest/gtest.h>

#include "properties/RandomTree.h"
#include "support/TreeDump.h"

namespace zkhw {
namespace {

constexpr TreeKind kind{.mayRepeatChildren = false};

TEST(CloneProperties, ACloneIsEqual) {
    ForEachCase(8, [](Random& random) {
        const std::unique_ptr<ResTreeNode> tree = MakeRandomTree(random, kind);
        EXPECT_EQ(DumpTree(*tree->Clone()), DumpTree(*tree));
    });
}

TEST(CloneProperties, WhatIsDoneToOneDoesNothingToTheOther) {
    ForEachCase(9, [](Random& random) {
        std::unique_ptr<ResTreeNode> tree = MakeRandomTree(random, kind);
        const std::string before = DumpTree(*tree);
        std::unique_ptr<ResTreeNode> clone = tree->Clone();
        for (int i = 0; i < 4; ++i) {
            ChangeSomething(random, *clone);
        }
        EXPECT_EQ(DumpTree(*tree), before);
        const std::string changed = DumpTree(*clone);
        if (random.OneIn(2)) {
            ChangeSomething(random, *tree);
        } else {
            tree.reset();
        }
        EXPECT_EQ(DumpTree(*clone), changed);
    });
}

}  // namespace
}  // namespace zkhw
