// The scan of an installation: every resource file becomes a child of the root, with notes of where it came from.

#include <algorithm>

#include "cachebuilder/FPGAResTree.h"
#include "cachebuilder/SourceLists.h"
#include "cachebuilder/TargetDiscovery.h"
#include "qn/dsc/osdep/Compare.h"
#include "qn/dsc/osdep/path.h"
#include "restree/ResTreeNode.h"
#include "restree/ResultCode.h"

namespace zkhw {

using qn::dsc::NarrowString;
using qn::dsc::osdep::GetDirectoryName;
using qn::dsc::osdep::JoinPath;

namespace {

void SetIfMissing(ResTreeNode& node, std::u16string_view key, const String& value) {
    if (!node.GetProperty(key)) {
        node.SetProperty(key, value.View());
    }
}

void StampTarget(ResTreeNode& target, const String& file, const String& relativePath) {
    target.MakeTypeTableLocal();
    target.SetProperty(u"TargetXMLPath", relativePath.View());
    target.SetProperty(u"TargetDir", GetDirectoryName(file).View());
    target.SetProperty(u"TargetClassShortClassName", target.GetName());
    SetIfMissing(target, u"TargetClass", String::Concat({u"COM.QN.FPGA.", target.GetName()}));
    SetIfMissing(target, u"EIOItemTypeName", u"FPGA I/O");
    SetIfMissing(target, u"EIOItemIconName", JoinPath(u"fpga", u"IO.png"));
}

}  // namespace

int32_t FPGAResTree::ScanTargets(const String& directory, ResTreeNode& root) {
    std::vector<String> files;
    FindResourceFiles(directory, u"*resource.xml", files);
    const auto hostsFile = std::find_if(files.begin(), files.end(), IsHostsResourceFile);
    if (hostsFile != files.end()) {
        std::rotate(files.begin(), hostsFile, hostsFile + 1);
    }
    const String installRoot = GetInstallRoot();
    SourceLists sources;
    for (const String& file : files) {
        ResTreeNode* node = nullptr;
        root.LoadResourceFile(NarrowString(file), true, &node);
        if (node == nullptr) {
            continue;
        }
        String relativePath;
        if (MakeRelativePath(installRoot, file, relativePath) != success) {
            continue;
        }
        if (node->IsA(u"Target")) {
            StampTarget(*node, file, relativePath);
        } else if (!qn::dsc::osdep::Equal(node->GetName(), u"FPGAHostSet")) {
            sources.Add(*node, relativePath);
        }
    }
    return success;
}

}  // namespace zkhw
