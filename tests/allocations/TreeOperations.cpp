// The operations of a tree as a whole, of its owner, and of what looks for project items, with what the headers say of
// each where memory is short.

#include "allocations/WorldOperation.h"
#include "interfaces/ResourceToAliasMapBuilder.h"

namespace allocations {

namespace {

using zkhw::In;

#define SHOWN "A shown name that fits into nothing small"
#define ELEMENT(name, value) "<String><Name>" name "</Name><Val>" value "</Val></String>"
#define RESOURCE(path, alias, display)                                                             \
    "<Cluster><Name></Name><NumElts>3</NumElts>" ELEMENT("resource", path) ELEMENT("alias", alias) \
        ELEMENT("display name", display) "</Cluster>"

// "IUnknown::QueryInterface" of an object.
HRESULT Query(IUnknown* asked, const IID& id, Given& given) {
    return asked->QueryInterface(id, reinterpret_cast<void**>(&given.object));
}

using Builder = zkhw::CQNComObject<zkhw::ResourceToAliasMapBuilder>;

const std::vector<WorldOperation> operations = {
    {"IzkEIOGResourceTree::GetDescendantNames",
     [](World& w, Given& g) {
         return w.queries->GetDescendantNames(In(u"/N"), In(u"recurse=true,stripPathPrefix=/N"), &g.count, &g.texts);
     },
     "S_OK [with\\/slash, Partner]",
     {noArray, thrownArray}},
    {"IzkEIOGResourceTree::GetDescendantNames, in clusters",
     [](World& w, Given& g) {
         return w.queries->GetDescendantNames(
             In(u"/N"), In(u"includePath=true,includeAliases=true,includeDisplayNames=true"), &g.count, &g.texts);
     },
     "S_OK [" RESOURCE("/N/with\\/slash", "", "/" SHOWN "/with\\/slash") ", " RESOURCE("/N/Partner", "Alias",
                                                                                       "/" SHOWN "/Partner") "]",
     {noArray, thrownArray}},
    {"IzkEIOGResourceTree::GetMultiplePropertyNames",
     [](World& w, Given& g) {
         return w.queries->GetMultiplePropertyNames(In(u"/N"), In(u"recurse=true"), &g.count, &g.texts);
     },
     "S_OK [DisplayName, Protocols, SupportedValues, Reserves, Loc, P, ZKHWReservation]",
     {noArray, thrownArray}},
    {"IzkEIOGResourceTree::GetMultipleProperties",
     [](World& w, Given& g) {
         return w.queries->GetMultipleProperties(In(u"/N/with\\/slash"), In(u"includePath=true"), &g.count, &g.texts);
     },
     "S_OK [<Cluster><Name></Name><NumElts>2</NumElts>" ELEMENT("name", "/N/with\\/slash/P")
         ELEMENT("value", "1") "</Cluster>]",
     {noArray, thrownArray}},
    // An empty result is an array, too.
    {"IzkEIOGResourceTree::GetMultipleProperties, of which there are none",
     [](World& w, Given& g) {
         return w.queries->GetMultipleProperties(In(u"/N"), In(u"protocol=None"), &g.count, &g.texts);
     },
     "S_OK []",
     {noArray, thrownArray}},
    {"IzkEIOGResourceTree::GetProperty",
     [](World& w, Given& g) { return w.queries->GetProperty(In(u"/N/DisplayName"), nullptr, &g.text); },
     "S_OK " SHOWN,
     {noText}},
    {"IzkEIOGResourceTree2::GetFilteredXml",
     [](World& w, Given& g) { return w.queries->GetFilteredXml(In(u"/N"), 0, nullptr, 0, nullptr, &g.text); },
     "S_OK \n<Stage name=\"N\" ordered=\"true\">\n</Stage>",
     {"S_OK null", "E_OUTOFMEMORY", thrown}},
    {"IzkProjectItemSelector::SelectItem",
     [](World& w, Given& g) {
         Builder selector(&w.context, &w.aliases);
         return selector.SelectItem(&w.item, &g.flag);
     },
     "S_FALSE 1",
     {"bad_alloc 1"},
     Effect::Whole},
    // It asks the host's object.
    {"IzkhwResourceTreeOwner::GetRootNode",
     [](World& w, Given& g) { return w.owner->GetRootNode(reinterpret_cast<IzkhwResourceTreeNode**>(&g.object)); },
     "S_OK object",
     {}},
    {"IUnknown::QueryInterface, of a tree",
     [](World& w, Given& g) { return Query(w.queries.Get(), IID_IzkEIOGResourceTree, g); },
     "S_OK object",
     {}},
    {"IUnknown::QueryInterface, of an owner",
     [](World& w, Given& g) { return Query(w.owner.Get(), IID_IzkhwResourceTreeOwner, g); },
     "S_OK object",
     {}},
};

}  // namespace

std::vector<Operation> TreeOperations() {
    return OperationsOf(operations);
}

}  // namespace allocations
