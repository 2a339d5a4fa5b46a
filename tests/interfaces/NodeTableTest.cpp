// The table of a node's view by number, as a host's compiler has it: what stands in a slot is told by what it does.

#include <gtest/gtest.h>

#include "interfaces/CQNComObject.h"
#include "interfaces/support/NodeViewTest.h"
#include "interfaces/support/ProjectItems.h"
#include "restree/ChangeFlags.h"

namespace zkhw {
namespace {

using Node = IzkhwResourceTreeNode;

// Root (ordered): "Text" = "one", child "A:T" with the child "B:T".
class NodeTable : public NodeViewTest {
  protected:
    NodeTable() {
        AddText(*root, u"Text", u"one");
        a = AddChild(*root, u"A");
        b = AddChild(*a, u"B");
        view = View(*a);
    }

    template <typename... Arguments>
    HRESULT Call(size_t slot, Arguments... arguments) {
        void* const operation = (*reinterpret_cast<void***>(view.Get()))[slot];
        return reinterpret_cast<HRESULT (*)(void*, Arguments...)>(operation)(view.Get(), arguments...);
    }
    std::string Text(size_t slot) {
        return GivenText([&](BSTR* text) { return Call(slot, text); });
    }

    ResTreeNode* a = nullptr;
    ResTreeNode* b = nullptr;
    NodeView view;
};

TEST_F(NodeTable, Slots0To2AreThoseOfUnknown) {
    void* result = nullptr;
    EXPECT_EQ(Call(0, &IID_IzkhwResourceTreeNode3, &result), S_OK);
    EXPECT_EQ(result, view.Get());
    EXPECT_EQ(Call(1), 3);
    EXPECT_EQ(Call(2), 2);
    EXPECT_EQ(Call(2), 1);
}

TEST_F(NodeTable, Slots3To9TellWhatTheNodeIs) {
    AddText(*a, u"DisplayName", u"Shown");
    AddText(*a, u"Protocols", u"P");
    EXPECT_EQ(Text(3), "S_OK A");
    EXPECT_EQ(Text(4), "S_OK /A");
    EXPECT_EQ(Text(5), "S_OK /Shown");
    EXPECT_EQ(Text(7), "S_OK T");
    EXPECT_EQ(GivenTexts([&](ULONG* count, BSTR** types) { return Call(8, count, types); }), "S_OK [T, P]");
    EXPECT_EQ(Call(9, In(u"P")), S_OK);
    EXPECT_EQ(Call(9, In(u"Q")), S_FALSE);
    EXPECT_EQ(Call(6, In(u"Renamed")), S_OK);
    EXPECT_EQ(Text(3), "S_OK Renamed");
}

TEST_F(NodeTable, Slots10To14AreTheProperties) {
    AddText(*a, u"Y", u"localised", LocalizedTextEntry);
    EXPECT_EQ(Call(12, In(u"Z"), In(u"plain")), S_OK);
    EXPECT_EQ(GivenText([&](BSTR* text) { return Call(10, In(u"z"), text); }), "S_OK plain");
    EXPECT_EQ(GivenText([&](BSTR* text) { return Call(11, ULONG{0}, text); }), "S_OK localised");
    EXPECT_EQ(Call(13, ULONG{0}, In(u"new")), S_OK);
    EXPECT_EQ(GivenText([&](BSTR* text) { return Call(11, ULONG{1}, text); }), "S_OK new");
    EXPECT_EQ(GivenTexts([&](ULONG* count, BSTR** names) { return Call(14, count, names); }), "S_OK [Y, Z]");
}

TEST_F(NodeTable, Slots15To19AreTheReservationsByText) {
    EXPECT_EQ(GivenNumber([&](ULONG* granted) { return Call(16, In(u"me"), ULONG{2}, granted); }), "S_OK 2");
    EXPECT_EQ(GivenNumber([&](ULONG* mode) { return Call(15, In(u"me"), mode); }), "S_OK 2");
    EXPECT_EQ(Call(18, In(u"you"), ULONG{1}, In(u"T")), S_OK);
    EXPECT_EQ(b->GetOwnReservationFlags(nullptr, false), 1U);
    EXPECT_EQ(Call(19, In(u"you"), In(u"T")), S_OK);
    EXPECT_EQ(b->GetOwnReservationFlags(nullptr, false), 0U);
    EXPECT_EQ(Call(17, In(u"me")), S_OK);
    EXPECT_EQ(Call(17, In(u"me")), S_FALSE);
}

TEST_F(NodeTable, Slots20And21Edit) {
    EXPECT_EQ(Call(20, In(u"<New>1</New>")), S_OK);
    EXPECT_EQ(Call(20, In(u"<New>")), E_FAIL);
    EXPECT_NE(a->FindRaw(u"New"), nullptr);
    EXPECT_EQ(Call(21, In(u"New")), S_OK);
    EXPECT_EQ(a->FindRaw(u"New"), nullptr);
}

TEST_F(NodeTable, Slots22To27AreTheNeighbours) {
    AddChild(*a, u"C", u"U");
    AddChild(*b, u"D", u"U");
    EXPECT_EQ(Call(22), S_OK);
    EXPECT_EQ(GivenNode([&](Node** node) { return Call(23, node); }), "S_OK /");
    EXPECT_EQ(Call(24), S_OK);
    EXPECT_EQ(GivenNodes([&](ULONG* count, Node*** nodes) { return Call(25, count, nodes); }), "S_OK [/A/B, /A/C]");
    EXPECT_EQ(GivenNodes([&](ULONG* count, Node*** nodes) { return Call(26, In(u"U"), count, nodes); }), "S_OK [/A/C]");
    EXPECT_EQ(GivenNodes([&](ULONG* count, Node*** nodes) { return Call(27, In(u"U"), count, nodes); }),
              "S_OK [/A/B/D, /A/C]");
    view = Root();
    EXPECT_EQ(Call(22), S_FALSE);
    view = View(*a->FindRaw(u"C")->Child());
    EXPECT_EQ(Call(24), S_FALSE);
}

TEST_F(NodeTable, Slots28To30AreTheNames) {
    AddChild(*a, u"C", u"U");
    AddChild(*b, u"D", u"U");
    const auto none = static_cast<BSTR**>(nullptr);
    EXPECT_EQ(GivenTexts([&](ULONG* count, BSTR** names) { return Call(28, In(u"/x"), BOOL{1}, count, names, none); }),
              "S_OK [/x/B, /x/C]");
    EXPECT_EQ(GivenTexts([&](ULONG* count, BSTR** names) {
                  return Call(29, In(u"/x"), In(u"U"), BOOL{1}, count, names, none);
              }),
              "S_OK [/x/C]");
    EXPECT_EQ(GivenTexts([&](ULONG* count, BSTR** names) {
                  return Call(30, LPCWSTR{nullptr}, In(u"U"), BOOL{1}, count, names, none);
              }),
              "S_OK [/A/B/D, /A/C]");
}

TEST_F(NodeTable, Slot31FindsANode) {
    EXPECT_EQ(GivenNode([&](Node** node) {
                  ULONG consumed = 0;
                  BOOL crossed = 1;
                  const HRESULT result = Call(31, In(u"B/x"), &consumed, &crossed, node);
                  EXPECT_EQ(consumed, 2U);
                  EXPECT_EQ(crossed, 0);
                  return result;
              }),
              "S_FALSE /A/B");
}

class CountingHostObserver final : public StackObject<IzkhwResourceTreeNodeObserver> {
  public:
    HRESULT STDMETHODCALLTYPE NodeChanged(IzkhwResourceTreeNode*, ULONG changes, ULONG id) override {
        lastChanges = changes;
        lastId = id;
        return S_OK;
    }

