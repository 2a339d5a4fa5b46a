// What is written can be read, and is written again as it was.

#include <gtest/gtest.h>

#include "properties/RandomTree.h"
#include "restree/TreeWriter.h"
#include "support/ExactText.h"
#include "support/TreeDump.h"

namespace zkhw {
namespace {

std::string Written(ResTreeNode& root) {
    String text;
    WriteNode(root, text, {});
    return qn::dsc::ExactText(text);
}

TEST(WriterProperties, WhatWasWrittenAndReadIsWrittenAlike) {
    size_t nodes = 0;
    ForEachCase(1, [&](Random& random) {
        const std::unique_ptr<ResTreeNode> tree = MakeRandomTree(random, {.comesBack = true});
        nodes += NodesOf(*tree).size();
        String text;
        WriteNode(*tree, text, {});
        ResTreeNode read(u"", u"", false);
        ASSERT_EQ(read.LoadResourceText(text, false, nullptr), 0) << qn::dsc::ExactText(text);
        EXPECT_EQ(Written(read), qn::dsc::ExactText(text));
        EXPECT_EQ(NodesOf(read).size(), NodesOf(*tree).size());
    });
    EXPECT_GT(nodes, 4 * caseCount) << "the trees are too small to say much";
}

// The tree too, not just its text: a localised value may get its chosen text only when it is read.
TEST(WriterProperties, WhatWasReadOnceComesBackAsATree) {
    ForEachCase(2, [&](Random& random) {
        const std::unique_ptr<ResTreeNode> tree = MakeRandomTree(random, {.comesBack = true});
        String text;
        WriteNode(*tree, text, {});
        ResTreeNode once(u"", u"", false);
        once.LoadResourceText(text, false, nullptr);
        String again;
        WriteNode(once, again, {});
        ResTreeNode twice(u"", u"", false);
        twice.LoadResourceText(again, false, nullptr);
        EXPECT_EQ(DumpTree(twice), DumpTree(once));
    });
}

}  // namespace
}  // namespace zkhw
