#include <gtest/gtest.h>

#include "interfaces/support/NodeViewTest.h"
#include "interfaces/support/ProjectItems.h"
#include "restree/ChangeFlags.h"
#include "support/TreeDump.h"
#include "zkfpga/tree_owner.h"

namespace zkhw {
namespace {

class HostObserver final : public StackObject<IzkhwResourceTreeNodeObserver> {
  public:
    HRESULT STDMETHODCALLTYPE NodeChanged(IzkhwResourceTreeNode*, ULONG changes, ULONG) override {
        heard |= changes;
        ++calls;
        return S_OK;
    }
    ULONG STDMETHODCALLTYPE Release() override {
        if (touchedAtRelease != nullptr) {
            touchedAtRelease->AddRef();
            touchedAtRelease->Release();
        }
        return StackObject::Release();
    }

    IUnknown* touchedAtRelease = nullptr;  // Isn't owned.
    ULONG heard = 0;
    int calls = 0;
};

class CloneDetached : public NodeViewTest {
  protected:
    using Copy = InterfacePointer<IzkhwResourceTreeNode>;

    CloneDetached() {
        AddText(*n, u"P", u"1");
        AddText(*n, u"L", u"x", LocalizedTextEntry);
        AddText(*AddChild(*n, u"C", u"Module"), u"Q", u"2");
    }

    Copy Clone(const char16_t* name = nullptr) {
        Copy copy;
        EXPECT_EQ(View(*n)->CloneDetached(In(name), copy.Receive()), S_OK);
        return copy;
    }
    static ResTreeNode& NodeOf(const Copy& copy) { return *static_cast<ResTreeNodeAdapter*>(copy.Get())->GetNode(); }

