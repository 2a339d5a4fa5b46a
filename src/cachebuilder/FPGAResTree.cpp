#include "cachebuilder/FPGAResTree.h"

#include <new>

#include "cachebuilder/ResourceCache.h"
#include "hostbridge/HostPath.h"
#include "qn/dsc/osdep/path.h"
#include "restree/ResTreeNode.h"
#include "restree/ResultCode.h"
#include "zkfpga/exports.h"

namespace zkhw {

using qn::dsc::osdep::GetCurrentDirectoryPath;
using qn::dsc::osdep::IsDirectory;
using qn::dsc::osdep::IsExistingFile;
using qn::dsc::osdep::JoinPath;

namespace {

FPGAResTree* singleton = nullptr;

struct SingletonCleanUp {
    ~SingletonCleanUp() {
        delete singleton;
        singleton = nullptr;
    }
};
SingletonCleanUp singletonCleanUp;

}  // namespace

int32_t FPGAResTree::BuildResourceTree(String directory, bool useCache, ResTreeNode*& root) {
    root = nullptr;
    root = new (std::nothrow) ResTreeNode(u"", u"ProviderResourceTreeRoot", false);
    if (root == nullptr) {
        return outOfMemory;
    }
    // False for every relative path.
    if (!IsDirectory(directory)) {
        directory = JoinPath(GetCurrentDirectoryPath(), directory);
        if (!IsDirectory(directory)) {
            return generalFailure;
        }
    }
    const String cachePath = JoinPath(directory, u"resource_cache.xml");
    if (useCache && IsExistingFile(cachePath)) {
        const int32_t read = ReadResourceCache(directory, cachePath, *root);
        if (read != needsScan) {
            return read < 0 ? read : success;
        }
    }
    const int32_t scanned = ScanTargets(directory, *root);
    if (scanned < 0) {
        return scanned;
    }
    const int32_t written = WriteResourceCache(*root, cachePath);
    return written < 0 ? written : success;
}

int32_t FPGAResTree::CreateRootNode(ResTreeNode*& root) {
    constexpr uint32_t targetsDirectory = 24;
    const String specialDirectory = GetHostSpecialDir(targetsDirectory);
    return BuildResourceTree(JoinPath(JoinPath(specialDirectory, u"QN"), u"FPGA"), true, root);
}

}  // namespace zkhw

zkhw::FPGAResTree* gFPGAResTree() {
    if (zkhw::singleton == nullptr) {
        zkhw::singleton = new (std::nothrow) zkhw::FPGAResTree;
    }
    return zkhw::singleton;
}
