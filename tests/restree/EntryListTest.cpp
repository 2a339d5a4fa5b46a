#include "restree/EntryList.h"

#include <algorithm>
#include <map>
#include <new>
#include <random>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "support/AllocationFaultScope.h"

namespace zkhw {
namespace {

// A text whose value is a number by which the tests know the entry.
NodeEntry* MakeNumbered(std::u16string_view key, uint32_t number) {
    return NodeEntry::MakeText(key, TextEntry,
                               std::u16string(number % 1000 + 1, static_cast<char16_t>(number / 1000 + 1)));
}

uint32_t NumberOf(const NodeEntry& entry) {
    const std::u16string_view text = *entry.Text();
    return (uint32_t{text[0]} - 1) * 1000 + static_cast<uint32_t>(text.size()) - 1;
}

std::u16string KeyOf(uint32_t number) {
    std::u16string key(u"k");
    for (uint32_t rest = number; rest != 0; rest /= 10) {
        key.push_back(static_cast<char16_t>(u'0' + rest % 10));
    }
    return key;
}

// The numbers of all entries from the front to the end.
std::vector<uint32_t> Walk(const EntryList& list) {
    std::vector<uint32_t> numbers;
    for (EntryPosition position = list.Begin(); !position.IsEnd(); position = list.Next(position)) {
        numbers.push_back(NumberOf(*list.At(position)));
    }
    return numbers;
}

std::vector<uint32_t> UpTo(uint32_t count) {
    std::vector<uint32_t> numbers(count);
    for (uint32_t i = 0; i < count; ++i) {
        numbers[i] = i;
    }
    return numbers;
}

void InsertSorted(EntryList& list, std::u16string_view key, uint32_t number) {
    const EntryList::Place place = list.FindPlace(key);
    ASSERT_EQ(place.entry, nullptr);
    list.Insert(place.position, MakeNumbered(key, number));
}

void Remove(EntryList& list, EntryPosition position) {
    NodeEntry* entry = list.At(position);
    list.Detach(position);
    NodeEntry::Release(entry);
}

TEST(EntryList, EmptyListHasNothing) {
    for (const bool ordered : {false, true}) {
        const EntryList list(ordered);
        EXPECT_TRUE(list.IsEmpty());
        EXPECT_EQ(list.Size(), 0u);
        EXPECT_TRUE(list.Begin().IsEnd());
        EXPECT_TRUE(list.Last().IsEnd());
        EXPECT_TRUE(list.AtIndex(0).IsEnd());
        EXPECT_EQ(list.IndexOf(EntryList::End()), 0u);
        EXPECT_EQ(list.Find(u"a"), nullptr);
        EXPECT_EQ(list.Find(u""), nullptr);
    }
}

TEST(EntryList, OrderedListKeepsTheOrderOfInsertion) {
    EntryList list(true);
    for (uint32_t i = 0; i < 5; ++i) {
        list.Insert(EntryList::End(), MakeNumbered(KeyOf(5 - i), i));
    }
    EXPECT_EQ(Walk(list), UpTo(5));
}

TEST(EntryList, SortedListIsInTheOrderOfTheKeys) {
    EntryList list(false);
    InsertSorted(list, u"b", 2);
    InsertSorted(list, u"C", 3);
    InsertSorted(list, u"A", 1);
    InsertSorted(list, u"", 0);
    EXPECT_EQ(Walk(list), UpTo(4));
}

TEST(EntryList, OrderedListFindsTheFirstOfEqualKeys) {
    EntryList list(true);
    list.Insert(EntryList::End(), MakeNumbered(u"x", 0));
    list.Insert(EntryList::End(), MakeNumbered(u"Foo", 1));
    list.Insert(EntryList::End(), MakeNumbered(u"FOO", 2));
    EXPECT_EQ(NumberOf(*list.Find(u"foo")), 1u);
    list.Insert(list.Begin(), MakeNumbered(u"fOO", 3));
    EXPECT_EQ(NumberOf(*list.Find(u"foo")), 3u);
}

// `key` compares as equal to "ab".
void ExpectTheSameKeyAsAb(const std::u16string& key) {
    EntryList sorted(false);
    InsertSorted(sorted, u"ab", 1);
    EXPECT_EQ(NumberOf(*sorted.FindPlace(key).entry), 1u);
    EntryList ordered(true);
    ordered.Insert(EntryList::End(), MakeNumbered(key, 2));
    ordered.Insert(EntryList::End(), MakeNumbered(u"AB", 3));
    EXPECT_EQ(NumberOf(*ordered.Find(u"ab")), 2u);
}

TEST(EntryList, KeyWithASoftHyphenIsTheSameKey) {
    ExpectTheSameKeyAsAb(u"A\u00ADb");
}

// Windows has an order of its own outside printable ASCII: docs/platforms.md lists where it differs.
TEST(EntryList, FullWidthKeyIsTheSameKeyAsOnlyLinuxOrdersSo) {
    // The full-width A and b.
    ExpectTheSameKeyAsAb(u"\uFF21\uFF42");
}

TEST(EntryList, MissingKeyIsInsertedInFrontOfTheNextKey) {
    // "b", "bb", "bbb" and so on, with room in front of each.
    for (const uint32_t count : {5u, 100u}) {
        EntryList list(false);
        for (uint32_t i = 0; i < count; ++i) {
            InsertSorted(list, std::u16string(i + 1, u'b'), i);
        }
        for (uint32_t i = 0; i < count; ++i) {
            const std::u16string key = std::u16string(i, u'b') + u'a';
            InsertSorted(list, key, count + i);
            const NodeEntry* entry = list.Find(key);
            ASSERT_EQ(NumberOf(*entry), count + i);
            EXPECT_EQ(list.IndexOf(list.Locate(entry)), i);
            Remove(list, list.Locate(entry));
        }
        InsertSorted(list, u"c", count);
        EXPECT_EQ(Walk(list), UpTo(count + 1));
    }
}

TEST(EntryList, ResetChangesTheForm) {
    EntryList list(false);
    list.Reset(true);
    EXPECT_TRUE(list.IsOrdered());
    list.Insert(EntryList::End(), MakeNumbered(u"b", 0));
    list.Insert(EntryList::End(), MakeNumbered(u"a", 1));
    EXPECT_EQ(Walk(list), UpTo(2));
}

TEST(EntryList, PositionsAndIndexesLeadToEachOther) {
    for (const uint32_t count : {1u, 31u, 32u, 33u, 126u, 127u, 1000u}) {
        EntryList list(true);
        for (uint32_t i = 0; i < count; ++i) {
            list.Insert(EntryList::End(), MakeNumbered(KeyOf(i), i));
        }
        for (uint32_t i = 0; i < count; ++i) {
            const EntryPosition position = list.AtIndex(i);
            ASSERT_FALSE(position.IsEnd());
            EXPECT_EQ(NumberOf(*list.At(position)), i);
            EXPECT_EQ(list.IndexOf(position), i);
            EXPECT_EQ(list.Locate(list.At(position)), position);
        }
        EXPECT_EQ(list.Last(), list.AtIndex(count - 1));
        EXPECT_TRUE(list.AtIndex(count).IsEnd());
        EXPECT_EQ(list.IndexOf(EntryList::End()), count);
    }
}

TEST(EntryList, InsertGivesThePlaceOfTheEntry) {
    EntryList list(true);
    for (uint32_t i = 0; i < 400; ++i) {
        NodeEntry* entry = MakeNumbered(u"k", i);
        const EntryPosition place = list.Insert(list.AtIndex(i / 2), entry);
        ASSERT_EQ(list.At(place), entry);
        ASSERT_EQ(list.IndexOf(place), i / 2);
    }
}

TEST(EntryList, DetachGivesThePositionOfTheFollower) {
    for (const uint32_t count : {3u, 32u, 33u, 300u}) {
        EntryList list(true);
        for (uint32_t i = 0; i < count; ++i) {
            list.Insert(EntryList::End(), MakeNumbered(u"k", i));
        }
        // Every second entry, from the first on.
        EntryPosition position = list.Begin();
        while (!position.IsEnd()) {
            NodeEntry* entry = list.At(position);
            position = list.Detach(position);
            NodeEntry::Release(entry);
            if (!position.IsEnd()) {
                position = list.Next(position);
            }
        }
        std::vector<uint32_t> odd;
        for (uint32_t i = 1; i < count; i += 2) {
            odd.push_back(i);
        }
        EXPECT_EQ(Walk(list), odd) << count;
    }
}

TEST(EntryList, NothingFollowsTheLastEntryThatIsDetached) {
    for (const uint32_t count : {1u, 3u, 32u, 33u, 300u}) {
        EntryList list(true);
        for (uint32_t i = 0; i < count; ++i) {
            list.Insert(EntryList::End(), MakeNumbered(u"k", i));
        }
        for (uint32_t left = count; left > 0; --left) {
            const EntryPosition last = list.AtIndex(left - 1);
            NodeEntry* entry = list.At(last);
            ASSERT_TRUE(list.Detach(last).IsEnd()) << left << " of " << count;
            NodeEntry::Release(entry);
        }
    }
}

TEST(EntryList, ListThatWasEmptiedTakesEntriesAgain) {
    for (const bool ordered : {false, true}) {
        EntryList list(ordered);
        for (int round = 0; round < 3; ++round) {
            for (uint32_t i = 0; i < 200; ++i) {
                const std::u16string key = KeyOf(i);
                list.Insert(ordered ? EntryList::End() : list.FindPlace(key).position, MakeNumbered(key, i));
            }
            EXPECT_EQ(NumberOf(*list.Find(KeyOf(77))), 77u);
            while (!list.IsEmpty()) {
                Remove(list, round == 0 ? list.Begin() : list.Last());
            }
            EXPECT_EQ(list.Find(KeyOf(77)), nullptr);
            EXPECT_TRUE(list.Begin().IsEnd());
        }
    }
}

TEST(EntryList, KeyThatIsAssignedIsFoundAndTheOldOneIsNot) {
    for (const uint32_t count : {5u, 500u}) {
        EntryList list(true);
        for (uint32_t i = 0; i < count; ++i) {
            list.Insert(EntryList::End(), MakeNumbered(KeyOf(i), i));
        }
        ASSERT_NE(list.Find(u"k3"), nullptr);
        NodeEntry* renamed = list.At(list.AtIndex(3));
        renamed->OwnKey();
        list.AssignKey(renamed, String(u"K4"));
        EXPECT_EQ(list.Find(u"k3"), nullptr);
        // In front of the other "k4".
        EXPECT_EQ(NumberOf(*list.Find(u"k4")), 3u);
    }
}

TEST(EntryList, FailedInsertChangesNothing) {
    for (const bool ordered : {false, true}) {
        EntryList list(ordered);
        uint32_t failures = 0;
        for (uint32_t i = 0; i < 600; ++i) {
            const std::u16string key = KeyOf(i);
            NodeEntry* entry = MakeNumbered(key, i);
            const EntryPosition place = ordered ? list.AtIndex(i / 3) : list.FindPlace(key).position;
            const std::vector<uint32_t> before = Walk(list);
            try {
                const support::AllocationFaultScope fault(1, true);
                list.Insert(place, entry);
            } catch (const std::bad_alloc&) {
                ++failures;
                ASSERT_EQ(Walk(list), before);
                // The failure may have changed the container, but not the order.
                list.Insert(ordered ? list.AtIndex(i / 3) : list.FindPlace(key).position, entry);
            }
            ASSERT_EQ(list.Size(), i + 1);
            ASSERT_EQ(list.Find(key), entry);
        }
        EXPECT_GT(failures, 5u);
    }
}

// --- Against a plain model ---

// How the keys below may be spelled beside the plain letters in either case.
struct Spelling {
    char16_t uncounted;  // Makes no difference, wherever it stands.
    char16_t wideA;      // The first of 26 letters that are equal to the plain ones; 0 if none are used.
};
constexpr Spelling softHyphens{0xAD, 0};
constexpr Spelling controlsAndWideLetters{1, 0xFF21};

// How those keys compare: by their letters, blind to case and width.
char16_t Folded(char16_t unit) {
    if (unit >= 0xFF21 && unit <= 0xFF3A) {
        unit = static_cast<char16_t>(unit - 0xFF21 + u'A');
    }
    return unit >= u'A' && unit <= u'Z' ? static_cast<char16_t>(unit - u'A' + u'a') : unit;
}

std::u16string Folded(const std::u16string& key) {
    std::u16string folded;
    for (const char16_t unit : key) {
        if (unit != softHyphens.uncounted && unit != controlsAndWideLetters.uncounted) {
            folded.push_back(Folded(unit));
        }
    }
    return folded;
}

class Random {
  public:
    explicit Random(uint32_t seed) : engine(seed) {}
    uint32_t Below(uint32_t limit) { return static_cast<uint32_t>(engine() % limit); }

