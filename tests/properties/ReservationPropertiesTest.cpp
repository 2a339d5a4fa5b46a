// Reservations leave no trace when they are given back, and none when they are refused, whatever others hold and
// however the lists of dependants run. Two ways of asking are left out: exclusively, which drops all other holders for
// good, and with no mode at all, which leaves a record that the text shows only from its next change on. The owner is a
// new one: what one had held before goes with a refusal.

#include <string>

#include <gtest/gtest.h>

#include "properties/RandomTree.h"
#include "restree/TextList.h"
#include "support/ExactText.h"
#include "support/TreeDump.h"

namespace zkhw {
namespace {

// The tree, and who holds what in it.
std::string StateOf(ResTreeNode& root) {
    std::string state = DumpTree(root);
    for (ResTreeNode* node : NodesOf(root)) {
        for (const Reservation& record : node->GetReservations()) {
            state += qn::dsc::ExactText(node->GetPath()) + " " + qn::dsc::ExactText(record.owner) + " " +
                     std::to_string(record.mode) + "\n";
        }
    }
    return state;
}

void MakeDependants(Random& random, ResTreeNode& root) {
    const std::vector<ResTreeNode*> nodes = NodesOf(root);
    for (ResTreeNode* node : nodes) {
        std::vector<String> paths(random.Below(3));
        for (String& path : paths) {
            path = nodes[random.Below(nodes.size())]->GetPath();
        }
        node->RemoveEntryByName(u"Reserves");
        if (!paths.empty()) {
            node->SetProperty(u"Reserves", JoinAll(paths, u',', true).View());
        }
    }
}

void LetOthersReserve(Random& random, ResTreeNode& root) {
    constexpr std::u16string_view owners[] = {u"a", u"b", u"B"};
    constexpr uint32_t modes[] = {ReserveRead, ReserveRead, ReserveWrite, ReserveRead | ReserveWrite, ReserveExclusive};
    const std::vector<ResTreeNode*> nodes = NodesOf(root);
    for (size_t left = random.Below(5); left > 0; --left) {
        nodes[random.Below(nodes.size())]->ReserveOne(String(random.Of(owners)), random.Of(modes));
    }
}

// Reserves and, if that was granted, gives back; how often each came about is counted.
class Attempts {
  public:
    void Try(Random& random) {
        const std::unique_ptr<ResTreeNode> tree = MakeRandomTree(random, {});
        MakeDependants(random, *tree);
        LetOthersReserve(random, *tree);
        const std::vector<ResTreeNode*> nodes = NodesOf(*tree);
        ResTreeNode& node = *nodes[random.Below(nodes.size())];
        const std::string before = StateOf(*tree);
        const uint32_t mode = 1 + static_cast<uint32_t>(random.Below(3));
        const String owner(u"new");
        const String filter(random.OneIn(2) ? u"" : u"ResourceList");
        const size_t way = random.Below(4);
        const bool isGranted = way == 0   ? node.ReserveOne(owner, mode) != 0
                               : way == 1 ? node.ReserveAll(owner, mode, filter)
                               : way == 2 ? node.ReserveDependants(owner, mode)
                                          : node.Reserve(owner, mode) != 0;
        if (isGranted) {
            way == 0   ? node.ReleaseOne(owner)
            : way == 1 ? node.ReleaseAll(owner, filter)
            : way == 2 ? node.ReleaseDependants(owner)
                       : node.Release(owner);
        }
        ++(isGranted ? granted : refused);
        EXPECT_EQ(StateOf(*tree), before) << (isGranted ? "granted, way " : "refused, way ") << way;
    }

    size_t granted = 0;
    size_t refused = 0;
};

TEST(ReservationProperties, WhatIsGivenBackAndWhatIsRefusedLeavesNoTrace) {
    Attempts attempts;
    ForEachCase(10, [&](Random& random) {
        // As many cases as it takes for both: about every fifth attempt is refused.
        for (int i = 0; i < 3; ++i) {
            attempts.Try(random);
        }
    });
    EXPECT_GT(attempts.granted, caseCount);
    EXPECT_GT(attempts.refused, caseCount / 4);
}

}  // namespace
}  // namespace zkhw
