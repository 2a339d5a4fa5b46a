#include "cachebuilder/Tool.h"

#include "cachebuilder/DeviceMenus.h"
#include "cachebuilder/FPGAResTree.h"
#include "qn/dsc/osdep/CommandLine.h"
#include "qn/dsc/osdep/_GetExeFullPath.h"
#include "qn/dsc/osdep/path.h"
#include "restree/ResTreeNode.h"
#include "restree/ResultCode.h"
#include "zkfpga/exports.h"

namespace zkhw {

using qn::dsc::osdep::GetExecutableDir;
using qn::dsc::osdep::JoinPath;
using qn::dsc::osdep::NormalizePath;
using qn::dsc::osdep::PathFromArgument;

namespace {

// Left at exit on purpose: taking a large tree down would only cost time. Here a leak checker finds it in use.
ResTreeNode* treeOfTheRun = nullptr;

}  // namespace

int32_t RunTool(int argc, char** argv) {
    String directory;
    FPGAResTree* tree = gFPGAResTree();
    if (tree == nullptr) {
        return outOfMemory;
    }
    if (argc >= 2) {
        directory = PathFromArgument(argv[1]);
    } else {
        directory = NormalizePath(JoinPath(GetExecutableDir(), u".."));
    }
    const int32_t built = tree->BuildResourceTree(directory, false, treeOfTheRun);
    if (built != success) {
        return built;
    }
    return InstallDeviceMenus(*treeOfTheRun);
}

void DiscardTreeOfTheRun() {
    delete treeOfTheRun;
    treeOfTheRun = nullptr;
}

}  // namespace zkhw
