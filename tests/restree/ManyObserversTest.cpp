// Very many observers on one node, and very many nodes that watch one: time in proportion to their number, and the
// same answers as with few.

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "restree/ObserverList.h"
#include "restree/ResTreeNode.h"
#include "support/ChangeLog.h"
#include "support/TreeMaking.h"

namespace zkhw {
namespace {

constexpr int many = 100'000;

// Notes the contexts under which it is called.
class ContextObserver : public ResTreeNodeChangeObserver {
  public:
    void OnNodeChanged(ResTreeNode* node, uint32_t, int32_t context) override {
        heard.push_back(context);
        if (reaction) {
            reaction(*node, context);
        }
    }

    std::vector<int32_t> heard;
    std::function<void(ResTreeNode& node, int32_t context)> reaction;
};

// 0 to `many` less one in an order that jumps: 7919 has no factor in common with `many`.
int32_t Jumping(int i) {
    return static_cast<int32_t>(static_cast<int64_t>(i) * 7919 % many);
}

std::u16string NumberedKey(int i) {
    const std::string digits = std::to_string(1'000'000 + i);
    return {digits.begin(), digits.end()};
}

// --- Observers ---

TEST(ManyObservers, AreCalledInTheOrderOfTheirRegistration) {
    ContextObserver observer;
    const auto root = MakeRootNode();
    std::vector<int32_t> expected;
    for (int i = 0; i < many; ++i) {
        EXPECT_TRUE(root->AddObserver(&observer, NodeNameChanged, Jumping(i)));
        expected.push_back(Jumping(i));
    }
    root->Raise(NodeNameChanged);
    EXPECT_EQ(observer.heard, expected);
    EXPECT_TRUE(root->RemoveObserver(&observer, -1, false));
    EXPECT_FALSE(root->RemoveObserver(&observer, -1, false));
}

TEST(ManyObservers, AreRegisteredOnce) {
    ContextObserver observer;
    const auto root = MakeRootNode();
    for (const uint32_t mask : {NodeNameChanged, PropertyChanged}) {
        for (int i = 0; i < many; ++i) {
            EXPECT_EQ(root->AddObserver(&observer, mask, Jumping(i)), mask == NodeNameChanged);
        }
    }
    root->Raise(NodeNameChanged);
    EXPECT_EQ(observer.heard.size(), 0u);
    root->Raise(PropertyChanged);
    EXPECT_EQ(observer.heard.size(), static_cast<size_t>(many));
    root->RemoveObserver(&observer, -1, false);
}

TEST(ManyObservers, AnyContextStandsForTheFirstOfThem) {
    ContextObserver observer;
    ContextObserver other;
    const auto root = MakeRootNode();
    root->AddObserver(&other, NodeNameChanged, 3);
    for (int i = 0; i < 1000; ++i) {
        root->AddObserver(&observer, NodeNameChanged, 1000 - i);
    }
    EXPECT_FALSE(root->AddObserver(&observer, PropertyChanged, -1));
    root->Raise(PropertyChanged);
    EXPECT_EQ(observer.heard, std::vector<int32_t>{1000});
    root->RemoveObserver(&observer, -1, false);
    root->RemoveObserver(&other, -1, false);
}

TEST(ManyObservers, AnyContextPassesOverThoseThatHaveJustGone) {
    for (const int count : {3, 1000}) {
        ContextObserver observer;
        ContextObserver other;
        const auto root = MakeRootNode();
        root->AddObserver(&other, NodeNameChanged, 3);
        for (int i = 0; i < count; ++i) {
            root->AddObserver(&observer, NodeNameChanged, 10 + i);
        }
        // While notices are under way what goes is only marked.
        observer.reaction = [&](ResTreeNode& node, int32_t) {
            EXPECT_TRUE(node.RemoveObserver(&observer, 10, false));
            EXPECT_FALSE(node.AddObserver(&observer, PropertyChanged, -1));
            EXPECT_TRUE(node.RemoveObserver(&observer, -1, false));
        };
        root->Raise(NodeNameChanged);
        EXPECT_EQ(observer.heard, std::vector<int32_t>{10});
        EXPECT_FALSE(root->RemoveObserver(&observer, -1, false));
        root->RemoveObserver(&other, -1, false);
    }
}

TEST(ManyObservers, GoOneByOneInAnyOrder) {
    std::vector<ContextObserver> observers(many);
    for (const bool jumps : {false, true}) {
        const auto root = MakeRootNode();
        for (ContextObserver& observer : observers) {
            root->AddObserver(&observer, NodeNameChanged, 7);
        }
        for (int i = 0; i < many - 2; ++i) {
            ContextObserver& observer = observers[static_cast<size_t>(jumps ? Jumping(i) : i)];
            ASSERT_TRUE(root->RemoveObserver(&observer, 7, false));
            ASSERT_FALSE(root->RemoveObserver(&observer, 7, false));
        }
        root->Raise(NodeNameChanged);
        int calls = 0;
        for (ContextObserver& observer : observers) {
            calls += static_cast<int>(observer.heard.size());
            observer.heard.clear();
        }
        EXPECT_EQ(calls, 2);
    }
}

TEST(ManyObservers, ThatStayKeepTheirOrder) {
    ContextObserver observer;
    const auto root = MakeRootNode();
    for (int i = 0; i < many; ++i) {
        root->AddObserver(&observer, NodeNameChanged, i);
    }
    std::vector<int32_t> expected;
    for (int i = 0; i < many; ++i) {
        if (i % 10 != 0) {
            root->RemoveObserver(&observer, i, false);
        } else if (i % 20 != 0) {
            // Those that are registered again come last.
            root->RemoveObserver(&observer, i, false);
            root->AddObserver(&observer, NodeNameChanged, i);
        } else {
            expected.push_back(i);
        }
    }
    for (int i = 10; i < many; i += 20) {
        expected.push_back(i);
    }
    root->Raise(NodeNameChanged);
    EXPECT_EQ(observer.heard, expected);
    root->RemoveObserver(&observer, -1, false);
}

// Places that are closed up take the flags of their records along.
TEST(ManyObservers, TheOneThatAloneAsksForAFlagHearsItWhereverItComesToStand) {
    constexpr int some = 200;
    for (const int only : {0, 1, 63, 64, 65, 127, 128, some - 1}) {
        ContextObserver observer;
        const auto root = MakeRootNode();
        for (int i = 0; i < some; ++i) {
            root->AddObserver(&observer, i == only ? NodeNameChanged | PropertyAdded : NodeNameChanged, i);
        }
        std::vector<int32_t> left;
        for (int i = 0; i < some; ++i) {
            if (i != only && i % 3 != 0) {
                root->RemoveObserver(&observer, i, false);
            } else {
                left.push_back(i);
            }
        }
        root->Raise(PropertyAdded);
        EXPECT_EQ(observer.heard, std::vector<int32_t>{only});
        observer.heard.clear();
        root->Raise(NodeNameChanged);
        EXPECT_EQ(observer.heard, left);
        root->RemoveObserver(&observer, -1, false);
    }
}

TEST(ManyObservers, MayAllGoInOneNotice) {
    ContextObserver observer;
    const auto root = MakeRootNode();
    for (int i = 0; i < many; ++i) {
        root->AddObserver(&observer, NodeNameChanged, i);
    }
    observer.reaction = [&](ResTreeNode& node, int32_t context) {
        EXPECT_TRUE(node.RemoveObserver(&observer, context, false));
        if (context == 5) {
            EXPECT_TRUE(node.RemoveObserver(&observer, 6, false));
        }
    };
    root->Raise(NodeNameChanged);
    EXPECT_EQ(observer.heard.size(), static_cast<size_t>(many - 1));
    root->Raise(NodeNameChanged);
    EXPECT_EQ(observer.heard.size(), static_cast<size_t>(many - 1));
    EXPECT_FALSE(root->RemoveObserver(&observer, -1, false));
}

TEST(ManyObservers, MayAllComeInOneNotice) {
    ContextObserver observer;
    const auto root = MakeRootNode();
    root->AddObserver(&observer, NodeNameChanged, 0);
    observer.reaction = [&](ResTreeNode& node, int32_t) {
        for (int i = 1; i < many; ++i) {
            node.AddObserver(&observer, NodeNameChanged, i);
        }
        observer.reaction = nullptr;
    };
    root->Raise(NodeNameChanged);
    EXPECT_EQ(observer.heard.size(), 1u);
    root->Raise(NodeNameChanged);
    EXPECT_EQ(observer.heard.size(), static_cast<size_t>(many + 1));
    root->RemoveObserver(&observer, -1, false);
}

// Each notice to the first adds one more observer, of something else.
TEST(ManyObservers, MayComeOneANotice) {
    ContextObserver observer;
    const auto root = MakeRootNode();
    root->AddObserver(&observer, NodeNameChanged, 0);
    int added = 0;
    observer.reaction = [&](ResTreeNode& node, int32_t) {
        EXPECT_TRUE(node.AddObserver(&observer, PropertyChanged, ++added));
    };
    for (int i = 0; i < many; ++i) {
        root->Raise(NodeNameChanged);
    }
    EXPECT_EQ(added, many);
    observer.reaction = nullptr;
    observer.heard.clear();
    root->Raise(PropertyChanged);
    EXPECT_EQ(observer.heard.size(), static_cast<size_t>(many));
    root->RemoveObserver(&observer, -1, false);
}

// --- Watching nodes ---

TEST(ManyWatchers, OfOneParentComeAndGoOneByOne) {
    CountingObserver observer;
    CountingObserver ofTheParent;
    const auto root = MakeRootNode();
    root->AddObserver(&ofTheParent, ChildAdded | ChildRemoved, 0);
    for (int i = 0; i < many; ++i) {
        AddChild(*root, NumberedKey(i).c_str())->AddObserver(&observer, NodeNameChanged | AncestorChanged, 5);
    }
    EXPECT_EQ(ofTheParent.calls, static_cast<uint64_t>(many));
    root->Rename(u"new");
    EXPECT_EQ(observer.calls, static_cast<uint64_t>(many));
    for (int i = 0; i < many; ++i) {
        root->RemoveEntryByName(NumberedKey(Jumping(i)));
    }
    EXPECT_EQ(ofTheParent.calls, static_cast<uint64_t>(2 * many));
    root->Rename(u"newer");
    EXPECT_EQ(observer.calls, static_cast<uint64_t>(many));
    root->RemoveObserver(&ofTheParent, -1, false);
}

TEST(ManyWatchers, EndWhenTheirObserversGo) {
    CountingObserver observer;
    const auto root = MakeRootNode();
    std::vector<ResTreeNode*> children;
    for (int i = 0; i < many; ++i) {
        children.push_back(AddChild(*root, NumberedKey(i).c_str()));
        children.back()->AddObserver(&observer, NodeNameChanged | AncestorChanged, 5);
    }
    for (int i = 0; i < many - 1; ++i) {
        EXPECT_TRUE(children[static_cast<size_t>(Jumping(i))]->RemoveObserver(&observer, 5, false));
    }
    root->Rename(u"new");
    EXPECT_EQ(observer.calls, 1u);
    EXPECT_TRUE(root->RemoveObserver(&observer, -1, true));
    root->Rename(u"newer");
    EXPECT_EQ(observer.calls, 1u);
}

TEST(ManyWatchers, OneNodeMayWatchVeryMany) {
    CountingObserver observer;
    const auto root = MakeRootNode();
    ResTreeNode* center = AddChild(*root, u"center");
    std::u16string reserves;
    for (int i = 0; i < many; ++i) {
        AddChild(*root, NumberedKey(i).c_str());
        reserves += u"../" + NumberedKey(i) + u",";
    }
    center->SetProperty(u"Reserves", reserves);
    for (int round = 0; round < 2; ++round) {
        observer.calls = 0;
        EXPECT_TRUE(center->AddObserver(&observer, ReservationChanged, 5));
        for (int i = 0; i < many; ++i) {
            root->Lookup(NumberedKey(i), nullptr)->Raise(ReservationChanged);
        }
        EXPECT_EQ(observer.calls, static_cast<uint64_t>(many));
        EXPECT_TRUE(center->RemoveObserver(&observer, 5, false));
        root->Lookup(NumberedKey(0), nullptr)->Raise(ReservationChanged);
        EXPECT_EQ(observer.calls, static_cast<uint64_t>(many));
    }
    // Once more with the watched ones going first, one by one.
    EXPECT_TRUE(center->AddObserver(&observer, ReservationChanged, 5));
    for (int i = 0; i < many; ++i) {
        root->RemoveEntryByName(NumberedKey(Jumping(i)));
    }
    EXPECT_EQ(center->GetParent(), root.get());
}

// --- Against a list without any index ---

// What the list promises, in the plainest form.
struct PlainList {
    struct Record {
        size_t observer;
        int32_t context;
        uint32_t mask;
        ObserverRecord::State state;
    };

