#pragma once

// Joins the tree to the host's project: which resource the user has given which name.

#include <map>

#include "interfaces/ResourceItemUISelector.h"
#include "qn/dsc/StringBase.h"

namespace zkhw {

// From the path of a resource to the name of the project item that refers to it. Paths that differ in letter case only
// are one.
using ResourceToAliasMap = std::map<qn::dsc::String, qn::dsc::String>;

class ResourceToAliasMapBuilder : public ResourceItemUISelector {
  public:
    ResourceToAliasMapBuilder(IzkHostContext* context, ResourceToAliasMap* map)
        : ResourceItemUISelector(context), m_map(map) {}

    // Notes the item. Of several for one resource the first counts. Never ends the search.
    bool OnItem(IzkProjectItem* item, IzkItemMarker* marker, IzkItemResourceLink* link) override;

  protected:
    ~ResourceToAliasMapBuilder() override = default;

  private:
    ResourceToAliasMap* m_map;  // Not owned.
};

// Adds all items below `item` to `map`.
void BuildAliasMap(IzkHostContext* context, IzkProjectItem* item, ResourceToAliasMap& map);

}  // namespace zkhw
