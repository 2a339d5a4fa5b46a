// Views of a node whose contents stand in a file that is read on demand.

#include <gtest/gtest.h>

#include "interfaces/support/HostObserver.h"
#include "interfaces/support/NodeViewTest.h"
#include "interfaces/support/ProjectItems.h"
#include "support/FaultyFileSystem.h"
#include "support/TemporaryFolder.h"

namespace zkhw {
namespace {

using qn::dsc::osdep::FileCall;

// "Stub", unordered, with "Own" = "stub" and the rest in a file: properties "Far" = "file" and "Shown" (localised), and
// the child "Child:Part" with "Deep" = "1". Next to it the free node "Other".
class NodeStub : public NodeViewTest {
  protected:
    NodeStub() : scope(files) {
        files.SetExecutablePath(folder.System(u"host.exe"));
        folder.WriteFile("stub.xml",
                         "<T name=\"Stub\"><Far>file</Far><Shown localize=\"true\">eng=text</Shown>"
                         "<Part name=\"Child\"><Deep>1</Deep></Part><DisplayName>Nice</DisplayName>"
                         "<Protocols>P</Protocols><Reserves>../Other</Reserves></T>");
        AddText(*stub, u"Own", u"stub");
        AddText(*stub, u":DeferredLoadPath", u"stub.xml");
        view = View(*stub);
    }

    bool IsLoaded() const { return stub->FindRaw(u":DeferredLoadPath") == nullptr; }

