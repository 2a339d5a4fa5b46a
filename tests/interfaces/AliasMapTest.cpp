// The map from resources to the names that the user has given them, filled while the host offers its items.

#include <string>

#include <gtest/gtest.h>

#include "interfaces/ResourceToAliasMapBuilder.h"
#include "interfaces/support/HostProject.h"
#include "support/ExactText.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;

class AliasMapTest : public ::testing::Test {
  protected:
    AliasMapTest() { context.locator = &locator; }

    std::string Build(IzkHostContext* host) {
        ResourceToAliasMap map;
        BuildAliasMap(host, &top, map);
        std::string text;
        for (const auto& [path, alias] : map) {
            text += ExactText(path) + "=" + ExactText(alias) + ";";
        }
        return text;
    }
    std::string Build() { return Build(&context); }

    HostLocator locator;
    HostContext context;
    HostItem top;
};

TEST_F(AliasMapTest, EachLinkedItemGivesItsNameToItsResource) {
    LinkedItem one(locator, 1, u"/b", u"Bee");
    LinkedItem two(locator, 2, u"/a", u"Ay");
    top.items = {&one.item, &two.item};
    EXPECT_EQ(Build(), "/a=Ay;/b=Bee;");
    EXPECT_EQ(top.answers, (std::vector<HRESULT>{S_FALSE, S_FALSE}));
    EXPECT_EQ(top.flags, (std::vector<BOOL>{1, 1}));
    EXPECT_TRUE(one.item.wasZeroed);
}

TEST_F(AliasMapTest, OfTwoItemsForOneResourceTheFirstCountsBlindToLetterCase) {
    LinkedItem one(locator, 1, u"/Res", u"first");
    LinkedItem two(locator, 2, u"/rES", u"second");
    top.items = {&one.item, &two.item};
    EXPECT_EQ(Build(), "/Res=first;");
}

TEST_F(AliasMapTest, TheNameIsThatOfTheItemThatWasOffered) {
    LinkedItem one(locator, 1, u"/a", u"offered");
    LinkedItem known(locator, 2, u"/x", u"found");
    locator.known[1] = &known.item;
    known.item.Answer(IID_IzkItemMarker, &one.marker);
    known.item.Answer(IID_IzkItemResourceLink, &one.link);
    top.items = {&one.item};
    EXPECT_EQ(Build(), "/a=offered;");
}

TEST_F(AliasMapTest, OnlyAResultOfZeroMeansThatThereIsAPath) {
    LinkedItem one(locator, 1, u"/a", u"x");
    top.items = {&one.item};
    for (const HRESULT given : {S_FALSE, E_FAIL, HRESULT{2}}) {
        one.link.given = given;
        EXPECT_EQ(Build(), "") << given;
    }
    EXPECT_EQ(one.link.calls, 3);
}

TEST_F(AliasMapTest, OtherResultsOfTheHostArentLookedAt) {
    LinkedItem one(locator, 1, u"/a", u"x");
    one.item.infoGiven = E_FAIL;
    one.item.nameGiven = E_FAIL;
    locator.given = E_FAIL;
    top.items = {&one.item};
    EXPECT_EQ(Build(), "/a=x;");
}

TEST_F(AliasMapTest, NullTextsAreEmpty) {
    LinkedItem one(locator, 1, nullptr, nullptr);
    top.items = {&one.item};
    EXPECT_EQ(Build(), "=;");
}

TEST_F(AliasMapTest, ItemsThatTheLocatorDoesntKnowArePassedOver) {
    LinkedItem one(locator, 1, u"/a", u"x");
    LinkedItem two(locator, 2, u"/b", u"y");
    locator.known.erase(1);
    top.items = {&one.item, &two.item};
    EXPECT_EQ(Build(), "/b=y;");
    EXPECT_EQ(top.answers, (std::vector<HRESULT>{S_FALSE, S_FALSE}));
    EXPECT_EQ(top.flags, (std::vector<BOOL>{1, 1}));
}

