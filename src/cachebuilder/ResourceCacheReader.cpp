#include "cachebuilder/FPGAResTree.h"
#include "cachebuilder/ResourceCache.h"
#include "cachebuilder/TargetDiscovery.h"
#include "qn/dsc/osdep/_GetExeFullPath.h"
#include "qn/dsc/osdep/path.h"
#include "restree/ReleaseScope.h"
#include "restree/ResTreeNode.h"
#include "restree/ResultCode.h"

namespace zkhw {

using qn::dsc::NarrowString;
using qn::dsc::osdep::GetDirectoryName;
using qn::dsc::osdep::GetExecutableDir;
using qn::dsc::osdep::GetFileModificationTime;
using qn::dsc::osdep::JoinPath;

namespace {

// ":DeferredLoadPath" comes last: with it in place, a name that the stub lacks makes it load, also when it is to be
// set.
void ArmTarget(ResTreeNode& target, const String& executableDir) {
    target.MakeTypeTableLocal();
    const String folder = GetDirectoryName(String(target.GetPropertyOrEmpty(u"TargetXMLPath")));
    target.SetProperty(u"TargetDir", JoinPath(executableDir, folder).View());
    target.SetProperty(u"TargetClassShortClassName", target.GetName());
    const String file(target.GetPropertyOrEmpty(u"TargetXMLPath"));
    target.SetProperty(u":DeferredLoadPath", file.View());
}

void ArmOther(ResTreeNode& node) {
    if (const auto source = node.GetProperty(u"FPGA_XMLSource")) {
        const String files(*source);
        node.SetProperty(u":DeferredLoadPath", files.View());
    }
}

// Whether there was a target.
bool ArmStubs(ResTreeNode& root) {
    const ReleaseScope scope;
    bool seenTarget = false;
    String executableDir;
    for (EntryIterator entry = root.Begin(); !entry.IsEnd(); ++entry) {
        ResTreeNode* const child = entry->Child();
        if (child == nullptr) {
            continue;
        }
        if (child->IsA(u"Target")) {
            if (!seenTarget) {
                seenTarget = true;
                executableDir = GetExecutableDir();
            }
            ArmTarget(*child, executableDir);
        } else {
            ArmOther(*child);
        }
    }
    return seenTarget;
}

}  // namespace

int32_t FPGAResTree::ReadResourceCache(const String& directory, const String& cachePath, ResTreeNode& root) {
    if (IsAnyResourceFileNewer(directory, u"*resource.xml", GetFileModificationTime(cachePath))) {
        return needsScan;
    }
    root.LoadResourceFile(NarrowString(cachePath), false, nullptr);
    if (ArmStubs(root)) {
        return success;
    }
    while (!root.Begin().IsEnd()) {
        root.RemoveEntry(root.Begin());
    }
    return needsScan;
}

}  // namespace zkhw