    ResTreeNode* n = AddChild(*root, u"N", u"T", true);
};

TEST_F(CloneDetached, CopiesTheNodeAndAllBelowAsARoot) {
    const Copy copy = Clone();
    EXPECT_EQ(DumpTree(NodeOf(copy)),
              "N:T ordered\n"
              "  P=1\n"
              "  L~x\n"
              "  C:Module\n"
              "    Q=2\n");
    EXPECT_EQ(copy->HasParent(), S_FALSE);
}

TEST_F(CloneDetached, KeepsTheNameUnlessOneIsGiven) {
    EXPECT_EQ(Clone(u"")->SetName(In(u"x")), S_OK);
    EXPECT_EQ(NodeOf(Clone(u"")).GetName(), u"N");
    EXPECT_EQ(NodeOf(Clone(nullptr)).GetName(), u"N");
    EXPECT_EQ(NodeOf(Clone(u"New")).GetName(), u"New");
    EXPECT_EQ(n->GetName(), u"N");
}

TEST_F(CloneDetached, TheCopyAndTheOriginalGoTheirOwnWays) {
    const Copy copy = Clone();
    copy->SetProperty(In(u"P"), In(u"changed"));
    copy->RemoveEntry(In(u"C"));
    EXPECT_EQ(*n->GetProperty(u"P"), u"1");
    EXPECT_NE(n->FindRaw(u"C"), nullptr);
}

TEST_F(CloneDetached, TheCopyHasOneReferenceAndAnObserverSetOfItsOwn) {
    Copy copy = Clone();
    EXPECT_NE(static_cast<ResTreeNodeAdapter*>(copy.Get())->GetObservers(), &observers);
    EXPECT_EQ(copy->AddRef(), 2U);
    EXPECT_EQ(copy->Release(), 1U);
}

TEST_F(CloneDetached, TheCopyAnswersToAllVersions) {
    const Copy copy = Clone();
    void* same = nullptr;
    ASSERT_EQ(copy->QueryInterface(IID_IzkhwResourceTreeNode5, &same), S_OK);
    EXPECT_EQ(same, copy.Get());
    copy->Release();
}

TEST_F(CloneDetached, TheCopyLivesAsLongAsAnyReferenceToItsView) {
    Copy copy = Clone();
    Copy second = Copy::Share(copy.Get());
    copy.Reset();
    EXPECT_EQ(GivenText([&](BSTR* value) { return second->GetProperty(In(u"P"), value); }), "S_OK 1");
}

TEST_F(CloneDetached, OtherViewsOfTheCopyDoNotKeepIt) {
    Copy copy = Clone();
    Copy child;
    ASSERT_EQ(copy->FindNode(In(u"C"), nullptr, nullptr, child.Receive()), S_OK);
    Copy parent;
    ASSERT_EQ(child->GetParent(parent.Receive()), S_OK);
    EXPECT_NE(parent.Get(), copy.Get());
    parent.Reset();
    EXPECT_EQ(GivenText([&](BSTR* value) { return copy->GetProperty(In(u"P"), value); }), "S_OK 1");
    copy.Reset();
    EXPECT_EQ(child->AddRef(), 2U);
    EXPECT_EQ(child->Release(), 1U);
}

TEST_F(CloneDetached, LinksOfACopiedRootLeadToTheCopies) {
    AddLink(*root, u"L", u"N/C");
    AddLink(*n, u"Up", u"..");
    Copy copy;
    ASSERT_EQ(Root()->CloneDetached(nullptr, copy.Receive()), S_OK);
    EXPECT_EQ(
        GivenNode([&](IzkhwResourceTreeNode** node) { return copy->FindNode(In(u"N/Up/L"), nullptr, nullptr, node); }),
        "S_OK /N/C");
}

// They are paths from the place of the original, which the copy hasn't got.
TEST_F(CloneDetached, LinksOfACopyFromBelowLeadNowhere) {
    AddLink(*n, u"ToC", u"C");
    const Copy copy = Clone();
    EXPECT_EQ(DumpTree(NodeOf(copy)),
              "N:T ordered\n"
              "  P=1\n"
              "  L~x\n"
              "  C:Module\n"
              "    Q=2\n"
              "  ToC->../N/C\n");
    EXPECT_EQ(
        GivenNode([&](IzkhwResourceTreeNode** node) { return copy->FindNode(In(u"ToC"), nullptr, nullptr, node); }),
        "S_FALSE null");
}

TEST_F(CloneDetached, ACloneOfACloneIsItsOwn) {
    Copy copy = Clone();
    Copy second;
    ASSERT_EQ(static_cast<ResTreeNodeAdapter*>(copy.Get())->CloneDetached(In(u"Second"), second.Receive()), S_OK);
    copy.Reset();
    EXPECT_EQ(NodeOf(second).GetName(), u"Second");
}

TEST_F(CloneDetached, ObserversOfTheOriginalHearNothingOfTheCopy) {
    HostObserver observer;
    const NodeView view = View(*n);
    view->Advise(&observer, 0xFFFFFFFF, 7);
    const Copy copy = Clone(u"New");
    copy->SetProperty(In(u"P"), In(u"2"));
    EXPECT_EQ(observer.calls, 0);
    view->Unadvise(&observer, 7, 0);
}

TEST_F(CloneDetached, RegistrationsAtOtherViewsEndWithTheCopy) {
    HostObserver observer;
    Copy copy = Clone();
    Copy child;
    ASSERT_EQ(copy->FindNode(In(u"C"), nullptr, nullptr, child.Receive()), S_OK);
    child->Advise(&observer, 0xFFFFFFFF, 7);
    child->Advise(&observer, 0xFFFFFFFF, 8);
    child->Advise(&observer, 0xFFFFFFFF, 0xFFFFFFFF);
    child->SetProperty(In(u"Q"), In(u"3"));
    EXPECT_EQ(observer.heard, ULONG{PropertyChanged});
    EXPECT_EQ(observer.references, 3U);
    EXPECT_EQ(child->AddRef(), 5U);
    EXPECT_EQ(child->Release(), 4U);
    copy.Reset();
    EXPECT_EQ(observer.references, 0U);
    EXPECT_EQ(observer.calls, 3);
    EXPECT_EQ(child->AddRef(), 2U);
    EXPECT_EQ(child->Release(), 1U);
}

TEST_F(CloneDetached, ARegistrationAtTheOwningViewKeepsTheCopy) {
    HostObserver observer;
    Copy copy = Clone();
    copy->Advise(&observer, PropertyChanged, 7);
    IzkhwResourceTreeNode* const bare = copy.Get();
    copy.Reset();
    bare->SetProperty(In(u"P"), In(u"2"));
    EXPECT_EQ(observer.calls, 1);
    EXPECT_EQ(bare->Unadvise(&observer, 7, 0), S_OK);
    EXPECT_EQ(observer.references, 0U);
}

// An observer that is let go while the owning view dies may touch that view's count without ending it again.
TEST_F(CloneDetached, TheOwningViewCanBeCountedWhileItEnds) {
    HostObserver observer;
    Copy copy = Clone();
    Copy child;
    ASSERT_EQ(copy->FindNode(In(u"C"), nullptr, nullptr, child.Receive()), S_OK);
    child->Advise(&observer, 0xFFFFFFFF, 7);
    observer.touchedAtRelease = copy.Get();
    copy.Reset();
    EXPECT_EQ(observer.references, 0U);
}

}  // namespace
}  // namespace zkhw