  private:
    std::mt19937 engine;
};

// One of `variety` keys in one of its spellings; units outside ASCII come only if `wide`.
std::u16string RandomKey(Random& random, uint32_t variety, const Spelling& spelling, bool wide) {
    uint32_t number = random.Below(variety);
    std::u16string key;
    while (number != 0) {
        const char16_t letter = static_cast<char16_t>(number % 5);
        const bool isWide = wide && spelling.wideA != 0 && random.Below(64) == 0;
        const char16_t plainA = random.Below(2) == 0 ? u'a' : u'A';
        key.push_back(static_cast<char16_t>((isWide ? spelling.wideA : plainA) + letter));
        if ((wide || spelling.uncounted < 0x80) && random.Below(32) == 0) {
            key.push_back(spelling.uncounted);
        }
        number /= 5;
    }
    return key;
}

class OrderedModel {
  public:
    struct Item {
        std::u16string key;
        uint32_t number;
    };

    OrderedModel(uint32_t seed, const Spelling& spelling)
        : random(seed), variety(1 + random.Below(60)), spelling(spelling), hasWideKeys(seed % 2 != 0) {}

    void Run(uint32_t operations) {
        for (uint32_t i = 0; i < operations; ++i) {
            Step();
        }
        std::vector<uint32_t> numbers;
        for (const Item& item : items) {
            numbers.push_back(item.number);
        }
        ASSERT_EQ(Walk(list), numbers);
    }