TEST_F(AliasMapTest, ItemsWithoutAMarkerOrALinkArePassedOver) {
    HostMarker marker;
    HostLink link;
    HostObject<IUnknown> marked;
    HostObject<IUnknown> linked;
    HostItem one;
    HostItem two;
    one.id.Data1 = 1;
    two.id.Data1 = 2;
    link.path = u"/a";
    marked.Answer(IID_IzkItemMarker, &marker);
    linked.Answer(IID_IzkItemResourceLink, &link);
    locator.known = {{1, &marked}, {2, &linked}};
    top.items = {&one, &two};
    EXPECT_EQ(Build(), "");
    EXPECT_EQ(link.calls, 0);
}

TEST_F(AliasMapTest, WithoutAContextOrALocatorThereAreNoAliases) {
    LinkedItem one(locator, 1, u"/a", u"x");
    top.items = {&one.item};
    EXPECT_EQ(Build(nullptr), "");
    context.locator = nullptr;
    EXPECT_EQ(Build(), "");
    EXPECT_EQ(top.flags, (std::vector<BOOL>{1, 1}));
    EXPECT_TRUE(one.item.wasZeroed);
}

TEST_F(AliasMapTest, WhatSelectItemsGivesIsReleased) {
    HostObject<IUnknown> selected;
    top.selected = &selected;
    EXPECT_EQ(Build(), "");
    EXPECT_EQ(selected.References(), 0);
}

TEST_F(AliasMapTest, TheSelectorStartsWithoutAReference) {
    ULONG added = 0;
    top.whenSelecting = [&](IzkProjectItemSelector& selector) { added = selector.AddRef(); };
    Build();
    EXPECT_EQ(added, 1U);
}

TEST_F(AliasMapTest, TheSelectorKnowsItsOwnIdAndIUnknown) {
    HRESULT own = E_FAIL;
    HRESULT unknown = E_FAIL;
    HRESULT other = S_OK;
    bool isOne = false;
    top.whenSelecting = [&](IzkProjectItemSelector& selector) {
        void* a = nullptr;
        void* b = nullptr;
        void* c = &a;
        own = selector.QueryInterface(IID_IzkProjectItemSelector, &a);
        unknown = selector.QueryInterface(IID_IUnknown, &b);
        other = selector.QueryInterface(IID_IzkItemMarker, &c);
        isOne = a == &selector && b == &selector && c == nullptr;
        // Back to one and not to zero: the selector isn't on the heap.
        selector.Release();
    };
    Build();
    EXPECT_EQ(own, S_OK);
    EXPECT_EQ(unknown, S_OK);
    EXPECT_EQ(other, E_NOINTERFACE);
    EXPECT_TRUE(isOne);
}

TEST_F(AliasMapTest, TheSelectorsTableHasSelectItemInTheFourthSlot) {
    LinkedItem one(locator, 1, u"/a", u"x");
    top.whenSelecting = [&](IzkProjectItemSelector& selector) {
        using Operation = HRESULT (*)(void*, IzkProjectItem*, BOOL*);
        BOOL flag = 0;
        EXPECT_EQ((*reinterpret_cast<Operation**>(&selector))[3](&selector, &one.item, &flag), S_FALSE);
        EXPECT_EQ(flag, 1);
    };
    EXPECT_EQ(Build(), "/a=x;");
}

// Stops at the first item that it likes.
class Picker : public ResourceItemUISelector {
  public:
    explicit Picker(IzkHostContext* context) : ResourceItemUISelector(context) {}
    bool OnItem(IzkProjectItem*, IzkItemMarker*, IzkItemResourceLink*) override { return true; }

  protected:
    ~Picker() override = default;
};

TEST_F(AliasMapTest, ASelectorThatHasFoundItsItemSaysSo) {
    LinkedItem one(locator, 1, u"/a", u"x");
    CQNComObject<Picker> picker(&context);
    BOOL flag = 0;
    EXPECT_EQ(picker.SelectItem(&one.item, &flag), S_OK);
    EXPECT_EQ(flag, 1);
}

}  // namespace
}  // namespace zkhw
