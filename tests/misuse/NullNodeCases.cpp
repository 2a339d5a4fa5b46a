// Null for every pointer of the operations of a node and of an owner.

#include "misuse/NullCases.h"

namespace misuse {

namespace {

using Node = IzkhwResourceTreeNode;
using Node3 = IzkhwResourceTreeNode3;
using Node4 = IzkhwResourceTreeNode4;
using Node5 = IzkhwResourceTreeNode5;

Node5* Shelf() {
    return fixture.shelf;
}

LPCWSTR nodeNames[] = {u"A"};
LPCWSTR propertyNames[] = {u"Height"};

// Hears nothing of what these cases do.
Observer observer;

void AddIdentity(Cases& cases) {
    const std::string scope = "IzkhwResourceTreeNode::";
    Outputs& o = outputs;
    AddNulls(cases, scope + "GetName", Shelf, &Node::GetName, {"name"}, &o.text);
    AddNulls(cases, scope + "GetPath", Shelf, &Node::GetPath, {"path"}, &o.text);
    AddNulls(cases, scope + "GetDisplayPath", Shelf, &Node::GetDisplayPath, {"path"}, &o.text);
    AddNulls(cases, scope + "SetName", Shelf, &Node::SetName, {"name"}, u"U");
    AddNulls(cases, scope + "GetType", Shelf, &Node::GetType, {"type"}, &o.text);
    AddNulls(cases, scope + "GetTypes", Shelf, &Node::GetTypes, {"count", "types"}, &o.count, &o.texts);
    AddNulls(cases, scope + "IsOfType", Shelf, &Node::IsOfType, {"type"}, u"Pin");
}

void AddProperties(Cases& cases) {
    const std::string scope = "IzkhwResourceTreeNode::";
    Outputs& o = outputs;
    AddNulls(cases, scope + "GetProperty", Shelf, &Node::GetProperty, {"name", "value"}, u"Height", &o.text);
    AddNulls(cases, scope + "GetPropertyAt", Shelf, &Node::GetPropertyAt, {"index", "value"}, 0, &o.text);
    AddNulls(cases, scope + "SetProperty", Shelf, &Node::SetProperty, {"name", "value"}, u"Height", u"8");
    AddNulls(cases, scope + "SetPropertyAt", Shelf, &Node::SetPropertyAt, {"index", "value"}, 0, u"8");
    AddNulls(cases, scope + "GetPropertyNames", Shelf, &Node::GetPropertyNames, {"count", "names"}, &o.count, &o.texts);
    AddNulls(cases, "IzkhwResourceTreeNode5::IsLocalizedProperty", Shelf, &Node5::IsLocalizedProperty, {"name"},
             u"Label");
}

void AddReservations(Cases& cases) {
    const std::string scope = "IzkhwResourceTreeNode::";
    Outputs& o = outputs;
    AddNulls(cases, scope + "GetReservation", Shelf, &Node::GetReservation, {"owners", "mode"}, u"me", &o.number);
    AddNulls(cases, scope + "Reserve", Shelf, &Node::Reserve, {"owner", "mode", "granted"}, u"me", 1, &o.number);
    AddNulls(cases, scope + "Unreserve", Shelf, &Node::Unreserve, {"owner"}, u"me");
    AddNulls(cases, scope + "ReserveDescendants", Shelf, &Node::ReserveDescendants, {"owner", "mode", "type"}, u"me", 1,
             u"Slot");
    AddNulls(cases, scope + "UnreserveDescendants", Shelf, &Node::UnreserveDescendants, {"owner", "type"}, u"me",
             u"Slot");
    AddNulls(cases, "IzkhwResourceTreeNode2::GetReservationEx", Shelf, &IzkhwResourceTreeNode2::GetReservationEx,
             {"owners", "except", "mode"}, u"me", 1, &o.number);
}

void AddItemReservations(Cases& cases) {
    const std::string scope = "IzkhwResourceTreeNode5::";
    Outputs& o = outputs;
    IzkProjectItem* const item = &fixture.item;
    AddNulls(cases, "IzkhwResourceTreeNode4::ResolveReservations", Shelf, &Node4::ResolveReservations,
             {"locator", "foundCount", "found", "missingCount", "missing", "activeOnly"}, &fixture.locator, &o.count,
             &o.items, &o.otherCount, &o.texts, 0);
    AddNulls(cases, scope + "ReserveForItem", Shelf, &Node5::ReserveForItem, {"item", "mode", "granted"}, item, 1,
             &o.number);
    AddNulls(cases, scope + "GetReservationForItem", Shelf, &Node5::GetReservationForItem, {"item", "mode"}, item,
             &o.number);
    AddNulls(cases, scope + "UnreserveForItem", Shelf, &Node5::UnreserveForItem, {"item"}, item);
    AddNulls(cases, scope + "ReserveDescendantsForItem", Shelf, &Node5::ReserveDescendantsForItem,
             {"item", "mode", "type"}, item, 1, u"Slot");
    AddNulls(cases, scope + "UnreserveDescendantsForItem", Shelf, &Node5::UnreserveDescendantsForItem, {"item", "type"},
             item, u"Slot");
}

void AddNeighbours(Cases& cases) {
    const std::string scope = "IzkhwResourceTreeNode::";
    Outputs& o = outputs;
    AddNulls(cases, scope + "GetParent", Shelf, &Node::GetParent, {"parent"}, &o.node);
    AddNulls(cases, scope + "GetChildren", Shelf, &Node::GetChildren, {"count", "nodes"}, &o.count, &o.nodes);
    AddNulls(cases, scope + "GetChildrenOfType", Shelf, &Node::GetChildrenOfType, {"type", "count", "nodes"}, u"Pin",
             &o.count, &o.nodes);
    AddNulls(cases, scope + "GetDescendantsOfType", Shelf, &Node::GetDescendantsOfType, {"type", "count", "nodes"},
             u"Pin", &o.count, &o.nodes);
    AddNulls(cases, scope + "GetChildNames", Shelf, &Node::GetChildNames,
             {"path", "includePath", "count", "names", "displayNames"}, u"/at", 1, &o.count, &o.texts, &o.displays);
    AddNulls(cases, scope + "GetChildNamesOfType", Shelf, &Node::GetChildNamesOfType,
             {"path", "type", "includePath", "count", "names", "displayNames"}, u"/at", u"Slot", 1, &o.count, &o.texts,
             &o.displays);
    AddNulls(cases, scope + "GetDescendantNames", Shelf, &Node::GetDescendantNames,
             {"path", "type", "includePath", "count", "names", "displayNames"}, u"/at", u"Slot", 1, &o.count, &o.texts,
             &o.displays);
    AddNulls(cases, "IzkhwResourceTreeNode4::GetDescendantNamesEx", Shelf, &Node4::GetDescendantNamesEx,
             {"path", "type", "includePath", "exclusionProperty", "count", "names", "displayNames"}, u"/at", u"Slot", 1,
             u"Hidden", &o.count, &o.texts, &o.displays);
    AddNulls(cases, scope + "FindNode", Shelf, &Node::FindNode, {"path", "consumed", "crossedLink", "node"}, u"A/Q",
             &o.number, &o.flag, &o.node);
}

void AddChanges(Cases& cases) {
    const std::string scope = "IzkhwResourceTreeNode::";
    Outputs& o = outputs;
    AddNulls(cases, scope + "LoadContent", Shelf, &Node::LoadContent, {"fragment"}, u"<Made>1</Made>");
    AddNulls(cases, scope + "RemoveEntry", Shelf, &Node::RemoveEntry, {"name"}, u"Height");
    AddNulls(cases, scope + "Advise", Shelf, &Node::Advise, {"observer", "mask", "id"}, &observer, 0, 5);
    AddNulls(cases, scope + "Unadvise", Shelf, &Node::Unadvise, {"observer", "id", "subtree"}, &observer, 0xFFFFFFFF,
             1);
    AddNulls(cases, scope + "BeginChange", Shelf, &Node::BeginChange, {"pending"}, &o.number);
}

void AddTexts(Cases& cases) {
    Outputs& o = outputs;
    AddNulls(cases, "IzkhwResourceTreeNode::GetXml", Shelf, &Node::GetXml, {"xml"}, &o.text);
    AddNulls(cases, "IzkhwResourceTreeNode3::GetFilteredXml", Shelf, &Node3::GetFilteredXml,
             {"nodeNameCount", "nodeNames", "propertyNameCount", "propertyNames", "xml"}, 0, nodeNames, 0,
             propertyNames, &o.text);
    AddNulls(cases, "IzkhwResourceTreeNode3::IsCompatibleWith", Shelf, &Node3::IsCompatibleWith, {"other", "result"},
             nullptr, &o.flag);
    AddNulls(cases, "IzkhwResourceTreeNode4::CloneDetached", Shelf, &Node4::CloneDetached, {"name", "clone"}, u"Copy",
             &o.node);
    AddNulls(cases, "IzkhwResourceTreeNode4::GetFilteredXmlEx", Shelf, &Node4::GetFilteredXmlEx,
             {"keep", "nodeNameCount", "nodeNames", "propertyNameCount", "propertyNames", "xml"}, 1, 0, nodeNames, 0,
             propertyNames, &o.text);
    AddNulls(cases, "IzkhwResourceTreeNode5::IsCompatibleWithEx", Shelf, &Node5::IsCompatibleWithEx,
             {"other", "result", "skipLocalized"}, nullptr, &o.flag, 0);
}

// The host's object stands for the tree.
IzkhwResourceTreeOwner* Owner() {
    void* owner = nullptr;
    library.QueryResourceTreeInterface(&IID_IzkhwResourceTreeOwner, &fixture.context, nullptr, &owner);
    return static_cast<IzkhwResourceTreeOwner*>(owner);
}

}  // namespace

void AddNodeNulls(Cases& cases) {
    AddIdentity(cases);
    AddProperties(cases);
    AddReservations(cases);
    AddItemReservations(cases);
    AddNeighbours(cases);
    AddChanges(cases);
    AddTexts(cases);
    cases["IzkhwResourceTreeOwner::GetRootNode root"] = {[] {
        IzkhwResourceTreeOwner* const owner = Owner();
        SayResult(owner->GetRootNode(nullptr));
        owner->Release();
    }};
    cases["IUnknown::QueryInterface result of a view"] = {
        [] { SayResult(fixture.shelf->QueryInterface(IID_IzkhwResourceTreeNode, nullptr)); }};
    cases["IUnknown::QueryInterface result of a tree"] = {
        [] { SayResult(fixture.tree->QueryInterface(IID_IzkEIOGResourceTree, nullptr)); }};
    cases["IUnknown::QueryInterface result of an owner"] = {
        [] { SayResult(Owner()->QueryInterface(IID_IzkhwResourceTreeOwner, nullptr)); }};
    cases["IUnknown::QueryInterface result of a selector"] = {[] {
        fixture.item.whenSelecting = [](IzkProjectItemSelector* selector) {
            SayResult(selector->QueryInterface(IID_IzkProjectItemSelector, nullptr));
        };
        fixture.tree->GetDescendantNames(u"Rack", u"includeAliases=true", &outputs.count, &outputs.texts);
    }};
}

}  // namespace misuse