    Record* Find(size_t observer, int32_t context, bool onlyActive) {
        for (Record& record : records) {
            if (record.observer == observer && (context == -1 || record.context == context) &&
                (onlyActive ? record.state == ObserverRecord::Active : record.state != ObserverRecord::Removed)) {
                return &record;
            }
        }
        return nullptr;
    }
    void Erase() {
        std::erase_if(records, [](const Record& record) { return record.state == ObserverRecord::Removed; });
    }

    std::vector<Record> records;
};

// The active records of a mask as text: observer, context and mask of each.
std::string ActiveOf(const ObserverList& list, uint32_t mask, const std::vector<ContextObserver>& observers) {
    std::string text;
    size_t place = 0;
    while (const ObserverRecord* record = list.NextActive(place, mask)) {
        text += std::to_string(static_cast<const ContextObserver*>(record->observer) - observers.data()) + "#" +
                std::to_string(record->context) + ":" + std::to_string(record->mask) + " ";
    }
    return text;
}

std::string ActiveOf(const PlainList& list, uint32_t mask) {
    std::string text;
    for (const PlainList::Record& record : list.records) {
        if (record.state == ObserverRecord::Active && (record.mask & mask) != 0) {
            text += std::to_string(record.observer) + "#" + std::to_string(record.context) + ":" +
                    std::to_string(record.mask) + " ";
        }
    }
    return text;
}

// Some thousands of steps by chance; `growth` of 8 steps register rather than remove.
void CompareByChance(uint32_t growth, uint32_t seed) {
    std::vector<ContextObserver> observers(12);
    ObserverList list;
    PlainList plain;
    bool notifying = false;
    const auto chance = [&seed](uint32_t limit) {
        seed = seed * 1664525 + 1013904223;
        return (seed >> 16) % limit;
    };
    for (int step = 0; step < 3000; ++step) {
        const size_t observer = chance(12);
        const int32_t context = static_cast<int32_t>(chance(40)) - 1;
        const uint32_t flag = 1U << chance(11);
        const uint32_t mask = flag | 1U << chance(11);
        if (chance(20) == 0) {
            if (notifying) {
                list.Sweep();
                plain.Erase();
                for (PlainList::Record& record : plain.records) {
                    record.state = ObserverRecord::Active;
                }
            }
            notifying = !notifying;
            list.SetNotifying(notifying);
        } else if (chance(8) < growth) {
            ObserverRecord* found = list.FindActive(&observers[observer], context);
            PlainList::Record* expected = plain.Find(observer, context, true);
            ASSERT_EQ(found != nullptr, expected != nullptr);
            if (found != nullptr) {
                ASSERT_EQ(found->context, expected->context);
                ASSERT_EQ(found->mask, expected->mask);
                list.SetMask(*found, mask);
                expected->mask = mask;
            } else {
                const ObserverRecord& made = list.Append(&observers[observer], context, mask, nullptr);
                ASSERT_EQ(list.WithSerial(made.serial).observer, &observers[observer]);
                plain.records.push_back(
                    {observer, context, mask, notifying ? ObserverRecord::Added : ObserverRecord::Active});
            }
        } else {
            ObserverRecord* found = list.FindPresent(&observers[observer], context);
            PlainList::Record* expected = plain.Find(observer, context, false);
            ASSERT_EQ(found != nullptr, expected != nullptr);
            if (found != nullptr) {
                ASSERT_EQ(found->context, expected->context);
                list.Remove(*found);
                expected->state = ObserverRecord::Removed;
                if (!notifying) {
                    plain.Erase();
                }
            }
        }
        const uint32_t asked = 1U << chance(11);
        ASSERT_EQ(ActiveOf(list, asked, observers), ActiveOf(plain, asked));
        ASSERT_EQ(list.HasActive(asked), !ActiveOf(plain, asked).empty());
    }
}

TEST(ObserverList, GivesTheSameAsAPlainListWhileItGrows) {
    CompareByChance(6, 1);
}

TEST(ObserverList, GivesTheSameAsAPlainListWhileItStaysShort) {
    CompareByChance(2, 2);
}

TEST(ObserverList, GivesTheSameAsAPlainListAroundTheLimit) {
    CompareByChance(4, 3);
    CompareByChance(3, 4);
}

TEST(ObserverList, CountsItsRecordsForTheProcess) {
    ContextObserver observer;
    EXPECT_TRUE(ObserverCount::IsZero());
    {
        ObserverList list;
        for (int i = 0; i < 100; ++i) {
            list.Append(&observer, i, NodeDeleted, nullptr);
        }
        EXPECT_FALSE(ObserverCount::IsZero());
        for (int i = 0; i < 100; ++i) {
            list.Remove(*list.FindPresent(&observer, i));
        }
        EXPECT_TRUE(ObserverCount::IsZero());
        list.Append(&observer, 0, NodeDeleted, nullptr);
        list.SetNotifying(true);
        list.Remove(*list.FindPresent(&observer, 0));
        // Counted until the dispatch that still has it at hand is over.
        EXPECT_FALSE(ObserverCount::IsZero());
        list.Sweep();
        EXPECT_TRUE(ObserverCount::IsZero());
        list.Append(&observer, 0, NodeDeleted, nullptr);
    }
    EXPECT_TRUE(ObserverCount::IsZero());
}

}  // namespace
}  // namespace zkhw