  private:
    void Step() {
        const uint32_t choice = random.Below(16);
        if (choice < 8 || items.empty()) {
            Insert();
        } else if (choice < 11) {
            Detach();
        } else if (choice < 14) {
            Find();
        } else if (choice == 14) {
            Assign();
        } else if (random.Below(8) == 0) {
            list.DropIndex();
        }
        ASSERT_EQ(list.Size(), items.size());
    }

    // An index: the front, the end, or anywhere between.
    size_t AnyPlace(size_t count) {
        switch (random.Below(4)) {
            case 0:
                return 0;
            case 1:
                return count;
            default:
                return random.Below(static_cast<uint32_t>(count) + 1);
        }
    }

    void Insert() {
        const std::u16string key = RandomKey(random, variety, spelling, hasWideKeys);
        const size_t index = AnyPlace(items.size());
        list.Insert(list.AtIndex(static_cast<uint32_t>(index)), MakeNumbered(key, made));
        items.insert(items.begin() + static_cast<std::ptrdiff_t>(index), {Folded(key), made});
        ++made;
    }

    void Detach() {
        const size_t index = std::min(AnyPlace(items.size() - 1), items.size() - 1);
        const EntryPosition position = list.AtIndex(static_cast<uint32_t>(index));
        NodeEntry* entry = list.At(position);
        ASSERT_EQ(NumberOf(*entry), items[index].number);
        ASSERT_EQ(list.Locate(entry), position);
        const EntryPosition next = list.Detach(position);
        ASSERT_EQ(list.IndexOf(next), index);
        NodeEntry::Release(entry);
        items.erase(items.begin() + static_cast<std::ptrdiff_t>(index));
    }

