// Reservations of the model.

#include <algorithm>
#include <set>

#include "TreeModel.h"
#include "qn/dsc/osdep/Compare.h"
#include "restree/ChangeFlags.h"
#include "restree/Reservation.h"
#include "restree/TextList.h"

namespace fuzz::model {

using qn::dsc::String;
using qn::dsc::osdep::Compare;
using zkhw::ReserveExclusive;
using zkhw::ReserveRead;
using zkhw::ReserveWrite;

std::vector<Node*> Tree::Dependants(Node& node) {
    Nodelist list;
    const Entry* reserves = Find(node, u"Reserves");
    if (reserves == nullptr || reserves->kind != zkhw::TextEntry) {
        return list;
    }
    std::vector<String> paths;
    zkhw::SplitList(String(reserves->text), u',', paths, true);
    for (const String& path : paths) {
        if (Node* dependant = Lookup(node, path.View())) {
            list.push_back(dependant);
        }
    }
    return list;
}

// --- One node ---

uint32_t Tree::ReserveOne(Node& node, const std::u16string& owner, uint32_t mode) {
    uint32_t current = 0;
    for (const Holder& holder : node.holders) {
        current |= holder.mode;
    }
    if ((current & ReserveExclusive) != 0) {
        return 0;
    }
    uint32_t result = mode;
    bool updated = false;
    if ((mode & ReserveExclusive) != 0) {
        node.holders.clear();
    } else {
        if ((mode & current & ReserveWrite) != 0) {
            return 0;
        }
        result |= current;
        for (Holder& holder : node.holders) {
            if (!updated && Compare(holder.owner, owner) == 0) {
                holder.mode = mode;
                updated = true;
            }
        }
    }
    if (!updated) {
        node.holders.push_back({owner, mode});
    }
    if (result != 0) {
        ShowHolders(node);
        Raise(node, zkhw::ReservationChanged);
    }
    return result;
}

bool Tree::ReleaseOne(Node& node, const std::u16string& owner) {
    const auto found = std::find_if(node.holders.begin(), node.holders.end(),
                                    [&](const Holder& holder) { return Compare(holder.owner, owner) == 0; });
    if (found == node.holders.end()) {
        return false;
    }
    node.holders.erase(found);
    ShowHolders(node);
    Raise(node, zkhw::ReservationChanged);
    return true;
}

void Tree::ShowHolders(Node& node) {
    const uint32_t saved = BeginChanges(node);
    std::u16string text;
    for (const Holder& holder : node.holders) {
        text += text.empty() ? u"" : u",";
        text += holder.owner + u":=";
        text += (holder.mode & ReserveExclusive) != 0 ? u"!" : u"";
        text += (holder.mode & ReserveWrite) != 0 ? u"w" : u"";
        text += (holder.mode & ReserveRead) != 0 ? u"r" : u"";
    }
    if (node.holders.empty()) {
        RemoveByName(node, u"ZKHWReservation");
    } else {
        Set(node, u"ZKHWReservation", text);
    }
    EndChanges(node, saved, true);
}

// --- With dependants ---

bool Tree::ReserveEach(const Nodelist& list, const std::u16string& owner, uint32_t mode) {
    size_t next = 0;
    for (; next < list.size(); ++next) {
        Node& node = *list[next];
        if (node.isOnPath) {
            continue;
        }
        if (!ReserveDependants(node, owner, mode)) {
            break;
        }
        node.isOnPath = true;
        const bool taken = ReserveOne(node, owner, mode) != 0;
        node.isOnPath = false;
        if (!taken) {
            ReleaseDependants(node, owner);
            break;
        }
    }
    if (next == list.size()) {
        return true;
    }
    ReleaseEach({list.begin(), list.begin() + static_cast<ptrdiff_t>(next)}, owner);
    return false;
}

bool Tree::ReserveDependants(Node& node, const std::u16string& owner, uint32_t mode) {
    node.isOnPath = true;
    const bool taken = ReserveEach(Dependants(node), owner, mode);
    node.isOnPath = false;
    return taken;
}

uint32_t Tree::Reserve(Node& node, const std::u16string& owner, uint32_t mode) {
    if (!ReserveDependants(node, owner, mode)) {
        return 0;
    }
    const uint32_t result = ReserveOne(node, owner, mode);
    if (result == 0) {
        ReleaseDependants(node, owner);
    }
    return result;
}

bool Tree::ReleaseEach(const Nodelist& list, const std::u16string& owner) {
    bool any = false;
    for (size_t i = list.size(); i-- > 0;) {
        any |= Release(*list[i], owner);
    }
    return any;
}

bool Tree::ReleaseDependants(Node& node, const std::u16string& owner) {
    node.isOnPath = true;
    const bool any = ReleaseEach(Dependants(node), owner);
    node.isOnPath = false;
    return any;
}

bool Tree::Release(Node& node, const std::u16string& owner) {
    if (node.isOnPath) {
        return false;
    }
    const bool released = ReleaseOne(node, owner);
    return ReleaseDependants(node, owner) || released;
}

// --- Descendants ---

void Tree::CollectMatching(Node& node, std::u16string_view filter, Nodelist& list) {
    for (const auto& entry : node.entries) {
        if (entry->child && Supports(*entry->child, filter)) {
            list.push_back(entry->child.get());
            CollectMatching(*entry->child, filter, list);
        }
    }
}

bool Tree::ReserveAll(Node& node, const std::u16string& owner, uint32_t mode, std::u16string_view filter) {
    Nodelist list;
    CollectMatching(node, filter, list);
    return ReserveEach(list, owner, mode);
}

bool Tree::ReleaseAll(Node& node, const std::u16string& owner, std::u16string_view filter) {
    Nodelist list;
    CollectMatching(node, filter, list);
    return ReleaseEach(list, owner);
}

// --- Questions ---

uint32_t Tree::Flags(Node& node, const std::u16string* owners, bool except) {
    if (node.isOnPath) {
        return 0;
    }
    std::set<String> wanted;
    if (owners != nullptr) {
        zkhw::SplitList(String(*owners), u',', wanted, true);
    }
    uint32_t flags = 0;
    for (const Holder& holder : node.holders) {
        if (owners == nullptr) {
            flags |= holder.mode;
        } else if (wanted.contains(String(holder.owner)) != except) {
            flags = holder.mode;
            break;
        }
    }
    node.isOnPath = true;
    for (Node* dependant : Dependants(node)) {
        flags |= Flags(*dependant, owners, except);
    }
    node.isOnPath = false;
    return flags;
}

}  // namespace fuzz::model