    qn::dsc::osdep::TemporaryFolder folder;
    qn::dsc::osdep::FaultyFileSystem files;
    qn::dsc::osdep::FileSystemScope scope;
    ResTreeNode* stub = AddChild(*root, u"Stub");
    ResTreeNode* other = AddChild(*root, u"Other");
    NodeView view;
};

TEST_F(NodeStub, IsNotReadForWhatIsThere) {
    EXPECT_EQ(GivenText([&](BSTR* value) { return view->GetProperty(In(u"Own"), value); }), "S_OK stub");
    EXPECT_EQ(GivenText([&](BSTR* text) { return view->GetName(text); }), "S_OK Stub");
    EXPECT_EQ(GivenText([&](BSTR* text) { return view->GetPath(text); }), "S_OK /Stub");
    EXPECT_EQ(GivenText([&](BSTR* text) { return view->GetType(text); }), "S_OK T");
    EXPECT_EQ(view->IsLocalizedProperty(In(u"Own")), S_FALSE);
    EXPECT_EQ(view->IsOfType(In(u"T")), S_OK);
    EXPECT_EQ(view->IsOfType(In(u"")), S_OK);
    EXPECT_EQ(view->SetProperty(In(u"Own"), In(u"new")), S_OK);
    EXPECT_EQ(view->RemoveEntry(In(u"Own")), S_OK);
    EXPECT_EQ(view->HasParent(), S_OK);
    EXPECT_EQ(view->HasPendingChanges(), S_FALSE);
    EXPECT_EQ(view->Unreserve(In(u"me")), S_FALSE);
    EXPECT_FALSE(IsLoaded());
    EXPECT_EQ(files.Count(FileCall::OpenText), 0U);
}

TEST_F(NodeStub, IsNotReadWhenARegistrationEnds) {
    HostObserver observer;
    ASSERT_EQ(view->Advise(&observer, PropertyChanged, 7), S_OK);
    EXPECT_EQ(view->Unadvise(&observer, 7, 0), S_OK);
    EXPECT_FALSE(IsLoaded());
    EXPECT_EQ(observer.Take(), "");
}

TEST_F(NodeStub, IsReadOnce) {
    for (int i = 0; i < 3; ++i) {
        EXPECT_EQ(GivenText([&](BSTR* value) { return view->GetProperty(In(u"Missing"), value); }),
                  "S_FALSE untouched");
    }
    EXPECT_EQ(files.Count(FileCall::OpenText), 1U);
}

TEST_F(NodeStub, IsReadByGetPropertyOnAMiss) {
    EXPECT_EQ(GivenText([&](BSTR* value) { return view->GetProperty(In(u"Far"), value); }), "S_OK file");
}

TEST_F(NodeStub, IsReadByGetPropertyAt) {
    // Keys in order: DisplayName, Far, Own, Protocols, Reserves, Shown.
    EXPECT_EQ(GivenText([&](BSTR* value) { return view->GetPropertyAt(1, value); }), "S_OK file");
}

TEST_F(NodeStub, IsReadBySetPropertyAt) {
    EXPECT_EQ(view->SetPropertyAt(1, In(u"new")), S_OK);
    EXPECT_EQ(*stub->GetProperty(u"Far"), u"new");
}

TEST_F(NodeStub, IsReadBySetPropertyOnAMissSoThatTheFilesEntryIsAssigned) {
    EXPECT_EQ(view->SetProperty(In(u"Far"), In(u"new")), S_OK);
    EXPECT_TRUE(IsLoaded());
    EXPECT_EQ(*stub->GetProperty(u"Far"), u"new");
}

TEST_F(NodeStub, IsReadByGetPropertyNames) {
    EXPECT_EQ(GivenTexts([&](ULONG* count, BSTR** names) { return view->GetPropertyNames(count, names); }),
              "S_OK [DisplayName, Far, Own, Protocols, Reserves, Shown]");
}

TEST_F(NodeStub, IsReadByIsLocalizedPropertyOnAMiss) {
    EXPECT_EQ(view->IsLocalizedProperty(In(u"Shown")), S_OK);
}

TEST_F(NodeStub, IsReadByGetDisplayPath) {
    EXPECT_EQ(GivenText([&](BSTR* path) { return view->GetDisplayPath(path); }), "S_OK /Nice");
}

TEST_F(NodeStub, IsReadForItsProtocols) {
    EXPECT_EQ(GivenTexts([&](ULONG* count, BSTR** types) { return view->GetTypes(count, types); }), "S_OK [T, P]");
}

TEST_F(NodeStub, IsReadByIsOfTypeForAnotherType) {
    EXPECT_EQ(view->IsOfType(In(u"P")), S_OK);
}

TEST_F(NodeStub, IsReadForTheNodesThatItReserves) {
    EXPECT_EQ(view->Reserve(In(u"me"), 1, nullptr), S_OK);
    EXPECT_TRUE(IsLoaded());
    EXPECT_EQ(other->GetOwnReservationFlags(nullptr, false), 1U);
}

TEST_F(NodeStub, IsReadByGetReservation) {
    other->ReserveOne(u"me", 2);
    EXPECT_EQ(GivenNumber([&](ULONG* mode) { return view->GetReservation(In(u"me"), mode); }), "S_OK 2");
}

TEST_F(NodeStub, IsReadByResolveReservations) {
    FakeProjectItem item({});
    FakeLocator locator;
    locator.answers[u"{AAAAAAAA-0000-0000-0000-000000000001}"] = {&item, S_OK};
    other->ReserveOne(u"{AAAAAAAA-0000-0000-0000-000000000001}", 2);
    ULONG foundCount = 0;
    IUnknown** found = nullptr;
    ULONG missingCount = 0;
    BSTR* missing = nullptr;
    EXPECT_EQ(view->ResolveReservations(&locator, &foundCount, &found, &missingCount, &missing, 0), S_OK);
    ASSERT_EQ(foundCount, 1U);
    EXPECT_EQ(found[0]->Release(), 0U);
    CoTaskMemFree(found);
}

TEST_F(NodeStub, IsReadByReserveDescendants) {
    EXPECT_EQ(view->ReserveDescendants(In(u"me"), 2, In(u"Part")), S_OK);
    EXPECT_EQ(view->UnreserveDescendants(In(u"me"), In(u"Part")), S_OK);
}

TEST_F(NodeStub, IsReadByUnreserveDescendants) {
    EXPECT_EQ(view->UnreserveDescendants(In(u"me"), In(u"Part")), S_FALSE);
    EXPECT_TRUE(IsLoaded());
}

TEST_F(NodeStub, IsReadByHasChildren) {
    EXPECT_EQ(view->HasChildren(), S_OK);
}

TEST_F(NodeStub, IsReadByTheListsOfNodes) {
    const auto children = [&](ULONG* count, IzkhwResourceTreeNode*** nodes) { return view->GetChildren(count, nodes); };
    EXPECT_EQ(GivenNodes(children), "S_OK [/Stub/Child]");
}

TEST_F(NodeStub, BelowTheNodeIsReadByGetDescendantsOfType) {
    const NodeView top = Root();
    EXPECT_EQ(GivenNodes([&](ULONG* count, IzkhwResourceTreeNode*** nodes) {
                  return top->GetDescendantsOfType(In(u"Part"), count, nodes);
              }),
              "S_OK [/Stub/Child]");
}

TEST_F(NodeStub, IsReadByTheNamesOfChildren) {
    EXPECT_EQ(
        GivenTexts([&](ULONG* count, BSTR** names) { return view->GetChildNames(nullptr, 1, count, names, nullptr); }),
        "S_OK [/Stub/Child]");
}

TEST_F(NodeStub, BelowTheNodeIsReadByTheNamesOfDescendants) {
    const NodeView top = Root();
    EXPECT_EQ(GivenTexts([&](ULONG* count, BSTR** names) {
                  return top->GetDescendantNames(nullptr, nullptr, 1, count, names, nullptr);
              }),
              "S_OK [/Stub, /Stub/Child, /Other]");
}

TEST_F(NodeStub, IsReadByFindNodeOnAMiss) {
    EXPECT_EQ(GivenNode([&](IzkhwResourceTreeNode** node) {
                  return Root()->FindNode(In(u"Stub/Child"), nullptr, nullptr, node);
              }),
              "S_OK /Stub/Child");
}

TEST_F(NodeStub, IsReadBehindALink) {
    AddLink(*other, u"L", u"../Stub/Child");
    const NodeView otherView = View(*other);
    EXPECT_EQ(otherView->HasChildren(), S_OK);
    EXPECT_TRUE(IsLoaded());
}

TEST_F(NodeStub, IsReadByRemoveEntryOnAMiss) {
    EXPECT_EQ(view->RemoveEntry(In(u"Far")), S_OK);
    EXPECT_TRUE(IsLoaded());
    EXPECT_EQ(stub->FindRaw(u"Far"), nullptr);
}

TEST_F(NodeStub, IsReadByGetXml) {
    const std::string xml = GivenText([&](BSTR* text) { return view->GetXml(text); });
    EXPECT_NE(xml.find("<Deep>1</Deep>"), std::string::npos) << xml;
    EXPECT_EQ(xml.find("DeferredLoadPath"), std::string::npos) << xml;
}

TEST_F(NodeStub, IsReadIntoTheCopyByGetFilteredXml) {
    LPCWSTR properties[] = {In(u"Far")};
    EXPECT_EQ(GivenText([&](BSTR* xml) { return view->GetFilteredXml(0, nullptr, 1, properties, xml); }),
              "S_OK \n<T name=\"Stub\">\n   <Far>file</Far>\n</T>");
    EXPECT_FALSE(IsLoaded());
}

TEST_F(NodeStub, IsComparedInFull) {
    ResTreeNode* const asking = AddChild(*root, u"Asking");
    AddText(*asking, u"Far", u"file");
    BOOL result = -1;
    EXPECT_EQ(View(*asking)->IsCompatibleWith(view.Get(), &result), S_OK);
    EXPECT_EQ(result, 1);
    EXPECT_EQ(view->IsCompatibleWith(View(*asking).Get(), &result), S_OK);
    EXPECT_EQ(result, 0);
}

TEST_F(NodeStub, IsCopiedAsAStubByCloneDetached) {
    InterfacePointer<IzkhwResourceTreeNode> copy;
    ASSERT_EQ(view->CloneDetached(nullptr, copy.Receive()), S_OK);
    EXPECT_FALSE(IsLoaded());
    EXPECT_EQ(GivenText([&](BSTR* value) { return copy->GetProperty(In(u"Far"), value); }), "S_OK file");
    EXPECT_FALSE(IsLoaded());
}

TEST_F(NodeStub, WhoseFileIsMissingAnswersWithWhatItHas) {
    folder.Remove("stub.xml");
    EXPECT_EQ(view->HasChildren(), S_FALSE);
    EXPECT_TRUE(IsLoaded());
    EXPECT_EQ(GivenText([&](BSTR* value) { return view->GetProperty(In(u"Own"), value); }), "S_OK stub");
    EXPECT_EQ(GivenText([&](BSTR* value) { return view->GetProperty(In(u"Far"), value); }), "S_FALSE untouched");
}

}  // namespace
}  // namespace zkhw
