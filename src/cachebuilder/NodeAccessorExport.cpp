// The host's own accessor of a node (zkfpga/exports.h).

#include "hostbridge/HostFunctions.h"
#include "interfaces/InterfacePointer.h"
#include "qn/dsc/Guid.h"
#include "qn/dsc/osdep/Module.h"
#include "zkfpga/exports.h"
#include "zkfpga/tree_node.h"

namespace zkhw {

namespace {

using qn::dsc::osdep::FindExport;
using qn::dsc::osdep::FindLoadedModule;
using qn::dsc::osdep::ModuleHandle;
using SetRefNumFunction = int32_t (*)(IzkhwResourceTreeNode4* node);

constexpr int32_t noAccessor = 1;

}  // namespace

}  // namespace zkhw

using namespace zkhw;  // NOLINT(google-build-using-namespace): the function below belongs to no namespace.

int32_t ZkhwResTree_GetNode(uint32_t refNum, int32_t* accessor) {
    constexpr const IID& id = IID_IzkhwResourceTreeNode4;
    InterfacePointer<IzkhwResourceTreeNode4> node;
    if (FAILED(QueryInterfaceForZKRefNum(refNum, qn::dsc::Guid(id.Data1, id.Data2, id.Data3, id.Data4),
                                         node.ReceiveAny()))) {
        return noAccessor;
    }
    const ModuleHandle module = FindLoadedModule("zkhwResourceTreeAccess.mxx");
    if (module == nullptr) {
        return noAccessor;
    }
    const auto setRefNum = reinterpret_cast<SetRefNumFunction>(FindExport(module, "ZkhwResourceTreeAccessorSetRefNum"));
    if (setRefNum == nullptr) {
        return noAccessor;
    }
    const int32_t result = setRefNum(node.Get());
    if (accessor != nullptr) {
        *accessor = result;
    }
    return 0;
}
