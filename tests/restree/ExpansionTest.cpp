// An expansion leaves out what holds no "#{" as far as the nodes have noted it. So whatever brings such a text into a
// tree that has been expanded, the next expansion has to find it: in nodes with few entries and with many, of either
// form, and in those above.

#include <functional>
#include <memory>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include "restree/Parameters.h"
#include "restree/ReadTree.h"
#include "support/AllocationFaultScope.h"
#include "support/ChangeLog.h"
#include "support/TreeMaking.h"

namespace zkhw {
namespace {

void Expand(ResTreeNode& node, const char16_t* key, const char16_t* value) {
    ParameterMap values;
    values.emplace(key, value);
    node.ApplyParameters(MapParameters(std::move(values)));
}

// The keys of all texts of the subtree with `part` in them, in no order that matters.
std::vector<std::string> TextsWith(ResTreeNode& top, std::u16string_view part) {
    std::vector<std::string> keys;
    std::vector<ResTreeNode*> nodes{&top};
    while (!nodes.empty()) {
        ResTreeNode& node = *nodes.back();
        nodes.pop_back();
        for (EntryIterator entry = node.Begin(); !entry.IsEnd(); ++entry) {
            if (ResTreeNode* child = entry->Child()) {
                nodes.push_back(child);
            } else if (entry->IsText() && entry->Text()->find(part) != std::u16string_view::npos) {
                keys.push_back(qn::dsc::ExactText(entry->Key()));
            }
        }
    }
    return keys;
}

String Numbered(const char16_t* stem, int number) {
    String key(stem);
    key.Append(Wide(std::to_string(1000 + number)));
    return key;
}

// --- Ways for a text to come in ---

struct Way {
    const char* name;
    std::function<void(ResTreeNode&)> go;
};

const std::vector<Way>& Ways() {
    static const std::vector<Way> ways = {
        {"AddTextEntry", [](ResTreeNode& node) { node.AddTextEntry(u"New", u"#{A}", TextEntry); }},
        {"AddTextEntryBeforeAnother",
         [](ResTreeNode& node) {
             const String before(u"K1050");
             node.AddTextEntry(u"K1049a", u"#{A}", LocalizedTextEntry, &before);
         }},
        {"SetPropertyThatIsNew", [](ResTreeNode& node) { node.SetProperty(u"New", u"x#{A}"); }},
        {"SetPropertyThatIsThere", [](ResTreeNode& node) { node.SetProperty(u"K1001", u"x#{A}"); }},
        {"SetEntryText", [](ResTreeNode& node) { node.SetEntryText(node.FindEntry(u"K1000"), u"#{A}x"); }},
        {"EditEntryText",
         [](ResTreeNode& node) { node.EditEntryText(*node.Find(u"K1001")).Append(std::u16string_view(u"#{A}")); }},
        {"InsertedText", [](ResTreeNode& node) { node.InsertEntry(node.Begin(), u"K1000a", TextEntry, u"#{A}"); }},
        {"InsertedNode",
         [](ResTreeNode& node) {
             auto child = std::make_unique<ResTreeNode>(u"New", u"T", false);
             AddText(*AddChild(*child, u"Below"), u"V", u"#{A}");
             node.InsertEntry(node.Begin(), u"New", std::move(child));
         }},
        {"TextOfANewChild", [](ResTreeNode& node) { AddText(*AddChild(node, u"New"), u"V", u"#{A}"); }},
        {"TextOfAnOldChild", [](ResTreeNode& node) { node.Find(u"C1000")->Child()->SetProperty(u"V", u"#{A}"); }},
        {"Merge",
         [](ResTreeNode& node) {
             ResTreeNode source(u"S", u"T", false);
             AddText(source, u"New", u"#{A}");
             node.MergeFrom(source, false);
         }},
        {"MergeThatOverwrites",
         [](ResTreeNode& node) {
             ResTreeNode source(u"S", u"T", false);
             AddText(source, u"K1001", u"#{A}");
             // In an ordered node a second entry of the key.
             node.MergeFrom(source, true);
         }},
        {"MergeExpandedFromAnother",
         [](ResTreeNode& node) {
             ResTreeNode source(u"S", u"T", false);
             AddText(*AddChild(source, u"New"), u"V", u"#{B}");
             ParameterMap values;
             values.emplace(u"B", u"#{A}");
             node.MergeExpanded(source, false, MapParameters(std::move(values)));
         }},
        {"Clone",
         [](ResTreeNode& node) {
             ResTreeNode source(u"S", u"T", false);
             AddText(source, u"V", u"#{A}");
             ResTreeNode* child = nullptr;
             node.CloneSubtreeInto(node.End(), u"New", source, false, child);
             ASSERT_NE(child, nullptr);
         }},
        {"CloneThatIsExpanded",
         [](ResTreeNode& node) {
             ResTreeNode source(u"S", u"T", false);
             AddText(source, u"V", u"#{name} #{A}");
             const InstanceParameters parameters(u"n", u"", 0);
             const NodeEntry* behind = node.Find(u"K1000");
             ASSERT_NE(node.CloneExpandedBehind(behind, u"New", source, false, parameters), nullptr);
         }},
        {"EntryThatIsRenamedBehindIt",
         [](ResTreeNode& node) {
             node.SetProperty(u"K1000", u"#{A}");
             ASSERT_TRUE(node.RenameEntry(u"K1000", u"Z"));
         }},
        {"ChildThatIsRenamedAheadOfIt",
         [](ResTreeNode& node) {
             ASSERT_TRUE(node.RenameEntry(u"C1000", u"Z"));
             node.Find(u"Z")->Child()->SetProperty(u"V", u"#{A}");
         }},
        {"NodeThatIsRenamedAheadOfIt",
         [](ResTreeNode& node) {
             ASSERT_TRUE(node.Rename(u"Renamed"));
             node.SetProperty(u"K1000", u"#{A}");
         }},
        {"ReservationOfAnOwnerOfThatName",
         [](ResTreeNode& node) {
             node.ReserveOne(u"x", 1);
             Expand(node, u"X", u"");
             node.ReserveOne(u"#{A}", 1);
         }},
        {"Report",
         [](ResTreeNode& node) { EXPECT_EQ(node.LoadResourceText(u"<a b='#{A}'", true, nullptr), loadFailed); }},
        {"SecondReport",
         [](ResTreeNode& node) {
             EXPECT_EQ(node.LoadResourceText(u"<a", true, nullptr), loadFailed);
             Expand(node, u"X", u"");
             EXPECT_EQ(node.LoadResourceText(u"<a b='#{A}'", true, nullptr), loadFailed);
         }},
        {"Document",
         [](ResTreeNode& node) { EXPECT_EQ(node.LoadResourceText(u"<New><V>#{A}</V></New>", true, nullptr), 0); }},
        {"XmlValue",
         [](ResTreeNode& node) {
             EXPECT_EQ(node.LoadResourceText(u"<New><V type='xml'><a b='#{A}'/></V></New>", true, nullptr), 0);
         }},
        {"DeadLink",
         [](ResTreeNode& node) {
             EXPECT_EQ(node.LoadResourceText(u"<New><:Link>x/#{A}</:Link></New>", true, nullptr), 0);
         }},
        {"LocalizedValue",
         [](ResTreeNode& node) {
             EXPECT_EQ(node.LoadResourceText(u"<New><V localize='1'>eng=#{A}</V></New>", true, nullptr), 0);
         }},
        {"ListOfReferences",
         [](ResTreeNode& node) {
             EXPECT_EQ(node.LoadResourceText(u"<New><V type='ref-list'>/#{A},y</V></New>", true, nullptr), 0);
         }},
        {"ValueOfAParameter",
         [](ResTreeNode& node) {
             EXPECT_EQ(node.LoadResourceText(u"<New b='#{A}'><V>#{b}</V></New>", true, nullptr), 0);
         }},
        {"CopyOfAPrototype",
         [](ResTreeNode& node) {
             const char16_t* text = u"<New><P><V>#{A}</V></P><N name='n' prototype='P'/><P replace='1'/></New>";
             EXPECT_EQ(node.LoadResourceText(text, true, nullptr), 0);
         }},
        {"Instances",
         [](ResTreeNode& node) {
             EXPECT_EQ(node.LoadResourceText(u"<New><N names='a,b'><V>#{A} #{name}</V></N></New>", true, nullptr), 0);
         }},
    };
    return ways;
}

struct Place {
    bool ordered;
    int count;
    bool isBelow;
};

constexpr Place places[] = {{false, 3, false}, {true, 3, false}, {false, 400, false}, {true, 400, false},
                            {false, 3, true},  {true, 3, true},  {false, 400, true},  {true, 400, true}};

using Case = std::tuple<size_t, size_t>;

class ExpandedAgain : public ::testing::TestWithParam<Case> {
  protected:
    // A node with "count" texts K1000, K1001, ... and as many nodes C1000, ...; the tests are about it, or about one of
    // its nodes. What the tree holds has been expanded before.
    ExpandedAgain() {
        const Place& place = places[std::get<1>(GetParam())];
        tested = AddChild(*root, u"N", u"T", place.ordered);
        Fill(*tested, place.count);
        if (place.isBelow) {
            tested = tested->Find(Numbered(u"C", place.count / 2).View())->Child();
            Fill(*tested, 2);
        }
        EXPECT_FALSE(TextsWith(*root, u"#{").empty());
        Expand(*root, u"Old", u"");
        EXPECT_TRUE(TextsWith(*root, u"#{").empty());
    }

