#include "interfaces/ResourceToAliasMapBuilder.h"

#include "interfaces/BoundaryText.h"
#include "interfaces/InterfacePointer.h"

namespace zkhw {

bool ResourceToAliasMapBuilder::OnItem(IzkProjectItem* item, IzkItemMarker*, IzkItemResourceLink* link) {
    OwnedBstr path;
    if (link->GetResourcePath(path.Receive()) == S_OK) {
        OwnedBstr name;
        item->GetName(name.Receive());
        m_map->emplace(String(path.View()), String(name.View()));
    }
    return false;
}

void BuildAliasMap(IzkHostContext* context, IzkProjectItem* item, ResourceToAliasMap& map) {
    // Here and not on the heap, with a count of 0: it lives no longer than the call that uses it.
    CQNComObject<ResourceToAliasMapBuilder> builder(context, &map);
    InterfacePointer<IUnknown> selected;
    item->SelectItems(&builder, selected.Receive());
}

}  // namespace zkhw