    void Find() {
        const std::u16string key = RandomKey(random, variety, spelling, hasWideKeys);
        const std::u16string folded = Folded(key);
        const auto expected =
            std::find_if(items.begin(), items.end(), [&](const Item& item) { return item.key == folded; });
        const NodeEntry* found = list.Find(key);
        ASSERT_EQ(found != nullptr, expected != items.end());
        if (found != nullptr) {
            ASSERT_EQ(NumberOf(*found), expected->number);
        }
    }

    void Assign() {
        const std::u16string key = RandomKey(random, variety, spelling, hasWideKeys);
        const size_t index = random.Below(static_cast<uint32_t>(items.size()));
        NodeEntry* renamed = list.At(list.AtIndex(static_cast<uint32_t>(index)));
        renamed->OwnKey();
        list.AssignKey(renamed, String(std::u16string_view(key)));
        items[index].key = Folded(key);
    }

    Random random;
    uint32_t variety;
    Spelling spelling;
    bool hasWideKeys;
    uint32_t made = 0;
    EntryList list{true};
    std::vector<Item> items;
};

void RunOrderedModels(const Spelling& spelling) {
    for (uint32_t seed = 0; seed < 1000; ++seed) {
        OrderedModel(seed, spelling).Run(150);
        ASSERT_FALSE(testing::Test::HasFatalFailure()) << "seed " << seed;
    }
    for (uint32_t seed = 0; seed < 8; ++seed) {
        OrderedModel(seed, spelling).Run(5000);
        ASSERT_FALSE(testing::Test::HasFatalFailure()) << "long run, seed " << seed;
    }
}

TEST(EntryList, OrderedListDoesWhatAVectorDoes) {
    RunOrderedModels(softHyphens);
}

TEST(EntryList, OrderedListDoesWhatAVectorDoesWithWideKeysAsOnlyLinuxOrdersSo) {
    RunOrderedModels(controlsAndWideLetters);
}

class SortedModel {
  public:
    SortedModel(uint32_t seed, const Spelling& spelling)
        : random(seed), variety(1 + random.Below(4000)), spelling(spelling), hasWideKeys(seed % 2 != 0) {}