    static void Fill(ResTreeNode& node, int count) {
        for (int i = 0; i < count; ++i) {
            node.AddTextEntry(Numbered(u"K", i).View(), i % 40 == 0 ? u"#{Old}" : u"text", TextEntry);
            AddChild(node, Numbered(u"C", i).CStr());
        }
    }

    void Go() { Ways()[std::get<0>(GetParam())].go(*tested); }

    std::unique_ptr<ResTreeNode> root = MakeRootNode();
    ResTreeNode* tested;
};

std::string NameOf(const ::testing::TestParamInfo<Case>& test) {
    const Place& place = places[std::get<1>(test.param)];
    return std::string(Ways()[std::get<0>(test.param)].name) + (place.ordered ? "Ordered" : "Unordered") +
           std::to_string(place.count) + (place.isBelow ? "Below" : "");
}

INSTANTIATE_TEST_SUITE_P(Ways, ExpandedAgain,
                         ::testing::Combine(::testing::Range(size_t{0}, Ways().size()),
                                            ::testing::Range(size_t{0}, std::size(places))),
                         NameOf);

TEST_P(ExpandedAgain, WhatHasComeInIsFoundFromTheTop) {
    Go();
    ASSERT_FALSE(TextsWith(*root, u"#{A}").empty());
    Expand(*root, u"A", u"value");
    EXPECT_TRUE(TextsWith(*root, u"#{A}").empty());
    EXPECT_FALSE(TextsWith(*root, u"value").empty());
}

TEST_P(ExpandedAgain, WhatStaysUnknownIsFoundLater) {
    Go();
    const std::vector<std::string> before = TextsWith(*root, u"#{A}");
    Expand(*root, u"X", u"");
    Expand(*tested, u"X", u"");
    EXPECT_EQ(TextsWith(*root, u"#{A}"), before);
    Expand(*root, u"A", u"");
    EXPECT_TRUE(TextsWith(*root, u"#{A}").empty());
}

TEST_P(ExpandedAgain, WhatHasComeInIsFoundUnderAnObserver) {
    ChangeLog log;
    LoggingObserver observer(log, "o");
    root->AddObserver(&observer, PropertyChanged, 0);
    Go();
    Expand(*root, u"X", u"");
    Expand(*root, u"A", u"");
    EXPECT_TRUE(TextsWith(*root, u"#{A}").empty());
    root->RemoveObserver(&observer, -1, false);
}

// --- What can come in between ---

TEST(ApplyParameters, WhatALoadBringsInIsExpandedWithTheRest) {
    for (const bool ordered : {false, true}) {
        ResTreeNode root(u"R", u"R", ordered);
        for (int i = 0; i < 300; ++i) {
            AddText(*AddChild(root, Numbered(u"C", i).CStr()), u"V", i % 7 == 0 ? u"#{A}" : u"v");
        }
        // There is no such file: what is named is gone, and nothing has come.
        AddText(*root.Find(u"C1150")->Child(), u":DeferredLoadPath", u"none.xml");
        Expand(root, u"X", u"");
        EXPECT_EQ(TextsWith(root, u"#{A}").size(), 43U);
        EXPECT_EQ(root.Find(u"C1150")->Child()->FindRaw(u":DeferredLoadPath"), nullptr);
        Expand(root, u"A", u"");
        EXPECT_TRUE(TextsWith(root, u"#{").empty());
    }
}

TEST(ApplyParameters, WithoutMemoryOnTheWayTheRestIsFoundNextTime) {
    for (const bool ordered : {false, true}) {
        ResTreeNode root(u"R", u"R", ordered);
        for (int i = 0; i < 300; ++i) {
            AddText(*AddChild(root, Numbered(u"C", i).CStr()), u"V", u"#{A}");
        }
        Expand(root, u"X", u"");
        ParameterMap values;
        // Longer than the text, which so needs a block for each.
        values.emplace(u"A", u"a value that is much longer than the text was");
        const MapParameters parameters(std::move(values));
        {
            const support::AllocationFaultScope fault(200, true);
            EXPECT_THROW(root.ApplyParameters(parameters), std::bad_alloc);
        }
        const size_t left = TextsWith(root, u"#{A}").size();
        EXPECT_GT(left, 100U);
        EXPECT_LT(left, 300U);
        root.ApplyParameters(parameters);
        EXPECT_TRUE(TextsWith(root, u"#{A}").empty());
    }
}

TEST(ApplyParameters, WhatAnObserverPutsBehindTheWalkIsFoundNextTime) {
    for (const int count : {3, 400}) {
        auto root = MakeRootNode(true);
        for (int i = 0; i < count; ++i) {
            AddText(*AddChild(*root, Numbered(u"C", i).CStr()), u"V", u"#{A}");
        }
        ChangeLog log;
        LoggingObserver observer(log, "o");
        ResTreeNode& last = *root->Find(Numbered(u"C", count - 1).View())->Child();
        last.AddObserver(&observer, PropertyChanged, 0);
        observer.reaction = [&](ResTreeNode&, uint32_t) {
            root->Find(u"C1000")->Child()->SetProperty(u"New", u"#{B}");
            root->SetProperty(u"New", u"#{B}");
        };
        Expand(*root, u"A", u"");
        last.RemoveObserver(&observer, -1, false);
        EXPECT_EQ(TextsWith(*root, u"#{B}").size(), 2U);
        Expand(*root, u"B", u"");
        EXPECT_TRUE(TextsWith(*root, u"#{").empty());
    }
}

TEST(ApplyParameters, NodesOfTheSameKeyAreAllFound) {
    ResTreeNode root(u"R", u"R", true);
    std::vector<ResTreeNode*> children;
    for (int i = 0; i < 300; ++i) {
        children.push_back(AddChild(root, u"Same"));
    }
    AddText(root, u"T", u"#{X}");
    Expand(root, u"X", u"");
    AddText(*children[140], u"V", u"#{A}");
    Expand(root, u"A", u"1");
    EXPECT_EQ(TextAt(*children[140], u"V"), "1");
}

TEST(ApplyParameters, TextsStayFoundInANodeThatTakesTheOtherForm) {
    auto root = MakeUnnamedRoot();
    for (int i = 0; i < 300; ++i) {
        root->AddTextEntry(Numbered(u"K", i).View(), i == 150 ? u"#{A}" : u"v", TextEntry);
    }
    Expand(*root, u"X", u"");
    Load(*root, "<SomeList><V>1</V></SomeList>");
    ASSERT_TRUE(root->IsOrdered());
    Expand(*root, u"A", u"1");
    EXPECT_EQ(TextAt(*root, u"K1150"), "1");
}

}  // namespace
}  // namespace zkhw
