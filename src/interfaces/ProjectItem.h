#pragma once

// What the host tells of a project item.

#include "qn/dsc/StringBase.h"
#include "zkfpga/host_interfaces.h"

namespace zkhw {

// A record that the host has filled in; frees what it holds.
class ItemRecord {
  public:
    // Asks the item; its result isn't looked at.
    explicit ItemRecord(IzkProjectItem* item);
    ~ItemRecord();
    ItemRecord(const ItemRecord&) = delete;
    ItemRecord& operator=(const ItemRecord&) = delete;

    ProjectItemRecord* Get() { return &record; }

  private:
    ProjectItemRecord record;
};

// The key by which an item appears in reservations: the text of its id, "{" to "}" with capital digits.
qn::dsc::String GetItemKey(IzkProjectItem* item);

}  // namespace zkhw
