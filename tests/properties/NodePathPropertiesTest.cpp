// Paths lead to the nodes that they were made of.
//
// They are texts of names, so the ways that no name can show are left out: to a child whose name isn't the first of its
// kind in an ordered node, is "." or "..", or is no name at all right below the root. From the root or to it, and from
// a node to one below it by a first name that would need an escape, a relative path is no path of a node.

#include <gtest/gtest.h>

#include "properties/RandomTree.h"
#include "qn/dsc/osdep/Compare.h"
#include "restree/NodePath.h"
#include "support/ExactText.h"

namespace zkhw {
namespace {

using qn::dsc::osdep::Equal;

bool IsShownByItsPath(ResTreeNode& node) {
    for (ResTreeNode* step = &node; step->GetParent() != nullptr; step = step->GetParent()) {
        ResTreeNode& parent = *step->GetParent();
        const std::u16string_view name = step->GetName();
        const NodeEntry* entry = parent.FindRaw(name);
        if (entry == nullptr || entry->Child() != step || Equal(name, u".") || Equal(name, u"..") ||
            (parent.GetParent() == nullptr && Equal(name, u""))) {
            return false;
        }
    }
    return true;
}

bool IsBelow(const ResTreeNode& node, const ResTreeNode& top) {
    const ResTreeNode* above = node.GetParent();
    while (above != nullptr && above != &top) {
        above = above->GetParent();
    }
    return above == &top;
}

// The child of `top` that `node` is or stands below.
const ResTreeNode& FirstStep(const ResTreeNode& node, const ResTreeNode& top) {
    const ResTreeNode* step = &node;
    while (step->GetParent() != &top) {
        step = step->GetParent();
    }
    return *step;
}

bool IsShownFrom(const ResTreeNode& base, ResTreeNode& target) {
    if (base.GetParent() == nullptr || target.GetParent() == nullptr) {
        return false;
    }
    if (!IsBelow(target, base)) {
        return true;
    }
    const std::u16string_view name = FirstStep(target, base).GetName();
    return !name.empty() && name.find_first_of(u"/\\") == std::u16string_view::npos && name.substr(0, 2) != u"#{";
}

TEST(NodePathProperties, TheNodeAtThePathOfANodeIsThatNode) {
    size_t shown = 0;
    size_t all = 0;
    ForEachCase(3, [&](Random& random) {
        const std::unique_ptr<ResTreeNode> tree = MakeRandomTree(random, {});
        const std::vector<ResTreeNode*> nodes = NodesOf(*tree);
        ResTreeNode& start = *nodes[random.Below(nodes.size())];
        all += nodes.size();
        for (ResTreeNode* node : nodes) {
            if (IsShownByItsPath(*node)) {
                ++shown;
                EXPECT_EQ(start.Lookup(node->GetPath().View(), nullptr), node) << qn::dsc::ExactText(node->GetPath());
            }
        }
    });
    EXPECT_GT(shown, all * 3 / 4) << "too much is left out";
}

TEST(NodePathProperties, ARelativePathLeadsFromItsBaseToItsTarget) {
    size_t shown = 0;
    ForEachCase(4, [&](Random& random) {
        const std::unique_ptr<ResTreeNode> tree = MakeRandomTree(random, {});
        const std::vector<ResTreeNode*> nodes = NodesOf(*tree);
        ResTreeNode& base = *nodes[random.Below(nodes.size())];
        for (ResTreeNode* target : nodes) {
            if (IsShownByItsPath(*target) && IsShownByItsPath(base) && IsShownFrom(base, *target)) {
                ++shown;
                const String path = MakeRelativeNodePath(target->GetPath(), base.GetPath());
                EXPECT_EQ(base.Lookup(path.View(), nullptr), target)
                    << qn::dsc::ExactText(path) << " from " << qn::dsc::ExactText(base.GetPath());
            }
        }
    });
    EXPECT_GT(shown, 2 * caseCount) << "too much is left out";
}

}  // namespace
}  // namespace zkhw
