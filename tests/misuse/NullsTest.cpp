// Null for every pointer of every interface. A null text counts as the empty one, a null that is optional as not asked
// for; where something has to be stored, E_POINTER, or the trap of QueryInterface.

#include "misuse/MisuseTest.h"

namespace {

const std::string pointer = "80004003";
const std::string itemKey = "{11223344-5566-7788-99AA-BBCCDDEEFF00}";

// The shelves, if something was added to what the nodes hold.
std::string Shelves(const std::string& ofS, const std::string& ofA, const std::string& ofQ, const std::string& ofB) {
    const std::string a = "A{Width=1" + ofA + ";Q{Speed=9" + ofQ + ";}}";
    return Now("S{Height=7,Label=Name" + ofS + ";" + a + "B{Width=2" + ofB + ";}}T{;" + a + "}");
}

std::string Held(const std::string& text) {
    return ",ZKHWReservation=" + text;
}

void AppendPointers(Expectations& all, const std::string& operation, const std::vector<std::string>& arguments) {
    for (const std::string& argument : arguments) {
        all.push_back(Answers(operation + " " + argument, pointer));
    }
}

void AppendIdentity(Expectations& all) {
    const std::string node = "IzkhwResourceTreeNode::";
    AppendPointers(all, node + "GetName", {"name"});
    AppendPointers(all, node + "GetPath", {"path"});
    AppendPointers(all, node + "GetDisplayPath", {"path"});
    AppendPointers(all, node + "SetName", {"name"});
    AppendPointers(all, node + "GetType", {"type"});
    AppendPointers(all, node + "GetTypes", {"count", "types"});
    AppendPointers(all, node + "GetPropertyNames", {"count", "names"});
    AppendPointers(all, node + "GetParent", {"parent"});
    AppendPointers(all, node + "GetChildren", {"count", "nodes"});
    AppendPointers(all, "IzkhwResourceTreeOwner::GetRootNode", {"root"});
    all.push_back(Answers(node + "IsOfType type", "00000000"));
    for (const char* const object : {"a view", "a tree", "an owner", "a selector"}) {
        all.push_back(Traps(std::string("IUnknown::QueryInterface result of ") + object));
    }
}

void AppendProperties(Expectations& all) {
    const std::string node = "IzkhwResourceTreeNode::";
    all.push_back(Answers(node + "GetProperty name", "00000001"));
    all.push_back(Answers(node + "SetProperty name",
                          "00000000" + Now("S{=8,Height=7,Label=Name;" + slotA + slotB + "}" + shelfT)));
    all.push_back(
        Answers(node + "SetProperty value", "00000000" + Now("S{Height=,Label=Name;" + slotA + slotB + "}" + shelfT)));
    all.push_back(Answers(node + "SetPropertyAt value",
                          "00000000" + Now("S{Height=,Label=Name;" + slotA + slotB + "}" + shelfT)));
    all.push_back(Answers("IzkhwResourceTreeNode5::IsLocalizedProperty name", "00000001"));
}

void AppendReservations(Expectations& all) {
    const std::string node = "IzkhwResourceTreeNode::";
    all.push_back(Answers(node + "GetReservation owners", "00000001 number=00000000"));
    all.push_back(Answers(node + "GetReservation mode", "00000001"));
    all.push_back(Answers(node + "Reserve owner", "00000000 number=00000001" + Shelves(Held(":=r"), "", "", "")));
    all.push_back(Answers(node + "Reserve granted", "00000000" + Shelves(Held("me:=r"), "", "", "")));
    all.push_back(Answers(node + "Unreserve owner", "00000001"));
    all.push_back(Answers(node + "ReserveDescendants owner", "00000000" + Shelves("", Held(":=r"), "", Held(":=r"))));
    all.push_back(Answers(node + "ReserveDescendants type",
                          "00000000" + Shelves("", Held("me:=r"), Held("me:=r"), Held("me:=r"))));
    all.push_back(Answers(node + "UnreserveDescendants owner", "00000001"));
    all.push_back(Answers(node + "UnreserveDescendants type", "00000001"));
    all.push_back(Answers("IzkhwResourceTreeNode2::GetReservationEx owners", "00000001 number=00000000"));
    all.push_back(Answers("IzkhwResourceTreeNode2::GetReservationEx mode", "00000001"));
}

void AppendItemReservations(Expectations& all) {
    const std::string node = "IzkhwResourceTreeNode5::";
    const std::string held = Held(itemKey + ":=r");
    AppendPointers(all, "IzkhwResourceTreeNode4::ResolveReservations",
                   {"locator", "foundCount", "found", "missingCount", "missing"});
    AppendPointers(all, node + "ReserveForItem", {"item"});
    AppendPointers(all, node + "UnreserveForItem", {"item"});
    AppendPointers(all, node + "ReserveDescendantsForItem", {"item"});
    AppendPointers(all, node + "UnreserveDescendantsForItem", {"item"});
    all.push_back(Answers(node + "ReserveForItem granted", "00000000" + Shelves(held, "", "", "")));
    all.push_back(Answers(node + "GetReservationForItem item", "00000001 number=00000000"));
    all.push_back(Answers(node + "GetReservationForItem mode", "00000001"));
    all.push_back(Answers(node + "ReserveDescendantsForItem type", "00000000" + Shelves("", held, held, held)));
    all.push_back(Answers(node + "UnreserveDescendantsForItem type", "00000001"));
}

void AppendNodes(Expectations& all) {
    const std::string node = "IzkhwResourceTreeNode::";
    AppendPointers(all, node + "GetChildrenOfType", {"count", "nodes"});
    AppendPointers(all, node + "GetDescendantsOfType", {"count", "nodes"});
    AppendPointers(all, node + "FindNode", {"node"});
    all.push_back(Answers(node + "GetChildrenOfType type", "00000000 2 {A,B}"));
    all.push_back(Answers(node + "GetDescendantsOfType type", "00000000 3 {A,Q,B}"));
    all.push_back(Answers(node + "FindNode path", "00000001 number=00000000 flag=0"));
    all.push_back(Answers(node + "FindNode consumed", "00000000 @Q flag=0"));
    all.push_back(Answers(node + "FindNode crossedLink", "00000000 @Q number=00000003"));
}

// Names of slots, and their display paths, which begin at the shelf's own.
void AppendNames(Expectations& all) {
    const std::string node = "IzkhwResourceTreeNode::";
    const std::string own = "[/Rack/S/A,/Rack/S/B]";
    const std::string given = "[/at/A,/at/B]";
    const std::string displays = " </Rack/S/A,/Rack/S/B>";
    for (const char* const operation :
         {"IzkhwResourceTreeNode::GetChildNames", "IzkhwResourceTreeNode::GetChildNamesOfType",
          "IzkhwResourceTreeNode::GetDescendantNames", "IzkhwResourceTreeNode4::GetDescendantNamesEx"}) {
        AppendPointers(all, operation, {"count", "names"});
        all.push_back(Answers(std::string(operation) + " path", "00000000 2 " + own + displays));
    }
    all.push_back(Answers(node + "GetChildNames displayNames", "00000000 2 " + given));
    all.push_back(Answers(node + "GetChildNamesOfType type", "00000000 2 " + given + displays));
    all.push_back(Answers(node + "GetChildNamesOfType displayNames", "00000000 2 " + given));
    // What is reached without a link has its own path, whatever `path` says.
    const std::string withPin = "00000000 3 [/Rack/S/A,/Rack/S/A/Q,/Rack/S/B] </Rack/S/A,/Rack/S/A/Q,/Rack/S/B>";
    all.push_back(Answers(node + "GetDescendantNames type", withPin));
    all.push_back(Answers(node + "GetDescendantNames displayNames", "00000000 2 " + own));
    all.push_back(Answers("IzkhwResourceTreeNode4::GetDescendantNamesEx type", withPin));
    all.push_back(
        Answers("IzkhwResourceTreeNode4::GetDescendantNamesEx exclusionProperty", "00000000 2 " + own + displays));
    all.push_back(Answers("IzkhwResourceTreeNode4::GetDescendantNamesEx displayNames", "00000000 2 " + own));
}

void AppendChanges(Expectations& all) {
    const std::string node = "IzkhwResourceTreeNode::";
    AppendPointers(all, node + "Advise", {"observer"});
    all.push_back(Answers(node + "Unadvise observer", "00000000"));
    all.push_back(Answers(node + "LoadContent fragment", "00000000"));
    all.push_back(Answers(node + "RemoveEntry name", "00000000"));
}

void AppendTexts(Expectations& all) {
    const std::string emptyShelf = "00000000 \"|<Shelf name=\"S\">|</Shelf>\"";
    for (const char* const operation :
         {"IzkhwResourceTreeNode3::GetFilteredXml", "IzkhwResourceTreeNode4::GetFilteredXmlEx",
          "IzkEIOGResourceTree2::GetFilteredXml"}) {
        all.push_back(Answers(std::string(operation) + " nodeNames", emptyShelf));
        all.push_back(Answers(std::string(operation) + " propertyNames", emptyShelf));
    }
    for (const char* const operation :
         {"IzkhwResourceTreeNode3::IsCompatibleWith", "IzkhwResourceTreeNode5::IsCompatibleWithEx"}) {
        AppendPointers(all, operation, {"result"});
        all.push_back(Answers(std::string(operation) + " other", "00000000 flag=0"));
    }
    all.push_back(Answers("IzkhwResourceTreeNode4::CloneDetached name", "00000000 @S"));
}

// A null path is the root's.
void AppendTree(Expectations& all) {
    const std::string tree = "IzkEIOGResourceTree::";
    AppendPointers(all, tree + "GetDescendantNames", {"count", "names"});
    AppendPointers(all, tree + "GetMultiplePropertyNames", {"count", "names"});
    AppendPointers(all, tree + "GetMultipleProperties", {"count", "values"});
    all.push_back(Answers(tree + "GetDescendantNames path", "00000000 1 [Rack]"));
    all.push_back(Answers(tree + "GetDescendantNames options", "00000000 2 [S,T]"));
    all.push_back(Answers(tree + "GetMultiplePropertyNames path", "00000000 0 []"));
    all.push_back(Answers(tree + "GetMultiplePropertyNames options", "00000000 2 [Height,Label]"));
    all.push_back(Answers(tree + "GetMultipleProperties path", "00000000 0 []"));
    all.push_back(Answers(tree + "GetMultipleProperties options",
                          "00000000 1 [<Cluster><Name></Name><NumElts>2</NumElts><String><Name>name</Name>"
                          "<Val>Width</Val></String><String><Name>value</Name><Val>2</Val></String></Cluster>]"));
    all.push_back(Answers(tree + "GetProperty path", "00000001"));
    all.push_back(Answers(tree + "GetProperty options", "00000000 \"7\""));
    all.push_back(Answers("IzkEIOGResourceTree2::GetFilteredXml path",
                          "00000000 \"|<ProviderResourceTreeRoot name=\"\">|</ProviderResourceTreeRoot>\""));
}

}  // namespace

Expectations NullExpectations() {
    Expectations all;
    AppendIdentity(all);
    AppendProperties(all);
    AppendReservations(all);
    AppendItemReservations(all);
    AppendNodes(all);
    AppendNames(all);
    AppendChanges(all);
    AppendTexts(all);
    AppendTree(all);
    return all;
}

INSTANTIATE_TEST_SUITE_P(OfNull, Misuse, testing::ValuesIn(NullExpectations()), TestName);
