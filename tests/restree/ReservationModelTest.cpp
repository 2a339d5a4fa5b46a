// Reservations over random lists of dependants, beside a model that follows the rules one by one, recursively.

#include <algorithm>
#include <array>
#include <cstdint>
#include <memory>
#include <random>
#include <string>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include "restree/ResTreeNode.h"
#include "restree/ReservedTree.h"
#include "support/ChangeLog.h"
#include "support/TreeMaking.h"

namespace zkhw {
namespace {

constexpr size_t nodeCount = 6;

struct ModelNode {
    std::vector<std::pair<char, uint32_t>> records;
    std::vector<size_t> dependants;
    uint64_t notices = 0;
    bool isOnPath = false;
};

struct Model {
    std::array<ModelNode, nodeCount> nodes;

    uint32_t Flags(size_t at) const {
        uint32_t flags = 0;
        for (const auto& record : nodes[at].records) {
            flags |= record.second;
        }
        return flags;
    }

    uint32_t ReserveOne(size_t at, char owner, uint32_t mode) {
        ModelNode& node = nodes[at];
        const uint32_t current = Flags(at);
        uint32_t result = mode;
        bool updated = false;
        if ((current & ReserveExclusive) != 0) {
            return 0;
        }
        if ((mode & ReserveExclusive) != 0) {
            node.records.clear();
        } else {
            if ((mode & current & ReserveWrite) != 0) {
                return 0;
            }
            result |= current;
            for (auto& record : node.records) {
                if (record.first == owner) {
                    record.second = mode;
                    updated = true;
                }
            }
        }
        if (!updated) {
            node.records.emplace_back(owner, mode);
        }
        node.notices += result != 0 ? 1 : 0;
        return result;
    }

    bool ReserveDependants(size_t at, char owner, uint32_t mode) {
        nodes[at].isOnPath = true;
        const bool done = Walk(nodes[at].dependants, owner, mode);
        nodes[at].isOnPath = false;
        return done;
    }

    bool Walk(const std::vector<size_t>& list, char owner, uint32_t mode) {
        size_t next = 0;
        for (; next < list.size(); ++next) {
            if (nodes[list[next]].isOnPath) {
                continue;
            }
            if (!ReserveDependants(list[next], owner, mode)) {
                break;
            }
            if (ReserveOne(list[next], owner, mode) == 0) {
                ReleaseDependants(list[next], owner);
                break;
            }
        }
        if (next == list.size()) {
            return true;
        }
        while (next-- > 0) {
            Release(list[next], owner);
        }
        return false;
    }

    uint32_t Reserve(size_t at, char owner, uint32_t mode) {
        if (!ReserveDependants(at, owner, mode)) {
            return 0;
        }
        const uint32_t result = ReserveOne(at, owner, mode);
        if (result == 0) {
            ReleaseDependants(at, owner);
        }
        return result;
    }

    bool ReleaseOne(size_t at, char owner) {
        const size_t erased =
            std::erase_if(nodes[at].records, [&](const auto& record) { return record.first == owner; });
        nodes[at].notices += erased;
        return erased != 0;
    }

    bool ReleaseDependants(size_t at, char owner) {
        bool any = false;
        nodes[at].isOnPath = true;
        for (size_t i = nodes[at].dependants.size(); i-- > 0;) {
            any |= Release(nodes[at].dependants[i], owner);
        }
        nodes[at].isOnPath = false;
        return any;
    }

    bool Release(size_t at, char owner) {
        if (nodes[at].isOnPath) {
            return false;
        }
        const bool released = ReleaseOne(at, owner);
        return ReleaseDependants(at, owner) || released;
    }

    uint32_t AllFlags(size_t at) {
        if (nodes[at].isOnPath) {
            return 0;
        }
        uint32_t flags = Flags(at);
        nodes[at].isOnPath = true;
        for (const size_t dependant : nodes[at].dependants) {
            flags |= AllFlags(dependant);
        }
        nodes[at].isOnPath = false;
        return flags;
    }

