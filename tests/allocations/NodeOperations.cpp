// The operations of a node, and what the headers say of each where memory is short.

#include "allocations/WorldOperation.h"
#include "interfaces/support/ForeignNode.h"
#include "support/TreeMaking.h"

namespace allocations {

namespace {

using zkhw::In;

#define SHOWN "A shown name that fits into nothing small"
// As names and as paths, with what they are shown as.
#define NAMES_BELOW "[with/slash, Partner] [/" SHOWN "/with\\/slash, /" SHOWN "/Partner]"
#define PATHS_BELOW "[/N/with\\/slash, /N/Partner] [/" SHOWN "/with\\/slash, /" SHOWN "/Partner]"

const char* const noNames = "E_OUTOFMEMORY [] []";

const std::vector<WorldOperation> whatTheNodeIs = {
    {"IzkhwResourceTreeNode::GetName", [](World& w, Given& g) { return w.view->GetName(&g.text); }, "S_OK N", {noText}},
    {"IzkhwResourceTreeNode::GetPath",
     [](World& w, Given& g) { return w.view->GetPath(&g.text); },
     "S_OK /N",
     {noText, thrown}},
    {"IzkhwResourceTreeNode::GetDisplayPath",
     [](World& w, Given& g) { return w.view->GetDisplayPath(&g.text); },
     "S_OK /" SHOWN,
     {noText, thrown}},
    {"IzkhwResourceTreeNode::SetName",
     [](World& w, Given&) { return w.view->SetName(In(u"Another name, and a long one at that")); },
     "S_OK",
     {thrown},
     Effect::Whole},
    // Its observer has asked for the names above as well.
    {"IzkhwResourceTreeNode::SetName, of the node above",
     [](World& w, Given&) { return w.rootView->SetName(In(u"Another name, and a long one at that")); },
     "S_OK",
     {thrown},
     Effect::Whole},
    {"IzkhwResourceTreeNode::GetType",
     [](World& w, Given& g) { return w.view->GetType(&g.text); },
     "S_OK Stage",
     {noText}},
    {"IzkhwResourceTreeNode::GetTypes",
     [](World& w, Given& g) { return w.view->GetTypes(&g.count, &g.texts); },
     "S_OK [Stage, P, Q]",
     {noArray, thrown}},
    {"IzkhwResourceTreeNode::IsOfType", [](World& w, Given&) { return w.view->IsOfType(In(u"Q")); }, "S_OK", {}},
};

const std::vector<WorldOperation> properties = {
    {"IzkhwResourceTreeNode::GetProperty",
     [](World& w, Given& g) { return w.view->GetProperty(In(u"DisplayName"), &g.text); },
     "S_OK " SHOWN,
     {noText}},
    {"IzkhwResourceTreeNode::GetProperty, of a name that is missing",
     [](World& w, Given& g) { return w.view->GetProperty(In(u"none"), &g.text); },
     "S_FALSE",
     {}},
    {"IzkhwResourceTreeNode::GetPropertyAt",
     [](World& w, Given& g) { return w.view->GetPropertyAt(4, &g.text); },
     "S_OK x",
     {noText}},
    {"IzkhwResourceTreeNode::SetProperty",
     [](World& w, Given&) { return w.view->SetProperty(In(u"A new key of some length"), In(u"with a new value")); },
     "S_OK",
     {thrown},
     Effect::Whole},
    {"IzkhwResourceTreeNode::SetProperty, of a name that is there",
     [](World& w, Given&) { return w.view->SetProperty(In(u"Protocols"), In(u"R, and others that are longer")); },
     "S_OK",
     {thrown},
     Effect::Whole},
    {"IzkhwResourceTreeNode::SetPropertyAt",
     [](World& w, Given&) { return w.view->SetPropertyAt(1, In(u"R, and others that are longer")); },
     "S_OK",
     {thrown},
     Effect::Whole},
    {"IzkhwResourceTreeNode::GetPropertyNames",
     [](World& w, Given& g) { return w.view->GetPropertyNames(&g.count, &g.texts); },
     "S_OK [DisplayName, Protocols, SupportedValues, Reserves, Loc]",
     {noArray, thrown}},
    {"IzkhwResourceTreeNode5::IsLocalizedProperty",
     [](World& w, Given&) { return w.view->IsLocalizedProperty(In(u"Loc")); },
     "S_OK",
     {}},
};

void HoldAll(World& w) {
    w.view->Reserve(In(u"me"), 1, nullptr);
    w.view->ReserveDescendants(In(u"me"), 1, nullptr);
}

void HoldAllForTheItem(World& w) {
    w.view->ReserveForItem(&w.item, 1, nullptr);
    w.view->ReserveDescendantsForItem(&w.item, 1, nullptr);
}

const std::vector<WorldOperation> reservations = {
    {"IzkhwResourceTreeNode::GetReservation",
     [](World& w, Given& g) {
         return w.view->GetReservation(In(u"you, {AAAAAAAA-0000-0000-0000-000000000001}"), &g.number);
     },
     "S_OK 1",
     {thrown}},
    {"IzkhwResourceTreeNode::Reserve",
     [](World& w, Given& g) { return w.view->Reserve(In(u"me"), 1, &g.number); },
     "S_OK 1",
     {thrown},
     Effect::TakenBack},
    // The node that names it in "Reserves" hears of it.
    {"IzkhwResourceTreeNode::Reserve, of a node that is reserved with another",
     [](World& w, Given& g) { return w.partnerView->Reserve(In(u"me"), 1, &g.number); },
     "S_OK 1",
     {thrown},
     Effect::TakenBack},
    {"IzkhwResourceTreeNode::Unreserve",
     [](World& w, Given&) { return w.view->Unreserve(In(u"me")); },
     "S_OK",
     {thrown},
     Effect::Stepwise,
     HoldAll},
    {"IzkhwResourceTreeNode::ReserveDescendants",
     [](World& w, Given&) { return w.view->ReserveDescendants(In(u"me"), 1, In(u"T")); },
     "S_OK",
     {thrown},
     Effect::TakenBack},
    {"IzkhwResourceTreeNode::UnreserveDescendants",
     [](World& w, Given&) { return w.view->UnreserveDescendants(In(u"me"), In(u"T")); },
     "S_OK",
     {thrown},
     Effect::Stepwise,
     HoldAll},
    {"IzkhwResourceTreeNode2::GetReservationEx",
     [](World& w, Given& g) { return w.view->GetReservationEx(In(u"you, me"), 1, &g.number); },
     "S_OK 1",
     {thrown}},
    {"IzkhwResourceTreeNode4::ResolveReservations",
     [](World& w, Given& g) {
         return w.view->ResolveReservations(&w.locator, &g.objectCount, &g.objects, &g.count, &g.texts, 0);
     },
     "S_OK [2 objects] [{CCCCCCCC-0000-0000-0000-000000000003}]",
     {"E_OUTOFMEMORY [] []", "bad_alloc [] []"}},
    {"IzkhwResourceTreeNode5::ReserveForItem",
     [](World& w, Given& g) { return w.view->ReserveForItem(&w.item, 1, &g.number); },
     "S_OK 1",
     {thrown},
     Effect::TakenBack},
    {"IzkhwResourceTreeNode5::GetReservationForItem",
     [](World& w, Given& g) { return w.view->GetReservationForItem(&w.item, &g.number); },
     "S_OK 1",
     {thrown}},
    {"IzkhwResourceTreeNode5::UnreserveForItem",
     [](World& w, Given&) { return w.view->UnreserveForItem(&w.item); },
     "S_OK",
     {thrown},
     Effect::Stepwise,
     HoldAllForTheItem},
    {"IzkhwResourceTreeNode5::ReserveDescendantsForItem",
     [](World& w, Given&) { return w.view->ReserveDescendantsForItem(&w.item, 1, nullptr); },
     "S_OK",
     {thrown},
     Effect::TakenBack},
    {"IzkhwResourceTreeNode5::UnreserveDescendantsForItem",
     [](World& w, Given&) { return w.view->UnreserveDescendantsForItem(&w.item, nullptr); },
     "S_OK",
     {thrown},
     Effect::Stepwise,
     HoldAllForTheItem},
};

const std::vector<WorldOperation> editing = {
    // Without memory for a parser the fragment isn't read at all, and nothing is thrown.
    {"IzkhwResourceTreeNode::LoadContent",
     [](World& w, Given&) { return w.view->LoadContent(In(u"<A>1</A><B name=\"b\"><C>2</C></B>")); },
     "S_OK",
     {thrown, "E_FAIL"},
     Effect::Lasting},
    {"IzkhwResourceTreeNode::RemoveEntry",
     [](World& w, Given&) { return w.view->RemoveEntry(In(u"with/slash")); },
     "S_OK",
     {thrown},
     Effect::Stepwise},
    {"IzkhwResourceTreeNode::RemoveEntry, of a node that is observed",
     [](World& w, Given&) { return w.view->RemoveEntry(In(u"with/slash")); },
     "S_OK",
     {thrown},
     Effect::Stepwise,
     [](World& w) { w.tree.At(u"/N/with\\/slash")->Advise(&w.second, 0xFFFFFFFF, 2); }},
    {"IzkhwResourceTreeNode::Advise",
     [](World& w, Given&) { return w.view->Advise(&w.second, 0xFFFFFFFF, 2); },
     "S_OK",
     {"E_OUTOFMEMORY"},
     Effect::Whole},
    {"IzkhwResourceTreeNode::Unadvise",
     [](World& w, Given&) { return w.view->Unadvise(&w.second, 2, 1); },
     "S_OK",
     {},
     Effect::Whole,
     [](World& w) { w.view->Advise(&w.second, 0xFFFFFFFF, 2); }},
    {"IzkhwResourceTreeNode::BeginChange",
     [](World& w, Given& g) {
         const HRESULT result = w.view->BeginChange(&g.number);
         w.view->EndChange(0, 0);
         return result;
     },
     "S_OK 0",
     {}},
    {"IzkhwResourceTreeNode::EndChange",
     [](World& w, Given& g) {
         w.view->BeginChange(&g.number);
         return w.view->EndChange(8, 0);
     },
     "S_OK 0",
     {}},
    {"IzkhwResourceTreeNode::HasPendingChanges",
     [](World& w, Given&) { return w.view->HasPendingChanges(); },
     "S_FALSE",
     {}},
};

const std::vector<WorldOperation> neighbours = {
    {"IzkhwResourceTreeNode::HasParent", [](World& w, Given&) { return w.view->HasParent(); }, "S_OK", {}},
    {"IzkhwResourceTreeNode::GetParent",
     [](World& w, Given& g) { return w.view->GetParent(&g.node); },
     "S_OK /",
     {noNode}},
    {"IzkhwResourceTreeNode::HasChildren", [](World& w, Given&) { return w.view->HasChildren(); }, "S_OK", {}},
    {"IzkhwResourceTreeNode::GetChildren",
     [](World& w, Given& g) { return w.view->GetChildren(&g.count, &g.nodes); },
     "S_OK [/N/with\\/slash, /Partner]",
     {noArray, thrown, thrownArray}},
    {"IzkhwResourceTreeNode::GetChildrenOfType",
     [](World& w, Given& g) { return w.view->GetChildrenOfType(In(u"Part"), &g.count, &g.nodes); },
     "S_OK [/Partner]",
     {noArray, thrown, thrownArray}},
    {"IzkhwResourceTreeNode::GetDescendantsOfType",
     [](World& w, Given& g) { return w.view->GetDescendantsOfType(nullptr, &g.count, &g.nodes); },
     "S_OK [/N/with\\/slash, /Partner]",
     {noArray, thrown, thrownArray}},
    {"IzkhwResourceTreeNode::FindNode",
     [](World& w, Given& g) { return w.view->FindNode(In(u"Partner"), nullptr, &g.flag, &g.node); },
     "S_OK /Partner 1",
     {"E_OUTOFMEMORY null 1", "bad_alloc null 0"}},
    // As the number, "with\/slash" is 10 units, a separator and the one "/" inside.
    {"IzkhwResourceTreeNode::FindNode, with what is left",
     [](World& w, Given& g) { return w.view->FindNode(In(u"with\\/slash/P"), &g.number, nullptr, &g.node); },
     "S_FALSE /N/with\\/slash 12",
     {"E_OUTOFMEMORY null 0", "bad_alloc null 0"}},
};

const std::vector<WorldOperation> names = {
    {"IzkhwResourceTreeNode::GetChildNames",
     [](World& w, Given& g) { return w.view->GetChildNames(nullptr, 1, &g.count, &g.texts, &g.displayTexts); },
     "S_OK " PATHS_BELOW,
     {noNames, thrown}},
    {"IzkhwResourceTreeNode::GetChildNamesOfType",
     [](World& w, Given& g) {
         return w.view->GetChildNamesOfType(In(u"/path"), In(u"Part"), 1, &g.count, &g.texts, nullptr);
     },
     "S_OK [/path/Partner]",
     {noArray, thrown}},
    {"IzkhwResourceTreeNode::GetDescendantNames",
     [](World& w, Given& g) {
         return w.view->GetDescendantNames(nullptr, nullptr, 0, &g.count, &g.texts, &g.displayTexts);
     },
     "S_OK " NAMES_BELOW,
     {noNames, thrown}},
    {"IzkhwResourceTreeNode4::GetDescendantNamesEx",
     [](World& w, Given& g) {
         return w.view->GetDescendantNamesEx(nullptr, nullptr, 1, In(u"Hidden"), &g.count, &g.texts, &g.displayTexts);
     },
     "S_OK " PATHS_BELOW,
     {noNames, thrown}},
};

#define XML_OF_THE_CHILD "\n   <T name=\"with/slash\">\n      <P>1</P>\n   </T>"

#define XML_OF_THE_ENTRIES                                                            \
    "\n   <DisplayName>" SHOWN                                                        \
    "</DisplayName>\n   <Protocols>P,Q</Protocols>"                                   \
    "\n   <SupportedValues>a,b</SupportedValues>\n   <Reserves>../Partner</Reserves>" \
    "\n   <Loc localize=\"true\">eng=x</Loc>" XML_OF_THE_CHILD                        \
    "\n   <:Link  name=\"Partner\">../Partner</:Link>\n</Stage>"

LPCWSTR childNames[] = {In(u"T"), In(u"a name that nothing has")};
LPCWSTR propertyNames[] = {In(u"P")};

// A second tree, which offers all that the first asks for. It stays until the next one is made.
IzkhwResourceTreeNode* Twin() {
    static World twin(nullptr);
    return twin.view.Get();
}

const std::vector<WorldOperation> textsAndCopies = {
    {"IzkhwResourceTreeNode::GetXml",
     [](World& w, Given& g) { return w.view->GetXml(&g.text); },
     "S_OK \n<Stage name=\"N\" ordered=\"true\">\n   <Protocols>P,Q</Protocols>" XML_OF_THE_ENTRIES,
     {noText, thrown},
     Effect::None,
     nullptr,
     // The types at the head are written before the file is read.
     "S_OK \n<Stage name=\"N\" ordered=\"true\">" XML_OF_THE_ENTRIES},
    {"IzkhwResourceTreeNode3::GetFilteredXml",
     [](World& w, Given& g) { return w.view->GetFilteredXml(2, childNames, 1, propertyNames, &g.text); },
     "S_OK \n<Stage name=\"N\" ordered=\"true\">" XML_OF_THE_CHILD "\n</Stage>",
     {"S_OK null", thrown}},
    {"IzkhwResourceTreeNode4::GetFilteredXmlEx",
     [](World& w, Given& g) { return w.view->GetFilteredXmlEx(1, 0, nullptr, 0, nullptr, &g.text); },
     "S_OK \n<Stage name=\"N\" ordered=\"true\">\n</Stage>",
     {"S_OK null", thrown}},
    // What the one side can't say, the other side doesn't offer.
    {"IzkhwResourceTreeNode3::IsCompatibleWith",
     [](World& w, Given& g) { return w.view->IsCompatibleWith(Twin(), &g.flag); },
     "S_OK 1",
     {"S_OK 0", thrown},
     Effect::None,
     [](World&) { Twin(); }},
    {"IzkhwResourceTreeNode5::IsCompatibleWithEx",
     [](World& w, Given& g) { return w.view->IsCompatibleWithEx(Twin(), &g.flag, 1); },
     "S_OK 1",
     {"S_OK 0", thrown},
     Effect::None,
     [](World&) { Twin(); }},
    // The other node is an object of the host, which makes its memory as the test does.
    {"IzkhwResourceTreeNode5::IsCompatibleWithEx, with a node of the host",
     [](World& w, Given& g) {
         zkhw::ForeignTree foreign;
         const zkhw::InterfacePointer<zkhw::ForeignNode> other(new zkhw::ForeignNode(foreign, Twin()));
         return w.view->IsCompatibleWithEx(other.Get(), &g.flag, 1);
     },
     "S_OK 1",
     {"S_OK 0", thrown},
     Effect::None,
     [](World&) { Twin(); }},
    {"IzkhwResourceTreeNode4::CloneDetached",
     [](World& w, Given& g) { return w.view->CloneDetached(In(u"Copy"), &g.node); },
     "S_OK /",
     {noNode}},
};

const std::vector<WorldOperation> counts = {
    {"IUnknown::QueryInterface, of a node",
     [](World& w, Given& g) {
         return w.view->QueryInterface(IID_IzkhwResourceTreeNode2, reinterpret_cast<void**>(&g.object));
     },
     "S_OK object",
     {}},
    // It ends the copy, and four registrations.
    {"IUnknown::Release, of a copy",
     [](World& w, Given&) {
         w.copy.Reset();
         return S_OK;
     },
     "S_OK",
     {},
     Effect::None,
     [](World& w) { w.wantsCopy = true; }},
    {"IUnknown::AddRef, and Release, of a node",
     [](World& w, Given& g) {
         w.view->AddRef();
         g.number = w.view->Release();
         return S_OK;
     },
     // The test's, and that of the registration.
     "S_OK 2",
     {}},
};

}  // namespace

std::vector<Operation> NodeOperations() {
    std::vector<WorldOperation> all;
    for (const auto& part :
         {whatTheNodeIs, properties, reservations, editing, neighbours, names, textsAndCopies, counts}) {
        all.insert(all.end(), part.begin(), part.end());
    }
    return OperationsOf(all);
}

}  // namespace allocations
