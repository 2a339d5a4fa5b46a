#include "cachebuilder/DeviceMenus.h"

#include <optional>
#include <string_view>

#include "qn/dsc/osdep/DebugTrap.h"
#include "qn/dsc/osdep/_GetExeFullPath.h"
#include "qn/dsc/osdep/path.h"
#include "restree/ReleaseScope.h"
#include "restree/ResTreeNode.h"
#include "restree/ResultCode.h"

namespace zkhw {

using qn::dsc::osdep::AppendSeparator;
using qn::dsc::osdep::CopyDirectoryTree;
using qn::dsc::osdep::DebugTrap;
using qn::dsc::osdep::Equal;
using qn::dsc::osdep::GetExecutableDir;
using qn::dsc::osdep::IsDirectory;
using qn::dsc::osdep::JoinPath;
using qn::dsc::osdep::NormalizePath;

namespace {

// The menu folders as the resource files give them: relative to the root of the installation, or absolute.
struct FamilyMenus {
    String virtex5;
    String virtex6;
    String spartan6;

    // Null for a family that isn't known here.
    const String* Of(std::u16string_view family) const {
        if (Equal(family, u"virtex5")) {
            return &virtex5;
        }
        if (Equal(family, u"virtex6")) {
            return &virtex6;
        }
        return Equal(family, u"spartan6") ? &spartan6 : nullptr;
    }
};

ResTreeNode* FindChild(ResTreeNode& node, std::u16string_view key) {
    const NodeEntry* entry = node.Find(key);
    return entry == nullptr ? nullptr : entry->Child();
}

bool ReadMenus(ResTreeNode& specs, std::u16string_view family, String& menus) {
    ResTreeNode* node = FindChild(specs, family);
    if (node == nullptr) {
        return false;
    }
    menus.Assign(node->GetPropertyOrEmpty(u"XIPINMenusPath"));
    return true;
}

bool ReadFamilyMenus(ResTreeNode& root, FamilyMenus& menus) {
    ResTreeNode* specs = FindChild(root, u"FpgaDeviceSpecs");
    return specs != nullptr && ReadMenus(*specs, u"Virtex5", menus.virtex5) &&
           ReadMenus(*specs, u"Virtex6", menus.virtex6) && ReadMenus(*specs, u"spartan6", menus.spartan6);
}

// None if the target names no family.
std::optional<std::u16string_view> FindDeviceFamily(ResTreeNode& target) {
    const NodeEntry* compilation = target.Find(u"FPGACompilation");
    if (compilation == nullptr) {
        return std::nullopt;
    }
    ResTreeNode* node = compilation->Child();
    if (node == nullptr) {
        DebugTrap();
    }
    return node->GetProperty(u"DeviceFamily");
}

bool LiesInside(const String& path, const String& folder) {
    return path.Length() >= folder.Length() && Equal(path.View().substr(0, folder.Length()), folder.View());
}

void CopyMenus(const String& menus, const String& targetDirectory) {
    String destination = NormalizePath(targetDirectory);
    String source = NormalizePath(JoinPath(JoinPath(GetExecutableDir(), u"..\\..\\..\\..\\"), menus));
    AppendSeparator(destination);
    AppendSeparator(source);
    if (IsDirectory(source) && !LiesInside(destination, source)) {
        CopyDirectoryTree(source, destination);
    }
}

void InstallMenus(const FamilyMenus& menus, ResTreeNode& target) {
    const auto family = FindDeviceFamily(target);
    const String* source = family ? menus.Of(*family) : nullptr;
    if (source != nullptr && target.Find(u"TargetDir") != nullptr) {
        CopyMenus(*source, String(target.GetPropertyOrEmpty(u"TargetDir")));
    }
}

}  // namespace

int32_t InstallDeviceMenus(ResTreeNode& root) {
    FamilyMenus menus;
    if (!ReadFamilyMenus(root, menus)) {
        return generalFailure;
    }
    // A look that misses may load, and so change the tree under the walk.
    const ReleaseScope scope;
    for (EntryIterator entry = root.Begin(); !entry.IsEnd(); ++entry) {
        ResTreeNode* const node = entry->Child();
        if (node == nullptr) {
            DebugTrap();
        }
        if (node->IsA(u"Target")) {
            InstallMenus(menus, *node);
        }
    }
    return success;
}

}  // namespace zkhw
