#include "restree/InstallRoot.h"

#include "qn/dsc/osdep/FileSystem.h"
#include "qn/dsc/osdep/_GetExeFullPath.h"
#include "qn/dsc/osdep/path.h"

namespace zkhw {

using qn::dsc::String;
using qn::dsc::osdep::GetDirectoryName;
using qn::dsc::osdep::GetExecutableBaseName;
using qn::dsc::osdep::GetExecutableDir;
using qn::dsc::osdep::GetFileSystem;
using qn::dsc::osdep::GetNativeFileSystem;
using qn::dsc::osdep::IsExistingFile;
using qn::dsc::osdep::JoinPath;

namespace {

bool HoldsHost(const String& folder) {
    for (const char16_t* executable : {u"Zarvik.exe", u"zkre.exe", u"zkde.exe"}) {
        if (IsExistingFile(JoinPath(folder, executable))) {
            return true;
        }
    }
    return false;
}

String FindInstallRoot() {
    String folder = GetExecutableDir();
    if (!(GetExecutableBaseName() == u"zkfpga_make_resource_cache")) {
        return folder;
    }
    // The first step up only takes the backslash off, so the tool's own folder is tested twice.
    while (!HoldsHost(folder)) {
        String parent = GetDirectoryName(folder);
        if (parent == folder) {
            break;
        }
        folder = std::move(parent);
    }
    return folder;
}

}  // namespace

String GetInstallRoot() {
    if (&GetFileSystem() != &GetNativeFileSystem()) {
        return FindInstallRoot();
    }
    // Every include asks, and each name that isn't there costs a look through a whole folder. Neither the executable
    // nor the host beside it moves while they run.
    static const String installRoot = FindInstallRoot();
    return installRoot;
}

}  // namespace zkhw
