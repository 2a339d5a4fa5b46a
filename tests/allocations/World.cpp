#include "allocations/World.h"

#include <gtest/gtest.h>

#include "support/ExactText.h"
#include "support/TreeDump.h"
#include "support/TreeMaking.h"
#include "zkfpga/tree_constants.h"

namespace allocations {

using zkhw::AddChild;
using zkhw::AddLink;
using zkhw::AddText;
using zkhw::ResTreeNode;

namespace {

constexpr ULONG itemA = 0xAAAAAAAA;
constexpr ULONG itemB = 0xBBBBBBBB;
constexpr ULONG itemC = 0xCCCCCCCC;

// "{AAAAAAAA-0000-0000-0000-000000000001}".
GUID IdOfItemA() {
    return {itemA, 0, 0, {0, 0, 0, 0, 0, 0, 0, 1}};
}

template <typename Interface>
void Give(Interface* object, IUnknown** result) {
    object->AddRef();
    *result = object;
}

std::string Reservations(const ResTreeNode& node) {
    std::string text;
    for (const zkhw::Reservation& each : node.GetReservations()) {
        text += " " + qn::dsc::ExactText(each.owner) + "=" + std::to_string(each.mode);
    }
    return text;
}

}  // namespace

// --- The host ---

HRESULT Item::GetItemInfo(ProjectItemRecord* record) {
    record->id = IdOfItemA();
    return S_OK;
}

HRESULT Item::GetName(BSTR* result) {
    *result = name.Give();
    return S_OK;
}

HRESULT Item::GetProject(IUnknown** project) {
    *project = nullptr;
    return E_FAIL;
}

HRESULT Item::SelectItems(IzkProjectItemSelector* selector, IUnknown** result) {
    BOOL flag = 0;
    *result = nullptr;
    return selector->SelectItem(this, &flag);
}

HRESULT Link::GetResourcePath(BSTR* result) {
    *result = path.Give();
    return S_OK;
}

HRESULT FoundItem::QueryInterface(REFIID id, void** result) {
    *result = nullptr;
    if (id == IID_IzkItemMarker) {
        marker.AddRef();
        *result = &marker;
    } else if (id == IID_IzkItemResourceLink) {
        link.AddRef();
        *result = &link;
    }
    return *result != nullptr ? S_OK : E_NOINTERFACE;
}

HRESULT Locator::FindItemById(GUID id, IUnknown** item) {
    *item = nullptr;
    if (id.Data1 == itemA || id.Data1 == itemB || id.Data1 == itemC) {
        Give(&found, item);
    }
    return id.Data1 == itemC ? E_FAIL : S_OK;
}

HRESULT Locator::FindItem(ProjectItemRecord*, IUnknown** item) {
    Give(&found, item);
    return S_OK;
}

HRESULT Context::QueryInterface(REFIID id, void** result) {
    *result = nullptr;
    if (id != IID_IUnknown && id != IID_IzkhwResourceTreeNode) {
        return E_NOINTERFACE;
    }
    AddRef();
    *result = this;
    return S_OK;
}

ContentsFile::ContentsFile() {
    folder.WriteFile("contents.xml",
                     "<Stage name=\"N\" ordered=\"true\">"
                     "<DisplayName>A shown name that fits into nothing small</DisplayName><Protocols>P,Q</Protocols>"
                     "<SupportedValues>a,b</SupportedValues><Reserves>../Partner</Reserves>"
                     "<Loc localize=\"true\">eng=x</Loc><T name=\"with/slash\"><P>1</P></T>"
                     "<:Link name=\"Partner\">../Partner</:Link></Stage>");
}

// --- The tree ---

void Fill(ResTreeNode& n) {
    AddText(n, u"DisplayName", u"A shown name that fits into nothing small");
    AddText(n, u"Protocols", u"P,Q");
    AddText(n, u"SupportedValues", u"a,b");
    AddText(n, u"Reserves", u"../Partner");
    n.AddTextEntry(u"Loc", std::u16string_view(u"x\0eng=x", 7), zkhw::LocalizedTextEntry);
    AddText(*AddChild(n, u"with/slash"), u"P", u"1");
    AddLink(n, u"Partner", u"../Partner");
}

World::World(const ContentsFile* file)
    : n(*AddChild(tree.Root(), u"N", u"Stage", true)), partner(*AddChild(tree.Root(), u"Partner", u"Part")) {
    for (const char16_t* id : {u"{AAAAAAAA-0000-0000-0000-000000000001}", u"{BBBBBBBB-0000-0000-0000-000000000002}",
                               u"{CCCCCCCC-0000-0000-0000-000000000003}"}) {
        partner.ReserveOne(id, ZkhwReserveRead);
    }
    ULONG everything = 0xFFFFFFFF;
    if (file == nullptr) {
        Fill(n);
    } else {
        n.AddTextEntry(u":DeferredLoadPath", file->Path().View(), zkhw::TextEntry);
        // That would look for "Reserves".
        everything &= ~ULONG{ZkhwReservationChanged};
    }
    context.locator = &locator;
    // First: context and item are those of the first query.
    queries = tree.Tree(&context, &item);
    view = tree.At(u"/N");
    rootView = tree.RootView();
    partnerView = tree.At(u"/Partner");
    view->Advise(&observer, everything, 1);
    tree.Owner().QueryTreeInterface(IID_IzkhwResourceTreeOwner, &context, nullptr, owner.ReceiveAny());
}

World::~World() {
    owner.Reset();
    queries.Reset();
    copy.Reset();
    view.Reset();
    rootView.Reset();
    partnerView.Reset();
    tree.End();
    for (const ULONG left : {item.references, locator.references, context.references, observer.references,
                             second.references, locator.found.references}) {
        EXPECT_EQ(left, 0U) << "references are left";
    }
}

void World::GetReady() {
    item.name.GetReady();
    locator.found.link.path.GetReady();
    if (wantsCopy && !copy) {
        view->CloneDetached(nullptr, copy.Receive());
        // Through views of their own: a registration with the copy itself would keep it alive.
        for (const char16_t* const path : {u"/", u"with\\/slash"}) {
            zkhw::InterfacePointer<IzkhwResourceTreeNode> observed;
            copy->FindNode(zkhw::Text(path), nullptr, nullptr, observed.Receive());
            observed->Advise(&second, 0xFFFFFFFF, 2);
            observed->Advise(&second, 0xFFFFFFFF, 3);
        }
    }
}

std::string World::State() {
    std::string state = zkhw::DumpTree(n) + "held" + Reservations(n) + (n.HasNoPendingChanges() ? "\n" : " changes\n");
    for (const auto& [path, name] : aliases) {
        state += qn::dsc::ExactText(path) + "=" + qn::dsc::ExactText(name) + "\n";
    }
    return state + Rest();
}

std::string World::Rest() {
    ResTreeNode& root = tree.Root();
    std::string rest = qn::dsc::ExactText(root.GetName()) + " of " + std::to_string(root.Entries().Size()) + "\n" +
                       zkhw::DumpTree(partner) + "held" + Reservations(partner) +
                       (partner.HasNoPendingChanges() ? "\n" : " changes\n");
    for (const ULONG references :
         {zkhw::ReferencesOf(view.Get()), zkhw::ReferencesOf(queries.Get()), item.references, locator.references,
          locator.found.references, locator.found.marker.references, locator.found.link.references, context.references,
          observer.references, second.references}) {
        rest += std::to_string(references) + " ";
    }
    return rest + "\n";
}

}  // namespace allocations
