#include "interfaces/ProjectItem.h"

#include "qn/dsc/Guid.h"
#include "zkfpga/memory.h"

namespace zkhw {

ItemRecord::ItemRecord(IzkProjectItem* item) : record() {
    record.size = sizeof record;
    item->GetItemInfo(&record);
}

ItemRecord::~ItemRecord() {
    SysFreeString(record.name);
    CoTaskMemFree(record.data);
}

qn::dsc::String GetItemKey(IzkProjectItem* item) {
    ItemRecord info(item);
    const GUID& id = info.Get()->id;
    return qn::dsc::Guid(id.Data1, id.Data2, id.Data3, id.Data4).ToString();
}

}  // namespace zkhw
