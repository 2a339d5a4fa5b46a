// Who of the owners of reservations the host still knows.

#include <unordered_set>
#include <vector>

#include "interfaces/BoundaryArrays.h"
#include "interfaces/BoundaryText.h"
#include "interfaces/InterfacePointer.h"
#include "interfaces/ResTreeNodeAdapter.h"
#include "qn/dsc/Guid.h"
#include "restree/ReleaseScope.h"
#include "restree/ResTreeNode.h"
#include "zkfpga/host_interfaces.h"

namespace zkhw {

namespace {

constexpr uint32_t anyMode = ReserveRead | ReserveWrite | ReserveExclusive;

// The owners of the nearest nodes that have records, depth first over "Reserves": below a node that has any nothing is
// looked at, and once an owner is found, nothing more at all. Each node is looked at once.
std::vector<String> NearestOwners(ResTreeNode& top, bool activeOnly) {
    std::vector<String> owners;
    std::unordered_set<const ResTreeNode*> seen;
    std::vector<ResTreeNode*> waiting{&top};
    while (!waiting.empty() && owners.empty()) {
        ResTreeNode* const node = waiting.back();
        waiting.pop_back();
        if (!seen.insert(node).second) {
            continue;
        }
        if (node->GetReservations().empty()) {
            std::vector<ResTreeNode*> dependants;
            node->GetDependants(dependants, false);
            waiting.insert(waiting.end(), dependants.rbegin(), dependants.rend());
            continue;
        }
        for (const Reservation& reservation : node->GetReservations()) {
            if (!activeOnly || (reservation.mode & anyMode) != 0) {
                owners.push_back(reservation.owner);
            }
        }
    }
    return owners;
}

GUID IdOf(const String& owner) {
    const qn::dsc::Guid id(owner);
    GUID result{id.data1, id.data2, id.data3, {}};
    for (int i = 0; i < 8; ++i) {
        result.Data4[i] = id.data4[i];
    }
    return result;
}

}  // namespace

HRESULT ResTreeNodeAdapter::ResolveReservations(IzkProjectItemLocator* locator, ULONG* foundCount, IUnknown*** found,
                                                ULONG* missingCount, BSTR** missing, BOOL activeOnly) {
    if (locator == nullptr || foundCount == nullptr || found == nullptr || missingCount == nullptr ||
        missing == nullptr) {
        return E_POINTER;
    }
    *foundCount = 0;
    *found = nullptr;
    *missingCount = 0;
    *missing = nullptr;
    const ReleaseScope scope;
    std::vector<InterfacePointer<IUnknown>> items;
    std::vector<String> missingOwners;
    for (const String& owner : NearestOwners(*m_node, activeOnly != 0)) {
        InterfacePointer<IUnknown> item;
        const HRESULT state = locator->FindItemById(IdOf(owner), item.Receive());
        if (!item) {
            continue;
        }
        if (state == S_OK) {
            items.push_back(std::move(item));
        } else {
            missingOwners.push_back(owner);
        }
    }
    const HRESULT missingGiven = GiveTexts(missingOwners, missingCount, missing);
    if (FAILED(missingGiven)) {
        return missingGiven;
    }
    const HRESULT itemsGiven = GiveObjects(items, foundCount, found);
    if (FAILED(itemsGiven)) {
        FreeTexts(*missingCount, *missing);
        *missingCount = 0;
        *missing = nullptr;
    }
    return itemsGiven;
}

}  // namespace zkhw