    ULONG lastChanges = 0;
    ULONG lastId = 0;
};

TEST_F(NodeTable, Slots32To36AreTheNotices) {
    CountingHostObserver observer;
    EXPECT_EQ(Call(32, &observer, ULONG{PropertyAdded}, ULONG{70}), S_OK);
    EXPECT_EQ(observer.references, 1U);
    ULONG pending = untouchedNumber;
    EXPECT_EQ(Call(34, &pending), S_OK);
    EXPECT_EQ(pending, 0U);
    AddText(*a, u"New", u"");
    EXPECT_EQ(Call(36), S_OK);
    EXPECT_EQ(observer.lastChanges, 0U);
    EXPECT_EQ(Call(35, ULONG{0}, BOOL{0}), S_OK);
    EXPECT_EQ(observer.lastChanges, ULONG{PropertyAdded});
    EXPECT_EQ(observer.lastId, 70U);
    EXPECT_EQ(Call(36), S_FALSE);
    EXPECT_EQ(Call(33, &observer, ULONG{70}, BOOL{0}), S_OK);
    EXPECT_EQ(observer.references, 0U);
}

TEST_F(NodeTable, Slots37To40AreXmlReservationAndComparison) {
    EXPECT_EQ(Text(37), "S_OK \n<T name=\"A\">\n   <T name=\"B\">\n   </T>\n</T>");
    a->Reserve(u"me", 2);
    EXPECT_EQ(GivenNumber([&](ULONG* mode) { return Call(38, In(u"me"), BOOL{1}, mode); }), "S_FALSE 0");
    EXPECT_EQ(GivenNumber([&](ULONG* mode) { return Call(38, In(u"me"), BOOL{0}, mode); }), "S_OK 2");
    a->Release(u"me");
    const auto none = static_cast<LPCWSTR*>(nullptr);
    EXPECT_EQ(GivenText([&](BSTR* xml) { return Call(39, ULONG{0}, none, ULONG{0}, none, xml); }),
              "S_OK \n<T name=\"A\">\n</T>");
    BOOL result = -1;
    const NodeView other = View(*a);
    EXPECT_EQ(Call(40, other.Get(), &result), S_OK);
    EXPECT_EQ(result, 1);
}

TEST_F(NodeTable, Slots41To44CloneNameFilterAndResolve) {
    EXPECT_EQ(GivenNode([&](Node** clone) { return Call(41, In(u"Copy"), clone); }), "S_OK /");
    AddText(*b, u"Hide", u"");
    const auto noTexts = static_cast<BSTR**>(nullptr);
    EXPECT_EQ(GivenTexts([&](ULONG* count, BSTR** names) {
                  return Call(42, LPCWSTR{nullptr}, In(u""), BOOL{0}, In(u"Hide"), count, names, noTexts);
              }),
              "S_OK []");
    LPCWSTR hide = In(u"Hide");
    const auto none = static_cast<LPCWSTR*>(nullptr);
    EXPECT_EQ(GivenText([&](BSTR* xml) { return Call(43, BOOL{0}, ULONG{0}, none, ULONG{1}, &hide, xml); }),
              "S_OK \n<T name=\"A\">\n   <T name=\"B\">\n   </T>\n</T>");
    FakeLocator locator;
    ULONG foundCount = untouchedNumber;
    IUnknown** found = nullptr;
    EXPECT_EQ(GivenTexts([&](ULONG* count, BSTR** missing) {
                  return Call(44, &locator, &foundCount, &found, count, missing, BOOL{0});
              }),
              "S_OK []");
    EXPECT_EQ(foundCount, 0U);
}

TEST_F(NodeTable, Slots45To49AreTheReservationsByItem) {
    FakeProjectItem item(IID_IzkItemMarker);
    EXPECT_EQ(GivenNumber([&](ULONG* granted) { return Call(45, &item, ULONG{4}, granted); }), "S_OK 4");
    EXPECT_EQ(GivenNumber([&](ULONG* mode) { return Call(46, &item, mode); }), "S_OK 4");
    EXPECT_EQ(Call(47, &item), S_OK);
    EXPECT_EQ(Call(48, &item, ULONG{1}, In(u"")), S_OK);
    EXPECT_EQ(b->GetOwnReservationFlags(nullptr, false), 1U);
    EXPECT_EQ(Call(49, &item, In(u"")), S_OK);
    EXPECT_EQ(b->GetOwnReservationFlags(nullptr, false), 0U);
}

TEST_F(NodeTable, Slots50And51CompareWithoutAndAskForLocalisedTexts) {
    AddText(*a, u"L", u"x", LocalizedTextEntry);
    BOOL result = -1;
    const NodeView other = View(*b);
    EXPECT_EQ(Call(50, other.Get(), &result, BOOL{1}), S_OK);
    EXPECT_EQ(result, 0);
    EXPECT_EQ(Call(51, In(u"L")), S_OK);
    EXPECT_EQ(Call(51, In(u"M")), S_FALSE);
}

// The platform's destructor has two slots; the second one frees.
TEST_F(NodeTable, Slots52And53AreTheDestructorAndSlot54IsOnCreate) {
    const auto none = static_cast<void*>(nullptr);
    EXPECT_EQ(Call(54, none, none), S_OK);
    auto* const made = ResTreeNodeAdapter::Make(root.get(), &observers);
    void* const destroy = (*reinterpret_cast<void***>(made))[53];
    reinterpret_cast<void (*)(void*)>(destroy)(made);
}

}  // namespace
}  // namespace zkhw