    void Owners(size_t at, std::string& list) {
        if (nodes[at].isOnPath || !list.empty()) {
            return;
        }
        for (const auto& record : nodes[at].records) {
            list += record.first;
        }
        nodes[at].isOnPath = true;
        for (const size_t dependant : nodes[at].dependants) {
            Owners(dependant, list);
        }
        nodes[at].isOnPath = false;
    }
};

// A tree of as many nodes below one root, with the same lists, and an observer on each.
struct Tree {
    explicit Tree(const Model& model) {
        for (size_t i = 0; i < nodeCount; ++i) {
            const char16_t name[] = {static_cast<char16_t>(u'A' + i), 0};
            nodes[i] = AddChild(*root, name);
            // Before there are lists: no node is to hear of another.
            nodes[i]->AddObserver(&observers[i], ReservationChanged, 7);
        }
        for (size_t i = 0; i < nodeCount; ++i) {
            std::u16string list;
            for (const size_t dependant : model.nodes[i].dependants) {
                list += u",../";
                list += static_cast<char16_t>(u'A' + dependant);
            }
            AddText(*nodes[i], u"Reserves", list.empty() ? u"" : list.c_str() + 1);
        }
    }
    ~Tree() {
        for (size_t i = 0; i < nodeCount; ++i) {
            nodes[i]->RemoveObserver(&observers[i], -1, false);
        }
    }
    Tree(const Tree&) = delete;
    Tree& operator=(const Tree&) = delete;

    std::unique_ptr<ResTreeNode> root = MakeRootNode(true);
    std::array<ResTreeNode*, nodeCount> nodes;
    std::array<CountingObserver, nodeCount> observers;
};

void ExpectSame(Model& model, const Tree& tree) {
    for (size_t i = 0; i < nodeCount; ++i) {
        std::string records;
        for (const auto& [owner, mode] : model.nodes[i].records) {
            records += owner + std::to_string(mode) + " ";
        }
        std::string present;
        for (const Reservation& record : tree.nodes[i]->GetReservations()) {
            present += qn::dsc::ExactText(record.owner) + std::to_string(record.mode) + " ";
        }
        EXPECT_EQ(present, records);
        EXPECT_EQ(tree.observers[i].calls, model.nodes[i].notices);
        EXPECT_EQ(tree.nodes[i]->GetReservationFlags(nullptr, false), model.AllFlags(i));
        std::string owners;
        model.Owners(i, owners);
        std::vector<String> list;
        tree.nodes[i]->GetReservationOwners(list, false);
        std::string presentOwners;
        for (const String& owner : list) {
            presentOwners += qn::dsc::ExactText(owner);
        }
        EXPECT_EQ(presentOwners, owners);
    }
}

TEST(ReservationModel, RandomListsGiveWhatTheRulesSay) {
    std::mt19937 random(1);
    const auto below = [&random](size_t bound) { return static_cast<size_t>(random() % bound); };
    for (int round = 0; round < 2000 && !::testing::Test::HasFailure(); ++round) {
        Model model;
        for (ModelNode& node : model.nodes) {
            for (size_t i = below(4); i > 0; --i) {
                node.dependants.push_back(below(nodeCount));
            }
        }
        Tree tree(model);
        for (int step = 0; step < 12; ++step) {
            const size_t at = below(nodeCount);
            const char owner = static_cast<char>('a' + below(3));
            const String ownerText(1, static_cast<char16_t>(owner));
            constexpr uint32_t modes[] = {1, 1, 1, 2, 2, 3, 4, 0, 8};
            const uint32_t mode = modes[below(std::size(modes))];
            SCOPED_TRACE("round " + std::to_string(round) + " step " + std::to_string(step));
            switch (below(6)) {
                case 0:
                    EXPECT_EQ(tree.nodes[at]->Release(ownerText), model.Release(at, owner));
                    break;
                case 1:
                    EXPECT_EQ(tree.nodes[at]->ReleaseDependants(ownerText), model.ReleaseDependants(at, owner));
                    break;
                case 2:
                    EXPECT_EQ(tree.nodes[at]->ReserveOne(ownerText, mode), model.ReserveOne(at, owner, mode));
                    break;
                case 3:
                    EXPECT_EQ(tree.nodes[at]->ReserveDependants(ownerText, mode),
                              model.ReserveDependants(at, owner, mode));
                    break;
                default:
                    EXPECT_EQ(tree.nodes[at]->Reserve(ownerText, mode), model.Reserve(at, owner, mode));
            }
            ExpectSame(model, tree);
        }
    }
}

}  // namespace
}  // namespace zkhw