    void Run(uint32_t operations) {
        for (uint32_t i = 0; i < operations; ++i) {
            Step();
        }
        std::vector<uint32_t> numbers;
        for (const auto& item : items) {
            numbers.push_back(item.second);
        }
        ASSERT_EQ(Walk(list), numbers);
    }

  private:
    void Step() {
        const std::u16string key = RandomKey(random, variety, spelling, hasWideKeys);
        const auto item = items.find(Folded(key));
        const bool isThere = item != items.end();
        const EntryList::Place place = list.FindPlace(key);
        ASSERT_EQ(place.entry != nullptr, isThere);
        ASSERT_EQ(list.Find(key), place.entry);
        if (isThere) {
            ASSERT_EQ(NumberOf(*place.entry), item->second);
            ASSERT_EQ(list.At(list.Locate(place.entry)), place.entry);
        }
        if (!isThere) {
            list.Insert(place.position, MakeNumbered(key, made));
            items.emplace(Folded(key), made++);
        } else if (random.Below(2) == 0) {
            Remove(list, list.Locate(place.entry));
            items.erase(item);
        }
        ASSERT_EQ(list.Size(), items.size());
    }

    Random random;
    uint32_t variety;
    Spelling spelling;
    bool hasWideKeys;
    uint32_t made = 0;
    EntryList list{false};
    std::map<std::u16string, uint32_t> items;
};

void RunSortedModels(const Spelling& spelling) {
    for (uint32_t seed = 0; seed < 1000; ++seed) {
        SortedModel(seed, spelling).Run(150);
        ASSERT_FALSE(testing::Test::HasFatalFailure()) << "seed " << seed;
    }
    for (uint32_t seed = 0; seed < 8; ++seed) {
        SortedModel(seed, spelling).Run(5000);
        ASSERT_FALSE(testing::Test::HasFatalFailure()) << "long run, seed " << seed;
    }
}

TEST(EntryList, SortedListDoesWhatAMapDoes) {
    RunSortedModels(softHyphens);
}

TEST(EntryList, SortedListDoesWhatAMapDoesWithWideKeysAsOnlyLinuxOrdersSo) {
    RunSortedModels(controlsAndWideLetters);
}

// --- Many entries ---

constexpr uint32_t many = 100'000;

TEST(EntryList, ManyOrderedEntriesAreFoundFromAnIndexBuiltEarly) {
    EntryList list(true);
    for (uint32_t i = 0; i < many; ++i) {
        list.Insert(EntryList::End(), MakeNumbered(KeyOf(i), i));
        if (i == 40) {
            ASSERT_NE(list.Find(u"k3"), nullptr);
        }
    }
    for (uint32_t i = 0; i < many; ++i) {
        ASSERT_EQ(NumberOf(*list.Find(KeyOf(i))), i);
    }
    EXPECT_EQ(list.Find(u"k"), list.At(list.Begin()));
    EXPECT_EQ(list.Find(u"missing"), nullptr);
}

TEST(EntryList, ManyOrderedEntriesAreFoundFromAnIndexBuiltLate) {
    EntryList list(true);
    for (uint32_t i = 0; i < many; ++i) {
        list.Insert(list.Begin(), MakeNumbered(KeyOf(i), i));
    }
    for (uint32_t i = 0; i < many; ++i) {
        ASSERT_EQ(NumberOf(*list.Find(KeyOf(i))), i);
    }
    EXPECT_EQ(NumberOf(*list.At(list.Begin())), many - 1);
}

TEST(EntryList, ManyEqualKeysGiveTheFirstWhileTheFrontGrowsAndShrinks) {
    EntryList list(true);
    list.Insert(EntryList::End(), MakeNumbered(u"k", 0));
    for (uint32_t i = 1; i < many; ++i) {
        list.Insert(i % 2 == 0 ? list.Begin() : EntryList::End(), MakeNumbered(i % 4 == 0 ? u"K" : u"k", i));
        if (i % 1000 == 0) {
            ASSERT_EQ(list.Find(u"k"), list.At(list.Begin()));
        }
    }
    while (list.Size() > 1) {
        Remove(list, list.Begin());
        if (list.Size() % 1000 == 0) {
            ASSERT_EQ(list.Find(u"k"), list.At(list.Begin()));
        }
    }
    EXPECT_EQ(NumberOf(*list.Find(u"K")), many - 1);
}

// A hundred entries of keys of their own, found once.
void FillLong(EntryList& list) {
    for (uint32_t i = 0; i < 100; ++i) {
        list.Insert(EntryList::End(), MakeNumbered(KeyOf(i), i));
    }
    ASSERT_EQ(NumberOf(*list.Find(KeyOf(50))), 50u);
}

TEST(EntryList, LongOrderedListFindsAKeyBehindTheFirstOfItThatHasGone) {
    EntryList list(true);
    FillLong(list);
    list.Insert(EntryList::End(), MakeNumbered(u"K05", 100));
    ASSERT_EQ(NumberOf(*list.Find(u"k05")), 50u);
    Remove(list, list.AtIndex(50));
    EXPECT_EQ(NumberOf(*list.Find(u"k05")), 100u);
    Remove(list, list.Last());
    EXPECT_EQ(list.Find(u"k05"), nullptr);
}

TEST(EntryList, LongOrderedListFindsAnEqualKeyThatWasPutInFront) {
    EntryList list(true);
    FillLong(list);
    list.Insert(list.AtIndex(10), MakeNumbered(u"K05", 100));
    EXPECT_EQ(NumberOf(*list.Find(u"k05")), 100u);
}

TEST(EntryList, LongOrderedListTellsKeysApartThatDifferInAMarkAlone) {
    EntryList list(true);
    FillLong(list);
    list.Insert(EntryList::End(), MakeNumbered(u"x-y", 100));
    list.Insert(EntryList::End(), MakeNumbered(u"xy", 101));
    list.Insert(EntryList::End(), MakeNumbered(u"x'y", 102));
    EXPECT_EQ(NumberOf(*list.Find(u"X-Y")), 100u);
    EXPECT_EQ(NumberOf(*list.Find(u"XY")), 101u);
    EXPECT_EQ(NumberOf(*list.Find(u"X'Y")), 102u);
    EXPECT_EQ(list.Find(u"-xy"), nullptr);
}

// `ab` and `cd` compare as equal to "ab" and "cd".
void ExpectToBeFoundInALongOrderedList(const std::u16string& ab, const std::u16string& cd) {
    EntryList list(true);
    FillLong(list);
    list.Insert(EntryList::End(), MakeNumbered(u"ab", 100));
    EXPECT_EQ(NumberOf(*list.Find(ab)), 100u);
    list.Insert(EntryList::End(), MakeNumbered(cd, 101));
    EXPECT_EQ(NumberOf(*list.Find(u"CD")), 101u);
    EXPECT_EQ(NumberOf(*list.Find(u"AB")), 100u);
}

TEST(EntryList, LongOrderedListFindsAsciiKeysByOthersAndTheOtherWayRound) {
    ExpectToBeFoundInALongOrderedList(u"A\u00ADb", u"c\u00ADd");
}

TEST(EntryList, LongOrderedListFindsAsciiKeysByWideOnesAsOnlyLinuxOrdersSo) {
    ExpectToBeFoundInALongOrderedList(u"\uFF21\uFF42", u"\uFF43d");
}

TEST(EntryList, PiecesThatGoFromALongOrderedListLeaveTheOthersFindable) {
    EntryList list(true);
    for (uint32_t i = 0; i < 1000; ++i) {
        list.Insert(EntryList::End(), MakeNumbered(KeyOf(i), i));
    }
    for (uint32_t i = 0; i < 300; ++i) {
        Remove(list, list.AtIndex(200));
    }
    for (uint32_t i = 0; i < 500; ++i) {
        list.Insert(list.AtIndex(100), MakeNumbered(u"new" + KeyOf(i), 1000 + i));
    }
    for (EntryPosition position = list.Begin(); !position.IsEnd(); position = list.Next(position)) {
        ASSERT_EQ(list.Locate(list.At(position)), position);
        ASSERT_EQ(list.Find(list.At(position)->Key()), list.At(position));
    }
}

// `a` and `c` compare as equal to "a" and "c".
void ExpectToMixInASortedList(const std::u16string& a, const std::u16string& c) {
    EntryList list(false);
    InsertSorted(list, u"d", 4);
    InsertSorted(list, u"a", 0);
    // It and a key with a mark come into an array that isn't in order yet.
    InsertSorted(list, c, 3);
    InsertSorted(list, u"b-", 2);
    InsertSorted(list, u"b", 1);
    EXPECT_EQ(NumberOf(*list.Find(u"c")), 3u);
    EXPECT_EQ(NumberOf(*list.FindPlace(u"C").entry), 3u);
    EXPECT_EQ(NumberOf(*list.Find(a)), 0u);
    EXPECT_EQ(list.Find(u"-b"), nullptr);
    EXPECT_EQ(Walk(list), UpTo(5));
}

TEST(EntryList, PlainAndOtherKeysMixInASortedList) {
    ExpectToMixInASortedList(u"a\u00AD", u"\u00ADC");
}

TEST(EntryList, PlainAndWideKeysMixInASortedListAsOnlyLinuxOrdersSo) {
    ExpectToMixInASortedList(u"\uFF41", u"\uFF23");
}

TEST(EntryList, SortedListThatGrowsLongIsInOrderAllTheWay) {
    EntryList list(false);
    for (uint32_t i = 0; i < 100; ++i) {
        const uint32_t number = i * 37 % 100;
        const char16_t key[] = {static_cast<char16_t>(u'0' + number / 10), static_cast<char16_t>(u'0' + number % 10)};
        InsertSorted(list, {key, 2}, number);
        if (i % 9 == 8) {
            const std::vector<uint32_t> numbers = Walk(list);
            ASSERT_TRUE(std::is_sorted(numbers.begin(), numbers.end()));
            ASSERT_EQ(numbers.size(), i + 1);
        }
    }
    EXPECT_EQ(Walk(list), UpTo(100));
}

TEST(EntryList, WalkGoesOnInOrderBehindWhatWasInsertedMeanwhile) {
    EntryList list(false);
    InsertSorted(list, u"b", 0);
    InsertSorted(list, u"d", 1);
    const EntryPosition position = list.Begin();
    const NodeEntry* entry = list.At(position);
    InsertSorted(list, u"c", 2);
    InsertSorted(list, u"a", 3);
    EXPECT_EQ(NumberOf(*list.At(list.Following(position, entry))), 2u);
}

TEST(EntryList, VisitReachesEveryEntryOnce) {
    for (const uint32_t count : {0u, 7u, 200u}) {
        EntryList list(false);
        for (uint32_t i = 0; i < count; ++i) {
            InsertSorted(list, KeyOf(count - 1 - i), i);
        }
        std::vector<uint32_t> numbers;
        list.VisitUnordered([&](const NodeEntry* visited) { numbers.push_back(NumberOf(*visited)); });
        std::sort(numbers.begin(), numbers.end());
        EXPECT_EQ(numbers, UpTo(count));
    }
}

TEST(EntryList, RoomThatIsReservedChangesNothing) {
    EntryList list(false);
    list.Reserve(20);
    EXPECT_TRUE(list.IsEmpty());
    InsertSorted(list, u"b", 1);
    list.Reserve(3);
    list.Reserve(100);
    InsertSorted(list, u"a", 0);
    EXPECT_EQ(Walk(list), UpTo(2));
}

TEST(EntryList, ManyEntriesAreInsertedAndRemovedInTheMiddle) {
    EntryList list(true);
    for (uint32_t i = 0; i < many; ++i) {
        list.Insert(list.AtIndex(i / 2), MakeNumbered(KeyOf(i % 1000), i));
    }
    EXPECT_NE(list.Find(u"k999"), nullptr);
    for (uint32_t left = many; left > 1; --left) {
        Remove(list, list.AtIndex(left / 2));
    }
    EXPECT_EQ(list.Size(), 1u);
}

TEST(EntryList, ManySortedEntriesComeInTheOrderOfTheirKeys) {
    EntryList list(false);
    std::mt19937 random(1);
    std::vector<uint32_t> numbers = UpTo(many);
    std::shuffle(numbers.begin(), numbers.end(), random);
    for (const uint32_t number : numbers) {
        // Five digits each, so that the order of the texts is that of the numbers.
        std::u16string key;
        for (uint32_t unit = 10'000; unit != 0; unit /= 10) {
            key.push_back(static_cast<char16_t>(u'0' + number / unit % 10));
        }
        InsertSorted(list, key, number);
    }
    EXPECT_EQ(Walk(list), UpTo(many));
    while (!list.IsEmpty()) {
        Remove(list, list.Size() % 2 == 0 ? list.Begin() : list.Last());
    }
    EXPECT_EQ(list.Find(u"00000"), nullptr);
}

// Renames entries of a list of that length one by one, with a search after each; gives the task allocations.
uint64_t AllocationsOfRenaming(uint32_t count) {
    EntryList list(true);
    for (uint32_t i = 0; i < count; ++i) {
        list.Insert(EntryList::End(), MakeNumbered(KeyOf(i), i));
    }
    const support::AllocationCounter counter;
    for (uint32_t i = 0; i < count; ++i) {
        NodeEntry* entry = list.Find(KeyOf(i));
        entry->OwnKey();
        list.AssignKey(entry, String(std::u16string_view(KeyOf(i).replace(0, 1, u"n"))));
        EXPECT_EQ(list.Find(KeyOf(i)), nullptr);
    }
    return counter.Count();
}

TEST(EntryList, RenamingAllEntriesOfALongOrderedListTakesLinearWork) {
    // Pieces of the index are allocated anew each time that it is built.
    const uint64_t once = AllocationsOfRenaming(2000);
    const uint64_t fourTimes = AllocationsOfRenaming(8000);
    EXPECT_LT(fourTimes, once * 5);
}

}  // namespace
}  // namespace zkhw
